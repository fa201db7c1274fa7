#include "q7r_file/objects/transform_record.h"

#include "k2v_file/stream/learned_once.h"
#include "k2v_file/stream/value_forms.h"
#include "torvane/objects/base_object.h"

namespace _torvane_
{

namespace
{

constexpr LLong kVectorSize = 3 * sizeof(ULLong);

void PutVector(UChar* place, const Vector& vector)
{
  bytes::PutBig(place, bytes::CleanBits(vector.x));
  bytes::PutBig(place + sizeof(ULLong), bytes::CleanBits(vector.y));
  bytes::PutBig(place + 2 * sizeof(ULLong), bytes::CleanBits(vector.z));
}

Real GetReal(const UChar* place) { return bytes::CleanReal(bytes::GetBig<ULLong>(place)); }

Vector GetVector(const UChar* place)
{
  return {GetReal(place), GetReal(place + sizeof(ULLong)), GetReal(place + 2 * sizeof(ULLong))};
}

// An object whose fields can be set.
class MarkedObject : public BaseObject
{
 public:
  MarkedObject() : BaseObject(kObjectGeneric) {}
  void Set(const TransformRecord::Fields& fields)
  {
    relPos_ = *fields.vectors[0];
    relScale_ = *fields.vectors[1];
    relRot_ = *fields.vectors[2];
    editorMode_ = *fields.numbers[0];
    renderMode_ = *fields.numbers[1];
    disabled_ = *fields.numbers[2];
    rotationOrder_ = *fields.numbers[3];
    markerDrawn_ = true; // none is taken from the run that happens to come first
  }
};

} // namespace

const TransformRecord* TransformRecord::Get() { return GetLearned<TransformRecord>(); }

// Numbers like no other in an object.
Bool TransformRecord::Learn()
{
  Vector vectors[] = {{1.25e101, 2, 3}, {1.25e102, 2, 3}, {1.25e103, 2, 3}};
  Long numbers[] = {0x5AC3E300, 0x5AC3E301, 0x5AC3E302, 0x5AC3E303};
  const Fields marks = {{&vectors[0], &vectors[1], &vectors[2]}, {&numbers[0], &numbers[1], &numbers[2], &numbers[3]}};
  MarkedObject sample;
  MarkedObject copy;
  sample.Set(marks);
  return record_.Learn(sample, copy, kObjectGeneric) && FindFields(marks);
}

Bool TransformRecord::FindFields(const Fields& fields)
{
  body_ = {record_.FindChunk(kChunkTransform), record_.GetSize() - StoredSize(kTagChunkEnd), 1};
  Bool found = body_.from >= 0;
  const auto find = [&](const UChar* mark, LLong size) {
    const LLong place = record_.TakeField(mark, size);
    found = found && place >= body_.from && place + size <= body_.to;
    return place - body_.from;
  };
  UChar mark[kVectorSize];
  for (std::size_t i = 0; i < std::size(vectors_); ++i) {
    PutVector(mark, *fields.vectors[i]);
    vectors_[i] = find(mark, kVectorSize);
  }
  for (std::size_t i = 0; i < std::size(numbers_); ++i) {
    bytes::PutBig(mark, static_cast<ULong>(*fields.numbers[i]));
    numbers_[i] = find(mark, sizeof(ULong));
  }
  return found;
}

void TransformRecord::Get(const UChar* place, const Fields& fields) const
{
  for (std::size_t i = 0; i < std::size(vectors_); ++i)
    *fields.vectors[i] = GetVector(place + vectors_[i]);
  for (std::size_t i = 0; i < std::size(numbers_); ++i)
    *fields.numbers[i] = static_cast<Long>(bytes::GetBig<ULong>(place + numbers_[i]));
}

} // namespace _torvane_
