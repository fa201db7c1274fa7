// The weights of a table while it is edited. A page is small enough for runs of single points, far apart in a small
// file, to ask for little memory.
#include "torvane/tags/joint_weight_table.h"

#include "k2v_file/memory/count_before.h"

namespace _torvane_
{

// The place of a page, or where it belongs.
Long WeightPages::FindPage(Long number) const
{
  return CountBefore(pages_.GetCount(), [&](Long place) { return pages_[place].number < number; });
}

// The page, made if there is none; null when memory is short.
WeightPages::Page* WeightPages::NeedPage(Long number)
{
  const Long place = FindPage(number);
  if (place < pages_.GetCount() && pages_[place].number == number)
    return &pages_[place];
  Page page{number, static_cast<UWord*>(GeAlloc(kPageSize * static_cast<LLong>(sizeof(UWord))))};
  if (page.values && pages_.Insert(place, page))
    return &pages_[place];
  GeFree(page.values);
  return nullptr;
}

UWord WeightPages::Get(Long point) const
{
  const Long place = FindPage(point / kPageSize);
  const Bool found = place < pages_.GetCount() && pages_[place].number == point / kPageSize;
  return found ? pages_[place].values[point % kPageSize] : UWord{0};
}

Bool WeightPages::Set(Long point, UWord value)
{
  if (value == 0 && Get(point) == 0)
    return true;
  Page* page = NeedPage(point / kPageSize);
  if (page)
    page->values[point % kPageSize] = value;
  return page != nullptr;
}

Bool WeightPages::Take(const WeightRuns& runs)
{
  for (Long i = 0; i < runs.GetRunCount(); ++i) {
    const WeightRun& run = runs.GetRun(i);
    for (LLong point = run.first; point <= run.last; ++point) {
      if (!Set(static_cast<Long>(point), runs.Get(static_cast<Long>(point))))
        return false;
    }
  }
  return true;
}

Bool WeightPages::Give(WeightRuns& runs) const
{
  runs.Reset();
  for (const Page& page : pages_) {
    for (Long i = 0; i < kPageSize; ++i) {
      if (!runs.Append(page.number * kPageSize + i, page.values[i]))
        return false;
    }
  }
  return true;
}

Bool WeightPages::CopyTo(WeightPages& destination) const
{
  destination.Flush();
  for (const Page& page : pages_) {
    Page* copy = destination.NeedPage(page.number);
    if (!copy)
      return false;
    GeCopyMem(copy->values, page.values, kPageSize * static_cast<LLong>(sizeof(UWord)));
  }
  return true;
}

void WeightPages::Flush()
{
  for (Page& page : pages_)
    GeFree(page.values);
  pages_.Flush();
}

} // namespace _torvane_
