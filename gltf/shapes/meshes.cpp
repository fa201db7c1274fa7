#include "gltf/shapes/meshes.h"

#include "gltf/text.h"
#include "torvane/objects/plane_parameters.h"
#include "torvane/objects/point_object.h"
#include "torvane/tags/value_tags.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

// The last tag that covers the whole object, or null.
const TextureTag* LastTextureTag(const BaseObject& object, bool& hasTags)
{
  const TextureTag* last = nullptr;
  for (const BaseTag* tag = object.GetFirstTag(); tag; tag = tag->GetNext()) {
    const auto* texture = NodeCast<TextureTag>(tag);
    hasTags = hasTags || texture;
    if (texture && !tag->GetDataInstance().GetString(kTextureOldName).Content())
      last = texture;
  }
  return last;
}

} // namespace

std::size_t Meshes::Find(BaseObject& object)
{
  if (object.GetType() == kObjectPlane)
    return FindQuad(object);
  if (GetPointCount(object) <= 0)
    return kNone;
  if (object.IsInstanceOf(kObjectSpline))
    return AddSpline(context_, materials_, object);
  return GetPolygonCount(object) > 0 ? AddPolygons(context_, materials_, object)
                                     : AddPoints(context_, materials_, object);
}

std::size_t Meshes::FindQuad(BaseObject& object)
{
  bool hasTags = false;
  const TextureTag* tag = LastTextureTag(object, hasTags);
  if (!hasTags && StandsForLayer(object))
    return kNone; // a nested composition: what it shows is under it
  const BaseContainer& settings = object.GetDataInstance();
  Output& output = context_.output;
  if (settings.GetLong(kPlaneAxis, kPlaneTowardsViewer) != kPlaneTowardsViewer)
    output.account.Tell(Loss::kPlaneAxis);
  materials_.TellTagLosses(object);
  const Surface surface = materials_.Find(tag, true);
  const float width = output.ToSingle(settings.GetReal(kPlaneWidth) * context_.settings.unit);
  const float height = output.ToSingle(settings.GetReal(kPlaneHeight) * context_.settings.unit);
  const auto [place, isNew] = quads_.try_emplace(Quad{width, height, surface.material}, kNone);
  if (isNew)
    place->second = AddQuad(width, height, surface);
  return place->second;
}

std::size_t Meshes::AddQuad(float width, float height, const Surface& surface)
{
  const std::size_t corners = CornersOf(width, height);
  Json attributes = {{"POSITION", corners}, {"NORMAL", quadNormals_}};
  if (surface.hasPicture)
    attributes["TEXCOORD_0"] = CoordinatesOfQuads();
  const Json primitive = {{"attributes", attributes}, {"indices", quadIndices_}, {"material", surface.material}};
  return context_.output.meshes.Add({{"primitives", Json::array({primitive})}});
}

// The places of a quad's corners; quads of one size share them, and all quads share the rest.
std::size_t Meshes::CornersOf(float width, float height)
{
  Output& output = context_.output;
  const auto [place, isNew] = corners_.try_emplace({width, height}, kNone);
  if (!isNew)
    return place->second;
  const float x = 0.5F * width;
  const float y = 0.5F * height;
  place->second = output.AddFloats({-x, -y, 0, x, -y, 0, x, y, 0, -x, y, 0}, 3, ViewTarget::kVertices, true);
  if (quadNormals_ == kNone) {
    quadNormals_ = output.AddFloats({0, 0, 1, 0, 0, 1, 0, 0, 1, 0, 0, 1}, 3, ViewTarget::kVertices, false);
    quadIndices_ = output.AddIndices({0, 1, 2, 0, 2, 3}, 4);
  }
  return place->second;
}

std::size_t Meshes::CoordinatesOfQuads()
{
  if (quadCoordinates_ == kNone)
    quadCoordinates_ = context_.output.AddFloats({0, 1, 1, 1, 1, 0, 0, 0}, 2, ViewTarget::kVertices, false);
  return quadCoordinates_;
}

Json NewMesh(const BaseObject& object)
{
  Json mesh = Json::object();
  if (object.GetName().Content())
    mesh["name"] = ToUtf8(object.GetName());
  return mesh;
}

} // namespace gltf
