#include "torvane/tags/joint_weight_table.h"

#include "k2v_file/memory/count_before.h"

namespace _torvane_
{

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
  return CountBefore(runs_.GetCount(), [&](Long run) { return runs_[run].last < point; });
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

} // namespace _torvane_
