// The host's project in memory: items, compositions and layers. Texts are UTF-8.
#pragma once

#include "exporter/host_api/aegp_types.h"
#include "host/model/property.h"

#include <array>
#include <cstddef>
#include <deque>
#include <filesystem>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace host
{

struct Composition;

enum class ItemKind
{
  kComposition,
  kFootage,
  kSolid, // of a solid layer or of a null
};

struct Item
{
  ItemKind kind = ItemKind::kFootage;
  std::string name;
  std::string id; // of the asset or of the project's item; empty for a file's top level and for solids of layers
  A_long width = 0;
  A_long height = 0;
  Composition* composition = nullptr; // of a composition
  std::string path;                   // of footage: absolute, or the id of embedded data; empty for a placeholder
  A_long files = 1;                   // of footage
  double duration = 0;                // of footage that is known to last, in seconds
  AEGP_ColorVal color{.alphaF = 1, .redF = 1, .greenF = 1, .blueF = 1}; // of a solid
};

// When a layer is there. In frames of the root composition.
struct LayerSpan
{
  double in = 0;
  double out = 0;
  double start = 0;   // where the layer's own time 0 lies
  double stretch = 1; // of the layer's own time; negative for one that runs backwards
};

struct Layer
{
  AEGP_LayerIDVal id = 0;
  std::string name; // may be empty
  AEGP_ObjectType type = AEGP_ObjectType_NONE;
  AEGP_LayerFlags flags = AEGP_LayerFlag_NONE;
  bool is3D = false;
  Item* source = nullptr;  // may be null
  Layer* parent = nullptr; // may be null; a layer of the same composition
  AEGP_CameraType cameraType = AEGP_CameraType_PERSPECTIVE;
  AEGP_FilmSizeUnits filmSizeUnits = AEGP_FilmSizeUnits_HORIZONTAL;
  double filmSize = 0; // pixels
  AEGP_LightType lightType = AEGP_LightType_POINT;
  std::optional<LayerSpan> span; // where the file tells it
  // By StreamIndex; null where the stream is not legal on this layer.
  std::array<std::unique_ptr<Property>, kStreamCount> streams;
};

struct Composition
{
  Item* item = nullptr;
  double frameRate = 0;       // as the file states it
  A_Time frameDuration{1, 1}; // the exact one
  A_Time workAreaStart{0, 1};
  A_Time workAreaDuration{0, 1}; // not below 0
  double frames = 0;             // how long it is, in frames of its own; 0 where that isn't known
  A_Ratio pixelAspect{1, 1};
  std::vector<Layer*> layers; // the top one first
};

// Owns what the handles of a host point to; moving a project leaves its parts where they are.
struct Project
{
  A_Time frameDuration{1, 1};           // that of the root, in which keyframes are counted
  Composition* root = nullptr;          // the file's top level
  std::deque<Composition> compositions; // the root first, then in the order of the assets
  std::deque<Item> items;
  std::deque<Layer> layers;          // in the order of their ids, which start at 1
  std::vector<std::string> warnings; // a line each, with the name of the file
};

// A file that cannot be used. what() is one line: the file's name, the place, the reason.
class CompositionError : public std::runtime_error
{
 public:
  // `message` tells the place, if any, and the reason; `offset` is the byte in the file, or -1, and `path` leads there:
  // a JSON pointer or the chunks around it.
  CompositionError(const std::string& file, const std::string& message, std::ptrdiff_t offset = -1,
                   std::string path = {})
      : std::runtime_error(file + ": " + message),
        file_(file),
        message_(message),
        path_(std::move(path)),
        offset_(offset)
  {}

  const std::string& File() const { return file_; }
  const std::string& Message() const { return message_; }
  const std::string& Path() const { return path_; }
  std::ptrdiff_t Offset() const { return offset_; }

 private:
  std::string file_;
  std::string message_;
  std::string path_;
  std::ptrdiff_t offset_;
};

// Reads a composition file. Throws CompositionError.
Project LoadComposition(const std::filesystem::path& file);

// Reads a composition from JSON text. `name` stands in messages, and its stem names a composition without a name of
// its own; footage is looked for relative to `folder`. Throws CompositionError.
Project LoadCompositionText(std::string_view text, const std::string& name, const std::filesystem::path& folder);

// The composition with the name, else the one with the asset id; null if there is none.
Composition* FindComposition(Project& project, std::string_view nameOrId);

} // namespace host
