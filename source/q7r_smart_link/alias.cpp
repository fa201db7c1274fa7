#include "torvane/links/alias.h"

#include <atomic>
#include <cstring>

#include "k2v_file/stream/value_forms.h"
#include "torvane/memory/owned.h"
#include "torvane/nodes/private_chunk.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/time/reproducible_run.h"

namespace _torvane_
{

namespace
{

// The two blocks that stand for links and goals in a file.
constexpr char kLinkMark[] = {'a', 'l', 'i', 'a', 's', '2'};
constexpr char kGoalMark[] = {'a', 'g', 'o', 'a', 'l', '1'};
constexpr LLong kMarkSize = 6;
constexpr LLong kRecordSize = kMarkSize + static_cast<LLong>(sizeof(GeAliasID));
constexpr LLong kNameLengthSize = 4;
constexpr LLong kValueHead = StoredSize(kTagMemory); // in front of a record

constexpr GeAliasID kLot = 64; // of numbers
std::atomic<GeAliasID> gNextTrunkId{1};

// What FirstLinkOfGoal gives for a link without an owner.
constexpr struct EmptyOwner
{
} kEmptyOwner;

void PutRecord(UChar (&record)[kRecordSize], const char (&mark)[kMarkSize], GeAliasID id)
{
  std::memcpy(record, mark, kMarkSize);
  std::memcpy(record + kMarkSize, &id, sizeof id); // in memory order, as readers take it
}

Bool GetRecord(const void* block, LLong size, const char (&mark)[kMarkSize], GeAliasID& id)
{
  if (size < kRecordSize || std::memcmp(block, mark, kMarkSize) != 0)
    return false;
  std::memcpy(&id, static_cast<const UChar*>(block) + kMarkSize, sizeof id);
  return true;
}

// A Memory value that was read. One of a record's size, as nearly all are, needs no block when it lies in the file's
// buffer.
class ReadRecord
{
 public:
  explicit ReadRecord(HyperFile& file)
  {
    const UChar* next = file.GetFile().ReadWindow(kValueHead + kRecordSize);
    if (next && next[0] == kTagMemory && bytes::GetBig<ULong>(next + 1) == kRecordSize)
      bytes_ = file.ReadMemoryInto(record_, kRecordSize, size_) ? record_ : nullptr;
    else if (file.ReadMemory(block_, size_))
      bytes_ = static_cast<const UChar*>(block_);
  }
  ~ReadRecord() { GeFree(block_); }
  ReadRecord(const ReadRecord&) = delete;
  ReadRecord& operator=(const ReadRecord&) = delete;

  const UChar* Bytes() const { return bytes_; } // null after a failure and for an empty value
  LLong Size() const { return size_; }

