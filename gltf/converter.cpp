#include "gltf/converter.h"

#include <algorithm>
#include <memory>

#include "gltf/context.h"
#include "gltf/motion/tracks.h"
#include "gltf/scene/camera.h"
#include "gltf/scene/nodes.h"
#include "gltf/scene/targets.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

constexpr const char* kGenerator = "q7r " Q7R_VERSION;

bool HasSeenLight(const SceneTree& tree)
{
  for (std::size_t i = 0; i < tree.Count(); ++i) {
    if (tree[i].object->GetType() == kObjectLight && !tree[i].hidden)
      return true;
  }
  return false;
}

bool IsLit(const Options& options, const SceneTree& tree)
{
  return options.shading == Shading::kByLights ? HasSeenLight(tree) : options.shading == Shading::kLit;
}

SceneSettings SettingsOf(BaseDocument& document, const Options& options)
{
  SceneSettings settings(document);
  if (options.unit > 0.0)
    settings.unit = options.unit;
  return settings;
}

// The tracks of all objects that have some.
class SceneTracks
{
 public:
  explicit SceneTracks(const SceneTree& tree) : tracks(tree), motions(tree)
  {
    for (std::size_t i = 0; i < tree.Count(); ++i) {
      if (!tree[i].object->GetFirstTrack())
        continue;
      auto set = std::make_unique<TrackSet>(*tree[i].object);
      keys += set->CountKeys();
      earliest = std::min(earliest, set->Earliest());
      auto motion = std::make_unique<Motion>(*tree[i].object, *set);
      tracks.Set(i, set.get());
      if (!motion->IsStill())
        motions.Set(i, motion.get());
      ownedTracks_.push_back(std::move(set));
      ownedMotions_.push_back(std::move(motion));
    }
  }

  ByObject<TrackSet> tracks;
  ByObject<const Motion> motions;
  std::size_t keys = 0;
  Real earliest = 0.0;

 private:
  std::vector<std::unique_ptr<TrackSet>> ownedTracks_;
  std::vector<std::unique_ptr<Motion>> ownedMotions_;
};

Json SceneJson(const SceneTree& tree, const SceneSettings& settings, Real timeOffset)
{
  Json scene = Json::object();
  for (std::size_t i = tree.Count() > 0 ? 0 : kNone; i != kNone; i = tree[i].nextSibling)
    scene["nodes"].push_back(i);
  Json& extras = scene["extras"]["q7r"];
  extras = {{"fps", settings.fps},   {"start", Finite(settings.start)}, {"end", Finite(settings.end)},
            {"unit", settings.unit}, {"width", settings.width},         {"height", settings.height}};
  if (tree.SceneCamera() != kNone)
    extras["camera"] = tree.SceneCamera();
  if (timeOffset != 0.0)
    extras["timeOffset"] = timeOffset;
  return scene;
}

} // namespace

Model Convert(BaseDocument& document, const Options& options)
{
  const SceneTree tree(document);
  const SceneSettings settings = SettingsOf(document, options);
  Output output;
  SceneTracks tracks(tree);
  Timeline timeline(settings.fps, tracks.earliest, tracks.keys, output.account);
  if (timeline.Offset() != 0.0)
    output.account.Tell(Loss::kNegativeTime);
  Targets targets(tree, tracks.motions);
  Context context = {document, options, tree, settings, timeline, output, IsLit(options, tree)};

  TrackSet none;
  const std::size_t camera = tree.SceneCamera();
  if (camera != kNone) { // many viewers take the first one
    TrackSet* const own = tracks.tracks[camera];
    AddCamera(context, *tree[camera].object, own ? *own : none);
  }
  Nodes(context, targets, tracks.motions, tracks.tracks).Write();

  const Real offset = timeline.Offset();
  const Json animation = offset != 0.0 ? Json{{"extras", {{"q7r", {{"timeOffset", offset}}}}}} : Json::object();
  Model model;
  model.json = output.Finish(kGenerator, SceneJson(tree, settings, offset), animation, options.bufferName);
  model.bytes = output.TakeBytes();
  model.account = std::move(output.account);
  return model;
}

} // namespace gltf
