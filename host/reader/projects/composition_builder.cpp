#include "host/reader/projects/composition_builder.h"

#include <algorithm>
#include <unordered_set>

#include "host/model/layer_streams.h"
#include "host/model/timing.h"
#include "host/reader/composition_checks.h"
#include "host/reader/item_reader.h"
#include "host/reader/projects/layouts.h"
#include "host/reader/warnings.h"

namespace host::projects
{

namespace
{

constexpr std::uint32_t kLargestId = 0x7FFFFFFF;

// A composition that is being built, and where it stands in the file.
struct Build
{
  const ProjectItem* item;
  Composition* composition;
  CompositionSettings settings;
  std::vector<Chunk> layers; // in the order of composition->layers
};

class ProjectBuilder
{
 public:
  ProjectBuilder(const ChunkDocument& document, const ItemIndex& items) : document_(document), items_(items) {}

  Project Run(const ProjectItem& root);

 private:
  Composition& AddComposition(const ProjectItem& item);
  void SetTimes(const CompositionSettings& settings, Composition& composition) const;
  A_Time ToTime(const Ratio& frames, const CompositionSettings& settings, const Chunk& at) const;
  void ReadLayers(std::size_t build);
  void ReadLayer(const Build& build, const Chunk& chunk, const LayerRecord& record, Layer& layer);
  void SetKind(const LayerRecord& record, Layer& layer);
  void SetCamera(const LayerRecord& record, Layer& layer);
  void SetLight(const LayerRecord& record, Layer& layer);
  void SetFlags(const LayerRecord& record, Layer& layer);
  void SetSpan(const LayerRecord& record, const PropertyGroup& properties, const LayerClock& clock, Layer& layer) const;
  Item* FindSource(const LayerRecord& record, const Layer& layer);
  void LinkParents(const Build& build, const std::vector<LayerRecord>& records);
  AEGP_LayerIDVal TakeId(std::uint32_t stated);
  RefuseLayer Refusal() const;
  void Warn(const Layer& layer, const std::string& text);

