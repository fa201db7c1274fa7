#include "gltf/scene/scene_tree.h"

#include <algorithm>
#include <cmath>

#include "torvane/ids.h"
#include "torvane/objects/object_walk.h"
#include "torvane/objects/unit_factors.h"
#include "torvane/render/render_data.h"
#include "torvane/views/base_draw.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

constexpr Long kFlagLocked = 4; // of a scene layer
constexpr Real kDefaultUnit = 0.01;

const LayerObject* LayerOf(const BaseObject& object)
{
  return NodeCast<LayerObject>(object.GetLayer()); // a file may point the link at anything
}

// In reach of single precision, and above 0.
bool IsUsable(Real number) { return number >= 1e-12 && number <= 1e12; }

Real UnitOf(const BaseDocument& document)
{
  const auto* unit =
      NodeCast<UnitScaleData>(document.GetDataInstance().GetCustomDataType(kKeyDocumentUnit, kCustomUnitScale));
  const Real factor = unit ? GetUnitFactor(unit) : 0.0;
  return IsUsable(factor) ? factor : kDefaultUnit;
}

void TakeIfUsable(const BaseContainer& settings, Long id, Real& value)
{
  const Real number = settings.GetReal(id, value);
  if (IsUsable(number))
    value = number;
}

std::size_t CountAll(BaseObject* first)
{
  std::size_t count = 0;
  for (BaseObject* object = first; object; object = GetNextDepthFirst(object))
    ++count;
  return count;
}

} // namespace

bool StandsForLayer(const BaseObject& object) { return object.GetDataInstance().FindData(kKeyLayerId) != nullptr; }

SceneTree::SceneTree(BaseDocument& document)
{
  AddAll(document.GetFirstObject());
  sceneCamera_ = FindSceneCamera(document);
}

// Without a recursion: chains of parents are as long as their makers like.
void SceneTree::AddAll(BaseObject* first)
{
  const std::size_t count = CountAll(first); // a list that grows is there twice, now and then
  objects_.reserve(count);
  std::vector<std::size_t> offLayer; // by object: the nearest ancestor that isn't on its scene layer, or kNone
  offLayer.reserve(count);
  std::size_t parent = kNone;
  std::size_t before = kNone; // the sibling before
  for (BaseObject* object = first; object;) {
    const std::size_t index = Add(*object, parent, offLayer);
    if (before != kNone)
      objects_[before].nextSibling = index;
    before = index;
    if (BaseObject* child = object->GetDown()) {
      parent = index;
      before = kNone;
      object = child;
      continue;
    }
    while (!object->GetNext() && parent != kNone) {
      before = parent;
      object = objects_[parent].object;
      parent = objects_[parent].parent;
    }
    object = object->GetNext();
  }
}

std::size_t SceneTree::Add(BaseObject& object, std::size_t parent, std::vector<std::size_t>& offLayer)
{
  const bool isOff = parent != kNone && LayerOf(*objects_[parent].object) != LayerOf(object);
  offLayer.push_back(isOff || parent == kNone ? parent : offLayer[parent]);
  objects_.push_back({&object, parent, kNone, IsHidden(object, parent, offLayer.back())});
  return objects_.size() - 1;
}

bool SceneTree::IsHidden(const BaseObject& object, std::size_t parent, std::size_t offLayer) const
{
  const Long mode = object.GetRenderMode();
  if (mode == kObjectModeOff || mode == kObjectModeOn)
    return mode == kObjectModeOff;
  if (!StandsForLayer(object))
    return parent != kNone && objects_[parent].hidden;
  const LayerObject* layer = LayerOf(object);
  const bool isNested = layer && !layer->GetFlag(kFlagLocked) && offLayer != kNone;
  return isNested && objects_[offLayer].hidden;
}

std::size_t SceneTree::FirstChild(std::size_t index) const
{
  return index + 1 < objects_.size() && objects_[index + 1].parent == index ? index + 1 : kNone;
}

std::size_t SceneTree::Find(const GeListNode* node) const
{
  if (!node)
    return kNone;
  if (places_.empty()) {
    places_.reserve(objects_.size());
    for (std::size_t i = 0; i < objects_.size(); ++i)
      places_.emplace(objects_[i].object, i);
  }
  const auto found = places_.find(node);
  return found == places_.end() ? kNone : found->second;
}

std::size_t SceneTree::FindSceneCamera(BaseDocument& document) const
{
  const auto* panels = document.GetViewPanelRoot();
  auto* panel = panels ? NodeCast<ViewPanel>(panels->GetFirst()) : nullptr;
  auto* draw = panel ? NodeCast<BaseDraw>(panel->GetDraws().GetFirst()) : nullptr;
  const GeListNode* linked = draw ? draw->GetSceneCamera().GetLink() : nullptr;
  std::size_t first = kNone;
  for (std::size_t i = 0; i < objects_.size(); ++i) {
    if (objects_[i].object->GetType() != kObjectCamera)
      continue;
    if (objects_[i].object == linked)
      return i;
    first = std::min(first, i);
  }
  return first;
}

SceneSettings::SceneSettings(BaseDocument& document)
    : unit(UnitOf(document)),
      fps(std::max(document.GetPref().GetFps(), Long{1})),
      start(document.GetPref().GetMinTime().Get()),
      end(document.GetPref().GetMaxTime().Get())
{
  const RenderData* render = document.GetActiveRenderData();
  if (!render)
    return;
  const BaseContainer& settings = render->GetDataInstance();
  TakeIfUsable(settings, kRenderWidth, width);
  TakeIfUsable(settings, kRenderHeight, height);
  aspect = width / height;
  TakeIfUsable(settings, kRenderFilmAspect, aspect);
}

} // namespace gltf
