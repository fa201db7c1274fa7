#include "torvane/nodes/base_list.h"

#include <cstring>

#include "k2v_file/stream/chunk_visitor.h"
#include "torvane/animation/ctrack.h"
#include "torvane/layers/layer_object.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/time/uuid.h"

namespace _torvane_
{

BaseList2D::BaseList2D(Long type) : type_(type) {}

BaseList2D::~BaseList2D()
{
  DeleteObj(tracks_);
  DeleteObj(shaders_);
  DeleteObj(uniqueIds_);
  DeleteObj(dynamicParameters_);
}

// The list, made if there is none; null when memory is short.
template <class Root>
Root* BaseList2D::NeedRoot(Root*& root)
{
  if (!root && (root = NewObj<Root>()))
    root->SetOwner(this);
  return root;
}

template <class Root>
Bool BaseList2D::ReadRoot(Root*& root, HyperFile& file)
{
  if (NeedRoot(root))
    return root->ReadChunks(file, false);
  file.SetError(FILEERROR_MEMORY);
  return false;
}

template <class Root>
Bool BaseList2D::CopyRoot(const Root* root, BaseList2D& target, Root*& targetRoot, ULong flags, TransArray* translation)
{
  if (root)
    return target.NeedRoot(targetRoot) && const_cast<Root*>(root)->CopyWithTranslation(*targetRoot, flags, translation);
  if (targetRoot && !(flags & kCopyNoBranches))
    targetRoot->FreeAll();
  return true;
}

// The marker's block: a flag that says that one follows, and its 16 bytes.
template <class Visitor>
Bool BaseList2D::VisitMarker(Visitor& v)
{
  v.ConstantUChar(1);
  if constexpr (Visitor::kReading) {
    UChar bytes[sizeof(NodeMarker)];
    LLong size = 0;
    if (v.Note(v.Good() && v.File().ReadMemoryInto(bytes, sizeof bytes, size)) && size > 0) {
      if (size < static_cast<LLong>(sizeof bytes))
        GetMarker(); // what the file doesn't tell stays drawn
      std::memcpy(marker_.bytes, bytes, static_cast<std::size_t>(size < 16 ? size : 16));
      markerDrawn_ = true;
    }
  } else {
    v.Memory(GetMarker().bytes, sizeof(NodeMarker));
  }
  return v.Good();
}

template <class Visitor>
Bool BaseList2D::VisitHeader(Visitor& v)
{
  v.LongInto(info_);
  v.ConstantLong(0);
  if (v.VersionBelow(kVersionNodeHeader))
    return v.Good();
  v.Container(data_);
  v.Goal(goal_);
  v.String(name_);
  if (v.Level() >= 1) {
    Long present = dynamicParameters_ && dynamicParameters_->GetCount() > 0 ? 1 : 0;
    v.Long(present);
    if (present >= 1 && v.Good()) {
      if (NeedDynamicParameters())
        v.Container(*dynamicParameters_);
      else
        v.File().SetError(FILEERROR_MEMORY);
    }
  }
  if (v.Level() >= 2) {
    // A list that old programs kept here: always empty now, its chunks are passed over.
    Long one = 1;
    Long count = 0;
    v.Long(one);
    if (one == 1)
      v.Long(count);
    for (Long i = 0; i < count && v.Good(); ++i)
      v.Note(SkipOneChunk(v.File()));
  }
  if (v.VersionBelow(kVersionTransform)) {
    if (v.Level() >= 3)
      v.template Skip<Long>();
    Long count = 0;
    if (v.Level() >= 4)
      v.Long(count);
    for (Long i = 0; i < count && v.Good(); ++i)
      v.template Skip<Long>();
  }
  if (v.Level() >= 5)
    v.Link(link_);
  if (v.Level() >= 6)
    VisitMarker(v);
  if (v.Level() >= 7 && !Visitor::kReading)
    v.ConstantBool(false);
  return v.Good();
}

Bool BaseList2D::SkipOneChunk(HyperFile& file)
{
  Long id = 0;
  Long level = 0;
  return file.ExpectTag(kTagChunkStart) && file.ReadChunkStart(id, level) && file.SkipToEndChunk();
}

Bool BaseList2D::ReadUniqueIds(HyperFile& file)
{
  Long count = 0;
  if (!file.ReadLong(count))
    return false;
  if (count >= 1) {
    if (uniqueIds_)
      uniqueIds_->FreeEntries();
    else
      uniqueIds_ = NewObj<UniqueIDArray>();
    if (!uniqueIds_)
      return false;
  }
  for (Long i = 0; i < count; ++i) {
    Long appId = 0;
    void* data = nullptr;
    LLong size = 0;
    if (!file.ReadLong(appId) || !file.ReadMemory(data, size))
      return false;
    if (!uniqueIds_->AppendEntry(appId, data, size)) {
      GeFree(data);
      return false;
    }
  }
  if (count >= 1)
    file.AddLookups(uniqueIds_->SettleEntries());
  return file.SkipToEndChunk();
}

void BaseList2D::WriteUniqueIds(HyperFile& file)
{
  file.WriteChunkStart(kChunkUniqueIds, kLevelUniqueIds);
  file.WriteLong(uniqueIds_->GetCount());
  for (const UniqueIDEntry& entry : *uniqueIds_) {
    file.WriteLong(entry.appId);
    file.WriteMemory(entry.data, entry.size);
  }
  file.WriteChunkEnd();
}

void BaseList2D::WriteChunks(HyperFile& file)
{
  if (GetFirstTrack())
    tracks_->WriteAsChunk(file, kChunkTracks);
  WriteChunk(file, kChunkNodeHeader, kLevelNodeHeader, [this](ChunkWriter& v) { return VisitHeader(v); });
  if (uniqueIds_)
    WriteUniqueIds(file);
  GeListNode::WriteChunks(file);
  keptChunks_.Write(file);
}

Bool BaseList2D::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (GeListNode::ReadChunk(file, id, level))
    return true;
  switch (id) {
  case kChunkNodeHeader:
    return ReadChunkBody(file, level, [this](ChunkReader& v) { return VisitHeader(v); });
  case kChunkUniqueIds:
    return ReadUniqueIds(file);
  case kChunkShaders:
    return ReadRoot(shaders_, file);
  case kChunkTracks:
    return ReadRoot(tracks_, file);
  default:
    return false;
  }
}

