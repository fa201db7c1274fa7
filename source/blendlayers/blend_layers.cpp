// The array of layers, and the custom value around it.
#include "torvane/shaders/blend_layers.h"

#include "blendlayers/blend_fields.h"
#include "k2v_file/memory/stack_room.h"
#include "torvane/memory/assertion.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

namespace
{

// What readers of the log know these reports by.
constexpr Long kLineAllocObject = 16;
constexpr Long kLineUnknownType = 41;
constexpr Long kLineReadUnknownType = 152;
constexpr Long kLineForeignLayer = 281;

// Below this level layers can't be switched off.
constexpr Long kLevelWithEnabled = 2;

// True if the array is that of the folder or of one below it.
Bool Holds(BlendLayer& layer, const CBlendLayers* array)
{
  BlendFolder* folder = layer.AsFolder();
  if (!folder)
    return false;
  const CBlendLayers& children = folder->GetChildren();
  Bool found = &children == array;
  for (Long i = 0; !found && i < children.GetCount(); ++i)
    found = Holds(*children.GetLayer(i), array);
  return found;
}

} // namespace

// ---------------------------------------------------------------------------------------------------------------
// Layers in the array

BlendLayer* CBlendLayers::GetLayer(Long index) const
{
  return index >= 0 && index < layers_.GetCount() ? layers_[index] : nullptr;
}

void CBlendLayers::FlushLayers()
{
  for (BlendLayer*& layer : layers_)
    DeleteLayer(layer);
  layers_.Flush();
}

BlendLayer* CBlendLayers::MakeLayer(Long type)
{
  switch (type) {
  case kBlendFolder:
    return NewObj<BlendFolder>();
  case kBlendShader:
    return NewObj<BlendShader>();
  case kBlendBC:
    return NewObj<BlendEffectBC>();
  case kBlendHSL:
    return NewObj<BlendEffectHSL>();
  case kBlendPosterize:
    return NewObj<BlendEffectPosterize>();
  case kBlendColorize:
    return NewObj<BlendEffectColorize>();
  case kBlendClamp:
    return NewObj<BlendEffectClamp>();
  case kBlendClip:
    return NewObj<BlendEffectClip>();
  case kBlendDistorter:
    return NewObj<BlendEffectDistorter>();
  case kBlendTransform:
    return NewObj<BlendEffectTransform>();
  default:
    ReportAssertion(kBlendModule, kLineUnknownType, "a blend layer of an unknown type was to be made");
    return nullptr;
  }
}

void* CBlendLayers::AllocObject()
{
  ReportAssertion(kBlendModule, kLineAllocObject, "a blend layer was to be made without a type");
  return nullptr;
}

void CBlendLayers::DeleteLayer(BlendLayer*& layer) { DeleteObj(layer); }

Long CBlendLayers::FindLayer(const BlendLayer* layer) const
{
  for (Long i = 0; i < layers_.GetCount(); ++i) {
    if (layers_[i] == layer)
      return i;
  }
  return -1;
}

Bool CBlendLayers::InsertLayer(BlendLayer* layer, Long position)
{
  if (!layers_.Insert(position, layer))
    return false;
  layer->parent_ = this;
  return true;
}

BlendLayer* CBlendLayers::AppendLayer(Long type)
{
  BlendLayer* layer = MakeLayer(type);
  if (layer && !InsertLayer(layer, GetCount()))
    DeleteLayer(layer);
  return layer;
}

Bool CBlendLayers::RemoveLayer(BlendLayer* layer)
{
  const Long place = FindLayer(layer);
  if (place < 0)
    return false;
  layer->ReleaseLinked();
  layers_.Remove(place);
  layer->parent_ = nullptr;
  return true;
}

void CBlendLayers::RemoveLayerFromParent(BlendLayer* layer)
{
  CBlendLayers* array = layer ? layer->parent_ : nullptr;
  if (!array)
    return;
  if (!array->layers_.Remove(array->FindLayer(layer)))
    ReportAssertion(kBlendModule, kLineForeignLayer, "a blend layer isn't in the array that it names");
  layer->parent_ = nullptr;
}

