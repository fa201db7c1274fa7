#include "torvane/values/custom_data.h"

#include <cstring>

#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/stream/value_forms.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

Bool CustomData::GetParameter(const ParameterPath&, GeData&) const { return false; }

Bool CustomData::SetParameter(const ParameterPath&, const GeData&) { return false; }

// ---------------------------------------------------------------------------------------------------------------

Bool OpaqueCustomData::IsEqual(const CustomData& other) const
{
  const RawChunkBody& body = static_cast<const OpaqueCustomData&>(other).body_;
  return body_.GetLevel() == body.GetLevel() && body_.GetSize() == body.GetSize() &&
         (body_.GetSize() == 0 ||
          std::memcmp(body_.GetData(), body.GetData(), static_cast<std::size_t>(body_.GetSize())) == 0);
}

Bool OpaqueCustomData::CopyTo(CustomData& destination, TransArray*) const
{
  return body_.CopyTo(static_cast<OpaqueCustomData&>(destination).body_);
}

Bool OpaqueCustomData::Read(HyperFile& file, Long level) { return body_.Read(file, level); }

void OpaqueCustomData::Write(HyperFile& file) const { body_.Write(file); }

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
  if (TakeBody()) {
    body_.Free();
    body_.SetLevel(type_.level);
  }
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
