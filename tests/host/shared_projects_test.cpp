// Real projects, held against what After Effects itself made of them. They lie beside the source tree; where they
// don't, these tests are skipped.
#include "project_stage.h"

#include "host/model/timing.h"
#include "host/reader/json_document.h"

#include <algorithm>
#include <fstream>

namespace project_tests
{

const std::filesystem::path kShared = TEST_SOURCE_DIR "/../shared/projects";

std::filesystem::path SharedFile(const std::string& name)
{
  const std::filesystem::path file = kShared / name;
  return std::filesystem::exists(file) ? file : std::filesystem::path();
}

struct AnswerName
{
  const char* group;
  const char* name;
  AEGP_LayerStream stream;
};

constexpr AnswerName kAnswers[] = {
    {"Transform", "Anchor Point", AEGP_LayerStream_ANCHORPOINT},
    {"Transform", "Point of Interest", AEGP_LayerStream_ANCHORPOINT},
    {"Transform", "Position", AEGP_LayerStream_POSITION},
    {"Transform", "Scale", AEGP_LayerStream_SCALE},
    {"Transform", "Orientation", AEGP_LayerStream_ORIENTATION},
    {"Transform", "X Rotation", AEGP_LayerStream_ROTATE_X},
    {"Transform", "Y Rotation", AEGP_LayerStream_ROTATE_Y},
    {"Transform", "Z Rotation", AEGP_LayerStream_ROTATE_Z},
    {"Transform", "Rotation", AEGP_LayerStream_ROTATE_Z},
    {"Camera Options", "Zoom", AEGP_LayerStream_ZOOM},
    {"Camera Options", "Focus Distance", AEGP_LayerStream_FOCUS_DISTANCE},
    {"Light Options", "Intensity", AEGP_LayerStream_INTENSITY},
    {"Light Options", "Color", AEGP_LayerStream_COLOR},
    {"Light Options", "Cone Angle", AEGP_LayerStream_CONE_ANGLE},
    {"Light Options", "Cone Feather", AEGP_LayerStream_CONE_FEATHER},
    {"Light Options", "Casts Shadows", AEGP_LayerStream_CASTS_SHADOWS},
    {"Light Options", "Shadow Darkness", AEGP_LayerStream_SHADOW_DARKNESS},
};

// Each keyframe is [seconds, value, ...]. Times are told to 14 digits.
std::size_t ExpectKeyframes(const host::Json& keyframes, const host::Property& property, double framesPerSecond)
{
  EXPECT_EQ(keyframes.size(), std::max<std::size_t>(property.KeyframeCount(), 1));
  for (std::size_t k = 0; k < keyframes.size(); ++k) {
    const double frame = keyframes[k][0].get<double>() * framesPerSecond;
    const Value actual = property.At(frame), before = property.At(frame - 1e-9);
    const std::vector<double> expected = keyframes[k][1].is_array()
                                             ? keyframes[k][1].get<std::vector<double>>()
                                             : std::vector<double>{keyframes[k][1].get<double>()};
    for (std::size_t c = 0; c < expected.size() && c < 3; ++c)
      EXPECT_TRUE(std::abs(expected[c] - actual[c]) < 1e-6 || std::abs(expected[c] - before[c]) < 1e-6)
          << expected[c] << " is " << actual[c] << " at frame " << frame;
  }
  return keyframes.size();
}

constexpr int kTowardsPoint = 4014; // as scripts are told that a camera or light looks at its point of interest

std::size_t ExpectLayer(const host::Json& answer, const host::Layer& layer, const host::Composition& composition)
{
  const double rate = static_cast<double>(composition.frameDuration.scale) / composition.frameDuration.value;
  const std::string& name = layer.name.empty() && layer.source ? layer.source->name : layer.name;
  EXPECT_EQ(answer["name"], name);
  EXPECT_EQ(answer["enabled"], (layer.flags & AEGP_LayerFlag_VIDEO_ACTIVE) != 0);
  EXPECT_EQ(answer.value("nullLayer", false), (layer.flags & AEGP_LayerFlag_NULL_LAYER) != 0);
  EXPECT_EQ(answer["autoOrient"] == kTowardsPoint, (layer.flags & AEGP_LayerFlag_LOOK_AT_POI) != 0);
  const bool isAlways3D = layer.type == AEGP_ObjectType_CAMERA || layer.type == AEGP_ObjectType_LIGHT;
  EXPECT_EQ(answer.value("threeDLayer", isAlways3D), layer.is3D);
  EXPECT_NEAR(answer["outPoint"].get<double>() * rate, layer.span->out, 1e-6);
  EXPECT_NEAR(answer["stretch"].get<double>() / 100, layer.span->stretch, 1e-12);
  const auto& layers = composition.layers;
  const auto parent = std::find(layers.begin(), layers.end(), layer.parent) - layers.begin() + 1;
  EXPECT_EQ(answer["parent"], layer.parent ? host::Json(parent) : host::Json());
  std::size_t count = 0;
  for (const AnswerName& known : kAnswers) {
    const host::Json& properties = answer["properties"];
    const auto& property = layer.streams[host::StreamIndex(*host::FindStreamInfo(known.stream))];
    if (!property || !properties.contains(known.group) || !properties[known.group].contains(known.name))
      continue;
    SCOPED_TRACE(known.name);
    const host::Json& told = properties[known.group][known.name];
    // A separated position is told twice, and only by its dimensions rightly.
    if (property->Split().empty())
      count += ExpectKeyframes(told["keyframes"], *property, rate);
  }
  return count;
}

TEST(SharedProjects, AgreeWithAfterEffectsPropertyByProperty)
{
  const std::pair<const char*, const char*> pairs[] = {{"every-layer-kind.aepx", "every-layer-kind.json"},
                                                       {"tracked-camera.aep", "tracked-camera.json"}};
  if (SharedFile(pairs[0].first).empty())
    GTEST_SKIP() << "the shared projects are not here";
  std::size_t count = 0;
  for (const auto& [file, answers] : pairs) {
    std::ifstream stream(SharedFile(answers));
    const host::Json told = host::Json::parse(stream);
    for (const host::Json& item : told["project"]["items"]) {
      SCOPED_TRACE(item["name"]);
      const auto project = host::OpenProjectFile(SharedFile(file));
      const auto list = project->Compositions();
      const auto id = std::to_string(item["id"].get<int>());
      const auto found = std::find_if(list.begin(), list.end(), [&](const auto& c) { return c.id == id; });
      ASSERT_NE(list.end(), found);
      EXPECT_TRUE(found->name == item["name"] && found->width == item["width"]);
      EXPECT_EQ(item["height"], found->height);
      EXPECT_NEAR(item["frameRate"], found->frameRate, 1e-12);
      EXPECT_NEAR(item["duration"], found->seconds, 1e-12);
      const host::Project read = project->Read(static_cast<std::size_t>(found - list.begin()));
      EXPECT_EQ(item["pixelAspect"], static_cast<double>(read.root->pixelAspect.num) / read.root->pixelAspect.den);
      const A_Time area = read.root->workAreaDuration;
      EXPECT_NEAR(item["workAreaDuration"], static_cast<double>(area.value) / area.scale, 1e-12);
      for (const host::Json& layer : item.value("layers", host::Json::array())) {
        SCOPED_TRACE(layer["name"]);
        const std::size_t index = layer["index"].get<std::size_t>() - 1;
        ASSERT_LT(index, read.root->layers.size());
        count += ExpectLayer(layer, *read.root->layers[index], *read.root);
      }
    }
  }
  EXPECT_GT(count, 450u); // two of the camera's properties have 182 keyframes each
}

// The values of layers with one name at every frame. What was exported has 3 decimals, its easing too.
void ExpectSameMovement(const host::Project& project, const host::Project& exported)
{
  for (const host::Layer* layer : project.root->layers) {
    const auto& others = exported.root->layers;
    const std::string& name = layer->name.empty() && layer->source ? layer->source->name : layer->name;
    const auto other = std::find_if(others.begin(), others.end(), [&](const auto* l) { return l->name == name; });
    if (other == others.end())
      continue;
    SCOPED_TRACE(name);
    for (std::size_t s = 0; s < host::kStreamCount; ++s) {
      const auto& own = layer->streams[s];
      const auto& its = (*other)->streams[s];
      if (!own || !its || own->Info().id == AEGP_LayerStream_SCALE) // flat scales have two components there
        continue;
      for (int frame = 0; frame < project.root->frames; ++frame)
        for (std::size_t c = 0; c < 2; ++c)
          ASSERT_NEAR(its->At(frame)[c], own->At(frame)[c], 0.1) << own->Info().name << " at frame " << frame;
    }
  }
}

TEST(SharedProjects, MoveAsWhatWasExportedFromThem)
{
  const std::string cases[][3] = {{"HamburgerArrow.aep", "HamburgerArrow.json", "HamburgerArrow"},
                                  {"MatteTimeStretch.aep", "MatteTimeStretch--Line.json", "Line"},
                                  {"MatteTimeStretch.aep", "MatteTimeStretch--Scan.json", "Scan"},
                                  {"MoveMultiple.aep", "MoveMultiple.json", "Main"}};
  if (SharedFile(cases[0][0]).empty())
    GTEST_SKIP() << "the shared projects are not here";
  for (const auto& [file, json, composition] : cases) {
    SCOPED_TRACE(json);
    const auto project = host::OpenProjectFile(SharedFile(file));
    const auto list = project->Compositions();
    const auto found =
        std::find_if(list.begin(), list.end(), [&name = composition](const auto& c) { return c.name == name; });
    const host::Project read = project->Read(static_cast<std::size_t>(found - list.begin()));
    const host::Project exported = host::LoadComposition(SharedFile(json));
    EXPECT_EQ(exported.root->layers.size(), read.root->layers.size());
    EXPECT_EQ(exported.root->item->width, read.root->item->width);
    EXPECT_EQ(exported.root->frameRate, read.root->frameRate);
    ExpectSameMovement(read, exported);
  }
}

} // namespace project_tests