  const ChunkDocument& document_;
  const ItemIndex& items_;
  Project project_;
  Doubts doubts_;
  std::deque<Build> builds_;                         // in the order of project_.compositions
  std::unordered_map<std::uint32_t, Item*> made_;    // by the item's id
  std::unordered_map<const Item*, Ratio> durations_; // of compositions, in seconds
  std::unordered_set<AEGP_LayerIDVal> ids_;
  AEGP_LayerIDVal spareId_ = kLargestId;
};

// --- Compositions

A_Time ProjectBuilder::ToTime(const Ratio& frames, const CompositionSettings& settings, const Chunk& at) const
{
  if (frames.IsWhole())
    if (const std::optional<A_Time> time = FramesToTime(frames.Numerator(), settings.frameDuration))
      return *time;
  const Ratio seconds = frames / settings.framesPerSecond;
  if (seconds.Numerator() > 0x7FFFFFFF || seconds.Divisor() > 0xFFFFFFFF)
    at.Refuse("the work area is beyond what the host can count");
  return {static_cast<A_long>(seconds.Numerator()), static_cast<A_u_long>(seconds.Divisor())};
}

Composition& ProjectBuilder::AddComposition(const ProjectItem& item)
{
  Build& build = builds_.emplace_back(
      Build{&item, &project_.compositions.emplace_back(), ReadCompositionSettings(item.chunk), {}});
  const CompositionSettings& settings = build.settings;
  Composition& composition = *build.composition;
  Item& made = project_.items.emplace_back();
  composition.item = &made;
  made.kind = ItemKind::kComposition;
  made.composition = &composition;
  made.id = std::to_string(item.id);
  made.name = OwnName(item.chunk);
  if (made.name.empty())
    made.name = made.id;
  made.width = settings.width;
  made.height = settings.height;
  made_[item.id] = &made;
  durations_[&made] = settings.duration;
  composition.pixelAspect = settings.pixelAspect;
  composition.frameRate = settings.frameRate;
  composition.frameDuration = settings.frameDuration;
  composition.frames = settings.frames();
  const Chunk data = item.chunk.Require("cdta"_tag);
  composition.workAreaStart = ToTime(settings.workAreaStart, settings, data);
  composition.workAreaDuration = ToTime(settings.workAreaEnd - settings.workAreaStart, settings, data);
  for (const Chunk& child : item.chunk.Children())
    if (child.IsList("Layr"_tag))
      build.layers.push_back(child);
  return composition;
}

Project ProjectBuilder::Run(const ProjectItem& root)
{
  project_.root = &AddComposition(root);
  project_.frameDuration = project_.root->frameDuration;
  // Those that are nested are added while they are found.
  for (std::size_t i = 0; i < builds_.size(); ++i)
    ReadLayers(i);
  CheckNesting(project_, Refusal());
  for (const std::string& doubt : doubts_)
    project_.warnings.push_back(document_.Name() + ": " + doubt);
  return std::move(project_);
}

// --- Layers

void ProjectBuilder::ReadLayers(std::size_t index)
{
  Build& build = builds_[index];
  std::vector<LayerRecord> records;
  for (const Chunk& chunk : build.layers) {
    records.push_back(ReadLayerRecord(chunk));
    Layer& layer = project_.layers.emplace_back();
    build.composition->layers.push_back(&layer);
    ReadLayer(build, chunk, records.back(), layer);
  }
  LinkParents(build, records);
}

void ProjectBuilder::ReadLayer(const Build& build, const Chunk& chunk, const LayerRecord& record, Layer& layer)
{
  layer.id = TakeId(record.id);
  layer.name = OwnName(chunk);
  SetKind(record, layer);
  layer.source = FindSource(record, layer);
  if (IsAudioVideo(layer) && layer.source && layer.source->width == 0)
    layer.is3D = false; // a sound
  SetFlags(record, layer);
  const std::optional<Chunk> list = chunk.FindList("tdgp"_tag);
  const PropertyGroup properties = list ? PropertyGroup(*list) : PropertyGroup();
  const LayerClock clock(record.start, record.stretch, builds_.front().settings.framesPerSecond);
  SetSpan(record, properties, clock, layer);
  const Chunk* overrides = properties.Find("ADBE Layer Overrides");
  const std::optional<Chunk> count = overrides ? overrides->Find("CprC"_tag) : std::nullopt;
  if (count && count->Size() >= 4 &&
      count->Get(Field<std::uint32_t>{0}) > 0) // what nobody knows is no reason to refuse
    doubts_.insert("values of Essential Graphics are passed over: nested compositions have their own");
  ReadStreams(properties, {build.settings, record, clock, doubts_}, layer);
}

void ProjectBuilder::SetKind(const LayerRecord& record, Layer& layer)
{
  layer.is3D = (record.switches & ldta::k3D) != 0;
  switch (record.kind) {
  case ldta::kAudioVideo:
    layer.type = AEGP_ObjectType_AV;
    break;
  case ldta::kLight:
    SetLight(record, layer);
    break;
  case ldta::kCamera:
    SetCamera(record, layer);
    break;
  case ldta::kText:
    layer.type = AEGP_ObjectType_TEXT;
    break;
  case ldta::kShape:
    layer.type = AEGP_ObjectType_VECTOR;
    break;
  default:
    layer.type = AEGP_ObjectType_NONE;
    layer.is3D = false;
    doubts_.insert(record.kind == ldta::kModel ? "layers that are 3D models are left out"
                                               : "layers of unknown kinds are left out");
  }
}

void ProjectBuilder::SetCamera(const LayerRecord& record, Layer& layer)
{
  layer.type = AEGP_ObjectType_CAMERA;
  layer.is3D = true;
  layer.filmSize = record.filmSize;
  if (record.cameraKind != 0)
    doubts_.insert("orthographic camera layers were never seen: taken as perspective");
  layer.filmSizeUnits = AEGP_FilmSizeUnits_HORIZONTAL;
  if (record.filmSizeUnits == AEGP_FilmSizeUnits_VERTICAL || record.filmSizeUnits == AEGP_FilmSizeUnits_DIAGONAL) {
    layer.filmSizeUnits = static_cast<AEGP_FilmSizeUnits>(record.filmSizeUnits);
    doubts_.insert("film sizes other than horizontal were never seen: 2 is taken as vertical, 3 as diagonal");
  }
}

void ProjectBuilder::SetLight(const LayerRecord& record, Layer& layer)
{
  layer.type = AEGP_ObjectType_LIGHT;
  layer.is3D = true;
  layer.lightType = static_cast<AEGP_LightType>(std::min(record.lightKind, ldta::kAmbient));
  if (record.lightKind == ldta::kParallel || record.lightKind == ldta::kAmbient)
    doubts_.insert("parallel and ambient lights were never seen: which is which is told by others");
  if (record.lightKind > ldta::kAmbient)
    doubts_.insert("environment lights were never seen: taken as ambient");
}

void ProjectBuilder::SetFlags(const LayerRecord& record, Layer& layer)
{
  if ((record.moreSwitches & ldta::kVideo) != 0)
    layer.flags |= AEGP_LayerFlag_VIDEO_ACTIVE;
  if ((record.moreSwitches & ldta::kLocked) != 0)
    layer.flags |= AEGP_LayerFlag_LOCKED;
  if (layer.is3D)
    layer.flags |= AEGP_LayerFlag_LAYER_IS_3D;
  if (CanLookAt(layer) && (record.switches & ldta::kLooksAtPoint) != 0)
    layer.flags |= AEGP_LayerFlag_LOOK_AT_POI;
  const bool hasSolid = layer.source && layer.source->kind == ItemKind::kSolid;
  if (IsAudioVideo(layer) && hasSolid && (record.switches & ldta::kNull) != 0)
    layer.flags |= AEGP_LayerFlag_NULL_LAYER;
}

// What lasts ends the layer that shows it, unless its time is remapped or runs backwards.
void ProjectBuilder::SetSpan(const LayerRecord& record, const PropertyGroup& properties, const LayerClock& clock,
                             Layer& layer) const
{
  LayerSpan span;
  span.start = clock.FrameAt(0);
  span.stretch = record.stretch.ToDouble();
  span.in = clock.FrameAt(record.in);
  span.out = clock.FrameAt(record.out);
  if (clock.RunsBackwards()) {
    std::swap(span.in, span.out);
  } else if (layer.source) {
    const auto known = durations_.find(layer.source);
    const double perSecond = clock.FrameAt(1) - span.start;
    const double duration = known != durations_.end() ? known->second.ToDouble() : layer.source->duration;
    const Chunk* remapping = properties.Find("ADBE Time Remapping");
    const bool isRemapped = remapping && remapping->IsList("tdbs"_tag) && remapping->FindList("list"_tag);
    if (duration > 0 && !isRemapped) {
      span.in = std::max(span.in, span.start);
      span.out = std::min(span.out,
                          known != durations_.end() ? clock.FrameAt(known->second) : span.start + duration * perSecond);
    }
  }
  layer.span = span;
}

Item* ProjectBuilder::FindSource(const LayerRecord& record, const Layer& layer)
{
  if (!IsAudioVideo(layer) || record.source == 0)
    return nullptr;
  if (const auto made = made_.find(record.source); made != made_.end())
    return made->second;
  const ProjectItem* item = items_.Find(record.source);
  if (!item) {
    Warn(layer, "its source, item " + std::to_string(record.source) + ", is not in the project");
    return nullptr;
  }
  if (item->kind == idta::kComposition)
    return AddComposition(*item).item;
  Item& footage = project_.items.emplace_back();
  ReadFootage(*item, footage);
  if (footage.kind == ItemKind::kSolid && footage.name.empty())
    footage.name = (record.switches & ldta::kNull) != 0 ? kUnnamedNull : kUnnamedSolid;
  made_[item->id] = &footage;
  return &footage;
}

void ProjectBuilder::LinkParents(const Build& build, const std::vector<LayerRecord>& records)
{
  const std::vector<Layer*>& layers = build.composition->layers;
  std::unordered_map<std::uint32_t, Layer*> byId;
  for (std::size_t i = 0; i < layers.size(); ++i)
    byId.try_emplace(records[i].id, layers[i]);
  for (std::size_t i = 0; i < layers.size(); ++i) {
    if (records[i].parent == 0)
      continue;
    const auto parent = byId.find(records[i].parent);
    if (parent == byId.end())
      Warn(*layers[i], "its parent, layer " + std::to_string(records[i].parent) + ", is not in the composition");
    else
      layers[i]->parent = parent->second;
  }
  CheckParents(*build.composition, Refusal());
}

// The id that the file states, unless the host can't use it or has given it away.
AEGP_LayerIDVal ProjectBuilder::TakeId(std::uint32_t stated)
{
  auto id = static_cast<AEGP_LayerIDVal>(stated <= kLargestId ? stated : 0);
  if (id == 0 || ids_.count(id) != 0) {
    while (ids_.count(spareId_) != 0)
      --spareId_;
    id = spareId_;
  }
  ids_.insert(id);
  return id;
}

RefuseLayer ProjectBuilder::Refusal() const
{
  return [this](const Composition& composition, std::size_t layer, const char*, const std::string& reason) {
    const auto build =
        std::find_if(builds_.begin(), builds_.end(), [&](const Build& b) { return b.composition == &composition; });
    (layer == kNoLayer ? build->item->chunk : build->layers[layer]).Refuse(reason);
  };
}

void ProjectBuilder::Warn(const Layer& layer, const std::string& text)
{
  project_.warnings.push_back(document_.Name() + ": " + LayerLabel(layer) + ": " + text);
}

} // namespace

Project BuildProject(const ChunkDocument& document, const ItemIndex& items, const ProjectItem& root)
{
  return ProjectBuilder(document, items).Run(root);
}

} // namespace host::projects
