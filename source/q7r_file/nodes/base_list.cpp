#include "torvane/nodes/base_list.h"

#include <cstring>

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/nodes/node_record.h"
#include "torvane/animation/ctrack.h"
#include "torvane/layers/layer_object.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/time/uuid.h"

namespace _torvane_
{

BaseList2D::BaseList2D(Long type) : type_(type) {}

BaseList2D::~BaseList2D() { DeleteObj(extras_); }

BaseList2D::Extras::~Extras()
{
  DeleteObj(tracks);
  DeleteObj(shaders);
  DeleteObj(uniqueIds);
  DeleteObj(dynamicParameters);
}

constinit const BaseList2D::Extras BaseList2D::kNoExtras{};

BaseList2D::Extras* BaseList2D::NeedExtras()
{
  if (!extras_)
    extras_ = NewObj<Extras>();
  return extras_;
}

template <class Part>
Part* BaseList2D::NeedExtra(Part* Extras::*part)
{
  Extras* extras = NeedExtras();
  if (extras && !(extras->*part))
    extras->*part = NewObj<Part>();
  return extras ? extras->*part : nullptr;
}

// The list, made if there is none; null when memory is short.
template <class Root>
Root* BaseList2D::NeedRoot(Root* Extras::*root)
{
  Root* list = NeedExtra(root);
  if (list)
    list->SetOwner(this);
  return list;
}

template <class Root>
Bool BaseList2D::ReadRoot(Root* Extras::*root, HyperFile& file)
{
  if (Root* list = NeedRoot(root))
    return list->ReadChunks(file, false);
  file.SetError(FILEERROR_MEMORY);
  return false;
}

template <class Root>
Bool BaseList2D::CopyRoot(Root* Extras::*root, BaseList2D& target, ULong flags, TransArray* translation) const
{
  if (Root* list = Extra().*root)
    return target.NeedRoot(root) && list->CopyWithTranslation(*(target.extras_->*root), flags, translation);
  if (Root* others = target.Extra().*root; others && !(flags & kCopyNoBranches))
    others->FreeAll();
  return true;
}

template <>
struct ChunkFields<BaseList2D>
{
  // The marker's block: a flag that says that one follows, and its 16 bytes.
  template <class Visitor>
  static Bool VisitMarker(BaseList2D& node, Visitor& v)
  {
    v.ConstantUChar(1);
    if constexpr (Visitor::kReading) {
      UChar bytes[sizeof(NodeMarker)];
      LLong size = 0;
      if (v.Note(v.Good() && v.File().ReadMemoryInto(bytes, sizeof bytes, size)) && size > 0) {
        if (size < static_cast<LLong>(sizeof bytes))
          node.GetMarker(); // what the file doesn't tell stays drawn
        std::memcpy(node.marker_.bytes, bytes, static_cast<std::size_t>(size < 16 ? size : 16));
        node.markerDrawn_ = true;
      }
    } else {
      v.Memory(node.GetMarker().bytes, sizeof(NodeMarker));
    }
    return v.Good();
  }

  template <class Visitor>
  static Bool VisitHeader(BaseList2D& node, Visitor& v)
  {
    VisitHeaderStart(node, v);
    if (v.VersionBelow(kVersionNodeHeader))
      return v.Good();
    v.String(node.name_);
    return VisitHeaderRest(node, v);
  }

  // What stands in front of the name.
  template <class Visitor>
  static Bool VisitHeaderStart(BaseList2D& node, Visitor& v)
  {
    v.LongInto(node.info_);
    v.ConstantLong(0);
    if (v.VersionBelow(kVersionNodeHeader))
      return v.Good();
    v.Container(node.data_);
    return v.Goal(node.goal_);
  }

