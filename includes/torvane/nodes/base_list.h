// The named node (BaseList2D) and the node with a place in a hierarchy (BaseList4D).
#pragma once

#include "torvane/links/alias.h"
#include "torvane/nodes/kept_chunks.h"
#include "torvane/nodes/private_chunk.h"
#include "torvane/nodes/root_list.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/text/ge_string.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

class BaseDocument;
class BaseShader;
class CTrack;

// 16 bytes that name a node uniquely.
struct NodeMarker
{
  UChar bytes[16];
};

// One extra identifier of a node: an application's id and that application's bytes.
struct UniqueIDEntry
{
  Long appId;
  Long order; // of entries that are read: the place in the file
  LLong size;
  void* data; // owned by the array
};

// The extra identifiers of a node, sorted by application id. Owns the entries' bytes.
class UniqueIDArray : public GeTempDynSortSearchArray<UniqueIDEntry, Long, GeMemberOrder<&UniqueIDEntry::appId>>
{
 public:
  ~UniqueIDArray() override { FreeEntries(); }

  // Replaces or adds an entry with a copy of the bytes. False when memory is short: the entry is then gone.
  Bool SetEntry(Long appId, const void* data, LLong size);
  // Replaces or adds an entry with a block that the array then owns; on failure the block stays the caller's.
  Bool AdoptEntry(Long appId, void* data, LLong size);
  // For reading many: takes the block without a search. SettleEntries is due before anything else.
  Bool AppendEntry(Long appId, void* data, LLong size);
  // Sorts what was appended. Of entries with equal ids the last one stays. Gives the comparisons that it took.
  LLong SettleEntries();
  void FreeEntries();
};

class NodeRecord;

