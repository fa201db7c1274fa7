// Persistent references between nodes. A node owns a GeAliasGoal; a reference is a GeAliasLink; the two meet in a
// shared, hidden AliasTrunk, so that a link survives the deletion of its target (it becomes empty), a write and read
// of the document, and a copy of part of the tree. A TransArray carries the ids of goals and links across a read or a
// copy and resolves them in whatever order they turn up.
//
// None of this is locked: a document with its links belongs to one thread at a time.
#pragma once

#include "torvane/links/id_table.h"
#include "torvane/memory/memory.h"
#include "torvane/memory/private_ge_mtools.h"
#include "torvane/text/ge_string.h"
#include "torvane/types.h"

namespace _torvane_
{

class GeAliasGoal;
class GeListNode;
class HyperFile;
class TransArray;
struct AliasTrunk;
struct TrunkPage;

// What a link that isn't empty has: its place in the list of a trunk, and what travels with it.
class GeAliasXLink : public GeTempPublicNode2D<GeAliasXLink>
{
 public:
  GeAliasXLink() = default;
  ~GeAliasXLink() override;

  // Leaves its present trunk and enters another one at the end.
  void Attach(AliasTrunk& target);
  // Leaves its trunk, if it has one.
  void Detach();
  // The goal at the other end, or null.
  GeAliasGoal* GetGoal() const;

  AliasTrunk* trunk = nullptr; // null without a target, and when it has gone
  void* owner = nullptr;       // what the link's owner gave
  String* name = nullptr;      // owned; null without a label
};

// A reference to a node; empty at the start. It may be moved in memory by its bytes.
class GeAliasLink
{
 public:
  GeAliasLink() = default;
  ~GeAliasLink();
  GeAliasLink(const GeAliasLink&) = delete; // use CopyLinkTo
  GeAliasLink& operator=(const GeAliasLink&) = delete;

  // Points at `node`; null clears. Stays empty when memory is short.
  void SetLink(GeListNode* node);
  // The target, or null when the link is empty, its target has gone, or the goal is not resolvable.
  GeListNode* GetLink() const;
  // The goal, resolvable or not; null when empty.
  GeAliasGoal* GetLinkGoal() const;
  // Empties the link; its name stays.
  void ClearLink();
  // The value that FirstLinkOfGoal gives for this link. Holds for later and for present attachment. Without memory it
  // is lost: an AllocationWatch tells.
  void SetLinkOwner(void* owner);

  // The label that travels with the link, or null.
  const String* GetName() const { return xlink_ ? xlink_->name : nullptr; }
  // Sets the label; an empty text removes it.
  void SetName(const String& name);

  // A new link, filled by CopyLinkTo; null when memory is short.
  GeAliasLink* CloneLink(TransArray* translation) const;
  // With a translation array the copy is registered there and finds its target when the copy ends; without one it
  // points at the same target at once. The label is copied. A null destination does nothing. False when memory is
  // short.
  Bool CopyLinkTo(GeAliasLink* destination, TransArray* translation) const;

  // True when both reach the same goal, or both are empty.
  Bool IsEqual(const GeAliasLink& other) const { return GetTrunk() == other.GetTrunk(); }

  // One Memory value: "alias2", the id, and the label if there is one.
  Bool WriteLink(HyperFile& file) const;
  Bool ReadLink(HyperFile& file);
  // What ReadLink does with the id that it read. False, with the file's error, when memory is short.
  Bool TakeTargetId(HyperFile& file, GeAliasID id);

  // Points at a goal directly, making its trunk if needed; null clears. False when memory is short: the link is empty
  // then.
  Bool SetLinkGoal(GeAliasGoal* goal);

 private:
  friend class TransArray;

  AliasTrunk* GetTrunk() const { return xlink_ ? xlink_->trunk : nullptr; }
  Bool SetTrunk(AliasTrunk* trunk);
  GeAliasID GetTargetId() const;
  Bool ReadName(const UChar* bytes, LLong size);
  GeAliasXLink* NeedXLink();
  void DropXLink();

