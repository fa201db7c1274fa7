#include "torvane/values/custom_data.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/stream/value_forms.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

namespace
{

// The values of three numbers in a file.
template <class Visitor, class Numbers>
void VisitNumbers(Visitor& v, Numbers& numbers)
{
  v.Long(numbers.second);
  v.Long(numbers.first);
  v.Bool(numbers.third);
}

} // namespace

Bool CustomData::GetValue(const ParameterPath&, GeData&, ULong&) const { return false; }

Bool CustomData::SetValue(const ParameterPath&, const GeData&, ULong&) { return false; }

Bool CustomData::GetParameter(const ParameterPath& path, GeData& value) const
{
  ULong flags = 0;
  return GetValue(path, value, flags) && (flags & kParameterAnswered);
}

Bool CustomData::SetParameter(const ParameterPath& path, const GeData& value)
{
  ULong flags = 0;
  return SetValue(path, value, flags) && (flags & kParameterAnswered);
}

// ---------------------------------------------------------------------------------------------------------------

Bool OpaqueCustomData::IsEqual(const CustomData& other) const
{
  const auto* opaque = NodeCast<OpaqueCustomData>(&other);
  return opaque && body_.IsEqual(opaque->body_);
}

Bool OpaqueCustomData::CopyTo(CustomData& destination, TransArray*) const
{
  auto* target = NodeCast<OpaqueCustomData>(&destination);
  return target && body_.CopyTo(target->body_);
}

Bool OpaqueCustomData::Read(HyperFile& file, Long level) { return body_.Read(file, level); }

void OpaqueCustomData::Write(HyperFile& file) const { body_.Write(file); }

// ---------------------------------------------------------------------------------------------------------------

Bool UnitScaleData::IsEqual(const CustomData& other) const
{
  const auto* units = NodeCast<UnitScaleData>(&other);
  return units && OpaqueCustomData::IsEqual(other) && static_cast<const UnitScale&>(*this) == *units;
}

Bool UnitScaleData::CopyTo(CustomData& destination, TransArray* translation) const
{
  auto* target = NodeCast<UnitScaleData>(&destination);
  if (!target)
    return false;
  static_cast<UnitScale&>(*target) = *this;
  return OpaqueCustomData::CopyTo(destination, translation);
}

Bool UnitScaleData::Read(HyperFile& file, Long level)
{
  static_cast<UnitScale&>(*this) = UnitScale();
  if (!OpaqueCustomData::Read(file, level))
    return false;
  if (TakeBody())
    body_.SetEmpty(type_.level);
  return true;
}

// Takes scale and unit out of the body if these two values are all that it holds.
Bool UnitScaleData::TakeBody()
{
  constexpr LLong kRealOffset = kTagSize;
  constexpr LLong kUnitOffset = StoredSize(kTagReal);
  constexpr LLong kBodySize = StoredSize(kTagReal, kTagLong);
  static_assert(kUnitOffset == 9 && kBodySize == 14);
  const UChar* body = static_cast<const UChar*>(body_.GetData());
  if (body_.GetSize() != kBodySize || body[0] != kTagReal || body[kUnitOffset] != kTagLong)
    return false;
  scale = bytes::CleanReal(bytes::GetBig<ULLong>(body + kRealOffset));
  unit = static_cast<Long>(bytes::GetBig<ULong>(body + kUnitOffset + kTagSize));
  return true;
}

void UnitScaleData::Write(HyperFile& file) const
{
  if (body_.GetData()) {
    OpaqueCustomData::Write(file);
    return;
  }
  file.WriteReal(scale);
  file.WriteLong(unit);
}

// ---------------------------------------------------------------------------------------------------------------

Bool ThreeNumbersData::IsEqual(const CustomData& other) const
{
  const auto* numbers = NodeCast<ThreeNumbersData>(&other);
  return numbers && static_cast<const ThreeNumbers&>(*this) == *numbers;
}

Bool ThreeNumbersData::CopyTo(CustomData& destination, TransArray*) const
{
  auto* target = NodeCast<ThreeNumbersData>(&destination);
  if (target)
    static_cast<ThreeNumbers&>(*target) = *this;
  return target != nullptr;
}

Bool ThreeNumbersData::Read(HyperFile& file, Long level)
{
  return ReadChunkBody(file, level, [this](ChunkReader& reader) { VisitNumbers(reader, *this); });
}

void ThreeNumbersData::Write(HyperFile& file) const
{
  ChunkWriter writer(file, GetChunkLevel());
  VisitNumbers(writer, *this);
}

} // namespace _torvane_
