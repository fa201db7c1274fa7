#include "torvane/tags/joint_weight_table.h"

#include <cmath>

#include "torvane/memory/owned.h"

#include "k2v_file/stream/array_elements.h"
#include "k2v_file/stream/chunk_visitor.h"

namespace _torvane_
{

namespace
{

constexpr Real kFullWeight = 65535.0;

UWord PackWeight(Real weight)
{
  const Real value = std::floor(weight * kFullWeight + 0.5);
  if (!(value > 0.0)) // a NaN too
    return 0;
  return value < kFullWeight ? static_cast<UWord>(value) : static_cast<UWord>(kFullWeight);
}

// The elements of an Array as an old file holds them: as plain bytes.
Bool ReadOldElements(HyperFile& file, void* data, Long type, LLong count)
{
  void* block = nullptr;
  LLong size = 0;
  const LLong elementSize = GetElementSize(type);
  if (!file.ReadMemory(block, size))
    return false;
  const Owned<void> owned(block);
  const Bool fits = size == count * elementSize;
  if (fits)
    FindUnpackElements(type, type)(static_cast<UChar*>(data), static_cast<UChar*>(block), elementSize, count);
  else
    file.SetError(FILEERROR_WRONG_VALUE);
  return fits;
}

// The elements of `array`, each made of `perElement` numbers of that type. Reading brings it to `count` elements
// first, once it is known that the file can hold them.
template <class Visitor, class Array>
Bool VisitElements(Visitor& v, Array& array, LLong count, Long type, Long perElement)
{
  const LLong size = GetElementSize(type);
  if constexpr (Visitor::kReading) {
    if (!v.Note(v.File().HasRoomFor(count, perElement * size)))
      return false;
    if (count > INT32_MAX || !array.SetCount(static_cast<Long>(count))) {
      v.File().SetError(FILEERROR_MEMORY);
      return v.Note(false);
    }
    return v.Note(v.VersionBelow(kVersionTransform) ? ReadOldElements(v.File(), array.Data(), type, count * perElement)
                                                    : v.File().ReadArray(array.Data(), type, size, count * perElement));
  } else {
    return v.Note(v.File().WriteArray(array.Data(), type, size, count * perElement));
  }
}

template <class Visitor, class List>
Bool VisitList(Visitor& v, List& list)
{
  for (auto& number : list.head)
    v.ULong(number);
  ULong length = static_cast<ULong>(list.values.GetCount());
  Long count = list.values.GetCount();
  v.ULong(length);
  v.Long(list.tail);
  if (!v.Good() || length == 0)
    return v.Good();
  if (!v.Long(count))
    return false;
  if (static_cast<ULong>(count) != length) {
    v.File().SetError(FILEERROR_WRONG_VALUE);
    return v.Note(false);
  }
  return VisitElements(v, list.values, count, kArrayLong, 1);
}

} // namespace

Bool JointPairList::Read(HyperFile& file)
{
  Flush();
  ChunkReader reader(file, 0);
  return VisitList(reader, *this);
}

Bool JointPairList::Write(HyperFile& file) const
{
  ChunkWriter writer(file, 0);
  return VisitList(writer, *this);
}

Bool JointPairList::CopyTo(JointPairList& destination) const
{
  for (Long i = 0; i < 3; ++i)
    destination.head[i] = head[i];
  destination.tail = tail;
  return values.CopyTo(destination.values);
}

void JointPairList::Flush()
{
  for (ULong& number : head)
    number = 0;
  tail = 0;
  values.Flush();
}

template <>
struct ChunkFields<WeightRuns>
{
  template <class Visitor, class Runs>
  static Bool VisitRuns(Runs& runs, Visitor& v)
  {
    Long count = runs.runs_.GetCount();
    v.Long(runs.head_[0]);
    v.Long(runs.head_[1]);
    v.Long(count);
    return v.Good() && (count == 0 || VisitElements(v, runs.runs_, count, kArrayLong, 3));
  }

