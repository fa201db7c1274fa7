#include "gltf/materials/materials.h"

#include <algorithm>
#include <cmath>
#include <iterator>

#include "gltf/motion/tracks.h"
#include "gltf/scene/color.h"
#include "gltf/text.h"
#include "torvane/materials/material.h"
#include "torvane/shaders/base_shader.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

constexpr Long kAlphaChannel = 8; // on in every new material, without a meaning of its own
constexpr Long kProjectionUVW = 6;
constexpr Vector kGrey(0.8, 0.8, 0.8);
constexpr Real kLeastLength = 1e-7;
constexpr const char* kMovieSuffixes[] = {"avi", "mov", "mpg", "mpeg", "mp4", "m4v", "mkv", "webm", "wmv"};

bool IsMovie(const Filename& file)
{
  return std::any_of(std::begin(kMovieSuffixes), std::end(kMovieSuffixes),
                     [&file](const char* suffix) { return file.CheckSuffix(suffix); });
}

Vector LinearOf(const Vector& color)
{
  return ToLinear(Clamped01({Finite(color.x), Finite(color.y), Finite(color.z)}));
}

} // namespace

// A file may point the link of a tag at anything.
const BaseMaterial* Materials::MaterialOf(const TextureTag* tag) const
{
  return tag ? NodeCast<BaseMaterial>(tag->GetMaterial()) : nullptr;
}

Materials::Placement Materials::PlacementOf(const TextureTag& tag) const
{
  const BaseContainer& settings = tag.GetDataInstance();
  Placement placement = {{settings.GetReal(kTextureOffsetX), settings.GetReal(kTextureOffsetY)},
                         {settings.GetReal(kTextureLengthX, 1.0), settings.GetReal(kTextureLengthY, 1.0)}};
  for (int i = 0; i < 2; ++i) {
    const bool isUsable = std::fabs(placement.length[i]) > kLeastLength && std::isfinite(placement.length[i]);
    placement.length[i] = isUsable ? placement.length[i] : 1.0;
    placement.offset[i] = Finite(placement.offset[i]);
  }
  return placement;
}

bool Materials::HasPicture(const TextureTag& tag)
{
  const BaseMaterial* material = MaterialOf(&tag);
  return material && PaintOf(*material).picture.image != kNone;
}

void Materials::TellTagLosses(const BaseObject& object)
{
  for (const BaseTag* tag = object.GetFirstTag(); tag; tag = tag->GetNext()) {
    const auto* texture = NodeCast<TextureTag>(tag);
    if (!texture)
      continue;
    if (tag->GetDataInstance().GetLong(kTextureProjection) != kProjectionUVW && HasPicture(*texture))
      context_.output.account.Tell(Loss::kTextureProjection);
    TellTracks(*tag, Loss::kMaterialTrack, context_.output.account);
  }
}

Surface Materials::Find(const TextureTag* tag, bool hasCoordinates)
{
  const BaseMaterial* material = MaterialOf(tag);
  if (!material)
    return {AddGrey(), false};
  const Paint& paint = PaintOf(*material);
  const bool withPicture = hasCoordinates && paint.picture.image != kNone;
  const Placement placement = withPicture ? PlacementOf(*tag) : Placement();
  const auto [place, isNew] = made_.try_emplace(Key{material, withPicture, placement}, kNone);
  if (isNew)
    place->second = Add(*material, paint, withPicture, placement);
  return {place->second, withPicture};
}

const Materials::Paint& Materials::PaintOf(const BaseMaterial& material)
{
  const auto found = paints_.find(&material);
  return found != paints_.end() ? found->second : paints_.emplace(&material, ReadPaint(material)).first->second;
}

Materials::Paint Materials::ReadPaint(const BaseMaterial& base)
{
  Account& account = context_.output.account;
  TellTracks(base, Loss::kMaterialTrack, account);
  Paint paint;
  const auto* material = NodeCast<Material>(&base);
  if (!material) {
    account.Tell(Loss::kForeignMaterial);
    paint.color = kGrey;
    return paint;
  }
  TellOtherChannels(*material);
  if (material->ChannelIsOn(kColorChannel) == 0)
    return paint; // black
  const BaseContainer& settings = material->GetDataInstance();
  paint.color = settings.GetVector(kMaterialColor, kGrey);
  paint.brightness = Finite(settings.GetReal(kMaterialColorBrightness, 1.0));
  if (const BaseShader* shader = material->ChannelShaderOf(kMaterialColorShader))
    TakePicture(*shader, paint);
  const bool isMixed = settings.GetReal(kMaterialColorMix, 1.0) < 1.0 || settings.GetLong(kMaterialColorMixMode) != 0;
  if (paint.picture.image != kNone && isMixed)
    account.Tell(Loss::kMixing);
  return paint;
}

