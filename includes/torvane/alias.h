// Persistent references between nodes. A node owns a GeAliasGoal; a reference is a GeAliasLink; the two meet in a
// shared, hidden AliasTrunk, so that a link survives the deletion of its target (it becomes empty), a write and read
// of the document, and a copy of part of the tree. A TransArray carries the ids of goals and links across a read or a
// copy and resolves them in whatever order they turn up.
//
// None of this is locked: a document with its links belongs to one thread at a time.
#pragma once

#include "torvane/ge_string.h"
#include "torvane/memory.h"
#include "torvane/private_ge_mtools.h"
#include "torvane/types.h"

namespace _torvane_
{

class GeAliasGoal;
class GeListNode;
class HyperFile;
class TransArray;
struct AliasTrunk;
struct TransEntry;

// Names a goal within one file; 0 means no link. A trunk takes its number from a process-wide counter that starts
// at 1, so that the same run writes the same bytes.
using GeAliasID = ULLong;

// One link's place in the list of its trunk.
class GeAliasXLink : public GeTempPublicNode2D<GeAliasXLink>
{
 public:
  explicit GeAliasXLink(void* linkOwner) : owner(linkOwner) {}
  ~GeAliasXLink() override;

  AliasTrunk* trunk = nullptr; // null when the target has gone
  void* owner;                 // what the link's owner gave
};

// A reference to a node; empty at the start.
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
  // The value that FirstLinkOfGoal gives for this link. Holds for later and for present attachment.
  void SetLinkOwner(void* owner);

  // The label that travels with the link, or null.
  const String* GetName() const { return name_; }
  // Sets the label; an empty text removes it.
  void SetName(const String& name);

  // A new link, filled by CopyLinkTo; null when memory is short.
  GeAliasLink* CloneLink(TransArray* translation) const;
  // With a translation array the copy is registered there and finds its target when the copy ends; without one it
  // points at the same target at once. The label is copied. A null destination does nothing.
  void CopyLinkTo(GeAliasLink* destination, TransArray* translation) const;

  // True when both reach the same goal, or both are empty.
  Bool IsEqual(const GeAliasLink& other) const { return GetLinkGoal() == other.GetLinkGoal(); }

  // One Memory value: "alias2", the id, and the label if there is one.
  Bool WriteLink(HyperFile& file) const;
  Bool ReadLink(HyperFile& file);

  // Points at a goal directly, making its trunk if needed; null clears.
  void SetLinkGoal(GeAliasGoal* goal);

 private:
  String* name_ = nullptr;        // owned
  GeAliasXLink* xlink_ = nullptr; // owned
  void* owner_ = nullptr;
};

// Walks the links of a goal.
struct GoalIterator
{
  GeAliasXLink* next = nullptr;
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
  // it has none; any other mode gives the goal's node. Null at the end.
  void* FirstLinkOfGoal(GoalIterator& iterator, Long mode) const;
  void* NextLinkOfGoal(GoalIterator& iterator, Long mode) const;

  // Moves every link of this goal to `destination`, in order.
  void MoveLinksTo(GeAliasGoal& destination);

  // Registers this goal's copy under this goal's id; without an array does nothing. False when memory is short.
  Bool CopyGoalTo(GeAliasGoal& destination, TransArray* translation) const;

  // One Memory value: "agoal1" and the id.
  Bool WriteGoal(HyperFile& file) const;
  Bool ReadGoal(HyperFile& file);

  GeListNode* node;            // the node that this goal stands for; not owned
  AliasTrunk* trunk = nullptr; // made on first need
  Bool resolvable = true;      // when false a link gives null for this goal, though it stays attached
};

// The meeting point of a goal and its links.
struct AliasTrunk : public GeMemory
{
  GeAliasGoal* goal = nullptr;
  GeAliasID id = 0;
  GeTempPublicList2D<GeAliasXLink> xlinks;
};

// Carries ids across one read or one copy. Entries keep their place in memory, so links may sit on an entry's
// placeholder; registering n links and goals costs O(n log n) in whatever order they come.
class TransArray : public GeMemory
{
 public:
  TransArray() = default;
  ~TransArray(); // drops what is left, without resolving
  TransArray(const TransArray&) = delete;
  TransArray& operator=(const TransArray&) = delete;

  // `goal` is the one of that id from now on: it gets all links that are registered under the id, before and after.
  // Links that it had become empty. Id 0 does no more. False when memory is short.
  Bool RegisterGoal(GeAliasID id, GeAliasGoal& goal);
  // `link` is to point at the goal of that id. In a copy `sourceGoal` is what the source link points at. Id 0 only
  // clears the link. False when memory is short.
  Bool RegisterLink(GeAliasID id, GeAliasLink& link, GeAliasGoal* sourceGoal);

  // Ends the translation and empties the array: a link whose goal never came becomes empty, or, with `keepToOrigin`,
  // goes back to the goal that its source points at if that has links of its own.
  void FinishTranslation(Bool keepToOrigin);

  LLong GetCount() const { return count_; }

 private:
  TransEntry* FindOrInsert(GeAliasID id);
  Bool GrowTable();
  TransEntry** SlotOf(GeAliasID id) const;
  void Clear();

  TransEntry** table_ = nullptr; // open addressing, a power of two; owned with the entries
  LLong capacity_ = 0;
  LLong count_ = 0;
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
