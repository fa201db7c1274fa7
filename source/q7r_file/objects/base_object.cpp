#include "torvane/objects/base_object.h"

#include <utility>

#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/values/container_defaults.h"
#include "q7r_file/nodes/node_data_chunk.h"
#include "torvane/hooks.h"
#include "torvane/math/crc.h"
#include "torvane/memory/assertion.h"
#include "torvane/tags/base_tag.h"

namespace _torvane_
{

namespace
{

constexpr ContainerDefault kSumsOfNothing[] = {{kKeyModelCheckSum, DefaultForm::kLong, kSumOfNothing}};

} // namespace

BaseObject::BaseObject(Long type) : BaseList4D(type) { tags_.SetOwner(this); }

BaseObject::~BaseObject()
{
  DeleteObj(frozen_);
  DeleteObj(display_);
  DeleteObj(legacyLists_);
  DeleteObj(objectData_);
  RemoveFromList();
  tags_.FreeAll();
}

BaseObject::LegacyLists::~LegacyLists()
{
  for (RootObject*& list : lists)
    DeleteObj(list);
}

Bool BaseObject::IsInstanceOf(Long type) const { return type == GetType() || BaseList4D::IsInstanceOf(type); }

Long BaseObject::GetDiskType() const { return objectData_ ? objectData_->GetDiskType() : kObjectGeneric; }

Bool BaseObject::Execute() { return objectData_ && objectData_->Execute(); }

void BaseObject::SetDocument(BaseDocument* document)
{
  if (document == GetDocument())
    return;
  BaseList4D::SetDocument(document);
  SetDocumentOfMembers(&tags_, document);
  for (Long i = 0; legacyLists_ && i < 2; ++i)
    SetDocumentOfMembers(legacyLists_->lists[i], document);
}

BaseTag* BaseObject::GetFirstTag() const { return NodeCast<BaseTag>(tags_.GetFirst()); }

BaseTag* BaseObject::GetTag(Long type) const
{
  BaseTag* tag = GetFirstTag();
  while (tag && tag->GetType() != type)
    tag = tag->GetNext();
  return tag;
}

void BaseObject::InsertTag(BaseTag* tag, BaseTag* after) { tags_.InsertAfter(tag, after); }

BaseTag* BaseObject::MakeTag(Long type)
{
  BaseTag* tag = _torvane_::MakeTag(type);
  InsertTag(tag);
  return tag;
}

void BaseObject::SetObjectData(NodeData* data) { ReplaceNodeData(*this, objectData_, data); }

RootList2D* BaseObject::AllocChildRoot() const { return AllocRootObject(); }

Bool BaseObject::ReadObjectData(HyperFile& file, Long id, Long level)
{
  Long type = 0;
  ChunkReader reader(file, level);
  if (!ReadNodeDataHead(reader, type, name_))
    return false;
  SetType(type);
  return ReadNodeDataBody(file, id, level, type, {*this, objectData_, raw_});
}

Bool BaseObject::ReadChunk(HyperFile& file, Long id, Long level)
{
  switch (id) {
  case kChunkList:
    return !GetChildRoot() || children_->ReadChunks(file, false);
  case kChunkTags:
    return tags_.ReadChunks(file, false);
  case kChunkTransform:
    return ReadTransform(file, level);
  case kChunkNodeData:
    return ReadObjectData(file, id, level);
  default:
    if (BaseList4D::ReadChunk(file, id, level))
      return true;
    break;
  }
  // Polygon objects keep their own chunks beside the others.
  if (!objectData_ || objectData_->GetDiskType() != kObjectPolygonLabel)
    return false;
  if (GetType() == kObjectPolygon)
    return objectData_->ReadData(file, id, level);
  return GetType() == kObjectJoint && file.SkipToEndChunk();
}

// How what is particular to the type stands in a file.
enum class BaseObject::DataForm
{
  kEnclosed, // in the chunk kChunkNodeData
  kBeside,   // behind the transform chunk, with an empty chunk kChunkNodeData that tells the type
  kStraight, // among the object's chunks, without a chunk kChunkNodeData: the label tells the type
};

// A spline's own chunks can stand straight where the label says all that there is to say; bytes that nobody understands
// and data of another type can't. Polygon data stand behind the transform chunk; those of a joint, though under the
// same label, don't.
BaseObject::DataForm BaseObject::GetDataForm() const
{
  const Bool points = objectData_ ? objectData_->GetDiskType() == kObjectPoint : raw_.GetSize() == 0;
  if (GetDiskType() == kObjectSpline && GetType() == kObjectSpline && points)
    return DataForm::kStraight;
  const Bool polygons = objectData_ && objectData_->GetDiskType() == kObjectPolygonLabel;
  return polygons && GetType() != kObjectJoint ? DataForm::kBeside : DataForm::kEnclosed;
}

// The sum stands in the container, which was written before: a file holds the sum of the write before its own.
void BaseObject::StoreModelCheckSum()
{
  Crc32 sum;
  if (GetType() == kObjectPolygon) {
    for (Long type : {kTagPoint, kTagPolygon}) {
      if (const BaseTag* tag = GetTag(type)) {
        LLong size = 0;
        const void* entries = tag->GetEntryBytes(size);
        sum.Update(entries, size);
      }
    }
  }
  SetModelCheckSum(static_cast<Long>(sum.GetCrc()));
}

// A container that holds no more than the sum of nothing, as most do, shares it.
void BaseObject::SetModelCheckSum(Long sum)
{
  const GeData* present = std::as_const(data_).FindData(kKeyModelCheckSum);
  if (present && present->GetRawType() == kDataLong && present->GetLong() == sum)
    return;
  if (sum == kSumOfNothing && data_.GetCount() == 0)
    data_.SetDefaults(DefaultsOf<kSumsOfNothing>());
  else
    data_.SetLong(kKeyModelCheckSum, sum);
}

void BaseObject::WriteObjectData(HyperFile& file)
{
  const DataForm form = GetDataForm();
  if (form == DataForm::kStraight) {
    WriteNodeDataBody(file, objectData_, raw_);
    return;
  }
  Long type = GetType();
  WriteChunk(file, kChunkNodeData, NodeDataLevel(objectData_, raw_), [&](ChunkWriter& v) {
    if (VisitNodeDataHead(v, type, name_) && form == DataForm::kEnclosed)
      WriteNodeDataBody(file, objectData_, raw_);
  });
}

void BaseObject::WriteChunks(HyperFile& file)
{
  BaseList4D::WriteChunks(file);
  StoreModelCheckSum();
  WriteObjectData(file);
  if (children_ && children_->HasContent())
    children_->WriteAsChunk(file, kChunkList);
  if (tags_.HasContent())
    tags_.WriteAsChunk(file, kChunkTags);
  WriteTransform(file);
  if (GetDataForm() == DataForm::kBeside)
    objectData_->WriteChunks(file);
}

Bool BaseObject::CopyObjectData(BaseObject& destination, ULong flags, TransArray* translation) const
{
  if (!objectData_) {
    // What the destination was made with would be written in place of the bytes.
    DeleteObj(destination.objectData_);
    return raw_.CopyTo(destination.raw_);
  }
  destination.SetType(GetType());
  Bool known = false;
  NodeData* data = AllocObjectDataOfType(GetType(), known);
  if (!data && !known)
    data = AllocNodeDataFor(destination, GetType(), known);
  if (known && !data)
    return false;
  if (!AttachNodeData(data, {destination, destination.objectData_, destination.raw_}))
    return false;
  return !data || objectData_->CopyTo(*data, flags, translation);
}

// False when memory is short: the destination then holds a part.
Bool BaseObject::CopyTransform(BaseObject& destination) const
{
  if (!frozen_) {
    DeleteObj(destination.frozen_);
  } else {
    FrozenPart* part = destination.NeedFrozen();
    if (!part)
      return false;
    *part = *frozen_;
  }
  static_cast<ObjectPlacement&>(destination) = *this;
  return destination.SetDisplay(Display());
}

Bool BaseObject::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<BaseObject>(&destination);
  if (!target)
    return false;
  if (target == this)
    return true;
  if (!CopyObjectData(*target, flags, translation))
    return false;
  if (!BaseList2D::CopyTo(*target, flags, translation) || !tags_.CopyWithTranslation(target->tags_, flags, translation))
    return false;
  if (GetType() != target->GetType() && !(flags & kCopyNoBranches))
    ReportAssertion("q7r_file", __LINE__, "an object was copied onto an object of another type");
  return CopyTransform(*target);
}

