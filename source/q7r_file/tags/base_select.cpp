#include "torvane/tags/base_select.h"

#include "k2v_file/stream/counted_records.h"
#include "k2v_file/stream/value_forms.h"
#include "torvane/bytes/base_file.h"
#include "torvane/memory/owned.h"
#include "torvane/memory/private_ge_mtools.h"

namespace _torvane_
{

namespace
{

constexpr LLong kSegmentSize = sizeof(SelectSegment);
constexpr LLong kStoredPairSize = 8; // two numbers
constexpr LLong kStoredRecordSize = StoredSize(kTagLong, kTagLong);
static_assert(kStoredRecordSize == 10);

template <class Visitor, class Segment>
Bool VisitSegment(Visitor& v, Segment& segment)
{
  v.Long(segment.first);
  v.Long(segment.last);
  return v.Good();
}

Bool IsInOrder(const SelectSegment* segments, Long count)
{
  LLong before = -2; // the last number of the segment before; a gap must follow
  for (Long i = 0; i < count; ++i) {
    if (segments[i].first <= before + 1 || segments[i].last < segments[i].first)
      return false;
    before = segments[i].last;
  }
  return true;
}

class ByFirstNumber : public GeSortAndSearch
{
 public:
  Long Compare(const void* a, const void* b) override
  {
    const Long first = static_cast<const SelectSegment*>(a)->first;
    const Long second = static_cast<const SelectSegment*>(b)->first;
    return first < second ? -1 : static_cast<Long>(first > second);
  }
};

// The places where membership changes, in order: each segment's first number, and the number behind its last.
class BorderWalk
{
 public:
  BorderWalk(const SelectSegment* segments, Long count) : next_(segments), end_(segments + count) {}

  static constexpr LLong kEnd = INT64_MAX;

  Bool IsInside() const { return inside_; }
  LLong GetBorder() const
  {
    if (next_ == end_)
      return kEnd;
    return inside_ ? LLong{next_->last} + 1 : LLong{next_->first};
  }
  void PassBorderAt(LLong place)
  {
    if (GetBorder() != place)
      return;
    if (inside_)
      ++next_;
    inside_ = !inside_;
  }

