// The host's project in memory: items, compositions and layers. Texts are UTF-8.
#pragma once

#include "exporter/host_api/aegp_types.h"
#include "host/model/property.h"

#include <array>
#include <deque>
#include <filesystem>
#include <stdexcept>
#include <string>
#include <string_view>
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
  std::string id; // of the asset; empty for the root composition and for solids
  A_long width = 0;
  A_long height = 0;
  Composition* composition = nullptr; // of a composition
  std::string path;                   // of footage: absolute, or the id of embedded data
  A_long files = 1;                   // of footage
  AEGP_ColorVal color{.alphaF = 1, .redF = 1, .greenF = 1, .blueF = 1}; // of a solid
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
  // By StreamIndex; null where the stream is not legal on this layer.
  std::array<std::unique_ptr<Property>, kStreamCount> streams;
};

struct Composition
{
  Item* item = nullptr;
  A_long workAreaStart = 0; // frames
  A_long workAreaEnd = 0;   // frames, not before the start
  A_Ratio pixelAspect{1, 1};
  std::vector<Layer*> layers; // the top one first
};

// Owns what the handles of a host point to; moving a project leaves its parts where they are.
struct Project
{
  double frameRate = 0;                 // as the file states it
  A_Time frameDuration{1, 1};           // the exact one
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
  using std::runtime_error::runtime_error;
};

// Reads a composition file. Throws CompositionError.
Project LoadComposition(const std::filesystem::path& file);

// Reads a composition from JSON text. `name` stands in messages, and its stem names a composition without a name of
// its own; footage is looked for relative to `folder`. Throws CompositionError.
Project LoadCompositionText(std::string_view text, const std::string& name, const std::filesystem::path& folder);

// The composition with the name, else the one with the asset id; null if there is none.
Composition* FindComposition(Project& project, std::string_view nameOrId);

} // namespace host
