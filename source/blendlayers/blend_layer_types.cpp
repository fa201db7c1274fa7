// The kinds of layers and their settings, each in file order: the value, its id, its sub number, its range.
#include "blendlayers/blend_fields.h"
#include "torvane/shaders/base_shader.h"

namespace _torvane_
{

BlendFields BlendFolder::Fields()
{
  return {{mode_, 2000}, {opacity_, 2001, 0, 0.0, 1.0}, {isOpen2_, 2002}, {children_, kBlendFolderFirstLink}};
}

Bool BlendFolder::LayersEqualIgnoringFlags(const BlendLayer& other, Long mode) const
{
  if (!BlendLayer::LayersEqualIgnoringFlags(other, mode))
    return false;
  const CBlendLayers& others = static_cast<const BlendFolder&>(other).children_;
  if (children_.GetCount() != others.GetCount())
    return false;
  for (Long i = 0; i < children_.GetCount(); ++i) {
    if (!children_.GetLayer(i)->LayersEqualIgnoringFlags(*others.GetLayer(i), mode))
      return false;
  }
  return true;
}

namespace
{

Bool HoldsLayer(const CBlendLayers& stack, const BlendLayer& layer)
{
  Bool found = false;
  for (Long i = 0; !found && i < stack.GetCount(); ++i) {
    BlendFolder* folder = stack.GetLayer(i)->AsFolder();
    found = stack.GetLayer(i) == &layer || (folder && HoldsLayer(folder->GetChildren(), layer));
  }
  return found;
}

Bool HoldsLayer(const BaseContainer& settings, const BlendLayer& layer)
{
  BaseContainer::Iterator place;
  Long id = 0;
  const GeData* value = nullptr;
  Bool found = false;
  for (Bool more = settings.BrowseFirst(place, id, value); more && !found;
       more = settings.BrowseNext(place, id, value)) {
    if (auto* stack = NodeCast<iBlendDataType>(value->GetCustomDataType(kCustomBlendLayers)))
      found = HoldsLayer(stack->GetLayers(), layer);
    else if (const BaseContainer* nested = value->GetContainer())
      found = HoldsLayer(*nested, layer);
  }
  return found;
}

// True if the layer stands in a stack of the shader's or of a shader below it.
Bool HoldsLayer(const BaseShader& shader, const BlendLayer& layer)
{
  Bool found = HoldsLayer(shader.GetDataInstance(), layer);
  for (const BaseShader* child = shader.GetDown(); child && !found; child = child->GetNext())
    found = HoldsLayer(*child, layer);
  for (const BaseShader* own = shader.GetShaders(); own && !found; own = own->GetNext())
    found = HoldsLayer(*own, layer);
  return found;
}

} // namespace

BlendFields BlendShader::Fields() { return {{mode_, 2000}, {opacity_, 2001, 0, 0.0, 1.0}, {link_, 2002}}; }

BaseShader* BlendShader::GetShader() const
{
  return NodeCast<BaseShader>(link_.GetLink()); // a file may link anything
}

void BlendShader::GetLayerName(String& name)
{
  const BaseShader* shader = GetShader();
  name_ = shader ? shader->GetName() : String("BlendShader");
  name = name_;
}

// A shader in no list isn't the scene's to delete, nor is one that would take the layer's own stack along.
void BlendShader::ReleaseLinked()
{
  BaseShader* shader = GetShader();
  link_.ClearLink();
  if (!shader || !shader->IsInList() || HoldsLayer(*shader, *this))
    return;
  shader->RemoveFromList();
  DeleteObj(shader);
}

BlendFields BlendEffectBC::Fields()
{
  return {{first_, 2000, 0, -1.0, 1.0}, {second_, 2001, 1, -1.0, 1.0}, {third_, 2002, 2, 0.1, 10.0}};
}

BlendFields BlendEffectHSL::Fields()
{
  const Real lowest = flag_ ? 0.0 : -180.0;
  const Real highest = flag_ ? 360.0 : 180.0;
  return {{first_, 2000, 0, lowest, highest},
          {second_, 2001, 1, flag_ ? 0.0 : -1.0, 1.0},
          {third_, 2002, 2, -1.0, 1.0},
          {flag_, 2003, 3}};
}

BlendFields BlendEffectPosterize::Fields() { return {{part_, 2001, 0, 0.0, 1.0}, {number_, 2000, 1, 1.0, 255.0}}; }

BlendFields BlendEffectColorize::Fields()
{
  return {{number_, 2000, 0, 0.0, 6.0}, {gradient_, 2001, 1}, {first_, 2002}, {second_, 2003, 2, 0.0, -1.0, 1}};
}

BlendFields BlendEffectLimits::Fields() { return {{first_, 2000, 0, 0.0, 1000.0}, {second_, 2001, 1, 0.0, 1000.0}}; }

BlendFields BlendEffectDistorter::Fields()
{
  return {{firstNumber_, 2000}, {first_, 2001, 0, -1.0, 1.0},  {secondNumber_, 2006},
          {flag_, 2005},        {second_, 2002, 1, 0.0, 20.0}, {third_, 2003, 2},
          {fourth_, 2004, 3}};
}

BlendFields BlendEffectTransform::Fields()
{
  return {{real_, 2000, 0},
          {firstFlag_, 2001, 1},
          {secondFlag_, 2002, 2},
          {firstVector_, 2003, 3},
          {secondVector_, 2004, 4}};
}

} // namespace _torvane_