  template <class Visitor>
  static Bool VisitHeaderRest(BaseList2D& node, Visitor& v)
  {
    if (v.Level() >= 1) {
      const BaseContainer* parameters = node.Extra().dynamicParameters;
      Long present = parameters && parameters->GetCount() > 0 ? 1 : 0;
      v.Long(present);
      if (present >= 1 && v.Good()) {
        if (BaseContainer* list = node.NeedDynamicParameters())
          v.Container(*list);
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
        v.Note(node.SkipOneChunk(v.File()));
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
      v.Link(node.link_);
    if (v.Level() >= 6)
      VisitMarker(node, v);
    if (v.Level() >= 7 && !Visitor::kReading)
      v.ConstantBool(false);
    return v.Good();
  }
};

// Takes the stretches of the header that are as in most nodes in one piece each; the second of them ends behind the
// chunk of node bits.
Bool BaseList2D::ReadHeader(HyperFile& file, Long level)
{
  const NodeRecord* record = level == kLevelNodeHeader && file.MayHoldRecords() ? NodeRecord::Get() : nullptr;
  using Fields = ChunkFields<BaseList2D>;
  if (!record)
    return ReadChunkBody(file, level, [this](ChunkReader& v) { return Fields::VisitHeader(*this, v); });
  ChunkReader v(file, level);
  const PreparedRecord& known = record->GetRecord();
  if (const UChar* start = file.NextRecord(known, record->GetStartPart())) {
    TakeHeaderStart(*record, start);
    file.PassRecord(known, record->GetStartPart());
  } else {
    Fields::VisitHeaderStart(*this, v);
  }
  const UChar* rest = v.String(name_) ? file.NextRecord(known, record->GetRestPart()) : nullptr;
  if (!rest)
    return Fields::VisitHeaderRest(*this, v) && file.SkipToEndChunk();
  TakeHeaderRest(file, *record, rest);
  file.PassRecord(known, record->GetRestPart());
  return true;
}

void BaseList2D::TakeHeaderStart(const NodeRecord& record, const UChar* place)
{
  const NodeRecord::Start start = record.GetStart(place);
  info_ = start.info;
  data_.Flush();
  data_.SetId(start.containerId);
}

void BaseList2D::TakeHeaderRest(const HyperFile& file, const NodeRecord& record, const UChar* place)
{
  record.GetRest(place, marker_, nbits_);
  markerDrawn_ = true;
  if (file.GetTranslator())
    link_.ClearLink();
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
  UniqueIDArray* entries = count >= 1 ? NeedExtra(&Extras::uniqueIds) : nullptr;
  if (entries)
    entries->FreeEntries();
  else if (count >= 1)
    return false;
  for (Long i = 0; i < count; ++i) {
    Long appId = 0;
    void* data = nullptr;
    LLong size = 0;
    if (!file.ReadLong(appId) || !file.ReadMemory(data, size))
      return false;
    if (!entries->AppendEntry(appId, data, size)) {
      GeFree(data);
      return false;
    }
  }
  if (entries)
    file.AddLookups(entries->SettleEntries());
  return file.SkipToEndChunk();
}

void BaseList2D::WriteUniqueIds(HyperFile& file)
{
  file.WriteChunkStart(kChunkUniqueIds, kLevelUniqueIds);
  const UniqueIDArray& entries = *Extra().uniqueIds;
  file.WriteLong(entries.GetCount());
  for (const UniqueIDEntry& entry : entries) {
    file.WriteLong(entry.appId);
    file.WriteMemory(entry.data, entry.size);
  }
  file.WriteChunkEnd();
}

void BaseList2D::WriteChunks(HyperFile& file)
{
  if (GetFirstTrack())
    GetTrackRoot()->WriteAsChunk(file, kChunkTracks);
  WriteChunk(file, kChunkNodeHeader, kLevelNodeHeader,
             [this](ChunkWriter& v) { return ChunkFields<BaseList2D>::VisitHeader(*this, v); });
  if (Extra().uniqueIds)
    WriteUniqueIds(file);
  GeListNode::WriteChunks(file);
  GetKeptChunks().Write(file);
}

Bool BaseList2D::ReadChunk(HyperFile& file, Long id, Long level)
{
  switch (id) {
  case kChunkNodeHeader:
    return ReadHeader(file, level);
  case kChunkUniqueIds:
    return ReadUniqueIds(file);
  case kChunkShaders:
    return ReadRoot(&Extras::shaders, file);
  case kChunkTracks:
    return ReadRoot(&Extras::tracks, file);
  default:
    return GeListNode::ReadChunk(file, id, level);
  }
}

Bool BaseList2D::KeepChunk(HyperFile& file, Long id, Long level)
{
  if (!KeptChunks::Keeps(file, id))
    return false;
  if (Extras* extras = NeedExtras())
    return extras->keptChunks.Read(file, id, level);
  file.SetError(FILEERROR_MEMORY);
  return false;
}

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
  target->name_ = name_;
  return link_.CopyLinkTo(&target->link_, translation) && !watch.Failed() &&
         GeListNode::CopyTo(destination, flags, translation) && CopyExtras(*target, flags, translation);
}

Bool BaseList2D::CopyExtras(BaseList2D& target, ULong flags, TransArray* translation) const
{
  if (!extras_ && !target.extras_)
    return true;
  if (!target.NeedExtras() || !GetKeptChunks().CopyTo(target.extras_->keptChunks))
    return false;
  if (!Extra().dynamicParameters)
    DeleteObj(target.extras_->dynamicParameters);
  else if (!target.NeedDynamicParameters() ||
           !extras_->dynamicParameters->CopyTo(*target.extras_->dynamicParameters, flags, translation))
    return false;
  if (!(flags & kCopyNoBranches) && !CopyRoot(&Extras::shaders, target, flags, translation))
    return false;
  return (flags & kCopyNoTracks) || CopyRoot(&Extras::tracks, target, flags, translation);
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
  const Bool hasParameters = data_.GetId() != -1 || data_.BrowseFirst(first, id, value) || Extra().dynamicParameters;
  const Bool hasLinks = link_.GetLinkGoal() || link_.GetName() || goal_.trunk;
  return name_.GetLength() == 0 && !hasParameters && !hasLinks && !GetShaderRoot() && !GetTrackRoot() &&
         !Extra().uniqueIds && GetKeptChunks().IsEmpty();
}

BaseList2D* BaseList2D::GetLayer() const { return NodeCast<LayerObject>(link_.GetLink()); }

void BaseList2D::SetDocument(BaseDocument* document)
{
  if (document_ == document)
    return;
  document_ = document;
  SetDocumentOfMembers(GetShaderRoot(), document);
  SetDocumentOfMembers(GetTrackRoot(), document);
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
  UniqueIDArray* entries = NeedExtra(&Extras::uniqueIds);
  return entries && entries->SetEntry(appId, data, size);
}

Bool BaseList2D::FindUniqueID(Long appId, const void*& data, LLong& size) const
{
  if (appId == kMarkerAppId) {
    data = GetMarker().bytes;
    size = sizeof(NodeMarker);
    return true;
  }
  UniqueIDArray* entries = Extra().uniqueIds;
  const UniqueIDEntry* entry = entries ? entries->Find(appId) : nullptr;
  if (!entry)
    return false;
  data = entry->data;
  size = entry->size;
  return true;
}

Long BaseList2D::GetUniqueIDCount() const { return (Extra().uniqueIds ? Extra().uniqueIds->GetCount() : 0) + 1; }

Bool BaseList2D::GetUniqueIDByIndex(Long index, Long& appId, const void*& data, LLong& size) const
{
  if (index < 0 || index >= GetUniqueIDCount())
    return false;
  if (index == 0) {
    appId = kMarkerAppId;
    return FindUniqueID(appId, data, size);
  }
  // A file may hold an entry with the marker's number too.
  const UniqueIDEntry& entry = (*Extra().uniqueIds)[index - 1];
  appId = entry.appId;
  data = entry.data;
  size = entry.size;
  return true;
}

BaseShader* BaseList2D::GetShaders() const
{
  return GetShaderRoot() ? NodeCast<BaseShader>(GetShaderRoot()->GetFirst()) : nullptr;
}

Bool BaseList2D::InsertShader(BaseShader* shader, BaseShader* after)
{
  return NeedRoot(&Extras::shaders) && GetShaderRoot()->InsertAfter(shader, after);
}

Bool BaseList2D::InsertShaderLast(BaseShader* shader)
{
  return NeedRoot(&Extras::shaders) && GetShaderRoot()->InsertLast(shader);
}

CTrack* BaseList2D::GetFirstTrack() const
{
  return GetTrackRoot() ? NodeCast<CTrack>(GetTrackRoot()->GetFirst()) : nullptr;
}

Bool BaseList2D::InsertTrackLast(CTrack* track)
{
  return NeedRoot(&Extras::tracks) && GetTrackRoot()->InsertLast(track);
}

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

} // namespace _torvane_