Bool BaseList2D::KeepChunk(HyperFile& file, Long id, Long level) { return keptChunks_.Read(file, id, level); }

Bool BaseList2D::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<BaseList2D>(&destination);
  if (!target)
    return false;
  const AllocationWatch watch;
  if (!(flags & kCopyNoInfo))
    target->info_ = info_;
  if (!data_.CopyTo(target->data_, flags, translation))
    return false;
  target->markerDrawn_ = target == this && markerDrawn_; // a copy is never the same node
  if (!keptChunks_.CopyTo(target->keptChunks_))
    return false;
  target->name_ = name_;
  if (!link_.CopyLinkTo(&target->link_, translation) || watch.Failed() ||
      !GeListNode::CopyTo(destination, flags, translation))
    return false;
  if (!dynamicParameters_)
    DeleteObj(target->dynamicParameters_);
  else if (!target->NeedDynamicParameters() ||
           !dynamicParameters_->CopyTo(*target->dynamicParameters_, flags, translation))
    return false;
  if (!(flags & kCopyNoBranches) && !CopyRoot(shaders_, *target, target->shaders_, flags, translation))
    return false;
  return (flags & kCopyNoTracks) || CopyRoot(tracks_, *target, target->tracks_, flags, translation);
}

void BaseList2D::RemoveFromList()
{
  Remove();
  listHead_ = nullptr;
  SetDocument(nullptr);
}

Bool BaseList2D::IsBare() const
{
  BaseContainer::Iterator first;
  Long id = 0;
  const GeData* value = nullptr;
  const Bool hasParameters = data_.GetId() != -1 || data_.BrowseFirst(first, id, value) || dynamicParameters_;
  const Bool hasLinks = link_.GetLinkGoal() || link_.GetName() || goal_.trunk;
  return name_.GetLength() == 0 && !hasParameters && !hasLinks && !shaders_ && !tracks_ && !uniqueIds_ &&
         keptChunks_.IsEmpty();
}

BaseList2D* BaseList2D::GetLayer() const { return NodeCast<LayerObject>(link_.GetLink()); }

void BaseList2D::SetDocument(BaseDocument* document)
{
  if (document_ == document)
    return;
  document_ = document;
  SetDocumentOfMembers(shaders_, document);
  SetDocumentOfMembers(tracks_, document);
}

// Members that have the document already have it in all that they own.
void BaseList2D::SetDocumentOfMembers(RootList2D* root, BaseDocument* document)
{
  for (BaseList2D* member = root ? root->GetFirst() : nullptr; member; member = member->GetNext())
    member->SetDocument(document);
}

