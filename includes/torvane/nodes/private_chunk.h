// The chunk interface: what every persistent thing of the scene model answers, and the one loop that reads chunks.
#pragma once

#include "torvane/ids.h"
#include "torvane/links/alias.h"
#include "torvane/memory/memory.h"
#include "torvane/memory/private_ge_mtools.h"
#include "torvane/nodes/node_kind.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/types.h"
#include "torvane/values/parameter_path.h"

namespace _torvane_
{

class BaseList2D;
class GeData;
class HyperFile;
class TransArray;

class PrivateChunk : public GeTempPublicNode2D<PrivateChunk>
{
 public:
  static constexpr NodeKindOf<PrivateChunk> kNodeKind{"chunk", nullptr};
  virtual const NodeKind& GetNodeKind() const { return kNodeKind; }

  PrivateChunk() = default;
  ~PrivateChunk() override = default;
  PrivateChunk(const PrivateChunk&) = delete;
  PrivateChunk& operator=(const PrivateChunk&) = delete;

  // True for 0, for the node's own type, and for the types of its classes.
  virtual Bool IsInstanceOf(Long type) const { return type == 0; }
  // Takes the chunk `id` whose start was just read. True: it was consumed with its end. False: the id isn't known here,
  // or its content can't be built; the loop then skips the chunk.
  virtual Bool ReadChunk(HyperFile& file, Long id, Long level);
  // Called in a loop that keeps going, for a chunk that nobody took and nothing was read of. True: it was kept, and
  // consumed with its end.
  virtual Bool KeepChunk(HyperFile&, Long, Long) { return false; }
  virtual Bool IsRootList() const { return false; }
  // Called in the loop of a root list for each chunk start. True: the chunk only holds more of what this loop reads,
  // which then goes on inside of it. A list enters its own chunks so, which keeps a chain of objects to one loop each.
  virtual Bool EntersChunk(Long) { return false; }
  virtual Long GetType() const { return 0; }
  // Writes the chunks of this node, those of the base class first. Failures show in the file's error.
  virtual void WriteChunks(HyperFile& file);
  // Copies this node's content onto `destination`, a node of the same class. `flags` are those of ids.h.
  virtual Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation);
  // False when the parameter isn't known here, or when memory was too short to give or to take the whole value.
  virtual Bool GetParameter(const ParameterPath& path, GeData& value);
  virtual Bool SetParameter(const ParameterPath& path, const GeData& value);
  // The level of the chunk that holds a NodeData's own values.
  virtual Long GetChunkLevel() const { return 0; }

  // Reads chunks up to the end mark of the chunk that encloses them and hands each to ReadChunk. With `keepGoing` a
  // chunk that nobody takes is skipped; without it the loop ends there. False on an error, and at the end of the file
  // (without an error). Loops of nodes nest no deeper than HyperFile::kMaxLoopDepth; those of root lists don't count.
  // `tagAlreadyRead` is always false.
  Bool ReadChunkLoop(HyperFile& file, Bool keepGoing, Bool tagAlreadyRead = false);
  // The loop with `keepGoing`; with `consumeHeader` the start of the enclosing chunk is read first (an end mark there
  // passes).
  Bool ReadChunks(HyperFile& file, Bool consumeHeader);
  // Chunk (id, 0) around WriteChunks. A node that could not be read again, so deep does it stand, is the error
  // FILEERROR_TOO_DEEP.
  void WriteAsChunk(HyperFile& file, Long id);
  // The entry to CopyTo. Without an array, and unless kCopyNoTranslation is set, links inside the copy are translated
  // here: they point at copies of what was copied along and else at what the source points at. False also where memory,
  // or the stack of the thread, is too small.
  Bool CopyWithTranslation(PrivateChunk& destination, ULong flags, TransArray* translation);

  Bool GetParameterById(Long id, GeData& value);
  Bool SetParameterById(Long id, const GeData& value);

 private:
  struct Loop;
  static Bool ReadLoopHeader(HyperFile& file);
  Bool ReadOneChunk(HyperFile& file, Loop& loop);
  Bool EndLoopChunk(HyperFile& file, Loop& loop);
};

// A node with an alias goal and 128 node bits.
class GeListNode : public PrivateChunk
{
 public:
  static constexpr NodeKindOf<GeListNode> kNodeKind{"list node", &PrivateChunk::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  GeListNode() : goal_(this) {}
  ~GeListNode() override = default;

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;

  // True when a derived class writes the goal in a chunk of its own.
  virtual Bool GoalIsWrittenElsewhere() const { return false; }
  // A bit number from 0 to 127 gives 0 or 1; -1 to -4 give the whole words 0 to 3. Other negative numbers are reported
  // and give 0.
  virtual ULong GetNBit(Long bit) const;
  // Mode 1 sets, 2 clears, 3 toggles (the bits 0xF0 of the mode are ignored). True when the bit changed. A bit number
  // from 128 on lands in word 3, modulo 32.
  virtual Bool ChangeNBit(Long bit, Long mode);
  // The id that labels the node in its root list.
  virtual Long GetDiskType() const { return GetType(); }
  virtual void RemoveFromList();
  // A new node with the same content: the flags are those of ids.h, the array as in CopyWithTranslation. Null for a
  // class that has no copies, and when the copy fails. The caller owns it.
  virtual GeListNode* MakeClone(ULong flags, TransArray* translation);

  GeAliasGoal& GetGoal() { return goal_; }
  const GeAliasGoal& GetGoal() const { return goal_; }

 protected:
  // A new node of this class, for MakeClone to copy onto; null when memory is short, and for a class without copies.
  virtual GeListNode* MakeEmpty() const { return nullptr; }

  GeAliasGoal goal_;
  ULong nbits_[4] = {0, 0, 0, 0};

 private:
  friend struct ChunkFields<GeListNode>;
};

// The behaviour of a node: what is particular to its type. Owned by the node.
class NodeData : public PrivateChunk
{
 public:
  static constexpr NodeKindOf<NodeData> kNodeKind{"node data", &PrivateChunk::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // The class of the nodes that these data are for; any node by default. The library gives data to no other node: what
  // a file says of a node's type is no promise of its class. Data that look into their node say so here.
  virtual const NodeKind& GetOwnerKind() const;
  // Called once after creation, with the node set; false makes the creation fail.
  virtual Bool Init() { return true; }
  // Called while a node is read, for the body of its node data chunk (kChunkNodeData), and for chunks of a polygon
  // object or a spline that nobody else takes. True: read; of other chunks than the node data's also the end tag.
  // False: the caller passes over the rest.
  virtual Bool ReadData(HyperFile& file, Long id, Long level);
  // A hook for clients, which BaseObject::Execute calls; the library itself never does.
  virtual Bool Execute() { return false; }
  // The label of the owner object in its root list.
  virtual Long GetDiskType() const { return kObjectGeneric; }

  BaseList2D* GetNode() const { return node_; }
  void SetNode(BaseList2D* node) { node_ = node; }

 protected:
  BaseList2D* node_ = nullptr; // the owner; not owned
};

} // namespace _torvane_
