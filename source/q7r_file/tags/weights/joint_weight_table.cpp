#include "torvane/tags/joint_weight_table.h"

#include "torvane/memory/owned.h"

#include <cmath>

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

// ---------------------------------------------------------------------------------------------------------------

namespace
{

LLong LengthOf(const WeightRun& run) { return LLong{run.last} - run.first + 1; }

} // namespace

LLong WeightRuns::GetWeightCount() const
{
  LLong count = 0;
  for (const WeightRun& run : runs_)
    count += LengthOf(run);
  return count;
}

// The first run that ends at the point or behind it, or the number of runs.
Long WeightRuns::FindRun(Long point) const
{
  Long low = 0;
  Long high = runs_.GetCount();
  while (low < high) {
    const Long middle = low + (high - low) / 2;
    if (runs_[middle].last < point)
      low = middle + 1;
    else
      high = middle;
  }
  return low;
}

UWord WeightRuns::Get(Long point) const
{
  const Long run = FindRun(point);
  if (run >= runs_.GetCount() || runs_[run].first > point)
    return 0;
  return values_[runs_[run].offset + (point - runs_[run].first)];
}

Bool WeightRuns::Set(Long point, UWord value)
{
  if (!packed_ && !Pack())
    return false;
  const Long run = FindRun(point);
  if (run >= runs_.GetCount() || runs_[run].first > point)
    return value == 0 || Insert(run, point, value);
  if (value == 0)
    return Remove(run, point);
  values_[runs_[run].offset + (point - runs_[run].first)] = value;
  return true;
}

// Brings the offsets from a run on into the order of the runs.
void WeightRuns::Renumber(Long run)
{
  for (; run < runs_.GetCount(); ++run)
    runs_[run].offset = run > 0 ? runs_[run - 1].offset + static_cast<Long>(LengthOf(runs_[run - 1])) : 0;
}

// A point before the run, which may touch it and the one before.
Bool WeightRuns::Insert(Long run, Long point, UWord value)
{
  const Long count = runs_.GetCount();
  const Bool lengthens = run > 0 && LLong{runs_[run - 1].last} + 1 == point;
  const Bool precedes = run < count && LLong{point} + 1 == runs_[run].first;
  const Long place = run < count ? runs_[run].offset : values_.GetCount();
  if (!values_.Insert(place, value))
    return false;
  if (lengthens && precedes) {
    runs_[run - 1].last = runs_[run].last;
    runs_.Remove(run);
  } else if (lengthens) {
    runs_[run - 1].last = point;
  } else if (precedes) {
    runs_[run].first = point;
  } else if (!runs_.Insert(run, {point, point, place})) {
    values_.Remove(place);
    return false;
  }
  Renumber(run);
  return true;
}

Bool WeightRuns::Remove(Long run, Long point)
{
  const WeightRun old = runs_[run];
  if (old.first < point && point < old.last) {
    if (!runs_.Insert(run + 1, {point + 1, old.last, 0}))
      return false;
    runs_[run].last = point - 1;
  } else if (old.first == old.last) {
    runs_.Remove(run);
  } else if (point == old.first) {
    ++runs_[run].first;
  } else {
    --runs_[run].last;
  }
  values_.Remove(old.offset + (point - old.first));
  Renumber(run);
  return true;
}

Bool WeightRuns::Append(Long point, UWord value)
{
  if (value == 0)
    return true;
  const Long place = values_.GetCount();
  if (!values_.Append(value))
    return false;
  WeightRun* last = runs_.GetCount() > 0 ? &runs_[runs_.GetCount() - 1] : nullptr;
  if (last && last->last + 1 == point) {
    last->last = point;
    return true;
  }
  if (runs_.Append({point, point, place}))
    return true;
  values_.Pop();
  return false;
}

void WeightRuns::Reset()
{
  runs_.Reset();
  values_.Reset();
  packed_ = true;
}

// Runs of a file: in order, without overlaps, with values of their own.
Bool WeightRuns::AreSound() const
{
  LLong end = 0;
  for (const WeightRun& run : runs_) {
    if (run.first < end || run.last < run.first || run.offset < 0 || run.offset + LengthOf(run) > values_.GetCount())
      return false;
    end = LLong{run.last} + 1;
  }
  return GetWeightCount() <= values_.GetCount();
}

Bool WeightRuns::ArePacked() const
{
  LLong offset = 0;
  for (const WeightRun& run : runs_) {
    if (run.offset != offset)
      return false;
    offset += LengthOf(run);
  }
  return offset == values_.GetCount();
}

// Brings the values into the order of the runs. A file may hold them otherwise; that stays so until a value changes.
Bool WeightRuns::Pack()
{
  GeTempDynArray<UWord> packed;
  if (!packed.Reserve(static_cast<Long>(GetWeightCount())))
    return false;
  for (const WeightRun& run : runs_) {
    const Long count = packed.GetCount();
    packed.SetCount(count + static_cast<Long>(LengthOf(run)));
    GeCopyMem(packed.Data() + count, values_.Data() + run.offset, LengthOf(run) * static_cast<LLong>(sizeof(UWord)));
  }
  // No more than there were: this takes no memory.
  values_.SetCount(packed.GetCount());
  GeCopyMem(values_.Data(), packed.Data(), packed.GetCount() * static_cast<LLong>(sizeof(UWord)));
  Renumber(0);
  packed_ = true;
  return true;
}

Bool WeightRuns::CopyTo(WeightRuns& destination) const
{
  destination.head_[0] = head_[0];
  destination.head_[1] = head_[1];
  destination.packed_ = packed_;
  return runs_.CopyTo(destination.runs_) && values_.CopyTo(destination.values_);
}

void WeightRuns::Flush()
{
  head_[0] = head_[1] = 0;
  runs_.Flush();
  values_.Flush();
  packed_ = true;
}

template <class Visitor, class Runs>
Bool WeightRuns::VisitRuns(Visitor& v, Runs& runs)
{
  Long count = runs.runs_.GetCount();
  v.Long(runs.head_[0]);
  v.Long(runs.head_[1]);
  v.Long(count);
  return v.Good() && (count == 0 || VisitElements(v, runs.runs_, count, kArrayLong, 3));
}

template <class Visitor, class Runs>
Bool WeightRuns::VisitValues(Visitor& v, Runs& runs)
{
  if (runs.runs_.GetCount() == 0)
    return v.Good();
  Long count = runs.values_.GetCount();
  return v.Long(count) && VisitElements(v, runs.values_, count, kArrayWord, 1);
}

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
  if (!WeightRuns::VisitRuns(reader, runs_) || !list_.Read(file) || !WeightRuns::VisitValues(reader, runs_))
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
  return WeightRuns::VisitRuns(writer, runs) && list_.Write(file) && WeightRuns::VisitValues(writer, runs);
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
