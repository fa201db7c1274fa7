// Values that only files of old versions hold. They are read and never written.
#include "k2v_file/stream/array_elements.h"
#include "k2v_file/stream/value_forms.h"
#include "k2v_file/values/container_index.h"
#include "torvane/memory/assertion.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

Bool HyperFile::ReadContainerLegacy(ContainerIndex& target, Bool flush)
{
  Long length = 0; // of no use: the end mark closes the container
  Long id = 0;
  if (!ReadPlainLong(length) || !ReadLong(id))
    return false;
  target.GetContainer().SetId(id);
  for (;;) {
    LLong start = file_.GetPosition();
    UChar type = 0;
    if (!ReadPlainLong(id))
      return false;
    if (!file_.ReadUChar(type))
      return FailFromFile(start);
    if (type == kLegacyEnd) // with the id -1
      return id == -1 || Fail(FILEERROR_WRONG_VALUE, start);
    if (!ReadLegacyEntry(target, flush, id, type))
      return false;
  }
}

// The kinds of value that an entry holds as it is held anywhere else.
Bool HyperFile::ReadLegacyEntry(ContainerIndex& target, Bool flush, Long id, UChar type)
{
  switch (type) {
  case kDataLong:
  case kDataReal:
  case kDataTime:
  case kDataVector:
  case kDataMatrix:
  case kDataString:
  case kDataFilename: {
    GeData* place = PlaceElement(target, flush, id);
    return place && place->ReadAs(*this, type);
  }
  case kDataOldMemory: // without a value
    return PlaceElement(target, flush, id) != nullptr;
  case kDataContainer:
    return ReadLegacyNested(target, flush, id);
  default:
    ReportAssertion("k2v_file", __LINE__, "a container of an old file holds an entry of an unknown type");
    return true;
  }
}

// A nested container is read into the one of that id if there is one.
Bool HyperFile::ReadLegacyNested(ContainerIndex& target, Bool flush, Long id)
{
  ContainerIndex* nested = target.Enter(id, flush);
  return nested ? ReadContainer(*nested, false) : Fail(FILEERROR_MEMORY, file_.GetPosition());
}

// A new block of `count` elements of `type`, converted from the stored type.
Bool HyperFile::ReadLegacyElements(LLong start, Long type, Long storedType, LLong count, void*& block)
{
  LLong storedSize = GetElementSize(storedType);
  LLong size = GetElementSize(type);
  void* packed = nullptr;
  if (!ReadBlock(packed, count * storedSize))
    return false;
  if (packed && type == storedType) {
    FindUnpackElements(type, storedType)(static_cast<UChar*>(packed), static_cast<UChar*>(packed), size, count);
    block = packed;
  } else if (packed) {
    block = GeAllocNC(count * size);
    if (block)
      FindUnpackElements(type, storedType)(static_cast<UChar*>(block), static_cast<UChar*>(packed), size, count);
    GeFree(packed);
    if (!block)
      return Fail(FILEERROR_MEMORY, start);
  }
  TickRead();
  return true;
}

Bool HyperFile::ReadLegacyPointArray(Vector*& points, LLong& count)
{
  points = nullptr;
  count = 0;
  LLong start = file_.GetPosition();
  LLong length = 0;
  void* block = nullptr;
  if (!GetBlockHead(kTagLegacyPointArray, length))
    return false;
  LLong found = length / 12; // whatever the precision
  Long storedType = singlePrecision_ ? kArraySReal : kArrayLReal;
  if (!ReadLegacyElements(start, kArrayLReal, storedType, found * 3, block))
    return false;
  points = static_cast<Vector*>(block);
  count = found;
  return true;
}

Bool HyperFile::ReadLegacyPolygonArray(LegacyPolygon*& polygons, LLong& count)
{
  polygons = nullptr;
  count = 0;
  LLong start = file_.GetPosition();
  LLong length = 0;
  Long narrow = 0;
  void* block = nullptr;
  if (!GetBlockHead(kTagLegacyPolygonArray, length) || !ReadPlainLong(narrow))
    return false;
  LLong found = length / (narrow != 0 ? 8 : 16);
  if (!ReadLegacyElements(start, kArrayLong, narrow != 0 ? kArrayWord : kArrayLong, found * 4, block))
    return false;
  polygons = static_cast<LegacyPolygon*>(block);
  count = found;
  return true;
}

Bool HyperFile::ReadLegacyWordArray(UWord*& words, LLong& count)
{
  words = nullptr;
  count = 0;
  LLong start = file_.GetPosition();
  LLong length = 0;
  void* block = nullptr;
  if (!GetBlockHead(kTagLegacyWordArray, length) ||
      !ReadLegacyElements(start, kArrayWord, kArrayWord, length / 2, block))
    return false;
  words = static_cast<UWord*>(block);
  count = length / 2;
  return true;
}

Bool HyperFile::ReadLegacyFloatArray(SReal*& floats, LLong& count)
{
  floats = nullptr;
  count = 0;
  LLong start = file_.GetPosition();
  LLong length = 0;
  void* block = nullptr;
  if (!GetBlockHead(kTagLegacyFloatArray, length) ||
      !ReadLegacyElements(start, kArraySReal, kArraySReal, length / 4, block))
    return false;
  floats = static_cast<SReal*>(block);
  count = length / 4;
  return true;
}

} // namespace _torvane_
