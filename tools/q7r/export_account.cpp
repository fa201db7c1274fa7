#include "export_account.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <map>

namespace q7r
{

namespace
{

struct Kind
{
  const char* one;
  const char* many;
  bool isTaken;
};

enum KindIndex : std::size_t
{
  kCamera,
  kLight,
  kPlane,
  kSolid,
  kNull,
  kNested,
  kText,
  kShape,
  kFlat,
  kSourceless,
  kOther,
  kKindCount,
};

constexpr std::array<Kind, kKindCount> kKinds = {{
    {"camera", "cameras", true},
    {"light", "lights", true},
    {"image plane", "image planes", true},
    {"solid", "solids", true},
    {"null", "nulls", true},
    {"nested composition", "nested compositions", true},
    {"text layer", "text layers", false},
    {"shape layer", "shape layers", false},
    {"layer with its 3D switch off", "layers with their 3D switch off", false},
    {"layer without a source", "layers without a source", false},
    {"layer of another kind", "layers of other kinds", false},
}};

using KindCounts = std::array<long long, kKindCount>;

KindIndex SourceKind(const host::Layer& layer)
{
  if (!layer.source)
    return kSourceless;
  if (layer.source->kind == host::ItemKind::kComposition)
    return kNested;
  if (layer.source->kind == host::ItemKind::kFootage)
    return kPlane;
  return (layer.flags & AEGP_LayerFlag_NULL_LAYER) != 0 ? kNull : kSolid;
}

// Text and shape layers stay out whether or not they stand in space.
KindIndex KindOf(const host::Layer& layer)
{
  switch (layer.type) {
  case AEGP_ObjectType_TEXT:
    return kText;
  case AEGP_ObjectType_VECTOR:
    return kShape;
  case AEGP_ObjectType_LIGHT:
    return layer.is3D ? kLight : kFlat;
  case AEGP_ObjectType_CAMERA:
    return layer.is3D ? kCamera : kFlat;
  case AEGP_ObjectType_AV:
    return layer.is3D ? SourceKind(layer) : kFlat;
  default:
    return kOther;
  }
}

void Count(const host::Composition& composition, KindCounts& counts)
{
  for (const host::Layer* layer : composition.layers) {
    const KindIndex kind = KindOf(*layer);
    ++counts[kind];
    if (kind == kNested && layer->source->composition)
      Count(*layer->source->composition, counts);
  }
}

std::string Counted(long long count, const char* one, const char* many)
{
  return std::to_string(count) + " " + (count == 1 ? one : many);
}

// "1 camera, 3 image planes".
std::string KindsText(const KindCounts& counts, bool taken)
{
  std::string text;
  for (std::size_t i = 0; i < kKindCount; ++i) {
    if (counts[i] > 0 && kKinds[i].isTaken == taken)
      text += (text.empty() ? "" : ", ") + Counted(counts[i], kKinds[i].one, kKinds[i].many);
  }
  return text;
}

// A warning without its names and numbers.
std::string Pattern(const std::string& warning)
{
  std::string pattern;
  bool quoted = false;
  for (const char c : warning) {
    if (c == '"')
      quoted = !quoted;
    else if (!quoted && !std::isdigit(static_cast<unsigned char>(c)))
      pattern += c;
  }
  return pattern;
}

} // namespace

std::string AccountText(const host::Composition& composition, const SceneCounts& scene)
{
  KindCounts counts = {};
  Count(composition, counts);
  long long layers = 0;
  for (const long long count : counts)
    layers += count;
  std::string text = Counted(layers, "layer", "layers");
  const std::string taken = KindsText(counts, true);
  const std::string left = KindsText(counts, false);
  if (!taken.empty())
    text += ": " + taken;
  if (!left.empty())
    text += "; left out: " + left;
  text += "; " + Counted(scene.tracks, "track", "tracks") + ", " + Counted(scene.keys, "key", "keys");
  if (layers > 0 && taken.empty())
    text += "\nthe scene is empty: no layer of the composition is a camera, a light or a picture in 3D";
  return text;
}

std::vector<std::string> MergedWarnings(const std::vector<std::string>& warnings)
{
  struct Group
  {
    std::string first;
    std::size_t count;
  };
  std::vector<Group> groups;
  std::map<std::string, std::size_t> known; // the group of a pattern
  for (const std::string& warning : warnings) {
    const auto [place, isNew] = known.emplace(Pattern(warning), groups.size());
    if (isNew)
      groups.push_back({warning, 0});
    ++groups[place->second].count;
  }
  std::vector<std::string> lines;
  lines.reserve(groups.size());
  for (const Group& group : groups)
    lines.push_back(group.count == 1 ? group.first
                                     : group.first + " (and " + std::to_string(group.count - 1) +
                                           " more like this; --verbose lists them)");
  return lines;
}

} // namespace q7r
