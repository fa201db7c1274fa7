// Scene materials as materials.
#pragma once

#include <map>
#include <tuple>

#include "gltf/context.h"
#include "gltf/materials/pictures.h"
#include "torvane/materials/base_material.h"
#include "torvane/tags/texture_tag.h"

namespace gltf
{

struct Surface
{
  std::size_t material = kNone; // index of the material
  bool hasPicture = false;      // it needs texture coordinates
};

class Materials
{
 public:
  explicit Materials(Context& context) : context_(context), pictures_(context) {}

  // The material that a texture tag lays on an object, in the tag's way; grey for null and for a tag without material.
  // `hasCoordinates` tells whether what is drawn has texture coordinates: without them a picture is left out.
  Surface Find(const _torvane_::TextureTag* tag, bool hasCoordinates);
  // Whether the tag's material has a picture that can be shown.
  bool HasPicture(const _torvane_::TextureTag& tag);
  // Tells what of an object's texture tags, and of their own tracks, can't be held.
  void TellTagLosses(const _torvane_::BaseObject& object);

 private:
  struct Placement // of a picture on a surface
  {
    Real offset[2] = {0.0, 0.0};
    Real length[2] = {1.0, 1.0};

    auto operator<=>(const Placement&) const = default; // NOLINT(modernize-use-nullptr): a wrong alarm
  };
  struct Paint // the colour channel of a scene material
  {
    Vector color; // sRGB
    Real brightness = 1.0;
    Picture picture;
    Json extras = Json::object();
  };
  using Key = std::tuple<const _torvane_::BaseList2D*, bool, Placement>;

  const _torvane_::BaseMaterial* MaterialOf(const _torvane_::TextureTag* tag) const;
  Placement PlacementOf(const _torvane_::TextureTag& tag) const;
  const Paint& PaintOf(const _torvane_::BaseMaterial& material);
  Paint ReadPaint(const _torvane_::BaseMaterial& material);
  void TakePicture(const _torvane_::BaseShader& shader, Paint& paint);
  void TellOtherChannels(const _torvane_::Material& material);
  std::size_t AddGrey();
  std::size_t Add(const _torvane_::BaseMaterial& material, const Paint& paint, bool withPicture,
                  const Placement& placement);
  Json TextureInfo(const Paint& paint, const Placement& placement);
  Json NewMaterial();

  Context& context_;
  Pictures pictures_;
  std::map<const _torvane_::BaseList2D*, Paint> paints_;
  std::map<Key, std::size_t> made_;
  std::size_t grey_ = kNone;
};

} // namespace gltf
