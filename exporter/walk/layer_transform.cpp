#include "exporter/walk/layer_transform.h"

#include <utility>

#include "exporter/entry/plugin_state.h"
#include "exporter/walk/keyframes.h"
#include "exporter/walk/layer_sample.h"
#include "exporter/walk/transform.h"
#include "torvane/objects/light_parameters.h"
#include "torvane/tags/base_tag.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr const char* kLockLayerName = "Lock Layer";
constexpr const char* kTargetSuffix = ".Target";
constexpr Long kLayerLockFlag = kLayerFirstFlag + 4;

class LayerTransform
{
 public:
  LayerTransform(ExportContext& context, A_long width, A_long height)
      : context_(context), host_(*context.suites), object_(*context.object)
  {
    rules_.width = width;
    rules_.height = height;
  }
  ~LayerTransform() { DisposeStreams(); }
  LayerTransform(const LayerTransform&) = delete;
  LayerTransform& operator=(const LayerTransform&) = delete;

  bool Run();

 private:
  void ReadParent();
  void ReadFlags();
  void OpenStreams();
  void DecideRotation();
  bool MakeTarget();
  void AssignLockLayer();
  void SetNames();
  void SetLayerId();
  void SetInitialTransform();
  void PlaceTarget();
  void ExportTracks();
  void DisposeStreams();
  void ReadParentSize();
  bool HasRotationStreams() const
  {
    return context_.rotateXStream && context_.rotateYStream && context_.rotateZStream && context_.orientationStream;
  }

  ExportContext& context_;
  HostCalls host_;
  BaseObject& object_;
  BaseObject* target_ = nullptr;
  AEGP_LayerH offsetLayer_ = nullptr; // its size shifts the object; null for none, and once the size was asked for
  HostStream anchorStream_;
  HostStream scaleStream_;
  TransformRules rules_;
  AEGP_LayerFlags flags_ = AEGP_LayerFlag_VIDEO_ACTIVE;
  bool hasAnchor_ = false;
  bool positionVaries_ = false;
  bool rotationVaries_ = false;
  bool rotationHasKeys_ = false;
  bool scaleVaries_ = false;
  bool anchorVaries_ = false;
};

bool LayerTransform::Run()
{
  hasAnchor_ = object_.GetType() == kObjectPlane || object_.GetType() == kObjectNull;
  ReadParent();
  ReadFlags();
  OpenStreams();
  DecideRotation();
  if (!MakeTarget())
    return false;
  AssignLockLayer();
  SetNames();
  SetLayerId();
  SetInitialTransform();
  ExportTracks();
  DisposeStreams();
  PlaceTarget();
  return host_.Good();
}

// Children stand where their parent's corner is; the scene counts from the centre of its plane. Only parents with a
// source have a size: a 2D parent, a camera, a light or a text shifts nothing, and keeps the enclosing layer, which
// counts where there is no parent, from doing so.
void LayerTransform::ReadParent()
{
  AEGP_LayerH parent = nullptr;
  AEGP_ItemH item = nullptr;
  host_(&AEGP_LayerSuite13::AEGP_GetLayerParent, context_.layer, &parent);
  if (!parent) {
    offsetLayer_ = context_.enclosingLayer;
    return;
  }
  A_Boolean is3D = 0;
  AEGP_ObjectType objectType = AEGP_ObjectType_NONE;
  AEGP_ItemType itemType = 0;
  host_(&AEGP_LayerSuite13::AEGP_IsLayer3D, parent, &is3D);
  if (!is3D)
    return;
  host_(&AEGP_LayerSuite13::AEGP_GetLayerObjectType, parent, &objectType);
  host_(&AEGP_LayerSuite13::AEGP_GetLayerSourceItem, parent, &item);
  if (item)
    host_(&AEGP_ItemSuite13::AEGP_GetItemType, item, &itemType);
  if (itemType == AEGP_ItemType_FOOTAGE || itemType == AEGP_ItemType_COMP)
    offsetLayer_ = parent;
}

// Asked for once, where it is first needed.
void LayerTransform::ReadParentSize()
{
  const AEGP_LayerH layer = std::exchange(offsetLayer_, nullptr);
  AEGP_ItemH item = nullptr;
  A_long width = 0;
  A_long height = 0;
  if (layer)
    host_(&AEGP_LayerSuite13::AEGP_GetLayerSourceItem, layer, &item);
  if (item && host_(&AEGP_ItemSuite13::AEGP_GetItemDimensions, item, &width, &height))
    rules_.parentShift = ParentShift(width, height);
}

