// The weights with which one joint moves the points of an object: a number from 0 to 1 for each point, most of them 0.
#pragma once

#include "torvane/memory/private_ge_mtools.h"
#include "torvane/memory/spin_lock.h"
#include "torvane/stream/chunk_fields.h"
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
  // Adds a point behind all that have a weight; one without a weight does nothing. False when memory is short.
  Bool Append(Long point, UWord value);
  // Empties the runs; what else they hold stays.
  void Reset();

  Bool CopyTo(WeightRuns& destination) const;
  void Flush();

 private:
  friend class JointWeightTable;
  friend struct ChunkFields<WeightRuns>;

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

// The weights of a table that is edited: pages of consecutive points in the order of their points. A page is made with
// the first weight on it.
class WeightPages
{
 public:
  WeightPages() = default;
  ~WeightPages() { Flush(); }
  WeightPages(const WeightPages&) = delete; // use CopyTo
  WeightPages& operator=(const WeightPages&) = delete;

  // Room for the pages of so many points. False when memory is short.
  Bool Reserve(Long pointCount) { return pointCount <= 0 || pages_.Reserve((pointCount - 1) / kPageSize + 1); }
  UWord Get(Long point) const;
  // False, with nothing changed, when memory is short.
  Bool Set(Long point, UWord value);
  // False when memory is short: the destination then holds a part.
  Bool Take(const WeightRuns& runs);
  Bool Give(WeightRuns& runs) const;
  Bool CopyTo(WeightPages& destination) const;
  void Flush();

 private:
  static constexpr Long kPageSize = 512; // points

  struct Page
  {
    Long number;
    UWord* values; // owned
  };

  Long FindPage(Long number) const;
  Page* NeedPage(Long number);

  GeTempDynArray<Page> pages_;
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

  // Between the two the weights stand in pages, which makes writing any of them quick; there is room for `pointCount`
  // points at once. False when memory is short: beginning then changes nothing, and ending leaves the pages.
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
  WeightPages pages_; // while edited: what counts
  Bool edited_ = false;
};

} // namespace _torvane_
