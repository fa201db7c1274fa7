#include "torvane/views/base_draw.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/nodes/node_tools.h"
#include "q7r_file/views/draw_defaults.h"
#include "torvane/document/base_document.h"

namespace _torvane_
{

namespace
{

constexpr Long kKeyCameraOfDraw = 1123; // of a camera's container: set where the camera is a draw's own
constexpr Vector kEditorPos(600.0001, 300.0, -600.0);
constexpr Vector kEditorRot(DegreesToRadians(45.0), DegreesToRadians(-20.0), 0.0);

} // namespace

BaseDraw::BaseDraw() : BaseList2D(kTypeBaseDraw) { SetDrawDefaults(data_); }

BaseDraw::~BaseDraw() { DeleteObj(editorCamera_); }

BaseObject* BaseDraw::GetEditorCamera()
{
  if (editorCamera_)
    return editorCamera_;
  editorCamera_ = AllocObject(kObjectCamera);
  if (editorCamera_ && !editorCamera_->GetDataInstance().SetData(kKeyCameraOfDraw, GeData(true)))
    DeleteObj(editorCamera_);
  if (!editorCamera_)
    return nullptr;
  editorCamera_->SetRelPos(kEditorPos);
  editorCamera_->SetRelRot(kEditorRot);
  editorCamera_->SetDocument(document_);
  return editorCamera_;
}

void BaseDraw::SetDocument(BaseDocument* document)
{
  BaseList2D::SetDocument(document);
  if (editorCamera_)
    editorCamera_->SetDocument(document);
}

template <>
struct ChunkFields<BaseDraw>
{
  template <class Visitor>
  static Bool VisitBody(BaseDraw& draw, Visitor& v)
  {
    if (!draw.GetEditorCamera()) {
      v.File().SetError(FILEERROR_MEMORY);
      return v.Note(false);
    }
    BaseObject& camera = *draw.editorCamera_;
    Vector pos = camera.GetRelPos();
    Vector scale = camera.GetRelScale();
    Vector rot = camera.GetRelRot();
    v.EmptyString();
    v.Container(camera.GetDataInstance());
    v.Vector(pos);
    v.Vector(scale);
    v.Vector(rot);
    if constexpr (Visitor::kReading) {
      camera.SetRelPos(pos);
      camera.SetRelScale(scale);
      camera.SetRelRot(rot);
    }
    if (v.Level() >= 1)
      v.Link(draw.sceneCamera_);
    if (v.Level() >= 2)
      v.EmptyLink();
    return v.Good();
  }
};

void BaseDraw::WriteChunks(HyperFile& file)
{
  BaseList2D::WriteChunks(file);
  pref_.WriteChunks(file);
  WriteChunk(file, kChunkBaseDraw, kLevelBaseDraw,
             [this](ChunkWriter& v) { return ChunkFields<BaseDraw>::VisitBody(*this, v); });
}

Bool BaseDraw::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList2D::ReadChunk(file, id, level))
    return true;
  return id == kChunkBaseDraw &&
         ReadChunkBody(file, level, [this](ChunkReader& v) { return ChunkFields<BaseDraw>::VisitBody(*this, v); });
}

Bool BaseDraw::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<BaseDraw>(&destination);
  if (!target)
    return false;
  if (!BaseList2D::CopyTo(destination, flags, translation))
    return false;
  // Two cameras that are still to be made are equal.
  if ((editorCamera_ || target->editorCamera_) &&
      (!GetEditorCamera() || !target->GetEditorCamera() ||
       !editorCamera_->CopyWithTranslation(*target->editorCamera_, flags, translation)))
    return false;
  return sceneCamera_.CopyLinkTo(&target->sceneCamera_, translation);
}

ViewPanel::ViewPanel() : BaseList2D(kTypeViewPanel) { draws_.SetOwner(this); }

void ViewPanel::SetDocument(BaseDocument* document)
{
  if (document_ == document)
    return;
  BaseList2D::SetDocument(document);
  SetDocumentOfMembers(&draws_, document);
}

void ViewPanel::WriteChunks(HyperFile& file)
{
  BaseList2D::WriteChunks(file);
  if (draws_.HasContent())
    draws_.WriteAsChunk(file, kChunkBaseDrawRoot);
  WriteChunk(file, kChunkViewPanel, 0, [this](ChunkWriter& v) { return v.Container(settings_); });
}

Bool ViewPanel::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList2D::ReadChunk(file, id, level))
    return true;
  switch (id) {
  case kChunkBaseDrawRoot:
    return ReadInnerChunk(file, draws_);
  case kChunkViewPanel:
    return ReadChunkBody(file, level, [this](ChunkReader& v) { return v.Container(settings_); });
  default:
    return false;
  }
}

Bool ViewPanel::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<ViewPanel>(&destination);
  if (!target)
    return false;
  return BaseList2D::CopyTo(destination, flags, translation) && draws_.CopyTo(target->draws_, flags, translation) &&
         settings_.CopyTo(target->settings_, flags, translation);
}

// All four or none. They go to the head of the list one after the other, the last view first.
Bool ViewPanel::MakeDraws()
{
  BaseDraw* draws[kDrawCount] = {};
  for (BaseDraw*& draw : draws) {
    draw = NewObj<BaseDraw>();
    if (draw && draw->GetEditorCamera())
      continue;
    for (BaseDraw*& made : draws)
      DeleteObj(made);
    return false;
  }
  for (Long index = kDrawCount - 1; index >= 0; --index) {
    SetViewOfIndex(*draws[index], index);
    draws_.InsertFirst(draws[index]);
  }
  return true;
}

BaseDraw* ViewPanel::GetBaseDraw(Long index)
{
  if (draws_.GetCount() < kDrawCount && !MakeDraws())
    return nullptr;
  index = index < 0 ? 0 : index >= kDrawCount ? kDrawCount - 1 : index;
  auto* draw = NodeCast<BaseDraw>(draws_.GetFirst());
  for (Long i = 0; draw && i < index; ++i)
    draw = draw->GetNext();
  return draw;
}

Bool BaseDocument::SetSceneCamera(BaseObject* camera)
{
  if (!camera || camera->GetType() != kObjectCamera || !viewPanels_)
    return false;
  auto* panel = NodeCast<ViewPanel>(viewPanels_->GetFirst());
  if (!panel) {
    panel = NewObj<ViewPanel>();
    viewPanels_->InsertFirst(panel);
  }
  BaseDraw* draw = panel ? panel->GetBaseDraw(0) : nullptr;
  if (!draw)
    return false;
  draw->GetSceneCamera().SetLink(camera);
  return true;
}

} // namespace _torvane_