void LayerTransform::ReadFlags()
{
  host_(&AEGP_LayerSuite13::AEGP_GetLayerFlags, context_.layer, &flags_);
  GeData lightType;
  bool canLook = object_.GetType() == kObjectCamera;
  if (object_.GetType() == kObjectLight && object_.GetParameterById(kLightType, lightType))
    canLook = lightType.GetLong() == kLightSpot;
  rules_.lookAtTarget = canLook && (flags_ & AEGP_LayerFlag_LOOK_AT_POI) != 0;
  if ((flags_ & AEGP_LayerFlag_VIDEO_ACTIVE) == 0)
    object_.SetRenderMode(kObjectModeOff);
}

void LayerTransform::OpenStreams()
{
  const AEGP_LayerH layer = context_.layer;
  context_.orientationStream.Open(host_, layer, AEGP_LayerStream_ORIENTATION);
  context_.rotateXStream.Open(host_, layer, AEGP_LayerStream_ROTATE_X);
  context_.rotateYStream.Open(host_, layer, AEGP_LayerStream_ROTATE_Y);
  context_.rotateZStream.Open(host_, layer, AEGP_LayerStream_ROTATE_Z);
  context_.positionStream.Open(host_, layer, AEGP_LayerStream_POSITION);
  if (hasAnchor_)
    anchorStream_.Open(host_, layer, AEGP_LayerStream_ANCHORPOINT);
  scaleStream_.Open(host_, layer, AEGP_LayerStream_SCALE);
  rules_.useScale = scaleStream_ && hasAnchor_;
  rules_.useAnchor = anchorStream_ && hasAnchor_;
}

void LayerTransform::DecideRotation()
{
  for (HostStream* stream :
       {&context_.rotateXStream, &context_.rotateYStream, &context_.rotateZStream, &context_.orientationStream}) {
    const A_long keys = StreamVaries(host_, stream->Get());
    rotationVaries_ = rotationVaries_ || keys > 0;
    rotationHasKeys_ = rotationHasKeys_ || keys != 0;
  }
  positionVaries_ = StreamVaries(host_, context_.positionStream.Get()) > 0;
  scaleVaries_ = StreamVaries(host_, scaleStream_.Get()) > 0;
  anchorVaries_ = StreamVaries(host_, anchorStream_.Get()) > 0;
  if (!HasRotationStreams())
    return;
  LayerSample sample;
  ReadRotation(host_, context_, context_.workAreaStart, sample);
  const bool turned =
      sample.orientation != Vector() || sample.rotateX != 0.0 || sample.rotateY != 0.0 || sample.rotateZ != 0.0;
  rules_.useRotation = turned || rotationHasKeys_;
}

// A camera or spot light without a rotation of its own follows a target object; one with a rotation has the look at its
// point of interest baked into its angles instead.
bool LayerTransform::MakeTarget()
{
  if (!rules_.lookAtTarget)
    return true;
  anchorStream_.Open(host_, context_.layer, AEGP_LayerStream_ANCHORPOINT);
  anchorVaries_ = StreamVaries(host_, anchorStream_.Get()) > 0;
  if (!anchorStream_ || rules_.useRotation)
    return true;
  target_ = AllocObject(kObjectNull);
  if (!target_)
    return false;
  target_->InsertAfter(&object_);
  BaseTag* tag = object_.MakeTag(kTagTarget);
  if (!tag)
    return false;
  tag->GetDataInstance().SetLink(kTargetLink, target_);
  return true;
}

// All locked layers of the top composition share one scene layer.
void LayerTransform::AssignLockLayer()
{
  if ((flags_ & AEGP_LayerFlag_LOCKED) == 0 || context_.enclosingLayer)
    return;
  if (!context_.lockLayer && (context_.lockLayer = AllocLayer())) {
    context_.lockLayer->SetName(kLockLayerName);
    context_.document->InsertLayer(context_.lockLayer);
    context_.lockLayer->SetParameterById(kLayerLockFlag, true);
  }
  if (!context_.lockLayer)
    return;
  object_.SetLayer(context_.lockLayer);
  if (target_)
    target_->SetLayer(context_.lockLayer);
}