 private:
  const SelectSegment* next_; // that the walk is in or comes to next
  const SelectSegment* end_;
  Bool inside_ = false;
};

// Calls `emit` with each run of numbers that `rule` selects.
template <class Emit>
void EmitRuns(BorderWalk here, BorderWalk there, Bool (*rule)(Bool, Bool), Emit&& emit)
{
  LLong start = -1; // of the run that the walk is in
  while (true) {
    const LLong a = here.GetBorder();
    const LLong b = there.GetBorder();
    const LLong place = a < b ? a : b;
    if (place == BorderWalk::kEnd)
      return;
    here.PassBorderAt(place);
    there.PassBorderAt(place);
    const Bool inside = rule(here.IsInside(), there.IsInside());
    if (inside && start < 0) {
      start = place;
    } else if (!inside && start >= 0) {
      emit(SelectSegment{static_cast<Long>(start), static_cast<Long>(place - 1)});
      start = -1;
    }
  }
}

} // namespace

// First the hint of the lookup before, then a search by halves.
Bool BaseSelect::FindSegment(Long n, Long& index) const
{
  index = -1;
  if (!segments_)
    return false;
  const Long next = lastHit_ + 1;
  if (next <= segmentCount_ && n >= segments_[lastHit_].first && (next == segmentCount_ || n < segments_[next].first)) {
    index = lastHit_;
    if (next < segmentCount_ && n >= segments_[next].first - 1)
      lastHit_ = next;
    return n <= segments_[index].last;
  }
  if (n < segments_[0].first)
    return false;
  Long low = 0;
  Long high = segmentCount_ - 1;
  while (low < high && n > segments_[low].last) {
    const Long middle = low + (high - low + 1) / 2;
    if (n < segments_[middle].first)
      high = middle - 1;
    else
      low = middle;
  }
  index = low;
  lastHit_ = low;
  return n <= segments_[low].last;
}

// Puts segments in the place of others, in a new array of just the size.
Bool BaseSelect::Splice(Long index, Long removed, const SelectSegment* added, Long addedCount)
{
  const Long count = segmentCount_ - removed + addedCount;
  SelectSegment* segments = nullptr;
  if (count > 0) {
    segments = static_cast<SelectSegment*>(GeAllocNC(count * kSegmentSize));
    if (!segments)
      return false;
    const Long behind = index + removed;
    GeCopyMem(segments, segments_, index * kSegmentSize);
    GeCopyMem(segments + index, added, addedCount * kSegmentSize);
    GeCopyMem(segments + index + addedCount, segments_ + behind, (segmentCount_ - behind) * kSegmentSize);
  }
  Replace(segments, count);
  return true;
}

void BaseSelect::Replace(SelectSegment* segments, Long count)
{
  GeFree(segments_);
  segments_ = segments;
  segmentCount_ = count;
  ++changeCount_;
}

Bool BaseSelect::SelectAdd(Long n)
{
  Long before = -1;
  if (n < 0 || FindSegment(n, before))
    return true;
  const Long after = before + 1;
  const Bool touchesBefore = before >= 0 && segments_[before].last == n - 1;
  const Bool touchesAfter = after < segmentCount_ && segments_[after].first - 1 == n;
  if (touchesBefore && touchesAfter) {
    const SelectSegment joined = {segments_[before].first, segments_[after].last};
    return Splice(before, 2, &joined, 1);
  }
  if (!touchesBefore && !touchesAfter) {
    const SelectSegment single = {n, n};
    return Splice(after, 0, &single, 1);
  }
  if (touchesBefore)
    segments_[before].last = n;
  else
    segments_[after].first = n;
  ++changeCount_;
  return true;
}

Bool BaseSelect::SelectRemove(Long n)
{
  Long index = -1;
  if (!FindSegment(n, index))
    return true;
  SelectSegment& segment = segments_[index];
  if (segment.first == segment.last)
    return Splice(index, 1, nullptr, 0);
  if (n > segment.first && n < segment.last) {
    const SelectSegment halves[] = {{segment.first, n - 1}, {n + 1, segment.last}};
    return Splice(index, 1, halves, 2);
  }
  if (n == segment.first)
    ++segment.first;
  else
    --segment.last;
  ++changeCount_;
  return true;
}

Bool BaseSelect::SelectToggle(Long n) { return IsSelected(n) ? SelectRemove(n) : SelectAdd(n); }

Bool BaseSelect::SelectAll(Long first, Long last)
{
  const SelectSegment segment = {first < 0 ? 0 : first, last};
  return Splice(0, segmentCount_, &segment, segment.last < segment.first ? 0 : 1);
}

Bool BaseSelect::SelectNone()
{
  Replace(nullptr, 0);
  return true;
}

// Walks through both sets twice: once to count the segments of the result, once to store them.
Bool BaseSelect::Combine(const SelectSegment* others, Long otherCount, Rule rule)
{
  if (otherCount == 0)
    return true;
  const BorderWalk here(segments_, segmentCount_);
  const BorderWalk there(others, otherCount);
  Long count = 0;
  EmitRuns(here, there, rule, [&](const SelectSegment&) { ++count; });
  SelectSegment* segments = nullptr;
  if (count > 0) {
    segments = static_cast<SelectSegment*>(GeAllocNC(count * kSegmentSize));
    if (!segments)
      return false;
    SelectSegment* place = segments;
    EmitRuns(here, there, rule, [&](const SelectSegment& segment) { *place++ = segment; });
  }
  Replace(segments, count);
  return true;
}

Bool BaseSelect::SelectMerge(const BaseSelect& other)
{
  return Combine(other.segments_, other.segmentCount_, [](Bool here, Bool there) { return here || there; });
}

Bool BaseSelect::SelectDeselect(const BaseSelect& other)
{
  return Combine(other.segments_, other.segmentCount_, [](Bool here, Bool there) { return here && !there; });
}

Bool BaseSelect::SelectToggleRange(Long first, Long last)
{
  const SelectSegment range = {first < 0 ? 0 : first, last};
  return Combine(&range, range.last < range.first ? 0 : 1, [](Bool here, Bool there) { return here != there; });
}

LLong BaseSelect::SelectedCount() const
{
  LLong sum = 0;
  for (Long i = 0; i < segmentCount_; ++i)
    sum += LLong{segments_[i].last} - segments_[i].first + 1;
  return sum;
}

Bool BaseSelect::GetSegment(Long index, Long* first, Long* last) const
{
  if (index < 0 || index >= segmentCount_)
    return false;
  if (first)
    *first = segments_[index].first;
  if (last)
    *last = segments_[index].last;
  return true;
}

// What a file holds may be in any order and may overlap; lookups need the order.
void BaseSelect::BringIntoOrder()
{
  if (IsInOrder(segments_, segmentCount_))
    return;
  ByFirstNumber order;
  order.Sort(segments_, segmentCount_, static_cast<Long>(kSegmentSize));
  Long kept = 0;
  for (Long i = 0; i < segmentCount_; ++i) {
    SelectSegment segment = segments_[i];
    if (segment.first < 0)
      segment.first = 0;
    if (segment.last < segment.first)
      continue;
    if (kept > 0 && segment.first - 1 <= segments_[kept - 1].last) {
      if (segments_[kept - 1].last < segment.last)
        segments_[kept - 1].last = segment.last;
    } else {
      segments_[kept++] = segment;
    }
  }
  segmentCount_ = kept;
  if (kept == 0)
    GeFree(segments_);
  else if (void* smaller = GeRealloc(segments_, kept * kSegmentSize))
    segments_ = static_cast<SelectSegment*>(smaller);
}

Bool BaseSelect::AssignSegments(BaseFile* file, Long count)
{
  if (count <= 0)
    return SelectNone();
  if (file)
    return ReadSegments(*file, count);
  if (count == segmentCount_) {
    ++changeCount_;
    return true;
  }
  auto* segments = static_cast<SelectSegment*>(GeAlloc(count * kSegmentSize));
  if (!segments)
    return false;
  Replace(segments, count);
  return true;
}

Bool BaseSelect::ReadSegments(BaseFile& file, Long count)
{
  SelectNone();
  const LLong remaining = file.GetRemaining();
  if (remaining >= 0 && count > remaining / kStoredPairSize) {
    file.SetError(FILEERROR_READ);
    return false;
  }
  SelectSegment* segments = nullptr;
  Long capacity = 0;
  for (Long i = 0; i < count; ++i) {
    if (!MakeRoomForRecord(segments, capacity, i, count) || !file.ReadLong(segments[i].first) ||
        !file.ReadLong(segments[i].last)) {
      GeFree(segments);
      return false;
    }
  }
  Replace(segments, count);
  BringIntoOrder();
  return true;
}

Bool BaseSelect::CopySelect(BaseSelect& destination) const
{
  if (&destination == this)
    return true;
  destination.SelectNone();
  return destination.Splice(0, 0, segments_, segmentCount_);
}

BaseSelect* BaseSelect::CloneSelect() const
{
  Owned<BaseSelect> clone(NewObj<BaseSelect>());
  return clone && CopySelect(*clone) ? clone.release() : nullptr;
}

void BaseSelect::WriteChunks(HyperFile& file)
{
  WriteChunk(file, kChunkSelect, kLevelSelect, [this](ChunkWriter& v) {
    v.Long(segmentCount_);
    for (Long i = 0; i < segmentCount_; ++i)
      VisitSegment(v, segments_[i]);
  });
}

Bool BaseSelect::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (id != kChunkSelect || level < 0)
    return false;
  SelectNone();
  return ReadChunkBody(file, level, [this](ChunkReader& v) {
    Long count = 0;
    v.Long(count);
    SelectSegment* segments = nullptr;
    Long read = 0;
    ReadRecords(v, count, kStoredRecordSize, segments, read, VisitSegment<ChunkReader, SelectSegment>);
    if (!v.Good()) {
      GeFree(segments);
      return;
    }
    Replace(segments, count);
    BringIntoOrder();
  });
}

} // namespace _torvane_
