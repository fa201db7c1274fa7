// The transform of an object in a file, with how the editor shows it.
#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/objects/transform_record.h"
#include "torvane/document/base_document.h"
#include "torvane/hooks.h"
#include "torvane/nodes/node_sink.h"
#include "torvane/objects/base_object.h"

namespace _torvane_
{

namespace
{

// In matrices of old files an axis below this is a mirrored one.
constexpr Real kMirroredBelow = -0.9;

} // namespace

template <>
struct ChunkFields<BaseObject>
{
  // The transform chunk. Files from kVersionTransform on hold every value; in older ones the level tells how far the
  // values reach.
  template <class Visitor>
  static Bool VisitTransform(BaseObject& object, Visitor& v)
  {
    const Bool old = v.VersionBelow(kVersionTransform);
    const Bool oldest = v.VersionBelow(kVersionNodeHeader);
    if (oldest)
      v.Container(object.data_);
    v.Vector(object.relPos_);
    v.Vector(object.relScale_);
    v.Vector(object.relRot_);
    if (old)
      VisitMirroring(object, v);
    if (oldest)
      v.String(object.name_);
    if (!oldest || v.Level() >= 1) {
      v.Long(object.editorMode_);
      v.Long(object.renderMode_);
      v.Long(object.disabled_);
    }
    if (oldest)
      return v.Good();
    VisitDisplay(object, v);
    if (!old || v.Level() >= 6)
      VisitFrozen(object, v);
    if (old)
      return v.Good();
    if (v.Level() == 8)
      v.template Skip<Long>(); // an order that only later levels mean
    if (v.Level() >= 9)
      v.Long(object.rotationOrder_);
    return v.Good();
  }

  // What two old matrices tell of mirrored axes: the scale of old files has no sign. The z axis is looked for in the
  // second one.
  template <class Visitor>
  static void VisitMirroring(BaseObject& object, Visitor& v)
  {
    if constexpr (Visitor::kReading) {
      Matrix local;
      Matrix axes;
      v.Matrix(local);
      v.Matrix(axes);
      if (axes.v1.x < kMirroredBelow)
        object.relScale_.x = -object.relScale_.x;
      if (axes.v2.y < kMirroredBelow)
        object.relScale_.y = -object.relScale_.y;
      if (axes.v2.z < kMirroredBelow)
        object.relScale_.z = -object.relScale_.z;
    }
  }

  template <class Visitor>
  static void VisitDisplay(BaseObject& object, Visitor& v)
  {
    const Bool old = v.VersionBelow(kVersionTransform);
    auto holds = [&](Long level) { return !old || v.Level() >= level; };
    BaseObject::DisplayPart part = object.Display();
    if (holds(1)) {
      v.Bool(part.flag);
      if (old)
        v.template Skip<Bool>();
      v.Vector(part.color);
    }
    if (holds(2))
      v.Long(part.colorMode);
    if (holds(3)) {
      v.Vector(part.storedVector);
      v.Long(part.storedMode);
    }
    if (holds(4))
      v.Matrix(part.storedMatrix);
    if constexpr (Visitor::kReading) {
      if (!object.SetDisplay(part)) {
        v.File().SetError(FILEERROR_MEMORY);
        v.Note(false);
      }
    }
    if (holds(5)) {
      VisitLegacyList(object, v, 0);
      VisitLegacyList(object, v, 1);
    }
  }

  // A list of objects that old files may hold here. It is never written.
  template <class Visitor>
  static void VisitLegacyList(BaseObject& object, Visitor& v, Long number)
  {
    if constexpr (Visitor::kReading) {
      Bool present = false;
      v.Bool(present);
      if (!present)
        return;
      if (!object.legacyLists_)
        object.legacyLists_ = NewObj<BaseObject::LegacyLists>();
      RootObject* list = object.legacyLists_ ? object.legacyLists_->lists[number] : nullptr;
      if (object.legacyLists_ && !list)
        list = object.legacyLists_->lists[number] = AllocRootObject();
      if (!list) {
        v.File().SetError(FILEERROR_MEMORY);
        v.Note(false);
        return;
      }
      list->SetOwner(&object);
      v.Note(list->ReadChunks(v.File(), true));
      if (NodeSink* sink = object.GetDocument() ? object.GetDocument()->GetNodeSink() : nullptr)
        sink->TakeBack(); // these are no objects of the scene
    } else {
      v.ConstantBool(false);
    }
  }

  template <class Visitor>
  static void VisitFrozen(BaseObject& object, Visitor& v)
  {
    v.ULong(object.frozenFlags_);
    if (!object.HasFrozenTransform())
      return;
    BaseObject::FrozenPart* part = object.NeedFrozen();
    if (!part) {
      object.frozenFlags_ = 0;
      v.File().SetError(FILEERROR_MEMORY);
      v.Note(false);
      return;
    }
    v.Vector(part->pos);
    v.Vector(part->scale);
    v.Vector(part->rot);
    v.Vector(part->absPos);
    v.Vector(part->absScale);
    v.Vector(part->absRot);
  }
};

void BaseObject::WriteTransform(HyperFile& file)
{
  WriteChunk(file, kChunkTransform, kLevelTransform,
             [this](ChunkWriter& v) { return ChunkFields<BaseObject>::VisitTransform(*this, v); });
}

// The chunk of an object without anything unusual, in one piece. False if it is another one.
Bool BaseObject::ReadPlainTransform(HyperFile& file, Long level)
{
  const Bool isCurrent = level == kLevelTransform && file.MayHoldRecords();
  const TransformRecord* record = isCurrent ? TransformRecord::Get() : nullptr;
  const UChar* place = record ? file.NextRecord(record->GetRecord(), record->GetBody()) : nullptr;
  if (!place)
    return false;
  TakePlainTransform(*record, place);
  file.PassRecord(record->GetRecord(), record->GetBody());
  return true;
}

void BaseObject::TakePlainTransform(const TransformRecord& record, const UChar* place)
{
  record.Get(place, {{&relPos_, &relScale_, &relRot_}, {&editorMode_, &renderMode_, &disabled_, &rotationOrder_}});
  frozenFlags_ = 0;
  SetDisplay(kPlainDisplay);
  TurnIn(rotationOrder_);
}

Bool BaseObject::ReadTransform(HyperFile& file, Long level)
{
  if (ReadPlainTransform(file, level))
    return true;
  ReadChunkBody(file, level, [this](ChunkReader& v) { return ChunkFields<BaseObject>::VisitTransform(*this, v); });
  const Bool hasOrder = file.GetFileVersion() >= kVersionTransform && level >= 8;
  TurnIn(hasOrder ? rotationOrder_ : kRotationOrderScene);
  return true;
}

// What follows from the values that were read.
void BaseObject::TurnIn(Long order)
{
  turnedIn_ = order;
  if (HasFrozenTransform()) {
    frozen_->matrix = AnglesToMatrix(frozen_->rot, order);
    frozen_->inverse = Invert(frozen_->matrix);
  } else if (frozen_) {
    frozen_->matrix = Matrix();
    frozen_->inverse = Matrix();
    TakeRelAsAbs();
  }
}

} // namespace _torvane_
