// Root lists: the owning containers of sibling nodes. A root list is itself a chunk thing, so that a whole sub-tree is
// written and read by the same loop as a single node. Each class knows how a member is labelled in a file and how a
// member is made from that label.
#pragma once

#include "torvane/nodes/kept_chunks.h"
#include "torvane/nodes/private_chunk.h"

namespace _torvane_
{

class BaseObject;
class BaseDocument;
class BaseTag;
class NodeSink;
class TextureTagRecord;
struct NodeType;

class RootList2D : public PrivateChunk
{
 public:
  static constexpr NodeKindOf<RootList2D> kNodeKind{"root list", &PrivateChunk::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  RootList2D() = default;
  ~RootList2D() override;

  Bool IsRootList() const override { return true; }
  // The list's own chunk, whose members replace the present ones.
  Bool EntersChunk(Long id) override;
  // Keeps members under labels that nobody knows; they are written behind the others. Those of files below version
  // 13000 are passed over.
  Bool KeepChunk(HyperFile& file, Long id, Long level) override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;

  BaseList2D* GetFirst() const;
  BaseList2D* GetLast() const;
  Bool IsEmpty() const { return GetFirst() == nullptr; }
  // True if there is anything to write: members, or chunks that were kept.
  virtual Bool HasContent() const { return !IsEmpty() || !keptChunks_.IsEmpty(); }

  // The class of the members; a node of another one is refused.
  virtual const NodeKind& GetMemberKind() const;
  // Inserting takes the node out of the list that it stands in, and sets its list head and document. False, with
  // nothing changed, for a node of another class than the members'; a null node is ignored.
  Bool InsertFirst(BaseList2D* node);
  Bool InsertLast(BaseList2D* node);
  Bool InsertAfter(BaseList2D* node, BaseList2D* reference);  // first when the reference is null
  Bool InsertBefore(BaseList2D* node, BaseList2D* reference); // first when the reference has no predecessor
  void RemoveMember(BaseList2D* node);
  // Deletes all members with what is below them, and what was kept.
  void FreeAll();
  LLong GetCount() const;
  // Members under labels that nobody knows.
  const KeptChunks& GetKeptChunks() const { return keptChunks_; }

  // Copies what was kept, for those that copy the members on their own. False when memory is short.
  Bool CopyKeptChunks(RootList2D& destination) const { return keptChunks_.CopyTo(destination.keptChunks_); }

  // The node above the list, or null; set by the owner.
  BaseList2D* GetOwner() const { return owner_; }
  void SetOwner(BaseList2D* owner) { owner_ = owner; }

  // The document that members belong to: that of the owner, or the one that was set for a document's own lists.
  BaseDocument* GetDocument() const;
  void SetDocument(BaseDocument* document) { document_ = document; }

 protected:
  // Called when a node has become a member.
  virtual void OnEnter(BaseList2D&) {}
  virtual void WriteMembers(HyperFile& file);
  // The label of a member's chunk.
  virtual Long GetMemberLabel(BaseList2D& member) const;
  // False: an empty list writes nothing at all, not even its outer chunk.
  virtual Bool IsWrittenWhenEmpty() const { return false; }
  // Reads a new member through the chunk loop and appends it, or hands it to the document's sink; a member that reads
  // badly is deleted. True unless it did.
  // Some lists leave the list head of the members that they read unset.
  Bool ReadMember(HyperFile& file, BaseList2D* member, Bool setListHead);
  // Whether a sink got members that were read; null for a list that keeps its members in any case.
  virtual Bool* PassedOn() { return nullptr; }
  // Appends behind the last member; false for a node of another class.
  Bool Append(BaseList2D* node, Bool setListHead);

 private:
  Bool Takes(const BaseList2D& node) const;
  void Add(BaseList2D& node, Bool setListHead);
  void Enter(BaseList2D& node, Bool setListHead);
  void BeginList();
  NodeSink* GetSink();
  void TakeBack();

  GeTempPublicList2D<PrivateChunk> list_;
  KeptChunks keptChunks_;
  BaseList2D* owner_ = nullptr;
  BaseDocument* document_ = nullptr;
};

// Objects: of a document, and the children of each object. Labels are the members' disk types; any is taken on reading.
class RootObject : public RootList2D
{
 public:
  const NodeKind& GetMemberKind() const override;
  Bool EntersChunk(Long id) override; // also an old nested list, whose members join the others
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  // Called while a list is read, for each label in it: a new object that the list then owns, or null for a label that
  // can't be made, which is passed over. A client may give objects of its own classes.
  virtual BaseObject* AllocMember(Long type);

 protected:
  Bool* PassedOn() override { return &passedOn_; }

 private:
  Bool passedOn_ = false;
};

// Tags of an object, the list's owner.
class RootTag : public RootList2D
{
 public:
  const NodeKind& GetMemberKind() const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  // Appends a texture tag, which a file's record of such a tag at `place` tells. False, with the file's error, when
  // memory is short.
  Bool TakeTextureTag(HyperFile& file, const TextureTagRecord& record, const UChar* place);

 protected:
  void OnEnter(BaseList2D& tag) override; // sets the tag's object
};

// Materials of a document.
class RootMaterial : public RootList2D
{
 public:
  const NodeKind& GetMemberKind() const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  // As that of RootObject, for the labels kMaterialStandard and kMaterialPlugin. A node that is no material is refused.
  virtual BaseList2D* AllocMember(Long type);

 protected:
  Bool* PassedOn() override { return &passedOn_; }

 private:
  Bool passedOn_ = false;
};

// Render settings of a document, and the children of each.
class RootRenderData : public RootList2D
{
 public:
  const NodeKind& GetMemberKind() const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  // New render settings that the caller owns, or null when memory is short. Also called for a new document's first set.
  virtual BaseList2D* AllocMember();
};

// Scene layers of a document, and the children of each.
class RootLayer : public RootList2D
{
 public:
  const NodeKind& GetMemberKind() const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  // A new layer that the caller owns, or null when memory is short.
  virtual BaseList2D* AllocMember();
};

// View panels of a document.
class RootViewPanel : public RootList2D
{
 public:
  const NodeKind& GetMemberKind() const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;

 protected:
  Bool IsWrittenWhenEmpty() const override { return true; }
};

// Draws of a view panel.
class RootBaseDraw : public RootList2D
{
 public:
  const NodeKind& GetMemberKind() const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;

 protected:
  Bool IsWrittenWhenEmpty() const override { return true; }
};

// A list whose members are all of one class and stand under one label. A member that reads badly stays in the list.
class FixedLabelRoot : public RootList2D
{
 public:
  // The label is a number of the table of types, which tells the class.
  explicit FixedLabelRoot(Long label);
  const NodeKind& GetMemberKind() const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;

 protected:
  Long GetMemberLabel(BaseList2D&) const override;
  Bool IsWrittenWhenEmpty() const override { return true; }

 private:
  const NodeType& type_;
};

class RootMultipass : public FixedLabelRoot
{
 public:
  RootMultipass();
};

class RootVideoPost : public FixedLabelRoot
{
 public:
  RootVideoPost();
};

class RootShader : public FixedLabelRoot
{
 public:
  RootShader();
};

class RootCTrack : public FixedLabelRoot
{
 public:
  RootCTrack();
};

class RootCKey : public FixedLabelRoot
{
 public:
  RootCKey();
};

} // namespace _torvane_