  template <class Visitor, class Runs>
  static Bool VisitValues(Runs& runs, Visitor& v)
  {
    if (runs.runs_.GetCount() == 0)
      return v.Good();
    Long count = runs.values_.GetCount();
    return v.Long(count) && VisitElements(v, runs.values_, count, kArrayWord, 1);
  }
};

// ---------------------------------------------------------------------------------------------------------------

Real JointWeightTable::ReadPointWeight(Long point) const
{
  ReadGuard guard(lock_);
  if (!edited_)
    return runs_.Get(point) / kFullWeight;
  return point >= 0 ? pages_.Get(point) / kFullWeight : 0.0;
}

Bool JointWeightTable::WritePointWeight(Long point, Real weight)
{
  WriteGuard guard(lock_);
  if (point < 0)
    return false;
  const UWord value = PackWeight(weight);
  return edited_ ? pages_.Set(point, value) : runs_.Set(point, value);
}

Long JointWeightTable::GetWeightCount() const
{
  ReadGuard guard(lock_);
  return static_cast<Long>(runs_.GetWeightCount());
}

Long JointWeightTable::GetRunCount() const
{
  ReadGuard guard(lock_);
  return runs_.GetRunCount();
}

Bool JointWeightTable::GetRun(Long index, WeightRun& run) const
{
  ReadGuard guard(lock_);
  if (index < 0 || index >= runs_.GetRunCount())
    return false;
  run = runs_.GetRun(index);
  return true;
}

Bool JointWeightTable::BeginEdit(Long pointCount)
{
  WriteGuard guard(lock_);
  if (edited_)
    return true;
  edited_ = pages_.Reserve(pointCount) && pages_.Take(runs_);
  if (!edited_)
    pages_.Flush();
  return edited_;
}

Bool JointWeightTable::EndEdit()
{
  WriteGuard guard(lock_);
  if (!edited_)
    return true;
  if (!pages_.Give(runs_))
    return false;
  pages_.Flush();
  edited_ = false;
  return true;
}

Bool JointWeightTable::IsEdited() const
{
  ReadGuard guard(lock_);
  return edited_;
}

Bool JointWeightTable::Read(HyperFile& file)
{
  WriteGuard guard(lock_);
  FlushContent();
  if (ReadContent(file))
    return true;
  FlushContent();
  return false;
}

Bool JointWeightTable::ReadContent(HyperFile& file)
{
  ChunkReader reader(file, 0);
  if (!ChunkFields<WeightRuns>::VisitRuns(runs_, reader) || !list_.Read(file) ||
      !ChunkFields<WeightRuns>::VisitValues(runs_, reader))
    return false;
  if (!runs_.AreSound()) {
    file.SetError(FILEERROR_WRONG_VALUE);
    return false;
  }
  runs_.packed_ = runs_.ArePacked();
  return true;
}

Bool JointWeightTable::Write(HyperFile& file) const
{
  ReadGuard guard(lock_);
  if (!edited_)
    return WriteContent(file, runs_);
  WeightRuns edited;
  if (!pages_.Give(edited)) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  edited.head_[0] = runs_.head_[0];
  edited.head_[1] = runs_.head_[1];
  return WriteContent(file, edited);
}

Bool JointWeightTable::WriteContent(HyperFile& file, const WeightRuns& runs) const
{
  ChunkWriter writer(file, 0);
  return ChunkFields<WeightRuns>::VisitRuns(runs, writer) && list_.Write(file) &&
         ChunkFields<WeightRuns>::VisitValues(runs, writer);
}

// The two locks are entered in the order of their addresses, so that two copies in opposite directions end.
Bool JointWeightTable::CopyTo(JointWeightTable& destination) const
{
  if (&destination == this)
    return true;
  if (this < &destination) {
    ReadGuard source(lock_);
    WriteGuard target(destination.lock_);
    return CopyContent(destination);
  }
  WriteGuard target(destination.lock_);
  ReadGuard source(lock_);
  return CopyContent(destination);
}

Bool JointWeightTable::CopyContent(JointWeightTable& destination) const
{
  destination.edited_ = edited_;
  return runs_.CopyTo(destination.runs_) && list_.CopyTo(destination.list_) && pages_.CopyTo(destination.pages_);
}

void JointWeightTable::Flush()
{
  WriteGuard guard(lock_);
  FlushContent();
}

void JointWeightTable::FlushContent()
{
  runs_.Flush();
  list_.Flush();
  pages_.Flush();
  edited_ = false;
}

} // namespace _torvane_
