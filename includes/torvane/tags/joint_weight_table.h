// The weights with which one joint moves the points of an object: a number from 0 to 1 for each point, most of them 0.
#pragma once

#include "torvane/memory/private_ge_mtools.h"
#include "torvane/memory/spin_lock.h"
#include "torvane/types.h"

namespace _torvane_
{

class HyperFile;

// A list of numbers that stands in joint records and in weight tables. Nothing here uses it: it is kept.
struct JointPairList
{
  ULong head[3] = {0, 0, 0};
  Long tail = 0;
  GeTempDynArray<Long> values;

  Bool Read(HyperFile& file);
  Bool Write(HyperFile& file) const;
  // False when memory is short: the destination then holds a part.
  Bool CopyTo(JointPairList& destination) const;
  void Flush();
};

// Consecutive points that have a weight, from the first to the last. Their values stand one behind the other.
struct WeightRun
{
  Long first;
  Long last;
  Long offset; // of the first value
};

// Runs in the order of their points, and the values of all of them: what a table holds, without its lock.
class WeightRuns
{
 public:
  Long GetRunCount() const { return runs_.GetCount(); }
  const WeightRun& GetRun(Long index) const { return runs_[index]; }
  // The number of points in all runs.
  LLong GetWeightCount() const;

  // The value of a point; 0 outside of all runs.
  UWord Get(Long point) const;
  // 0 takes the point out of the runs. False, with nothing changed, when memory is short.
  Bool Set(Long point, UWord value);
  // Takes over the values of the points 0 to count - 1. False when memory is short: it then holds a part.
  Bool SetAll(const UWord* values, Long count);
  // Writes the values of all runs into an array of `count` points; those beyond it are left out.
  void GetAll(UWord* values, Long count) const;
  // One behind the last point that has a weight.
  LLong GetEnd() const { return runs_.GetCount() > 0 ? LLong{runs_[runs_.GetCount() - 1].last} + 1 : 0; }

  Bool CopyTo(WeightRuns& destination) const;
  void Flush();

 private:
  friend class JointWeightTable;

  template <class Visitor, class Runs>
  static Bool VisitRuns(Visitor& visitor, Runs& runs);
  template <class Visitor, class Runs>
  static Bool VisitValues(Visitor& visitor, Runs& runs);
  Bool AreSound() const;
  Bool ArePacked() const;
  Bool Pack();
  Long FindRun(Long point) const;
  Bool Insert(Long run, Long point, UWord value);
  Bool Remove(Long run, Long point);
  void Renumber(Long run);

  Long head_[2] = {0, 0}; // stands before the runs in a file; kept
  GeTempDynArray<WeightRun> runs_;
  GeTempDynArray<UWord> values_;
  Bool packed_ = true; // the values stand in the order of the runs, without gaps
};

// The table of one joint. Every operation may be called on any thread at any time: those that read hold the reader
// side of the table's lock, the others the writer side. In use elsewhere a table must not be destroyed.
class JointWeightTable
{
 public:
  JointWeightTable() = default;
  JointWeightTable(const JointWeightTable&) = delete; // use CopyTo
  JointWeightTable& operator=(const JointWeightTable&) = delete;

  // The weight of a point, 0.0 to 1.0; 0.0 for a point that has none, and for a negative number.
  Real ReadPointWeight(Long point) const;
  // Stores a weight in steps of 1/65535, at least 0.0 and at most 1.0; a NaN counts as 0.0. What rounds to 0 takes the
  // point out. False, with nothing changed, for a negative point and when memory is short.
  Bool WritePointWeight(Long point, Real weight);
  // The number of points that have a weight, and of runs; while a table is edited as of the beginning.
  Long GetWeightCount() const;
  Long GetRunCount() const;
  // False for an index out of range.
  Bool GetRun(Long index, WeightRun& run) const;

  // Between the two the weights stand in a dense table of at least `pointCount` points, which makes writing any of
  // them quick. False when memory is short: beginning then changes nothing, and ending leaves the dense table.
  Bool BeginEdit(Long pointCount);
  Bool EndEdit();
  Bool IsEdited() const;

  // The values of a file. Reading replaces the content, and leaves nothing when it fails.
  Bool Read(HyperFile& file);
  Bool Write(HyperFile& file) const;
  // Locks both tables. False when memory is short: the destination then holds a part.
  Bool CopyTo(JointWeightTable& destination) const;
  void Flush();

 private:
  Bool ReadContent(HyperFile& file);
  Bool WriteContent(HyperFile& file, const WeightRuns& runs) const;
  Bool CopyContent(JointWeightTable& destination) const;
  void FlushContent();

  mutable ReadWriteSpinLock lock_;
  WeightRuns runs_;
  JointPairList list_;
  GeTempDynArray<UWord> dense_; // while edited: what counts
  Bool edited_ = false;
};

} // namespace _torvane_
