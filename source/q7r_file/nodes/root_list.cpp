#include "torvane/nodes/root_list.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/types/node_types.h"
#include "torvane/animation/ctrack.h"
#include "torvane/document/base_document.h"
#include "torvane/layers/layer_object.h"
#include "torvane/materials/base_material.h"
#include "torvane/memory/assertion.h"
#include "torvane/nodes/node_sink.h"
#include "torvane/objects/base_object.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/base_tag.h"
#include "torvane/tags/texture_tag.h"
#include "torvane/views/base_draw.h"

namespace _torvane_
{

RootList2D::~RootList2D()
{
  FreeAll();
  owner_ = nullptr;
}

const NodeKind& RootList2D::GetMemberKind() const { return BaseList2D::kNodeKind; }
const NodeKind& RootObject::GetMemberKind() const { return BaseObject::kNodeKind; }
const NodeKind& RootTag::GetMemberKind() const { return BaseTag::kNodeKind; }
const NodeKind& RootMaterial::GetMemberKind() const { return BaseMaterial::kNodeKind; }
const NodeKind& RootRenderData::GetMemberKind() const { return RenderData::kNodeKind; }
const NodeKind& RootLayer::GetMemberKind() const { return LayerObject::kNodeKind; }
const NodeKind& RootViewPanel::GetMemberKind() const { return ViewPanel::kNodeKind; }
const NodeKind& RootBaseDraw::GetMemberKind() const { return BaseDraw::kNodeKind; }

Bool RootList2D::Takes(const BaseList2D& node) const
{
  if (node.GetNodeKind().Is(GetMemberKind()))
    return true;
  ReportAssertion("q7r_file", __LINE__, "a node was to be put into a list of nodes of another class");
  return false;
}

BaseList2D* RootList2D::GetFirst() const { return NodeCast<BaseList2D>(list_.GetFirst()); }

BaseList2D* RootList2D::GetLast() const { return NodeCast<BaseList2D>(list_.GetLast()); }

BaseDocument* RootList2D::GetDocument() const { return owner_ ? owner_->GetDocument() : document_; }

Bool RootList2D::Append(BaseList2D* node, Bool setListHead)
{
  if (!Takes(*node))
    return false;
  Add(*node, setListHead);
  return true;
}

void RootList2D::Add(BaseList2D& node, Bool setListHead)
{
  list_.InsertLast(&node);
  Enter(node, setListHead);
}

void RootList2D::Enter(BaseList2D& node, Bool setListHead)
{
  node.SetListHead(setListHead ? this : nullptr);
  node.SetDocument(GetDocument());
  OnEnter(node);
}

Bool RootList2D::InsertFirst(BaseList2D* node) { return InsertAfter(node, nullptr); }

Bool RootList2D::InsertLast(BaseList2D* node) { return !node || Append(node, true); }

Bool RootList2D::InsertAfter(BaseList2D* node, BaseList2D* reference)
{
  if (!node || node == reference)
    return true;
  if (!Takes(*node))
    return false;
  if (reference)
    node->GeToolNode2D::InsertAfter(reference);
  else
    list_.InsertFirst(node);
  Enter(*node, true);
  return true;
}

Bool RootList2D::InsertBefore(BaseList2D* node, BaseList2D* reference)
{
  return InsertAfter(node, reference ? reference->GetPrev() : nullptr);
}

void RootList2D::RemoveMember(BaseList2D* node)
{
  if (node)
    node->RemoveFromList();
}

// The children of a member become members before it is deleted, so that a chain of them takes no more of the stack than
// one.
void RootList2D::FreeAll()
{
  while (BaseList2D* member = GetFirst()) {
    const auto* parent = NodeCast<BaseList4D>(static_cast<const BaseList2D*>(member));
    const RootList2D* children = parent ? parent->GetChildRoot() : nullptr;
    while (BaseList2D* child = children ? children->GetFirst() : nullptr) {
      child->Remove();
      child->SetListHead(nullptr);
      list_.InsertLast(child);
    }
    member->Remove();
    DeleteObj(member);
  }
  keptChunks_.Flush();
}

LLong RootList2D::GetCount() const
{
  LLong count = 0;
  for (const BaseList2D* member = GetFirst(); member; member = member->GetNext())
    ++count;
  return count;
}

Long RootList2D::GetMemberLabel(BaseList2D& member) const { return member.GetDiskType(); }

void RootList2D::WriteChunks(HyperFile& file)
{
  if (!HasContent() && !IsWrittenWhenEmpty())
    return;
  file.WriteChunkStart(kChunkList, 0);
  WriteMembers(file);
  keptChunks_.Write(file);
  file.WriteChunkEnd();
}

void RootList2D::WriteMembers(HyperFile& file)
{
  for (BaseList2D* member = GetFirst(); member; member = member->GetNext())
    member->WriteAsChunk(file, GetMemberLabel(*member));
}

Bool RootList2D::EntersChunk(Long id)
{
  if (id != kChunkList)
    return false;
  BeginList();
  return true;
}

Bool RootList2D::KeepChunk(HyperFile& file, Long id, Long level) { return keptChunks_.Read(file, id, level); }

Bool RootList2D::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (PrivateChunk::ReadChunk(file, id, level))
    return true;
  if (id != kChunkList)
    return false;
  BeginList();
  ReadChunkLoop(file, true);
  return true;
}

// What a file holds takes the place of the present members.
void RootList2D::BeginList()
{
  if (Bool* passedOn = PassedOn(); passedOn && *passedOn) {
    TakeBack();
    *passedOn = false;
  }
  FreeAll();
}

