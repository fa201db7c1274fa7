#include "q7r_smart_link/trunk_page.h"
#include "torvane/links/alias.h"
#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

constexpr const char* kModule = "q7r_smart_link";
// What readers of the log know these reports by.
constexpr Long kLineOfGoal = 794;
constexpr Long kLineOfLink = 843;
// Pages are made from this count of trunks on. One stays as long as any trunk in it: too much for what is copied alone.
constexpr LLong kFewTrunks = 256;
// A larger id wasn't counted but is, say, an address.
constexpr GeAliasID kCountedIds = 1 << 23;
constexpr GeAliasID kLeafEntries = 64;
constexpr GeAliasID kLeafIds = kLeafEntries * TrunkPage::kTrunks;
constexpr GeAliasID kLeaves = kCountedIds / kLeafIds;

// A zeroed array; null when memory is short.
template <class T>
T* NewArray(GeAliasID count)
{
  // NOLINTNEXTLINE(bugprone-sizeof-expression): T may be a pointer
  return static_cast<T*>(GeAlloc(static_cast<LLong>(count * sizeof(T))));
}

} // namespace

TrunkPage* TrunkPage::Make()
{
  constexpr LLong kSize = static_cast<LLong>(sizeof(TrunkPage) + kTrunks * sizeof(AliasTrunk));
  void* place = GeAllocNC(kSize);
  return place ? ::new (place) TrunkPage{0} : nullptr;
}

void AliasTrunk::Delete(AliasTrunk* trunk)
{
  if (!trunk || !trunk->inPage) {
    DeleteObj(trunk);
    return;
  }
  TrunkPage* page = reinterpret_cast<TrunkPage*>(trunk - trunk->place) - 1;
  trunk->~AliasTrunk();
  if (--page->live == 0)
    GeFree(page);
}

// The entry of the page that an id belongs to, or null.
TransArray::Entry* TransArray::FindEntry(GeAliasID id) const
{
  static_assert(8 * sizeof(Entry::made) == TrunkPage::kTrunks, "a bit for each trunk");
  Entry* leaf = leaves_ && id < kCountedIds ? leaves_[id / kLeafIds] : nullptr;
  return leaf ? leaf + id / TrunkPage::kTrunks % kLeafEntries : nullptr;
}

// The same, with a page in it; null when memory is short.
TransArray::Entry* TransArray::NeedEntry(GeAliasID id)
{
  if (!leaves_)
    leaves_ = NewArray<Entry*>(kLeaves);
  if (leaves_ && !leaves_[id / kLeafIds])
    leaves_[id / kLeafIds] = NewArray<Entry>(kLeafEntries);
  Entry* entry = FindEntry(id);
  if (entry && !entry->page)
    entry->page = TrunkPage::Make();
  return entry && entry->page ? entry : nullptr;
}

// The trunk of an id; a new one for `goal`. Null, with nothing changed, when memory is short.
AliasTrunk* TransArray::NeedTrunk(GeAliasID id, GeAliasGoal& goal)
{
  const Entry* entry = FindEntry(id);
  const ULong place = id % TrunkPage::kTrunks;
  return entry && entry->IsMade(place) ? entry->page->Trunks() + place : FindOrMakeTrunk(id, goal);
}

// The same for one that isn't in a page yet.
AliasTrunk* TransArray::FindOrMakeTrunk(GeAliasID id, GeAliasGoal& goal)
{
  if (AliasTrunk* trunk = single_.Find(id))
    return trunk;
  AliasTrunk* trunk = nullptr;
  if (count_ < kFewTrunks || id >= kCountedIds) {
    trunk = NewObj<AliasTrunk>(goal, ids_.Take());
    if (trunk && !single_.Add(id, *trunk))
      DeleteObj(trunk);
  } else if (Entry* entry = NeedEntry(id)) {
    const ULong place = id % TrunkPage::kTrunks;
    entry->SetMade(place);
    trunk = ::new (static_cast<void*>(entry->page->Trunks() + place)) AliasTrunk(goal, ids_.Take());
    trunk->place = place % TrunkPage::kTrunks;
    trunk->inPage = 1;
  }
  if (!trunk)
    return nullptr;
  trunk->inTranslation = 1;
  ++count_;
  return trunk;
}

Bool TransArray::RegisterGoal(GeAliasID id, GeAliasGoal& goal)
{
  goal.DropLinks();
  if (id == 0)
    return true;
  AliasTrunk* trunk = NeedTrunk(id, goal);
  if (!trunk)
    return false;
  if (!trunk->goal) {
    ReportAssertion(kModule, kLineOfGoal, "the goal of this id has gone");
    return true;
  }
  trunk->goal->trunk = nullptr;
  trunk->goal = &goal;
  goal.trunk = trunk;
  return true;
}

