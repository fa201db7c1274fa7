#include "gltf/materials/pictures.h"

#include "gltf/file/base64.h"
#include "gltf/text.h"

namespace gltf
{

namespace fs = std::filesystem;

namespace
{

constexpr int kLinear = 9729;
constexpr int kLinearMipmaps = 9987;
constexpr int kClamp = 33071;
constexpr int kRepeat = 10497;

std::string DataUri(const std::string& type, const std::vector<std::uint8_t>& bytes)
{
  Base64 text;
  text.Append(bytes.data(), bytes.size());
  return "data:" + type + ";base64," + text.Finish();
}

} // namespace

const Picture& Pictures::Find(const std::string& name)
{
  const auto found = byName_.find(name);
  return found != byName_.end() ? found->second : byName_.emplace(name, Read(name)).first->second;
}

Picture Pictures::Read(const std::string& name)
{
  const fs::path path = LocatePicture(context_.options.sceneFolder, name);
  std::error_code error;
  const fs::path real = fs::weakly_canonical(path, error);
  const auto found = byPath_.find(real);
  if (!error && !path.empty() && found != byPath_.end() && found->second.state == PictureState::kGood)
    return found->second;
  const PictureFile file = ReadPictureFile(path, context_.options.embed);
  Picture picture = {file.state, file.hasAlpha, kNone};
  if (file.state == PictureState::kGood)
    picture.image = AddImage(path, file);
  else if (file.state == PictureState::kMissing)
    context_.output.account.TellPicture(name, "the picture is missing");
  else if (file.state == PictureState::kUnreadable)
    context_.output.account.TellPicture(name, "the picture can't be read");
  else if (file.state == PictureState::kDamaged)
    context_.output.account.TellPicture(name, "the picture is damaged");
  if (!error)
    byPath_[real] = picture;
  return picture;
}

std::size_t Pictures::AddImage(const fs::path& path, const PictureFile& file)
{
  Output& output = context_.output;
  const std::string type = file.isPng ? "image/png" : "image/jpeg";
  if (!context_.options.embed)
    return output.images.Add({{"uri", ToUri(path, context_.options.outputFolder)}});
  if (context_.options.bufferName.empty())
    return output.images.Add({{"bufferView", output.AddBytes(file.bytes)}, {"mimeType", type}});
  return output.images.Add({{"uri", DataUri(type, file.bytes)}});
}

std::size_t Pictures::SamplerOf(bool repeatX, bool repeatY)
{
  const auto [place, isNew] = samplers_.try_emplace({repeatX, repeatY}, context_.output.samplers.Count());
  if (isNew)
    context_.output.samplers.Add({{"magFilter", kLinear},
                                  {"minFilter", kLinearMipmaps},
                                  {"wrapS", repeatX ? kRepeat : kClamp},
                                  {"wrapT", repeatY ? kRepeat : kClamp}});
  return place->second;
}

std::size_t Pictures::AddTexture(std::size_t image, bool repeatX, bool repeatY)
{
  const std::size_t sampler = SamplerOf(repeatX, repeatY);
  const auto [place, isNew] = textures_.try_emplace({image, sampler}, context_.output.textures.Count());
  if (isNew)
    context_.output.textures.Add({{"sampler", sampler}, {"source", image}});
  return place->second;
}

} // namespace gltf