// A node with a name, parameters, tracks, shaders and identifiers.
class BaseList2D : public GeListNode
{
 public:
  static constexpr NodeKindOf<BaseList2D> kNodeKind{"node", &GeListNode::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  explicit BaseList2D(Long type = 0);
  ~BaseList2D() override;

  Bool IsInstanceOf(Long type) const override { return type == type_ || type == 0; }
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  // Called for a new node that a file is to fill: reads all of its chunks, and the end mark behind them, where they
  // stand as in most nodes of its class. False, with nothing read, where they don't, and with the file's error without
  // memory.
  virtual Bool ReadInOnePiece(HyperFile&) { return false; }
  Long GetType() const override { return type_; }
  void WriteChunks(HyperFile& file) override;
  // Keeps what other programs put among the node's chunks: WriteChunks writes it behind those of this class. Chunks of
  // this library's own ids are never kept, since whoever refused one had a reason, nor are those of older files.
  Bool KeepChunk(HyperFile& file, Long id, Long level) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  // Looks in the node's container. A level of kDataGroup steps into a nested container, a level of kDataVector selects
  // a component of a Vector, which is always looked up in, and written back to, the top container; setting a component
  // also leaves an entry of its own under the component's id (1000, 1001 or 1002).
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;
  Bool GoalIsWrittenElsewhere() const override { return true; }
  // Outside of a list the node and all that it owns have no document, and the node no list head.
  void RemoveFromList() override;

  const String& GetName() const { return name_; }
  // Without memory the name is empty: an AllocationWatch tells.
  void SetName(const String& name) { name_ = name; }
  BaseContainer& GetDataInstance() { return data_; }
  const BaseContainer& GetDataInstance() const { return data_; }
  GeAliasLink& GetLinkInstance() { return link_; }

  // The scene layer that the node is assigned to, or null; assigning sets the node's own link.
  BaseList2D* GetLayer() const;
  void SetLayer(BaseList2D* layer) { link_.SetLink(layer); }

  BaseDocument* GetDocument() const { return document_; }
  // Sets the document of this node and of all that it owns.
  virtual void SetDocument(BaseDocument* document);
  RootList2D* GetListHead() const { return listHead_; }
  void SetListHead(RootList2D* head) { listHead_ = head; }
  BaseList2D* GetNext() const { return NodeCast<BaseList2D>(PrivateChunk::GetNext()); }
  BaseList2D* GetPrev() const { return NodeCast<BaseList2D>(PrivateChunk::GetPrev()); }

  // Info bits: a mask of one or more bits.
  void SetBit(ULong mask) { info_ |= mask; }
  void DelBit(ULong mask) { info_ &= ~mask; }
  Bool GetBit(ULong mask) const { return (info_ & mask) != 0; }
  void ToggleBit(ULong mask) { info_ ^= mask; }
  ULong GetInfo() const { return info_; }
  void SetInfo(ULong info) { info_ = info; }

  // The node's marker. It is drawn when it is first asked for.
  const NodeMarker& GetMarker() const;

  // Extra identifiers. The application id kMarkerAppId is the marker itself, of 16 bytes. Adding copies the bytes; it
  // fails for a negative size, for a size without bytes, and when memory is short. What the others give is valid until
  // the identifiers change.
  Bool AddUniqueID(Long appId, const void* data, LLong size);
  Bool FindUniqueID(Long appId, const void*& data, LLong& size) const;
  Long GetUniqueIDCount() const;
  // Index 0 is the marker.
  Bool GetUniqueIDByIndex(Long index, Long& appId, const void*& data, LLong& size) const;

  // The lists of shaders and tracks are null until the first member. False when memory for the list is short: the
  // shader or track then stays the caller's.
  RootShader* GetShaderRoot() const { return Extra().shaders; }
  BaseShader* GetShaders() const;
  Bool InsertShader(BaseShader* shader, BaseShader* after); // first when `after` is null
  Bool InsertShaderLast(BaseShader* shader);
  RootCTrack* GetTrackRoot() const { return Extra().tracks; }
  CTrack* GetFirstTrack() const;
  Bool InsertTrackLast(CTrack* track);
  // The first track whose path begins with the ids of `path`; data types and creators play no part. Null for an empty
  // path.
  CTrack* FindTrack(const ParameterPath& path) const;

  // Chunks of other programs among the node's own.
  const KeptChunks& GetKeptChunks() const { return Extra().keptChunks; }

  // Parameters added at run time. Adding takes the smallest free key from 1 on and gives the path (700, 5, 0),
  // (key, type, 0), or an empty path on failure. The others take such a path.
  const BaseContainer* GetDynamicParameters() const { return Extra().dynamicParameters; } // null while there are none
  ParameterPath AddDynamicParameter(const BaseContainer& settings);
  Bool RemoveDynamicParameter(const ParameterPath& path);
  const BaseContainer* FindDynamicParameter(const ParameterPath& path) const;
  Bool SetDynamicParameter(const ParameterPath& path, const BaseContainer& settings);

 protected:
  void SetType(Long type) { type_ = type; }
  static void SetDocumentOfMembers(RootList2D* root, BaseDocument* document); // null: does nothing
  // What such a part of a header at `place` tells, see node_record.h.
  void TakeHeaderStart(const NodeRecord& record, const UChar* place);
  void TakeHeaderRest(const HyperFile& file, const NodeRecord& record, const UChar* place);
  // True for a node with neither a name, parameters, a layer, shaders, tracks, identifiers besides the marker, chunks
  // of others, nor links that lead to it.
  Bool IsBare() const;

  String name_;
  GeAliasLink link_;
  BaseDocument* document_ = nullptr; // not owned; null outside a document
  Long type_;
  ULong info_ = 0;
  BaseContainer data_;
  RootList2D* listHead_ = nullptr; // the list that holds the node; not owned
  mutable NodeMarker marker_;
  mutable Bool markerDrawn_ = false;

 private:
  friend struct ChunkFields<BaseList2D>;

  // What most nodes, every key for one, have nothing of. All is owned; the pointers are null until the first member.
  struct Extras
  {
    ~Extras();

    UniqueIDArray* uniqueIds = nullptr;
    BaseContainer* dynamicParameters = nullptr;
    RootShader* shaders = nullptr;
    RootCTrack* tracks = nullptr;
    KeptChunks keptChunks;
  };
  static const Extras kNoExtras;

  const Extras& Extra() const { return extras_ ? *extras_ : kNoExtras; }
  // Made if there are none; null when memory is short. So are the parts.
  Extras* NeedExtras();
  template <class Part>
  Part* NeedExtra(Part* Extras::*part);
  BaseContainer* NeedDynamicParameters();

  Bool ReadHeader(HyperFile& file, Long level);
  template <class Root>
  Root* NeedRoot(Root* Extras::*root);
  template <class Root>
  Bool ReadRoot(Root* Extras::*root, HyperFile& file);
  template <class Root>
  Bool CopyRoot(Root* Extras::*root, BaseList2D& target, ULong flags, TransArray* translation) const;
  Bool CopyExtras(BaseList2D& target, ULong flags, TransArray* translation) const;
  static Bool SkipOneChunk(HyperFile& file);
  Bool ReadUniqueIds(HyperFile& file);
  void WriteUniqueIds(HyperFile& file);

  Extras* extras_ = nullptr; // owned; null until the first of them
};

// Settings of a new dynamic parameter of a data type, named `name`, with the type's limits and steps.
BaseContainer MakeDynamicSettings(Long type, const String& name);

inline constexpr Long kDynamicParameters = 700; // first level of a dynamic parameter's path

// A node with a place in a hierarchy.
class BaseList4D : public BaseList2D
{
 public:
  static constexpr NodeKindOf<BaseList4D> kNodeKind{"node with children", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  explicit BaseList4D(Long type = 0) : BaseList2D(type) {}
  ~BaseList4D() override;

  void SetDocument(BaseDocument* document) override;

  BaseList4D* GetUp() const;
  BaseList4D* GetDown() const;
  BaseList4D* GetDownLast() const;
  BaseList4D* GetNext() const { return NodeCast<BaseList4D>(BaseList2D::GetNext()); }
  BaseList4D* GetPrev() const { return NodeCast<BaseList4D>(BaseList2D::GetPrev()); }

  // Put this node beside `reference`, into its list; nothing happens if it is null or in no list. The node must be in
  // no list.
  void InsertBefore(BaseList4D* reference);
  void InsertAfter(BaseList4D* reference);
  // Put this node first or last among the children of `parent`. False, and nothing happens, if it is null, has no child
  // list or no memory for one: the node then stays the caller's.
  Bool InsertUnder(BaseList4D* parent);
  Bool InsertUnderLast(BaseList4D* parent);

  // The child list. What can be changed is made if there is none: null where a class makes none by itself, and when
  // memory is short.
  RootList2D* GetChildRoot();
  const RootList2D* GetChildRoot() const { return children_; }

 protected:
  // A new list for GetChildRoot.
  virtual RootList2D* AllocChildRoot() const { return nullptr; }

  RootList2D* children_ = nullptr; // owned; null until it is needed
};

} // namespace _torvane_