Bool TransArray::RegisterLink(GeAliasID id, GeAliasLink& link, GeAliasGoal* sourceGoal)
{
  AliasTrunk* source = sourceGoal ? sourceGoal->NeedTrunk() : nullptr;
  return Register(id, link, source) && (source || !sourceGoal);
}

Bool TransArray::RegisterCopy(const GeAliasLink& source, GeAliasLink& copy)
{
  return Register(source.GetTargetId(), copy, source.GetTrunk());
}

Bool TransArray::Register(GeAliasID id, GeAliasLink& link, AliasTrunk* source)
{
  link.ClearLink();
  if (id == 0)
    return true;
  AliasTrunk* trunk = NeedTrunk(id, awaited_);
  if (!trunk)
    return false;
  if (!trunk->goal) {
    ReportAssertion(kModule, kLineOfLink, "the goal of this id has gone");
    return true;
  }
  // Asked first, so that a load needn't wait for the trunk to come out of memory before it goes on with what follows.
  const Bool mayHaveOrigin = source || !origins_.IsEmpty();
  return link.SetTrunk(trunk) && (!mayHaveOrigin || trunk->goal != &awaited_ || SetOrigin(id, source));
}

// What the links that wait under this id go back to; null for nothing. False when memory is short.
Bool TransArray::SetOrigin(GeAliasID id, AliasTrunk* source)
{
  GeAliasXLink* origin = origins_.Find(id);
  if (!source) {
    if (origin)
      origin->Detach();
    return true;
  }
  if (!origin) {
    origin = NewObj<GeAliasXLink>();
    if (origin && !origins_.Add(id, *origin))
      DeleteObj(origin);
    if (!origin)
      return false;
  }
  origin->Attach(*source);
  return true;
}

void TransArray::ReturnToOrigins()
{
  using Origin = IdTable<GeAliasXLink>::Slot;
  // In the order of the ids: it is also the order in which links enter the list of a common target.
  class ById : public GeSortAndSearch
  {
    Long Compare(const void* a, const void* b) override
    {
      const GeAliasID left = static_cast<const Origin*>(a)->id;
      const GeAliasID right = static_cast<const Origin*>(b)->id;
      return left < right ? -1 : left > right ? 1 : 0;
    }
  };
  // To the front, where they need no place of their own any more.
  Origin* end = origins_.begin();
  for (Origin& origin : origins_) {
    if (origin.item && origin.item->trunk && NeedTrunk(origin.id, awaited_)->goal == &awaited_)
      std::swap(*end++, origin);
  }
  ById().Sort(origins_.begin(), static_cast<Long>(end - origins_.begin()), static_cast<Long>(sizeof(Origin)));
  for (Origin* origin = origins_.begin(); origin != end; ++origin)
    NeedTrunk(origin->id, awaited_)->MoveLinksTo(*origin->item->trunk);
}

void TransArray::FinishTranslation(Bool keepToOrigin)
{
  if (keepToOrigin)
    ReturnToOrigins();
  for (auto& [id, origin] : origins_)
    DeleteObj(origin);
  origins_.Clear();
  for (auto& [id, trunk] : single_) {
    if (trunk)
      Release(trunk);
  }
  single_.Clear();
  for (GeAliasID i = 0; leaves_ && i < kLeaves; ++i) {
    ReleaseLeaf(leaves_[i]);
    GeFree(leaves_[i]);
  }
  GeFree(leaves_);
  ids_.GiveBack();
  count_ = 0;
}

void TransArray::ReleaseLeaf(Entry* leaf)
{
  for (Entry* entry = leaf; leaf && entry != leaf + kLeafEntries; ++entry) {
    if (!entry->page)
      continue;
    entry->page->live = 1; // it stays until all are told
    for (ULong place = 0; place < TrunkPage::kTrunks; ++place) {
      if (!entry->IsMade(place))
        continue;
      ++entry->page->live;
      Release(entry->page->Trunks() + place);
    }
    if (--entry->page->live == 0)
      GeFree(entry->page);
  }
}

// The translation leads to the trunk no more: without a goal it goes.
void TransArray::Release(AliasTrunk* trunk)
{
  trunk->inTranslation = 0;
  if (!trunk->goal || trunk->goal == &awaited_)
    AliasTrunk::Delete(trunk);
}

// ---------------------------------------------------------------------------------------------------------------

Bool AliasTranslator::MakeTranslator()
{
  if (!array_)
    array_ = NewObj<TransArray>();
  return array_ != nullptr;
}

void AliasTranslator::Finish(Bool keepToOrigin)
{
  if (array_)
    array_->FinishTranslation(keepToOrigin);
  DeleteObj(array_);
}

} // namespace _torvane_