Bool BaseObject::CloneChildren(BaseObject& destination, ULong flags, TransArray* translation) const
{
  BaseObject* last = nullptr;
  for (BaseObject* child = GetDown(); child; child = child->GetNext()) {
    auto* clone = NodeCast<BaseObject>(child->MakeClone(flags, translation));
    if (!clone)
      return false;
    if (last) {
      clone->InsertAfter(last);
    } else if (!clone->InsertUnder(&destination)) {
      DeleteObj(clone);
      return false;
    }
    last = clone;
  }
  if (!children_ || !(children_->HasContent() || destination.children_))
    return true;
  return destination.GetChildRoot() && children_->CopyKeptChunks(*destination.children_);
}

BaseObject* BaseObject::MakeEmpty() const
{
  BaseObject* made = AllocObject(GetType());
  // An object of this class may have been read with the type of another.
  if (made && &made->GetNodeKind() != &kNodeKind && made->GetDiskType() != GetDiskType()) {
    DeleteObj(made);
    made = NewObj<BaseObject>(GetType());
  }
  return made;
}

GeListNode* BaseObject::MakeClone(ULong flags, TransArray* translation)
{
  BaseObject* clone = MakeEmpty();
  if (!clone)
    return nullptr;
  clone->tags_.FreeAll();
  if (!CopyWithTranslation(*clone, flags, translation) ||
      (!(flags & kCopyNoChildren) && !CloneChildren(*clone, flags, translation)))
    DeleteObj(clone);
  return clone;
}

} // namespace _torvane_
