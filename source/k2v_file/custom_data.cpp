#include "torvane/custom_data.h"

#include <cstring>

#include "k2v_file/chunk_visitor.h"
#include "torvane/hyper_file.h"

namespace _torvane_
{

Bool CustomData::GetParameter(const ParameterPath&, GeData&) const { return false; }

Bool CustomData::SetParameter(const ParameterPath&, const GeData&) { return false; }

// ---------------------------------------------------------------------------------------------------------------

OpaqueCustomData::~OpaqueCustomData() { DropBody(); }

void OpaqueCustomData::DropBody()
{
  GeFree(data_);
  size_ = 0;
}

Bool OpaqueCustomData::IsEqual(const CustomData& other) const
{
  const auto& opaque = static_cast<const OpaqueCustomData&>(other);
  return level_ == opaque.level_ && size_ == opaque.size_ &&
         (size_ == 0 || std::memcmp(data_, opaque.data_, static_cast<std::size_t>(size_)) == 0);
}

Bool OpaqueCustomData::CopyTo(CustomData& destination, TransArray*) const
{
  auto& opaque = static_cast<OpaqueCustomData&>(destination);
  if (&opaque == this)
    return true;
  opaque.DropBody();
  opaque.level_ = level_;
  if (size_ == 0)
    return true;
  opaque.data_ = GeAllocNC(size_);
  if (!opaque.data_)
    return false;
  GeCopyMem(opaque.data_, data_, size_);
  opaque.size_ = size_;
  return true;
}

Bool OpaqueCustomData::Read(HyperFile& file, Long level)
{
  DropBody();
  level_ = level;
  return file.ReadRawChunk(data_, size_, true);
}

void OpaqueCustomData::Write(HyperFile& file) const
{
  if (data_)
    file.WriteRawChunk(data_, size_, true);
}

// ---------------------------------------------------------------------------------------------------------------

Bool UnitScaleData::IsEqual(const CustomData& other) const
{
  const auto& units = static_cast<const UnitScaleData&>(other);
  return OpaqueCustomData::IsEqual(other) && scale == units.scale && unit == units.unit;
}

Bool UnitScaleData::CopyTo(CustomData& destination, TransArray* translation) const
{
  auto& units = static_cast<UnitScaleData&>(destination);
  units.scale = scale;
  units.unit = unit;
  return OpaqueCustomData::CopyTo(destination, translation);
}

Bool UnitScaleData::Read(HyperFile& file, Long level)
{
  scale = 1.0;
  unit = 3;
  if (!OpaqueCustomData::Read(file, level))
    return false;
  if (TakeBody(file.IsSinglePrecision())) {
    DropBody();
    level_ = type_.level;
  }
  return true;
}

// Takes scale and unit out of the body if these two values are all that it holds.
Bool UnitScaleData::TakeBody(Bool singlePrecision)
{
  const LLong realSize = singlePrecision ? 4 : 8;
  const LLong unitOffset = 1 + realSize;
  const UChar* body = static_cast<const UChar*>(data_);
  if (size_ != unitOffset + 5 || body[0] != kTagReal || body[unitOffset] != kTagLong)
    return false;
  scale = singlePrecision ? bytes::CleanReal(bytes::GetBig<ULong>(body + 1))
                          : bytes::CleanReal(bytes::GetBig<ULLong>(body + 1));
  unit = static_cast<Long>(bytes::GetBig<ULong>(body + unitOffset + 1));
  return true;
}

void UnitScaleData::Write(HyperFile& file) const
{
  if (data_) {
    OpaqueCustomData::Write(file);
    return;
  }
  file.WriteReal(scale);
  file.WriteLong(unit);
}

// ---------------------------------------------------------------------------------------------------------------

template <class Visitor, class Numbers>
void ThreeNumbersData::VisitBody(Visitor& v, Numbers& numbers)
{
  v.Long(numbers.second);
  v.Long(numbers.first);
  v.Bool(numbers.third);
}

Bool ThreeNumbersData::IsEqual(const CustomData& other) const
{
  const auto& numbers = static_cast<const ThreeNumbersData&>(other);
  return first == numbers.first && second == numbers.second && third == numbers.third;
}

Bool ThreeNumbersData::CopyTo(CustomData& destination, TransArray*) const
{
  auto& numbers = static_cast<ThreeNumbersData&>(destination);
  numbers.first = first;
  numbers.second = second;
  numbers.third = third;
  return true;
}

Bool ThreeNumbersData::Read(HyperFile& file, Long level)
{
  return ReadChunkBody(file, level, [this](ChunkReader& reader) { VisitBody(reader, *this); });
}

void ThreeNumbersData::Write(HyperFile& file) const
{
  ChunkWriter writer(file, GetChunkLevel());
  VisitBody(writer, *this);
}

} // namespace _torvane_
