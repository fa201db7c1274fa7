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

Bool HyperFile::ReadLegacyEntry(ContainerIndex& target, Bool flush, Long id, UChar type)
{
  if (IsTaggedLegacyEntry(type)) {
    GeData* place = PlaceElement(target, flush, id);
    return place && place->ReadAs(*this, type);
  }
  switch (type) {
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

// Reads one array of an old file as `count` entries in a new block; without one there is none and the count is 0.
Bool HyperFile::ReadLegacyArray(UChar tag, LegacyArrayForm form, void*& block, LLong& count)
{
  block = nullptr;
  count = 0;
  const LLong start = file_.GetPosition();
  LLong length = 0;
  Long narrow = 0;
  if (!GetBlockHead(tag, length) || (form.narrowType >= 0 && !ReadPlainLong(narrow)))
    return false;
  if (narrow != 0)
    form.storedType = form.narrowType;
  const LLong entrySize = form.entrySize > 0 ? form.entrySize : form.elements * GetElementSize(form.storedType);
  const LLong found = length / entrySize;
  if (!ReadLegacyElements(start, form.type, form.storedType, found * form.elements, block))
    return false;
  count = found;
  return true;
}

// The entries as what they are in memory.
template <class Entry>
Bool HyperFile::ReadLegacyEntries(UChar tag, const LegacyArrayForm& form, Entry*& entries, LLong& count)
{
  void* block = nullptr;
  const Bool read = ReadLegacyArray(tag, form, block, count);
  entries = static_cast<Entry*>(block);
  return read;
}

Bool HyperFile::ReadLegacyPointArray(Vector*& points, LLong& count)
{
  // The length counts 12 bytes a point, whatever the precision.
  const Long storedType = singlePrecision_ ? kArraySReal : kArrayLReal;
  return ReadLegacyEntries(kTagLegacyPointArray, {kArrayLReal, storedType, 3, 12}, points, count);
}

Bool HyperFile::ReadLegacyPolygonArray(LegacyPolygon*& polygons, LLong& count)
{
  return ReadLegacyEntries(kTagLegacyPolygonArray, {kArrayLong, kArrayLong, 4, 0, kArrayWord}, polygons, count);
}

Bool HyperFile::ReadLegacyWordArray(UWord*& words, LLong& count)
{
  return ReadLegacyEntries(kTagLegacyWordArray, {kArrayWord, kArrayWord}, words, count);
}

Bool HyperFile::ReadLegacyFloatArray(SReal*& floats, LLong& count)
{
  return ReadLegacyEntries(kTagLegacyFloatArray, {kArraySReal, kArraySReal}, floats, count);
}

} // namespace _torvane_