Bool CBlendLayers::MoveLayer(BlendLayer* layer, BlendLayer* target, Long place)
{
  if (place != kBlendBefore && place != kBlendInside && place != kBlendBehind)
    return true;
  if (layer == target)
    return layer && place != kBlendInside; // it stands beside itself
  CBlendLayers* array = this;
  if (target && place == kBlendInside) {
    BlendFolder* folder = target->AsFolder();
    array = folder ? &folder->GetChildren() : nullptr;
  } else if (target) {
    array = target->parent_;
  }
  if (!layer || !array || Holds(*layer, array))
    return false;
  if (layer->parent_ != array && !array->layers_.Reserve(array->GetCount() + 1))
    return false;
  RemoveLayerFromParent(layer);
  Long position = 0;
  if (target && place != kBlendInside)
    position = array->FindLayer(target) + (place == kBlendBehind ? 1 : 0);
  return array->InsertLayer(layer, position);
}

// ---------------------------------------------------------------------------------------------------------------
// The whole stack

void CBlendLayers::ClearSelection()
{
  for (BlendLayer* layer : layers_) {
    layer->SetSelected(false);
    if (BlendFolder* folder = layer->AsFolder())
      folder->GetChildren().ClearSelection();
  }
}

BlendLayer* CBlendLayers::FirstSelected() const
{
  for (BlendLayer* layer : layers_) {
    if (layer->IsSelected())
      return layer;
    BlendFolder* folder = layer->AsFolder();
    BlendLayer* found = folder ? folder->GetChildren().FirstSelected() : nullptr;
    if (found)
      return found;
  }
  return nullptr;
}

BlendLayer* CBlendLayers::FindById(Long id) const
{
  for (BlendLayer* layer : layers_) {
    if (layer->GetLayerId() == id)
      return layer;
    BlendFolder* folder = layer->AsFolder();
    BlendLayer* found = folder ? folder->GetChildren().FindById(id) : nullptr;
    if (found)
      return found;
  }
  return nullptr;
}

void CBlendLayers::ReleaseLinked()
{
  for (BlendLayer* layer : layers_)
    layer->ReleaseLinked();
}

GeAliasLink* CBlendLayers::GetFirstLink() const { return GetCount() > 0 ? layers_[0]->GetLink() : nullptr; }

Bool CBlendLayers::CopyLayersTo(CBlendLayers& other, TransArray* translation) const
{
  if (&other == this)
    return true;
  other.FlushLayers();
  if (!HasStackRoom())
    return false;
  for (const BlendLayer* layer : layers_) {
    BlendLayer* copy = other.AppendLayer(layer->GetLayerType());
    if (!copy || !layer->CopyLayerTo(*copy, translation))
      return false;
  }
  return true;
}

Bool CBlendLayers::CompareLayers(const CBlendLayers& other) const
{
  if (GetCount() != other.GetCount())
    return false;
  for (Long i = 0; i < GetCount(); ++i) {
    if (layers_[i]->LayersDiffer(*other.layers_[i]))
      return false;
  }
  return true;
}

// ---------------------------------------------------------------------------------------------------------------
// The file

Bool CBlendLayers::WriteOneLayer(HyperFile& file, BlendLayer& layer)
{
  file.WriteLong(layer.layerType_);
  file.WriteBool(layer.selected_);
  file.WriteString(layer.name_);
  file.WriteLong(layer.layerId_);
  file.WriteLong(layer.blendMode_);
  return layer.WriteLayer(file) && file.WriteBool(layer.enabled_);
}

Bool CBlendLayers::WriteList(HyperFile& file, Long level) const
{
  if (!file.EnterLoop()) // a list that could not be read again, so deep does it lie
    return false;
  Bool written = file.WriteLong(GetCount()) && file.WriteLong(level);
  for (BlendLayer* layer : layers_)
    written = WriteOneLayer(file, *layer) && written;
  file.LeaveLoop();
  return written;
}

