// What all layers do alike, by the list of their settings.
#include "blendlayers/blend_fields.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

BlendFields BlendLayer::CommonFields() const
{
  auto& layer = const_cast<BlendLayer&>(*this);
  return {{layer.isOpen_, 0},
          {layer.selected_, kBlendSelected},
          {layer.enabled_, kBlendEnabled},
          {layer.layerId_, 0},
          {layer.blendMode_, kBlendMode}};
}

BlendFields BlendLayer::FieldsOf() const { return const_cast<BlendLayer*>(this)->Fields(); }

// What goes down through folders in folders asks for one setting at a time: all of them in the frame of each level
// would take most of a stack.
[[gnu::noinline]] BlendField BlendLayer::FieldAt(Long index) const
{
  const Bool isCommon = index < kCommonFields;
  const BlendFields all = isCommon ? CommonFields() : FieldsOf();
  const Long place = isCommon ? index : index - kCommonFields;
  return place < all.count ? all.fields[place] : BlendField();
}

BlendField BlendLayer::FindField(Long id) const
{
  for (Long place = 0;; ++place) {
    const BlendField field = FieldAt(place);
    if (!field.value || (id != 0 && field.id == id))
      return field;
  }
}

Bool BlendLayer::CopyLayerTo(BlendLayer& destination, TransArray* translation) const
{
  if (destination.layerType_ != layerType_)
    return false;
  if (&destination == this)
    return true;
  destination.name_ = name_;
  Bool copied = true;
  for (Long i = 0; copied && FieldAt(i).value; ++i)
    copied = CopyField(FieldAt(i), destination.FieldAt(i), translation);
  return copied;
}

Bool BlendLayer::ReadLayer(HyperFile& file, Long level)
{
  Bool read = true;
  for (Long i = kCommonFields; FieldAt(i).value; ++i)
    read = ReadField(file, level, FieldAt(i)) && read;
  return read;
}

Bool BlendLayer::WriteLayer(HyperFile& file) const
{
  Bool written = true;
  for (Long i = kCommonFields; FieldAt(i).value; ++i)
    written = WriteField(file, FieldAt(i)) && written;
  return written;
}

Bool BlendLayer::LayersDiffer(const BlendLayer& other) const
{
  if (layerType_ != other.layerType_ || !(name_ == other.name_) || layerMark_ != other.layerMark_)
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
  const BlendField field = FindField(id);
  return field.value && GetField(field, value);
}

Bool BlendLayer::SetLayerParameter(Long id, const GeData& value)
{
  const BlendField field = FindField(id);
  return field.value && SetField(field, value);
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