  GeAliasXLink* xlink_ = nullptr; // owned; null for a link without a target, a label and an owner
};

// Walks the links of a goal. It may outlive any of them, and the goal too: a link that goes while the iterator stands
// before it is passed over, and the walk ends with the goal.
class GoalIterator
{
 public:
  GoalIterator() = default;
  ~GoalIterator() { Leave(); }
  GoalIterator(const GoalIterator&) = delete;
  GoalIterator& operator=(const GoalIterator&) = delete;

 private:
  friend class GeAliasGoal;
  friend class GeAliasXLink;
  friend struct AliasTrunk;

  void Enter(AliasTrunk& trunk);
  void Leave();

  AliasTrunk* trunk_ = nullptr;     // null at the end of the walk
  GeAliasXLink* next_ = nullptr;    // the link that comes next, null behind the last one
  GoalIterator* sibling_ = nullptr; // the next iterator on the same trunk
};

// What a link points at: the handle of one node.
class GeAliasGoal : public GeMemory
{
 public:
  explicit GeAliasGoal(GeListNode* goalNode = nullptr) : node(goalNode) {}
  // All links to this goal become empty.
  virtual ~GeAliasGoal();
  GeAliasGoal(const GeAliasGoal&) = delete;
  GeAliasGoal& operator=(const GeAliasGoal&) = delete;

  virtual Bool IsResolvable() const { return resolvable; }
  virtual Long GetKind() const { return 0; }
  virtual Long GetSubKind() const { return 0; }

  // The goal's id, 0 when no link points here.
  GeAliasID GetGoalId() const;
  // True if a link points here: then a node's file form holds a goal record.
  Bool HasLinks() const;

  // The first and next link of the goal. Mode 0 gives each link's owner, or the address of a shared empty object when
  // it has none; any other mode gives the goal's node. Null at the end. The body of the loop may delete links and
  // goals.
  void* FirstLinkOfGoal(GoalIterator& iterator, Long mode) const;
  static void* NextLinkOfGoal(GoalIterator& iterator, Long mode);

  // Moves every link of this goal to the end of the list of `destination`, in order. Needs no memory.
  void MoveLinksTo(GeAliasGoal& destination);
  // Empties all links to this goal.
  void DropLinks();
  // The meeting point, made if there is none; null when memory is short.
  AliasTrunk* NeedTrunk();

  // Registers this goal's copy under this goal's id; without an array does nothing. False when memory is short.
  Bool CopyGoalTo(GeAliasGoal& destination, TransArray* translation) const;

  // One Memory value: "agoal1" and the id.
  Bool WriteGoal(HyperFile& file) const;
  Bool ReadGoal(HyperFile& file);

  GeListNode* node;            // the node that this goal stands for; not owned
  AliasTrunk* trunk = nullptr; // made on first need
  Bool resolvable = true;      // when false a link gives null for this goal, though it stays attached
};

// Where the numbers of trunks come from: the reproducible run of the thread, or the counter of the process. One that
// takes many takes them from the counter by the lot, since all threads have to wait for each other there.
class TrunkIds
{
 public:
  TrunkIds() = default;
  ~TrunkIds() { GiveBack(); }
  TrunkIds(const TrunkIds&) = delete;
  TrunkIds& operator=(const TrunkIds&) = delete;

  // One that belongs to no lot.
  static GeAliasID TakeOne();
  GeAliasID Take();
  // What is left of a lot goes back to the counter if nobody took any since; else the numbers stay unused.
  void GiveBack();

 private:
  GeAliasID next_ = 0;
  GeAliasID end_ = 0; // of the lot in hand
};

// The meeting point of a goal and its links. It lives until its goal goes, or until the end of the translation that
// made it if that is later.
struct AliasTrunk
{
  AliasTrunk(GeAliasGoal& trunkGoal, GeAliasID trunkId);
  ~AliasTrunk() { Empty(); }

  static constexpr int kIdBits = 53;

  // Deletes a trunk that no translation leads to. Null does nothing.
  static void Delete(AliasTrunk* trunk);
  // All links become empty.
  void Empty();
  // Moves every link to the end of another list, in order.
  void MoveLinksTo(AliasTrunk& destination);