NodeSink* RootList2D::GetSink()
{
  const BaseDocument* document = PassedOn() ? GetDocument() : nullptr;
  return document ? document->GetNodeSink() : nullptr;
}

void RootList2D::TakeBack()
{
  if (NodeSink* sink = GetSink())
    sink->TakeBack();
}

Bool RootList2D::ReadMember(HyperFile& file, BaseList2D* member, Bool setListHead)
{
  if (!member)
    return false;
  member->SetDocument(GetDocument());
  if (!Takes(*member) || (!member->ReadInOnePiece(file) && !member->ReadChunkLoop(file, true))) {
    DeleteObj(member);
    TakeBack(); // its children
    return false;
  }
  NodeSink* sink = GetSink();
  if (!sink) {
    Add(*member, setListHead);
    return true;
  }
  sink->Take(*member);
  *PassedOn() = true;
  DeleteObj(member);
  return true;
}

Bool RootList2D::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  if (flags & kCopyNoBranches)
    return true;
  auto* target = NodeCast<RootList2D>(&destination);
  if (!target)
    return false;
  if (target == this)
    return true;
  // Members of a copied list always take their children along.
  flags &= ~kCopyNoChildren;
  target->FreeAll();
  for (BaseList2D* member = GetFirst(); member; member = member->GetNext()) {
    GeListNode* clone = member->MakeClone(flags, translation);
    auto* node = NodeCast<BaseList2D>(clone);
    if (!node || !target->Append(node, true)) {
      DeleteObj(clone);
      target->FreeAll();
      return false;
    }
  }
  return CopyKeptChunks(*target);
}

Bool RootObject::EntersChunk(Long id) { return id == kChunkNestedList || RootList2D::EntersChunk(id); }

Bool RootObject::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (RootList2D::ReadChunk(file, id, level))
    return true;
  if (id == kChunkNodeBits)
    return file.SkipToEndChunk();
  return ReadMember(file, AllocMember(id), true);
}

BaseObject* RootObject::AllocMember(Long type) { return MakeObjectOfLabel(type); }

Bool RootTag::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (RootList2D::ReadChunk(file, id, level))
    return true;
  if (id == kChunkNodeBits)
    return file.SkipToEndChunk();
  BaseTag* tag = MakeTag(id);
  if (!tag) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  tag->PrepareToRead();
  return ReadMember(file, tag, false);
}

Bool RootTag::TakeTextureTag(HyperFile& file, const TextureTagRecord& record, const UChar* place)
{
  auto* tag = NodeCast<TextureTag>(MakeTag(kTagTexture));
  if (!tag) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  tag->SetDocument(GetDocument());
  if (tag->TakeRecord(file, record, place))
    return Append(tag, false);
  DeleteObj(tag);
  return false;
}

void RootTag::OnEnter(BaseList2D& tag) { NodeCast<BaseTag>(&tag)->SetObject(NodeCast<BaseObject>(GetOwner())); }

Bool RootMaterial::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (RootList2D::ReadChunk(file, id, level))
    return true;
  if (id != kMaterialStandard && id != kMaterialPlugin)
    return false;
  return ReadMember(file, AllocMember(id), false);
}

BaseList2D* RootMaterial::AllocMember(Long type) { return MakeMaterial(type); }

Bool RootRenderData::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (RootList2D::ReadChunk(file, id, level))
    return true;
  return id == kTypeRenderData && ReadMember(file, AllocMember(), true);
}

BaseList2D* RootRenderData::AllocMember() { return AllocRenderData(); }

Bool RootLayer::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (RootList2D::ReadChunk(file, id, level))
    return true;
  if (id == kChunkNodeBits)
    return file.SkipToEndChunk();
  return id == kTypeLayer && ReadMember(file, AllocMember(), true);
}

BaseList2D* RootLayer::AllocMember() { return AllocLayer(); }

Bool RootViewPanel::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (RootList2D::ReadChunk(file, id, level))
    return true;
  return id == kTypeViewPanel && ReadMember(file, NewObj<ViewPanel>(), false);
}

Bool RootBaseDraw::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (RootList2D::ReadChunk(file, id, level))
    return true;
  return id == kTypeBaseDraw && ReadMember(file, NewObj<BaseDraw>(), false);
}

FixedLabelRoot::FixedLabelRoot(Long label) : type_(*FindNodeType(label, BaseList2D::kNodeKind)) {}

const NodeKind& FixedLabelRoot::GetMemberKind() const { return *type_.kind; }

Long FixedLabelRoot::GetMemberLabel(BaseList2D&) const { return type_.label; }

Bool FixedLabelRoot::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (RootList2D::ReadChunk(file, id, level))
    return true;
  if (id != type_.label)
    return false;
  BaseList2D* member = type_.make(type_, id);
  if (!member)
    return false;
  member->SetDocument(GetDocument());
  // The file's sticky error stops whatever follows a member that reads badly; the member itself stays.
  member->ReadChunkLoop(file, true);
  return Append(member, true);
}

RootMultipass::RootMultipass() : FixedLabelRoot(kTypeMultipass) {}
RootVideoPost::RootVideoPost() : FixedLabelRoot(kTypeVideoPost) {}
RootShader::RootShader() : FixedLabelRoot(kShaderLabel) {}
RootCTrack::RootCTrack() : FixedLabelRoot(kLabelTrack) {}
RootCKey::RootCKey() : FixedLabelRoot(kLabelKey) {}

} // namespace _torvane_
