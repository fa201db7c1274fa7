#include "gltf/scene/nodes.h"

#include <algorithm>
#include <utility>

#include "gltf/motion/animation.h"
#include "gltf/scene/camera.h"
#include "gltf/scene/light.h"
#include "gltf/text.h"
#include "torvane/layers/layer_object.h"
#include "torvane/objects/point_object.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

// Types that a file shows, or that are nothing but a place.
bool HasCounterpart(const BaseObject& object)
{
  switch (object.GetType()) {
  case kObjectNull:
  case kObjectCamera:
  case kObjectLight:
  case kObjectPlane:
  case kObjectPolygon:
    return true;
  default:
    return object.IsInstanceOf(kObjectPoint) || GetPointCount(object) > 0;
  }
}

bool IsIdentity(const Quaternion& q) { return q.x == 0.0 && q.y == 0.0 && q.z == 0.0; }

} // namespace

// False for one that is taken.
bool UniqueNames::Enter(const std::string& name)
{
  const std::size_t hash = std::max<std::size_t>(std::hash<std::string>()(name), 1);
  std::size_t place = hash;
  while (taken_[place %= taken_.size()] != 0 && taken_[place] != hash)
    ++place;
  return std::exchange(taken_[place], hash) == 0;
}

std::string UniqueNames::Take(const std::string& name)
{
  if (name.empty() || Enter(name))
    return name;
  int& number = next_.try_emplace(name, 2).first->second;
  for (;; ++number) {
    std::string other = name + "." + std::to_string(number);
    if (Enter(other))
      return other;
  }
}

Nodes::Nodes(Context& context, Targets& targets, const ByObject<const Motion>& motions,
             const ByObject<TrackSet>& tracks)
    : context_(context),
      targets_(targets),
      motions_(motions),
      tracks_(tracks),
      meshes_(context),
      names_(context.tree.Count())
{}

void Nodes::Write()
{
  for (std::size_t i = 0; i < context_.tree.Count(); ++i)
    WriteNode(i);
  for (const Json& node : addedNodes_)
    context_.output.nodes.Add(node);
}

void Nodes::WriteNode(std::size_t index)
{
  const SceneObject& entry = context_.tree[index];
  if (!HasCounterpart(*entry.object))
    context_.output.account.Tell(Loss::kObject);
  Json node = Json::object();
  const std::string name = names_.Take(ToUtf8(entry.object->GetName()));
  if (!name.empty())
    node["name"] = name;
  TrackSet none;
  TrackSet* const own = tracks_[index];
  TrackSet& tracks = own ? *own : none;
  const Parts parts = PartsOf(index, tracks);
  AddChildren(index, entry.hidden && parts.IsSeen() ? HiddenPart(parts) : kNone, node);
  AddPlace(index, node);
  AddParts(entry.hidden ? Parts{parts.camera, kNone, kNone} : parts, node);
  node["extras"]["q7r"] = ExtrasOf(index);
  context_.output.nodes.Add(node);
  AddChannels(index);
  tracks.TellRest(context_.output.account);
}

Nodes::Parts Nodes::PartsOf(std::size_t index, TrackSet& tracks)
{
  const SceneObject& entry = context_.tree[index];
  BaseObject& object = *entry.object;
  Parts parts;
  // The scene's camera was added first.
  if (object.GetType() == kObjectCamera)
    parts.camera = index == context_.tree.SceneCamera() ? 0 : AddCamera(context_, object, tracks);
  else if (entry.hidden && !context_.options.keepHidden)
    tracks.TakeAll();
  else if (object.GetType() == kObjectLight)
    parts.light = AddLight(context_, object, tracks);
  else
    parts.mesh = meshes_.Find(object);
  return parts;
}

void Nodes::AddChildren(std::size_t index, std::size_t hiddenPart, Json& node) const
{
  for (std::size_t child = context_.tree.FirstChild(index); child != kNone; child = context_.tree[child].nextSibling)
    node["children"].push_back(child);
  if (hiddenPart != kNone)
    node["children"].push_back(hiddenPart);
}

// What equals its default is left out.
void Nodes::AddPlace(std::size_t index, Json& node)
{
  Place place = RestOf(*context_.tree[index].object);
  if (targets_.TargetOf(index) != kNone)
    place.rotation = targets_.RestOf(index);
  const Quaternion q = Upright(ToQuaternion(place.rotation));
  if (place.position != Vector())
    node["translation"] = ToJson(ToPlace(place.position, context_.settings.unit));
  if (!IsIdentity(q))
    node["rotation"] = ToJson(q);
  if (place.scale != Vector(1.0, 1.0, 1.0))
    node["scale"] = ToJson(place.scale);
}

void Nodes::AddParts(const Parts& parts, Json& node)
{
  if (parts.camera != kNone)
    node["camera"] = parts.camera;
  if (parts.mesh != kNone)
    node["mesh"] = parts.mesh;
  if (parts.light != kNone)
    node["extensions"]["KHR_lights_punctual"]["light"] = parts.light;
}

// A child that is switched off, which draws what its parent doesn't.
std::size_t Nodes::HiddenPart(const Parts& parts)
{
  Json node = Json::object();
  AddParts({kNone, parts.mesh, parts.light}, node);
  node["extensions"]["KHR_node_visibility"]["visible"] = false;
  node["extras"]["q7r"]["part"] = "hidden";
  context_.output.UseExtension("KHR_node_visibility");
  addedNodes_.push_back(std::move(node));
  return context_.tree.Count() + addedNodes_.size() - 1;
}

Json Nodes::ExtrasOf(std::size_t index) const
{
  const SceneObject& entry = context_.tree[index];
  const BaseObject& object = *entry.object;
  Json extras = {{"name", ToUtf8(object.GetName())}, {"type", object.GetType()}};
  if (const BaseList2D* layer = object.GetLayer())
    extras["layer"] = ToUtf8(layer->GetName());
  if (entry.hidden)
    extras["hidden"] = true;
  const std::size_t target = targets_.TargetOf(index);
  if (target != kNone) {
    extras["target"] = target;
  } else if (object.GetAbsRot() != Vector()) {
    extras["rotationOrder"] = object.GetRotationOrder();
    extras["angles"] = ToJson(object.GetAbsRot());
  }
  return extras;
}

void Nodes::AddChannels(std::size_t index)
{
  Output& output = context_.output;
  Timeline& timeline = context_.timeline;
  const Motion* motion = motions_[index];
  if (motion)
    AddNodeChannel(output, index, "translation", motion->Translation(context_.settings.unit, timeline, output));
  if (targets_.TargetOf(index) != kNone)
    AddNodeChannel(output, index, "rotation", targets_.Rotation(index, timeline, output));
  else if (motion)
    AddNodeChannel(output, index, "rotation", motion->Rotation(timeline, output));
  if (motion)
    AddNodeChannel(output, index, "scale", motion->Scale(timeline, output));
}

} // namespace gltf