 private:
  UChar record_[kRecordSize];
  void* block_ = nullptr;
  const UChar* bytes_ = nullptr;
  LLong size_ = 0;
};

// Gives `done` back; a failure is one of memory and becomes the file's error.
Bool CheckMemory(HyperFile& file, Bool done)
{
  if (!done)
    file.SetError(FILEERROR_MEMORY);
  return done;
}

} // namespace

// ---------------------------------------------------------------------------------------------------------------

GeAliasXLink::~GeAliasXLink()
{
  Detach();
  DeleteObj(name);
}

void GeAliasXLink::Attach(AliasTrunk& target)
{
  Detach();
  target.xlinks.InsertLast(this);
  trunk = &target;
}

void GeAliasXLink::Detach()
{
  if (!trunk)
    return;
  for (GoalIterator* iterator = trunk->iterators; iterator; iterator = iterator->sibling_) {
    if (iterator->next_ == this)
      iterator->next_ = GetNext();
  }
  Remove();
  trunk = nullptr;
}

GeAliasGoal* GeAliasXLink::GetGoal() const { return trunk ? trunk->goal : nullptr; }

GeAliasID TrunkIds::TakeOne()
{
  ReproducibleRun* run = ReproducibleRun::GetCurrent();
  return run ? run->TakeLinkId() : gNextTrunkId.fetch_add(1, std::memory_order_relaxed);
}

GeAliasID TrunkIds::Take()
{
  if (ReproducibleRun* run = ReproducibleRun::GetCurrent())
    return run->TakeLinkId();
  if (next_ == end_) {
    next_ = gNextTrunkId.fetch_add(kLot, std::memory_order_relaxed);
    end_ = next_ + kLot;
  }
  return next_++;
}

void TrunkIds::GiveBack()
{
  GeAliasID end = end_;
  if (next_ < end_)
    gNextTrunkId.compare_exchange_strong(end, next_, std::memory_order_relaxed);
  next_ = end_ = 0;
}

AliasTrunk::AliasTrunk(GeAliasGoal& trunkGoal, GeAliasID trunkId)
    : goal(&trunkGoal), id(trunkId & ((GeAliasID{1} << kIdBits) - 1)), inTranslation(0), inPage(0), place(0)
{}

void AliasTrunk::Empty()
{
  while (iterators)
    iterators->Leave();
  while (GeAliasXLink* xlink = xlinks.GetFirst())
    xlink->Detach();
}

void AliasTrunk::MoveLinksTo(AliasTrunk& destination)
{
  while (GeAliasXLink* xlink = xlinks.GetFirst())
    xlink->Attach(destination);
}

void GoalIterator::Enter(AliasTrunk& trunk)
{
  trunk_ = &trunk;
  next_ = trunk.xlinks.GetFirst();
  sibling_ = trunk.iterators;
  trunk.iterators = this;
}

void GoalIterator::Leave()
{
  if (trunk_) {
    GoalIterator** place = &trunk_->iterators;
    while (*place != this)
      place = &(*place)->sibling_;
    *place = sibling_;
  }
  trunk_ = nullptr;
  next_ = nullptr;
  sibling_ = nullptr;
}

// ---------------------------------------------------------------------------------------------------------------

GeAliasLink::~GeAliasLink() { DeleteObj(xlink_); }

// Made if there is none; null when memory is short.
GeAliasXLink* GeAliasLink::NeedXLink()
{
  if (!xlink_)
    xlink_ = NewObj<GeAliasXLink>();
  return xlink_;
}

// Gives back what holds nothing any more.
void GeAliasLink::DropXLink()
{
  if (xlink_ && !xlink_->trunk && !xlink_->owner && !xlink_->name)
    DeleteObj(xlink_);
}

void GeAliasLink::SetLink(GeListNode* node) { SetLinkGoal(node ? &node->GetGoal() : nullptr); }

Bool GeAliasLink::SetLinkGoal(GeAliasGoal* goal)
{
  AliasTrunk* trunk = goal ? goal->NeedTrunk() : nullptr;
  return SetTrunk(trunk) && (trunk || !goal);
}

// Goes to the end of its list; null clears. False when memory is short: the link is empty then.
Bool GeAliasLink::SetTrunk(AliasTrunk* trunk)
{
  if (!trunk || !NeedXLink()) {
    ClearLink();
    return !trunk;
  }
  xlink_->Attach(*trunk);
  return true;
}

GeListNode* GeAliasLink::GetLink() const
{
  GeAliasGoal* goal = GetLinkGoal();
  return goal && goal->IsResolvable() ? goal->node : nullptr;
}

GeAliasGoal* GeAliasLink::GetLinkGoal() const { return xlink_ ? xlink_->GetGoal() : nullptr; }

GeAliasID GeAliasLink::GetTargetId() const
{
  const AliasTrunk* trunk = GetTrunk();
  return trunk ? trunk->id : 0;
}

void GeAliasLink::ClearLink()
{
  if (xlink_)
    xlink_->Detach();
  DropXLink();
}

void GeAliasLink::SetLinkOwner(void* owner)
{
  if (owner ? NeedXLink() : xlink_)
    xlink_->owner = owner;
  DropXLink();
}

void GeAliasLink::SetName(const String& name)
{
  String* copy = name.Content() ? NewObj<String>(name) : nullptr;
  if (copy ? NeedXLink() : xlink_)
    std::swap(xlink_->name, copy);
  DeleteObj(copy);
  DropXLink();
}

GeAliasLink* GeAliasLink::CloneLink(TransArray* translation) const
{
  Owned<GeAliasLink> clone(NewObj<GeAliasLink>());
  return clone && CopyLinkTo(clone.get(), translation) ? clone.release() : nullptr;
}

Bool GeAliasLink::CopyLinkTo(GeAliasLink* destination, TransArray* translation) const
{
  if (!destination || destination == this)
    return true;
  const Bool done = translation ? translation->RegisterCopy(*this, *destination) : destination->SetTrunk(GetTrunk());
  const String* name = GetName();
  const Bool named = name && name->Content();
  destination->SetName(named ? *name : String());
  return done && (!named || (destination->GetName() && destination->GetName()->Content()));
}

Bool GeAliasLink::WriteLink(HyperFile& file) const
{
  UChar record[kRecordSize];
  PutRecord(record, kLinkMark, GetTargetId());
  const String* name = GetName();
  const Long room = name ? name->GetCStringLen() : 0;
  if (room <= 0)
    return file.WriteMemory(record, kRecordSize);

  constexpr LLong kNameOffset = kRecordSize + kNameLengthSize;
  const Owned<UChar> block(static_cast<UChar*>(GeAllocNC(kNameOffset + room + 1)));
  if (!block)
    return CheckMemory(file, false);
  const Long length = name->GetCString(reinterpret_cast<char*>(block.get()) + kNameOffset, room + 1);
  std::memcpy(block.get(), record, kRecordSize);
  bytes::PutBig(block.get() + kRecordSize, static_cast<ULong>(length));
  return file.WriteMemory(block.get(), kNameOffset + length);
}

// Takes the label out of the bytes behind the id. A length that reaches past them is cut to what is there.
Bool GeAliasLink::ReadName(const UChar* bytes, LLong size)
{
  if (size < kNameLengthSize)
    return true;
  LLong length = bytes::GetBig<ULong>(bytes);
  if (length > size - kNameLengthSize)
    length = size - kNameLengthSize;
  if (!NeedXLink())
    return false;
  if (!xlink_->name)
    xlink_->name = NewObj<String>();
  if (!xlink_->name)
    return false;
  xlink_->name->SetCString(reinterpret_cast<const char*>(bytes + kNameLengthSize), static_cast<Long>(length));
  return length == 0 || xlink_->name->Content();
}

Bool GeAliasLink::ReadLink(HyperFile& file)
{
  const ReadRecord record(file);
  if (!record.Bytes())
    return false;
  GeAliasID id = 0;
  if (!GetRecord(record.Bytes(), record.Size(), kLinkMark, id))
    return true;
  return CheckMemory(file, ReadName(record.Bytes() + kRecordSize, record.Size() - kRecordSize)) &&
         TakeTargetId(file, id);
}

Bool GeAliasLink::TakeTargetId(HyperFile& file, GeAliasID id)
{
  TransArray* translation = file.GetTranslator();
  return !translation || CheckMemory(file, translation->RegisterLink(id, *this, nullptr));
}

// ---------------------------------------------------------------------------------------------------------------

GeAliasGoal::~GeAliasGoal() { DropLinks(); }

AliasTrunk* GeAliasGoal::NeedTrunk()
{
  if (!trunk)
    trunk = NewObj<AliasTrunk>(*this, TrunkIds::TakeOne());
  return trunk;
}

void GeAliasGoal::DropLinks()
{
  AliasTrunk* old = std::exchange(trunk, nullptr);
  if (!old || !old->inTranslation) {
    AliasTrunk::Delete(old);
    return;
  }
  old->Empty();
  old->goal = nullptr;
}

Bool GeAliasGoal::HasLinks() const { return trunk && !trunk->xlinks.IsEmpty(); }

GeAliasID GeAliasGoal::GetGoalId() const { return HasLinks() ? trunk->id : 0; }

void* GeAliasGoal::FirstLinkOfGoal(GoalIterator& iterator, Long mode) const
{
  iterator.Leave();
  if (trunk)
    iterator.Enter(*trunk);
  return NextLinkOfGoal(iterator, mode);
}

void* GeAliasGoal::NextLinkOfGoal(GoalIterator& iterator, Long mode)
{
  GeAliasXLink* xlink = iterator.next_;
  if (!xlink) {
    iterator.Leave();
    return nullptr;
  }
  iterator.next_ = xlink->GetNext();
  if (mode != 0)
    return xlink->trunk->goal->node;
  return xlink->owner ? xlink->owner : const_cast<EmptyOwner*>(&kEmptyOwner);
}

void GeAliasGoal::MoveLinksTo(GeAliasGoal& destination)
{
  if (!trunk || &destination == this)
    return;
  // A destination that nothing points at yet takes over the whole trunk.
  if (!destination.trunk) {
    destination.trunk = trunk;
    destination.trunk->goal = &destination;
    trunk = nullptr;
    return;
  }
  trunk->MoveLinksTo(*destination.trunk);
  DropLinks();
}

Bool GeAliasGoal::CopyGoalTo(GeAliasGoal& destination, TransArray* translation) const
{
  return !translation || translation->RegisterGoal(GetGoalId(), destination);
}

Bool GeAliasGoal::WriteGoal(HyperFile& file) const
{
  UChar record[kRecordSize];
  PutRecord(record, kGoalMark, GetGoalId());
  return file.WriteMemory(record, kRecordSize);
}

Bool GeAliasGoal::ReadGoal(HyperFile& file)
{
  const ReadRecord record(file);
  if (!record.Bytes())
    return false;
  GeAliasID id = 0;
  if (record.Size() == kRecordSize)
    GetRecord(record.Bytes(), record.Size(), kGoalMark, id);
  TransArray* translation = file.GetTranslator();
  return !translation || CheckMemory(file, translation->RegisterGoal(id, *this));
}

} // namespace _torvane_
