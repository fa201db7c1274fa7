// The file that is being made: the arrays of its JSON, its bytes, and what of the scene it can't hold.
#pragma once

#include <array>
#include <cstdint>
#include <set>
#include <string>
#include <unordered_map>
#include <vector>

#include "gltf/account.h"
#include "gltf/file/byte_buffer.h"
#include "gltf/file/json.h"

namespace gltf
{

// What an accessor of vertices or of animation is for.
enum class ViewTarget : int
{
  kNone = 0, // animation
  kVertices = 34962,
  kIndices = 34963,
};

class Output
{
 public:
  Section nodes;
  Section cameras;
  Section lights;
  Section meshes;
  Section materials;
  Section textures;
  Section images;
  Section samplers;
  Section animationSamplers;
  Section animationChannels;
  Account account;

  // Floats, `width` of them an element (1 to 4), which must be finite. `bounds` adds min and max. The accessor's index.
  std::size_t AddFloats(const std::vector<float>& values, std::size_t width, ViewTarget target, bool bounds);
  // Key times, with bounds; equal arrays share one accessor.
  std::size_t AddTimes(const std::vector<float>& times);
  // Indices of `vertices` vertices, in 16 bits where those can tell them.
  std::size_t AddIndices(const std::vector<std::uint32_t>& indices, std::size_t vertices);
  // Bytes of a file, with a view of their own: the view's index.
  std::size_t AddBytes(const std::vector<std::uint8_t>& bytes);

  void UseExtension(const char* name) { extensions_.insert(name); }
  // In single precision; counts what had to be brought into range.
  float ToSingle(Real number);

  const ByteBuffer& Bytes() const { return bytes_; }
  ByteBuffer TakeBytes() { return std::move(bytes_); }
  // The whole JSON. `generator` names the program, `scene` is the one scene, `animation` what the animation has beside
  // samplers and channels; `bufferUri` is empty where the bytes lie in the same file. The sections are empty then.
  LongText Finish(const std::string& generator, const Json& scene, const Json& animation, const std::string& bufferUri);

 private:
  std::size_t AddView(const void* data, std::size_t size, ViewTarget target);
  std::size_t AddAccessor(std::size_t view, int componentType, std::size_t count, const char* type, const Json& bounds);
  void AddAnimation(LongText& text, const Json& animation);

  Section accessors_;
  Section views_;
  ByteBuffer bytes_;
  std::set<std::string> extensions_;
  struct Times
  {
    std::size_t offset;
    std::size_t count;
    std::size_t accessor;
  };
  std::unordered_multimap<std::uint64_t, Times> times_; // by a hash of their bytes
};

} // namespace gltf