// The layer's own name or else that of its source.
void LayerTransform::SetNames()
{
  HostText layerName(host_);
  host_(&AEGP_LayerSuite13::AEGP_GetLayerName, PluginId, context_.layer, layerName.Out(), nullptr);
  String name = layerName.Take16();
  if (!name.Content()) {
    AEGP_ItemH item = nullptr;
    HostText itemName(host_);
    host_(&AEGP_LayerSuite13::AEGP_GetLayerSourceItem, context_.layer, &item);
    if (item)
      host_(&AEGP_ItemSuite13::AEGP_GetItemName, PluginId, item, itemName.Out());
    name = itemName.Take16();
  }
  object_.SetName(name);
  if (target_)
    target_->SetName(name + kTargetSuffix);
}

void LayerTransform::SetLayerId()
{
  AEGP_LayerIDVal id = kNoLayerId;
  if (!host_(&AEGP_LayerSuite13::AEGP_GetLayerID, context_.layer, &id))
    return;
  object_.GetDataInstance().SetLong(kKeyLayerId, id);
  context_.layers.Add(id, &object_);
}

void LayerTransform::SetInitialTransform()
{
  LayerSample sample;
  if (!context_.positionStream || !HasRotationStreams() ||
      !ReadLayerSample(host_, context_, anchorStream_, scaleStream_, context_.workAreaStart, rules_, sample))
    return;
  ReadParentSize();
  const SceneTransform transform = ConvertTransform(sample, rules_, nullptr);
  object_.SetRelPos(transform.position);
  if (rules_.useRotation) {
    object_.SetRotationOrder(kExportRotationOrder);
    object_.SetRelRot(transform.rotation);
  }
  if (rules_.useScale)
    object_.SetRelScale(transform.scale);
}

// What moves gets a position track; what turns, one for its rotation. The scale has tracks of its own only where it has
// keys: a constant one counts in the place of every frame all the same.
void LayerTransform::ExportTracks()
{
  const bool hasScaleTracks = rules_.useScale && scaleVaries_;
  if (!positionVaries_ && !rotationVaries_ && !anchorVaries_ && !hasScaleTracks)
    return;
  BaseObject* turning = rules_.useRotation ? &object_ : nullptr;
  BaseObject* scaling = hasScaleTracks ? &object_ : nullptr;
  TransformTracks tracks = {.position = {&object_, kObjectRelPos, kPositionTrackNames},
                            .rotation = {turning, kObjectRelRot, kRotationTrackNames},
                            .scale = {scaling, kObjectRelScale, kScaleTrackNames}};
  if (!tracks.position)
    return;
  SampleTransform(context_, host_, anchorStream_, scaleStream_, tracks, rules_);
  // What could not be sampled keeps its tracks, without keys.
  for (VectorTracks* vector : {&tracks.position, &tracks.rotation, &tracks.scale})
    vector->Insert();
}

void LayerTransform::DisposeStreams()
{
  for (HostStream* stream : {&context_.rotateXStream, &context_.rotateYStream, &context_.rotateZStream,
                             &context_.orientationStream, &context_.positionStream, &scaleStream_})
    stream->Dispose(host_);
}

void LayerTransform::PlaceTarget()
{
  if (target_) {
    const AEGP_StreamRefH stream = anchorStream_.Get();
    AEGP_StreamVal2 place = {};
    A_long keyframes = 0;
    A_Boolean varies = 0;
    if (ReadStream(host_, stream, context_.workAreaStart, place)) {
      ReadParentSize();
      target_->SetRelPos(FlipY(ToVector(place.three_d)) + rules_.parentShift);
    }
    host_(&AEGP_KeyframeSuite4::AEGP_GetStreamNumKFs, stream, &keyframes);
    host_(&AEGP_StreamSuite9::AEGP_IsStreamTimevarying, stream, &varies);
    if (varies || keyframes > 0) {
      VectorTracks tracks(target_, kObjectRelPos, kPositionTrackNames);
      // The first place is shifted by the parent, the keys are not.
      SampleStream(context_, host_, stream, tracks.All(), {.mode = SampleMode::kPosition});
    }
  }
  anchorStream_.Dispose(host_);
}

} // namespace

bool ExportTransform(ExportContext& context, A_long width, A_long height)
{
  return LayerTransform(context, width, height).Run();
}

} // namespace exporter
