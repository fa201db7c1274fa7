// A document as glTF 2.0: what it shows, mirrored from the scene's left-handed axes and brought to metres.
#pragma once

#include <cstdint>
#include <filesystem>
#include <functional>
#include <stdexcept>
#include <string>
#include <vector>

#include "gltf/account.h"
#include "gltf/file/byte_buffer.h"
#include "gltf/file/long_text.h"

namespace _torvane_
{
class BaseDocument;
}

namespace gltf
{

// Materials are lit if the scene has a light that is seen, or as asked.
enum class Shading
{
  kByLights,
  kLit,
  kUnlit,
};

struct Options
{
  bool embed = false;      // pictures are packed into the file
  bool keepHidden = false; // what isn't rendered stays, on nodes that are switched off (KHR_node_visibility)
  bool pointers = true;    // what moves in cameras and lights (KHR_animation_pointer)
  Shading shading = Shading::kByLights;
  double unit = 0.0; // metres of one scene unit; 0 for what the scene says
  // Where the scene lies: pictures without a folder of their own are looked for there.
  std::filesystem::path sceneFolder;
  // Where the file will lie: pictures that aren't packed in are named from there. It must exist.
  std::filesystem::path outputFolder;
  // The name of a file for the bytes; empty where they go into the same file (.glb).
  std::string bufferName;
};

// A converted document. The JSON refers to the bytes, which may be none.
struct Model
{
  LongText json;
  ByteBuffer bytes;
  Account account;
};

// Thrown for what no file can hold; a sentence without the name of the file.
class TooLarge : public std::runtime_error
{
 public:
  using std::runtime_error::runtime_error;
};

// Converts any document; equal ones give equal models. The document isn't changed. Throws TooLarge, and what the system
// tells of folders that can't be reached (std::filesystem::filesystem_error).
Model Convert(_torvane_::BaseDocument& document, const Options& options);

// One file of JSON and bytes, handed on piece by piece or as a whole. Throws TooLarge above 4 GB.
using Sink = std::function<void(const std::uint8_t* data, std::size_t size)>;
std::size_t GlbSize(const Model& model);
void WriteGlb(const Model& model, const Sink& sink);
std::vector<std::uint8_t> ToGlb(const Model& model);

} // namespace gltf
