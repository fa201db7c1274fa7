// What all layers do alike, by the list of their settings.
#include "blendlayers/blend_fields.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

BlendFields BlendLayer::FieldsOf() const { return const_cast<BlendLayer*>(this)->Fields(); }

// What goes down through folders in folders asks for one setting at a time: all of them in the frame of each level
// would take most of a stack.
[[gnu::noinline]] BlendField BlendLayer::FieldAt(Long index) const
{
  const BlendFields all = FieldsOf();
  return index < all.count ? all.fields[index] : BlendField();
}

Bool BlendLayer::CopyLayerTo(BlendLayer& destination, TransArray* translation) const
{
  if (destination.layerType_ != layerType_)
    return false;
  if (&destination == this)
    return true;
  destination.name_ = name_;
  destination.isOpen_ = isOpen_;
  destination.selected_ = selected_;
  destination.enabled_ = enabled_;
  destination.layerId_ = layerId_;
  destination.blendMode_ = blendMode_;
  Bool copied = true;
  for (Long i = 0; copied && FieldAt(i).value; ++i)
    copied = CopyField(FieldAt(i), destination.FieldAt(i), translation);
  return copied;
}

Bool BlendLayer::ReadLayer(HyperFile& file, Long level)
{
  Bool read = true;
  for (Long i = 0; FieldAt(i).value; ++i)
    read = ReadField(file, level, FieldAt(i)) && read;
  return read;
}

Bool BlendLayer::WriteLayer(HyperFile& file) const
{
  Bool written = true;
  for (Long i = 0; FieldAt(i).value; ++i)
    written = WriteField(file, FieldAt(i)) && written;
  return written;
}

Bool BlendLayer::LayersDiffer(const BlendLayer& other) const
{
  if (layerType_ != other.layerType_ || !(name_ == other.name_) || isOpen_ != other.isOpen_ ||
      selected_ != other.selected_ || enabled_ != other.enabled_ || layerId_ != other.layerId_ ||
      blendMode_ != other.blendMode_ || layerMark_ != other.layerMark_)
    return true;
  Bool differ = false;
  for (Long i = 0; !differ && FieldAt(i).value; ++i)
    differ = FieldsDiffer(FieldAt(i), other.FieldAt(i));
  return differ;
}

Bool BlendLayer::LayersEqualIgnoringFlags(const BlendLayer& other, Long) const
{
  return layerType_ == other.layerType_ && name_ == other.name_;
}

Bool BlendLayer::GetLayerParameter(Long id, GeData& value) const
{
  switch (id) {
  case kBlendEnabled:
    value = GeData(enabled_);
    return true;
  case kBlendSelected:
    value = GeData(selected_);
    return true;
  case kBlendMode:
    value = GeData(blendMode_);
    return true;
  default:
    break;
  }
  for (const BlendField& field : FieldsOf()) {
    if (field.id == id)
      return GetField(field, value);
  }
  return false;
}

Bool BlendLayer::SetLayerParameter(Long id, const GeData& value)
{
  switch (id) {
  case kBlendEnabled:
    enabled_ = value.GetBool();
    return true;
  case kBlendSelected:
    selected_ = value.GetBool();
    return true;
  case kBlendMode:
    blendMode_ = value.GetLong();
    return true;
  default:
    break;
  }
  for (const BlendField& field : Fields()) {
    if (field.id == id)
      return SetField(field, value);
  }
  return false;
}

Bool BlendLayer::GetLayerValue(Long sub, const ParameterPath& path, GeData& value, ULong& flags) const
{
  for (const BlendField& field : FieldsOf()) {
    if (field.sub == sub && sub != kNoBlendSub && GetFieldPart(field, path, value))
      flags |= kParameterAnswered;
  }
  return true;
}

Bool BlendLayer::SetLayerValue(Long sub, const ParameterPath& path, const GeData& value, ULong& flags)
{
  for (const BlendField& field : Fields()) {
    if (field.sub == sub && sub != kNoBlendSub && SetFieldPart(field, path, value))
      flags |= kParameterAnswered;
  }
  return true;
}

} // namespace _torvane_
