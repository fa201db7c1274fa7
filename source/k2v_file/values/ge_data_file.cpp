// The file form of a GeData: the type as a Long, then the value.
#include "k2v_file/stream/raw_values.h"
#include "k2v_file/values/value_kinds.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

// The unknown custom types that are kept although the file is older than version 11600.
constexpr Long kKeptOldTypes[] = {1000486, 1001053,   1009372,   1009617,   1011188,   1011190,   1019870,   1019918,
                                  1020497, 180000106, 200000027, 200000044, 200000157, 200000266, 465001521, 465001527};

// The level of a record that was dropped.
constexpr Long kDropped = -1;

Bool IsKept(const HyperFile& file, Long type)
{
  if (!file.IsBefore11600())
    return true;
  for (Long kept : kKeptOldTypes) {
    if (kept == type)
      return true;
  }
  return false;
}

} // namespace

Bool GeData::Read(HyperFile& file)
{
  Free();
  Long type = 0;
  if (!file.ReadLong(type))
    return false;
  // The two kinds that most elements of containers are.
  if (type == kDataLong || type == kDataReal) {
    type_ = type;
    return Keep(type == kDataLong ? file.ReadLong(payload_.integer) : file.ReadReal(payload_.real));
  }
  if (type >= kDataFirstCustom)
    return Keep(ReadCustom(file, type));
  if (type == kDataOldMemory) {
    UChar tag = 0;
    return file.ReadValueHeader(tag) && file.SkipValue(tag);
  }
  return Kind::Of(type).storedAs != StoredAs::kNever && ReadAs(file, type);
}

Bool GeData::ReadAs(HyperFile& file, Long type)
{
  if (!SetType(type)) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  return Keep(Kind::Of(type_).read(file, payload_));
}

Bool GeData::ReadCustom(HyperFile& file, Long type)
{
  Long id = 0;
  Long level = 0;
  if (!file.ExpectTag(kTagChunkStart) || !file.ReadChunkStart(id, level))
    return false;
  if (!FindCustomDataType(type))
    return ReadUnknown(file, type, level);
  if (!Make(Kind::Of(type), type)) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  return payload_.custom->Read(file, level);
}

Bool GeData::ReadUnknown(HyperFile& file, Long type, Long level)
{
  if (!SetType(kDataUnknown)) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  UnknownRecord& record = *payload_.unknown;
  record.type = type;
  if (!IsKept(file, type)) {
    record.level = kDropped;
    return file.SkipToEndChunk();
  }
  record.level = level;
  return file.ReadRawChunk(record.data, record.size, false) && ModernizeValues(record.data, record.size, file);
}

Bool GeData::IsStored() const { return type_ == kDataUnknown || Kind::Of(type_).storedAs == StoredAs::kValue; }

Bool GeData::Write(HyperFile& file) const
{
  if (type_ == kDataUnknown)
    return WriteUnknown(file);
  return file.WriteLong(type_) && Kind::Of(type_).write(file, payload_);
}

// The bytes hold the end tag that the file had; a dropped record has none.
Bool GeData::WriteUnknown(HyperFile& file) const
{
  const UnknownRecord& record = *payload_.unknown;
  if (!file.WriteLong(record.type) || !file.WriteChunkStart(0, record.level))
    return false;
  return record.level == kDropped ? file.WriteChunkEnd() : file.WriteRawChunk(record.data, record.size, false);
}

} // namespace _torvane_
