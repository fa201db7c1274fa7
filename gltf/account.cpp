#include "gltf/account.h"

#include <algorithm>
#include <iterator>

namespace gltf
{

namespace
{

// What stands behind the count, and what became of it. "#" is the detail.
struct Words
{
  Loss loss;
  const char* one;
  const char* many;
  const char* consequence;
};

constexpr Words kWords[] = {
    {Loss::kObject, "object", "objects", "of a kind without a counterpart: an empty node"},
    {Loss::kPlaneAxis, "plane", "planes", "along another axis: drawn facing the viewer"},
    {Loss::kProjection, "camera", "cameras", "with a projection of another kind: parallel"},
    {Loss::kMeasuredLight, "measured light", "measured lights", ": shines alike in all directions"},
    {Loss::kNegativeBrightness, "light", "lights", "with a negative brightness: dark"},
    {Loss::kTextureProjection, "texture tag", "texture tags", "with a projection other than UVW: drawn as UVW"},
    {Loss::kTextureSelection, "texture tag", "texture tags", "on a selection that isn't there: left out"},
    {Loss::kMixing, "picture", "pictures", "mixed with a colour: the picture alone"},
    {Loss::kChannel, "material", "materials", "with channel # on: left out"},
    {Loss::kForeignMaterial, "material", "materials", "of another program: grey"},
    {Loss::kForeignShader, "shader", "shaders", "other than a bitmap: the colour alone"},
    {Loss::kSequence, "image sequence", "image sequences", ": first picture only"},
    {Loss::kMovie, "movie", "movies", ": the colour alone"},
    {Loss::kPictureFormat, "picture", "pictures", "that are neither PNG nor JPEG: the colour alone"},
    {Loss::kNoCoordinates, "object", "objects", "with a picture but no texture coordinates: the colour alone"},
    {Loss::kMoreCoordinates, "object", "objects", "with several sets of texture coordinates: the first only"},
    {Loss::kSmoothing, "smoothing tag", "smoothing tags", ": drawn flat"},
    {Loss::kSelection, "selection", "selections", ": name and count only"},
    {Loss::kBrokenPolygon, "polygon", "polygons", "on points that aren't there: left out"},
    {Loss::kBrokenTag, "tag", "tags", "with fewer entries than the object needs: left out"},
    {Loss::kSplineType, "spline", "splines", "of a type without tangents: straight lines"},
    {Loss::kTimeTrack, "time track", "time tracks", ": left out"},
    {Loss::kFocusTrack, "track", "tracks", "of a focus distance: left out"},
    {Loss::kShadowTrack, "track", "tracks", "of a shadow density: left out"},
    {Loss::kVisibilityTrack, "track", "tracks", "of visibility: left out"},
    {Loss::kMaterialTrack, "track", "tracks", "of a material: left out"},
    {Loss::kOtherTrack, "track", "tracks", "of values without a counterpart: left out"},
    {Loss::kPointer, "channel", "channels", "of a camera or light: left out as asked"},
    {Loss::kNegativeTime, "scene", "scenes", "with keys before 0 seconds: all keys moved to begin at 0"},
    {Loss::kCoarse, "stretch", "stretches", "between two keys too long for a value each frame: fewer values"},
    {Loss::kNumber, "number", "numbers", "beyond single precision: brought into range"},
};

std::string LineOf(Loss loss, int detail, std::size_t count)
{
  const auto* words =
      std::find_if(std::begin(kWords), std::end(kWords), [loss](const Words& row) { return row.loss == loss; });
  if (words == std::end(kWords))
    return {};
  std::string consequence = words->consequence;
  const std::size_t place = consequence.find('#');
  if (place != std::string::npos)
    consequence.replace(place, 1, std::to_string(detail));
  const char* gap = consequence.front() == ':' ? "" : " ";
  return std::to_string(count) + " " + (count == 1 ? words->one : words->many) + gap + consequence;
}

} // namespace

void Account::Tell(Loss loss, std::size_t count, int detail)
{
  if (count > 0)
    counts_[{loss, detail}] += count;
}

void Account::TellPicture(const std::string& path, const std::string& why) { pictures_.push_back(path + ": " + why); }

std::vector<std::string> Account::Lines() const
{
  std::vector<std::string> lines = pictures_;
  for (const auto& [kind, count] : counts_)
    lines.push_back(LineOf(kind.first, kind.second, count));
  return lines;
}

std::size_t Account::CountOf(Loss loss, int detail) const
{
  const auto found = counts_.find({loss, detail});
  return found == counts_.end() ? 0 : found->second;
}

} // namespace gltf