const NodeMarker& BaseList2D::GetMarker() const
{
  if (!markerDrawn_) {
    std::memset(marker_.bytes, 0, sizeof marker_.bytes);
    CreateUuid(marker_.bytes);
    markerDrawn_ = true;
  }
  return marker_;
}

Bool BaseList2D::AddUniqueID(Long appId, const void* data, LLong size)
{
  if (appId == kMarkerAppId) {
    if (!data || size != sizeof(NodeMarker))
      return false;
    std::memcpy(marker_.bytes, data, sizeof(NodeMarker));
    markerDrawn_ = true;
    return true;
  }
  if (size < 0 || (size > 0 && !data))
    return false;
  if (!uniqueIds_)
    uniqueIds_ = NewObj<UniqueIDArray>();
  return uniqueIds_ && uniqueIds_->SetEntry(appId, data, size);
}

Bool BaseList2D::FindUniqueID(Long appId, const void*& data, LLong& size) const
{
  if (appId == kMarkerAppId) {
    data = GetMarker().bytes;
    size = sizeof(NodeMarker);
    return true;
  }
  const UniqueIDEntry* entry = uniqueIds_ ? uniqueIds_->Find(appId) : nullptr;
  if (!entry)
    return false;
  data = entry->data;
  size = entry->size;
  return true;
}

Long BaseList2D::GetUniqueIDCount() const { return (uniqueIds_ ? uniqueIds_->GetCount() : 0) + 1; }

Bool BaseList2D::GetUniqueIDByIndex(Long index, Long& appId, const void*& data, LLong& size) const
{
  if (index < 0 || index >= GetUniqueIDCount())
    return false;
  if (index == 0) {
    appId = kMarkerAppId;
    return FindUniqueID(appId, data, size);
  }
  // A file may hold an entry with the marker's number too.
  const UniqueIDEntry& entry = (*uniqueIds_)[index - 1];
  appId = entry.appId;
  data = entry.data;
  size = entry.size;
  return true;
}

BaseShader* BaseList2D::GetShaders() const { return shaders_ ? NodeCast<BaseShader>(shaders_->GetFirst()) : nullptr; }

Bool BaseList2D::InsertShader(BaseShader* shader, BaseShader* after)
{
  return NeedRoot(shaders_) && shaders_->InsertAfter(shader, after);
}

Bool BaseList2D::InsertShaderLast(BaseShader* shader) { return NeedRoot(shaders_) && shaders_->InsertLast(shader); }

CTrack* BaseList2D::GetFirstTrack() const { return tracks_ ? NodeCast<CTrack>(tracks_->GetFirst()) : nullptr; }

Bool BaseList2D::InsertTrackLast(CTrack* track) { return NeedRoot(tracks_) && tracks_->InsertLast(track); }

CTrack* BaseList2D::FindTrack(const ParameterPath& path) const
{
  Long count = path.GetLevelCount();
  if (count < 1)
    return nullptr;
  for (CTrack* track = GetFirstTrack(); track; track = track->GetNext()) {
    Long level = 0;
    while (level < count && track->GetPath()[level].id == path[level].id)
      ++level;
    if (level == count)
      return track;
  }
  return nullptr;
}

BaseList4D::~BaseList4D() { DeleteObj(children_); }

void BaseList4D::SetDocument(BaseDocument* document)
{
  if (document_ == document)
    return;
  BaseList2D::SetDocument(document);
  if (children_)
    SetDocumentOfMembers(children_, document);
}

BaseList4D* BaseList4D::GetUp() const { return listHead_ ? NodeCast<BaseList4D>(listHead_->GetOwner()) : nullptr; }

BaseList4D* BaseList4D::GetDown() const { return children_ ? NodeCast<BaseList4D>(children_->GetFirst()) : nullptr; }

BaseList4D* BaseList4D::GetDownLast() const { return children_ ? NodeCast<BaseList4D>(children_->GetLast()) : nullptr; }

void BaseList4D::InsertBefore(BaseList4D* reference)
{
  if (reference && reference->listHead_)
    reference->listHead_->InsertBefore(this, reference);
}

void BaseList4D::InsertAfter(BaseList4D* reference)
{
  if (reference && reference->listHead_)
    reference->listHead_->InsertAfter(this, reference);
}

Bool BaseList4D::InsertUnder(BaseList4D* parent)
{
  return parent && parent->children_ && parent->children_->InsertFirst(this);
}

Bool BaseList4D::InsertUnderLast(BaseList4D* parent)
{
  return parent && parent->children_ && parent->children_->InsertLast(this);
}

} // namespace _torvane_