  GeAliasGoal* goal; // null when it has gone before the end of the translation
  GeAliasID id : kIdBits;
  GeAliasID inTranslation : 1; // a TransArray leads here
  GeAliasID inPage : 1;        // lies among those of a translation's page, else in a block of its own
  GeAliasID place : 9;         // there
  GeTempPublicList2D<GeAliasXLink> xlinks;
  GoalIterator* iterators = nullptr; // those that stand on this trunk
};

// Carries ids across one read or one copy. The first registration under an id makes a trunk, on which links wait until
// the goal comes and takes it over. n registrations take O(n), in whatever order they come: where there are many, and
// the ids were counted, as a writer like this one does, an id leads straight to its trunk, in a page of those of the
// ids beside it; the first ones and scattered ids are found through a table.
class TransArray : public GeMemory
{
 public:
  TransArray() = default;
  ~TransArray() { FinishTranslation(false); } // what is left unresolved becomes empty
  TransArray(const TransArray&) = delete;
  TransArray& operator=(const TransArray&) = delete;

  // `goal` is the one of that id from now on: it gets all links that are registered under the id, before and after.
  // Links that it had become empty. Id 0 does no more. False when memory is short.
  Bool RegisterGoal(GeAliasID id, GeAliasGoal& goal);
  // `link` is to point at the goal of that id. In a copy `sourceGoal` is what the source link points at. Id 0 only
  // clears the link. False when memory is short.
  Bool RegisterLink(GeAliasID id, GeAliasLink& link, GeAliasGoal* sourceGoal);
  // The same for a copy of `source`, whose own target may still be awaited by another translation.
  Bool RegisterCopy(const GeAliasLink& source, GeAliasLink& copy);

  // Ends the translation and empties the array: a link whose goal never came becomes empty, or, with `keepToOrigin`,
  // goes back to the goal that its source points at if that has links of its own.
  void FinishTranslation(Bool keepToOrigin);

  LLong GetCount() const { return count_; }

 private:
  // What is known of a page. Its trunks' bits stay in the cache of a processor where the trunks themselves don't.
  struct Entry
  {
    static constexpr ULong kWord = 64; // bits

    Bool IsMade(ULong place) const { return (made[place / kWord] >> place % kWord & 1) != 0; }
    void SetMade(ULong place) { made[place / kWord] |= ULLong{1} << place % kWord; }

    TrunkPage* page; // null as long as none of its ids turned up
    ULLong made[8];  // a bit for each trunk in it that is there; asked before the page itself is looked at
  };

  Entry* FindEntry(GeAliasID id) const;
  Entry* NeedEntry(GeAliasID id);
  AliasTrunk* NeedTrunk(GeAliasID id, GeAliasGoal& goal);
  AliasTrunk* FindOrMakeTrunk(GeAliasID id, GeAliasGoal& goal);
  Bool Register(GeAliasID id, GeAliasLink& link, AliasTrunk* source);
  Bool SetOrigin(GeAliasID id, AliasTrunk* source);
  void ReturnToOrigins();
  void ReleaseLeaf(Entry* leaf);
  void Release(AliasTrunk* trunk);

  GeAliasGoal awaited_;           // the goal of trunks whose own hasn't turned up
  IdTable<AliasTrunk> single_;    // trunks outside of pages
  Entry** leaves_ = nullptr;      // the entries of all pages, in runs that are made when they are needed
  IdTable<GeAliasXLink> origins_; // in a copy, stand on the trunk of the goal that the source links have; owned
  LLong count_ = 0;
  TrunkIds ids_;
};

// Owns a TransArray for the length of one copy.
class AliasTranslator
{
 public:
  AliasTranslator() = default;
  ~AliasTranslator() { Finish(false); }
  AliasTranslator(const AliasTranslator&) = delete;
  AliasTranslator& operator=(const AliasTranslator&) = delete;

  // Makes the array; false when memory is short.
  Bool MakeTranslator();
  TransArray* GetArray() const { return array_; }
  // Ends the translation and deletes the array.
  void Finish(Bool keepToOrigin);

 private:
  TransArray* array_ = nullptr;
};

} // namespace _torvane_
