// The pictures of a file: each once, named or packed in.
#pragma once

#include <map>
#include <string>

#include "gltf/context.h"
#include "gltf/materials/picture_file.h"

namespace gltf
{

struct Picture
{
  PictureState state = PictureState::kMissing;
  bool hasAlpha = false;
  std::size_t image = kNone; // index of the image, of good pictures alone
};

class Pictures
{
 public:
  explicit Pictures(Context& context) : context_(context) {}

  // The picture that a scene names; what is missing or damaged is told when it is first asked for.
  const Picture& Find(const std::string& name);
  // A texture of an image and a way to go on beyond its edges: its index.
  std::size_t AddTexture(std::size_t image, bool repeatX, bool repeatY);

 private:
  Picture Read(const std::string& name);
  std::size_t AddImage(const std::filesystem::path& path, const PictureFile& file);
  std::size_t SamplerOf(bool repeatX, bool repeatY);

  Context& context_;
  std::map<std::string, Picture> byName_;
  std::map<std::filesystem::path, Picture> byPath_;
  std::map<std::pair<bool, bool>, std::size_t> samplers_;
  std::map<std::pair<std::size_t, std::size_t>, std::size_t> textures_; // by image and sampler
};

} // namespace gltf