// Appends the layer that it reads; null when none can be made. `read` becomes false when a value failed.
BlendLayer* CBlendLayers::ReadOneLayer(HyperFile& file, Long level, Bool& read)
{
  Long type = 0;
  BlendLayer* layer = file.ReadLong(type) ? AppendLayer(type) : nullptr;
  if (!layer) {
    if (file.GetError() == FILEERROR_NONE)
      ReportAssertion(kBlendModule, kLineReadUnknownType, "a file holds a blend layer of an unknown type");
    return nullptr;
  }
  read = file.ReadBool(layer->selected_) && read;
  read = file.ReadString(layer->name_) && read;
  read = file.ReadLong(layer->layerId_) && read;
  read = file.ReadLong(layer->blendMode_) && read;
  read = layer->ReadLayer(file, level) && read;
  if (level >= kLevelWithEnabled)
    read = file.ReadBool(layer->enabled_) && read;
  return layer;
}

Bool CBlendLayers::ReadList(HyperFile& file, Bool clear)
{
  if (clear)
    FlushLayers();
  Long count = 0;
  Long level = 0;
  if (!file.ReadLong(count) || !file.ReadLong(level) || !file.EnterLoop())
    return false;
  Bool read = true;
  Bool made = true;
  // The room grows with what is read: the count is not trusted.
  for (Long i = 0; i < count && made && file.GetError() == FILEERROR_NONE; ++i)
    made = ReadOneLayer(file, level, read) != nullptr;
  file.LeaveLoop();
  return read && made;
}

// ---------------------------------------------------------------------------------------------------------------
// The custom value

Bool iBlendDataType::IsEqual(const CustomData& other) const
{
  const auto* stack = NodeCast<iBlendDataType>(&other);
  return stack && layers_.CompareLayers(stack->layers_) && blendVersion_ == stack->blendVersion_;
}

Bool iBlendDataType::CopyTo(CustomData& destination, TransArray* translation) const
{
  auto* target = NodeCast<iBlendDataType>(&destination);
  if (!target)
    return false;
  target->blendVersion_ = blendVersion_;
  return layers_.CopyLayersTo(target->layers_, translation);
}

// A stack that can't be taken leaves the stream somewhere in its chunk, so it is an error of the file.
Bool iBlendDataType::Read(HyperFile& file, Long)
{
  if (layers_.ReadList(file, true) && file.ReadLong(blendVersion_))
    return file.SkipToEndChunk();
  if (file.GetError() == FILEERROR_NONE)
    file.SetError(FILEERROR_WRONG_VALUE);
  return false;
}

void iBlendDataType::Write(HyperFile& file) const
{
  if (layers_.WriteList(file, kBlendListLevel))
    file.WriteLong(blendVersion_);
}

// The layer that a path's first level addresses, or null; `sub` becomes the number within the layer.
BlendLayer* iBlendDataType::FindLayer(const ParameterPath& path, Long& sub) const
{
  if (path[0].id < kBlendFirstId)
    return nullptr;
  const Long place = path[0].id - kBlendFirstId;
  sub = place % kBlendIdsPerLayer;
  return layers_.FindById(place / kBlendIdsPerLayer);
}

Bool iBlendDataType::GetValue(const ParameterPath& path, GeData& value, ULong& flags) const
{
  Long sub = 0;
  const BlendLayer* layer = FindLayer(path, sub);
  return layer && layer->GetLayerValue(sub, path.WithoutFirst(1), value, flags);
}

Bool iBlendDataType::SetValue(const ParameterPath& path, const GeData& value, ULong& flags)
{
  Long sub = 0;
  BlendLayer* layer = FindLayer(path, sub);
  return layer && layer->SetLayerValue(sub, path.WithoutFirst(1), value, flags);
}

} // namespace _torvane_