void Materials::TakePicture(const BaseShader& shader, Paint& paint)
{
  Account& account = context_.output.account;
  TellTracks(shader, Loss::kMaterialTrack, account);
  if (!shader.HasBitmapFilename()) {
    if (shader.GetType() != kShaderBitmap)
      account.Tell(Loss::kForeignShader);
    return;
  }
  const Filename file = shader.BitmapFilename();
  const std::string name = ToUtf8(file.GetString());
  paint.picture = pictures_.Find(name);
  const LLong frames = LLong{shader.GetDataInstance().GetLong(kBitmapLastFrame)} + 1;
  if (frames > 1)
    paint.extras["frames"] = frames;
  if (paint.picture.state != PictureState::kGood)
    paint.extras["picture"] = name;
  if (paint.picture.state == PictureState::kOther)
    account.Tell(IsMovie(file) ? Loss::kMovie : Loss::kPictureFormat);
  if (paint.picture.state == PictureState::kGood && frames > 1)
    account.Tell(Loss::kSequence);
}

void Materials::TellOtherChannels(const Material& material)
{
  for (Long channel = kFirstChannel; channel <= kLastChannel; ++channel) {
    if (channel != kColorChannel && channel != kAlphaChannel && material.ChannelIsOn(channel) != 0)
      context_.output.account.Tell(Loss::kChannel, 1, channel);
  }
}

// What all materials have: layers are seen from behind too.
Json Materials::NewMaterial()
{
  Json material = Json::object();
  if (!context_.lit) {
    context_.output.UseExtension("KHR_materials_unlit");
    material["extensions"]["KHR_materials_unlit"] = Json::object();
  }
  material["doubleSided"] = true;
  return material;
}

namespace
{

Json FactorJson(const Vector& linear) { return {linear.x, linear.y, linear.z, 1.0}; }

} // namespace

std::size_t Materials::AddGrey()
{
  if (grey_ != kNone)
    return grey_;
  Json material = NewMaterial();
  material["pbrMetallicRoughness"] = {
      {"baseColorFactor", FactorJson(LinearOf(kGrey))}, {"metallicFactor", 0.0}, {"roughnessFactor", 1.0}};
  return grey_ = context_.output.materials.Add(material);
}

std::size_t Materials::Add(const BaseMaterial& base, const Paint& paint, bool withPicture, const Placement& placement)
{
  Json material = Json::object();
  if (base.GetName().Content())
    material["name"] = ToUtf8(base.GetName());
  material.update(NewMaterial());
  Json& surface = material["pbrMetallicRoughness"];
  const Real bright = std::clamp(paint.brightness, 0.0, 1.0);
  surface["baseColorFactor"] =
      FactorJson(withPicture ? Vector(bright, bright, bright) : LinearOf(paint.color * paint.brightness));
  if (withPicture)
    surface["baseColorTexture"] = TextureInfo(paint, placement);
  surface["metallicFactor"] = 0.0;
  surface["roughnessFactor"] = 1.0;
  if (withPicture && paint.picture.hasAlpha)
    material["alphaMode"] = "BLEND";
  if (!paint.extras.empty())
    material["extras"]["q7r"] = paint.extras;
  return context_.output.materials.Add(material);
}

Json Materials::TextureInfo(const Paint& paint, const Placement& p)
{
  Json info = {{"index", pictures_.AddTexture(paint.picture.image, p.length[0] != 1.0, p.length[1] != 1.0)}};
  if (p == Placement())
    return info;
  context_.output.UseExtension("KHR_texture_transform");
  info["extensions"]["KHR_texture_transform"] = {
      {"offset", {Finite(-p.offset[0] / p.length[0]), Finite(-p.offset[1] / p.length[1])}},
      {"scale", {Finite(1.0 / p.length[0]), Finite(1.0 / p.length[1])}}};
  return info;
}

} // namespace gltf
