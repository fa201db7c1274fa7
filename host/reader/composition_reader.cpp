// Reads a composition file into a project.
#include "host/reader/composition_reader.h"

#include <algorithm>
#include <cmath>
#include <optional>
#include <unordered_map>
#include <unordered_set>

#include "host/model/timing.h"
#include "host/reader/composition_checks.h"
#include "host/reader/item_reader.h"
#include "host/reader/json_document.h"
#include "host/reader/layer_reader.h"
#include "host/reader/warnings.h"
#include "host/text.h"

namespace host
{

namespace
{

constexpr double kLargestFrame = 1e9; // so that rounding fits; times are tested exactly
constexpr const char* kUncountable = "beyond what the host can count";

// The layers of a composition as the file lists them.
struct LayerList
{
  Composition* composition;
  const Json* json;                // the array
  std::vector<const Json*> layers; // its entries, in the order of composition->layers
};

class CompositionReader
{
 public:
  CompositionReader(const JsonDocument& document, const std::filesystem::path& folder)
      : document_(document), folder_(std::filesystem::absolute(folder))
  {}

  Project Read();

 private:
  struct Frames
  {
    A_Time start, duration;
  };

  void ReadRoot();
  void ReadAssets();
  void ReadAsset(const Json& json);
  void ReadSettings(const Json& json, Composition& composition);
  Composition& AddComposition(const Json& json, const Json& layers);
  Item& AddItem(ItemKind kind);

  void ReadLayers(LayerList& list);
  Item* ReadSource(const Json& json, const Layer& layer);
  AEGP_LayerIDVal ReadId(const Json& json);
  Item* FindAsset(const Json& json, const Layer& layer);
  void NoteUse(Item& item, const Json& layer);
  void LinkParents(LayerList& list);
  void SettleSizes();

  Frames ReadFrames(const Json& start, const Json& end, bool mayBeEmpty) const;
  A_Time ReadFrameDuration(const Json& json) const;
  const Json* FindPair(const Json& holder, const char* key) const;
  A_Ratio ReadRatio(const Json& pair) const;
  RefuseLayer Refusal() const;
  void Warn(const Layer& layer, const std::string& text);

  const JsonDocument& document_;
  std::filesystem::path folder_;
  Project project_;
  double frameRate_ = 0;
  double frames_ = 0;
  Frames rootFrames_{{0, 1}, {0, 1}};
  std::vector<LayerList> lists_; // in the order of project_.compositions
  std::unordered_map<std::string, Item*> assets_;
  std::unordered_map<const Item*, const Json*> firstUse_; // of compositions, by layers
  std::unordered_set<std::int64_t> ids_;                  // of layers that state theirs
};

// --- Settings

CompositionReader::Frames CompositionReader::ReadFrames(const Json& start, const Json& end, bool mayBeEmpty) const
{
  const double first = document_.Number(start), last = document_.Number(end);
  for (const Json* json : {&start, &end})
    if (std::abs(document_.Number(*json)) > kLargestFrame)
      document_.Refuse(*json, kUncountable);
  if (last < first || (last == first && !mayBeEmpty))
    document_.Refuse(end, "the end is not after the start");
  const std::int64_t from = std::llround(first), to = std::llround(last);
  const std::optional<A_Time> begin = FramesToTime(from, project_.frameDuration);
  const std::optional<A_Time> duration = FramesToTime(to - from, project_.frameDuration);
  if (!begin)
    document_.Refuse(start, kUncountable);
  if (!duration)
    document_.Refuse(end, kUncountable);
  return {*begin, *duration};
}

// A member of `holder` that holds two numbers; null when it is missing.
const Json* CompositionReader::FindPair(const Json& holder, const char* key) const
{
  const Json* found = document_.Find(holder, key);
  if (found && (!found->is_array() || found->size() != 2))
    document_.Refuse(*found, "expected an array of two numbers");
  return found;
}

// Two whole numbers above 0.
A_Ratio CompositionReader::ReadRatio(const Json& pair) const
{
  const auto part = [&](const Json& number, std::int64_t largest) {
    const std::int64_t value = document_.WholeNumber(number);
    if (value < 1 || value > largest)
      document_.Refuse(number, "expected a whole number above 0");
    return value;
  };
  return {static_cast<A_long>(part(pair[0], 0x7FFFFFFF)), static_cast<A_u_long>(part(pair[1], 0xFFFFFFFF))};
}

void CompositionReader::ReadSettings(const Json& json, Composition& composition)
{
  composition.frameRate = frameRate_;
  composition.frames = frames_;
  composition.frameDuration = project_.frameDuration;
  composition.workAreaStart = rootFrames_.start;
  composition.workAreaDuration = rootFrames_.duration;
  const Json* ae = document_.Find(json, "ae");
  if (!ae)
    return;
  if (const Json* area = FindPair(*ae, "workArea")) {
    const Frames frames = ReadFrames((*area)[0], (*area)[1], true);
    composition.workAreaStart = frames.start;
    composition.workAreaDuration = frames.duration;
  }
  if (const Json* aspect = FindPair(*ae, "pixelAspect"))
    composition.pixelAspect = ReadRatio(*aspect);
}

// What `ae.frameDuration` says, else what follows from the rate.
A_Time CompositionReader::ReadFrameDuration(const Json& json) const
{
  const Json* ae = document_.Find(json, "ae");
  const Json* duration = ae ? FindPair(*ae, "frameDuration") : nullptr;
  if (!duration)
    return FrameDuration(frameRate_);
  const A_Ratio ratio = ReadRatio(*duration);
  return {ratio.num, ratio.den};
}

void CompositionReader::ReadRoot()
{
  const Json& json = document_.Object(document_.Root());
  const A_long width = ReadSize(document_, document_.Require(json, "w"));
  const A_long height = ReadSize(document_, document_.Require(json, "h"));
  const Json& rate = document_.Require(json, "fr");
  frameRate_ = document_.Number(rate);
  if (!(frameRate_ > 0 && frameRate_ <= 999))
    document_.Refuse(rate, "expected a rate above 0 and not above 999");
  project_.frameDuration = ReadFrameDuration(json);
  rootFrames_ = ReadFrames(document_.Require(json, "ip"), document_.Require(json, "op"), false);
  frames_ = document_.Number(document_.Require(json, "op")) - document_.Number(document_.Require(json, "ip"));
  Composition& root = AddComposition(json, document_.Require(json, "layers"));
  root.item->name = document_.TextOr(json, "nm", PathToUtf8(PathFromUtf8(document_.Name()).stem()));
  root.item->width = width;
  root.item->height = height;
  project_.root = &root;
}

// --- Items

Item& CompositionReader::AddItem(ItemKind kind)
{
  Item& item = project_.items.emplace_back();
  item.kind = kind;
  return item;
}

Composition& CompositionReader::AddComposition(const Json& json, const Json& layers)
{
  Composition& composition = project_.compositions.emplace_back();
  composition.item = &AddItem(ItemKind::kComposition);
  composition.item->composition = &composition;
  ReadSettings(json, composition);
  LayerList& list = lists_.emplace_back(LayerList{&composition, &document_.Array(layers), {}});
  for (const Json& layer : layers)
    list.layers.push_back(&document_.Object(layer));
  return composition;
}

void CompositionReader::ReadAssets()
{
  const Json* assets = document_.Find(document_.Root(), "assets");
  if (!assets)
    return;
  for (const Json& asset : document_.Array(*assets))
    ReadAsset(asset);
}

void CompositionReader::ReadAsset(const Json& json)
{
  Item* item = nullptr;
  if (const Json* layers = document_.Find(json, "layers")) {
    item = AddComposition(json, *layers).item;
    // A size that the asset doesn't state is settled when its uses are known.
    if (const Json* width = document_.Find(json, "w"))
      item->width = ReadSize(document_, *width);
    if (const Json* height = document_.Find(json, "h"))
      item->height = ReadSize(document_, *height);
  } else if (document_.Find(json, "p")) {
    item = &AddItem(ItemKind::kFootage);
  } else {
    return; // fonts and the like
  }
  item->id = document_.TextOr(json, "id", "");
  if (item->kind == ItemKind::kFootage)
    ReadFootage(document_, json, folder_, *item);
  else
    item->name = document_.TextOr(json, "nm", item->id);
  if (!item->id.empty())
    assets_.try_emplace(item->id, item);
}

// --- Layers

RefuseLayer CompositionReader::Refusal() const
{
  return [this](const Composition& composition, std::size_t layer, const char* member, const std::string& reason) {
    const auto list =
        std::find_if(lists_.begin(), lists_.end(), [&](const auto& l) { return l.composition == &composition; });
    if (layer == kNoLayer)
      document_.Refuse(*list->json, reason);
    document_.RefuseMember(*list->layers[layer], std::string_view(member) == "source" ? "refId" : member, reason);
  };
}

void CompositionReader::Warn(const Layer& layer, const std::string& text)
{
  project_.warnings.push_back(document_.Name() + ": " + LayerLabel(layer) + ": " + text);
}

// `ae.id`, else the layer's place among all layers of the file.
AEGP_LayerIDVal CompositionReader::ReadId(const Json& json)
{
  const Json* ae = document_.Find(json, "ae");
  const Json* stated = ae ? document_.Find(*ae, "id") : nullptr;
  if (!stated)
    return static_cast<AEGP_LayerIDVal>(project_.layers.size());
  const std::int64_t id = document_.WholeNumber(*stated);
  if (id < 1 || id > 0x7FFFFFFF)
    document_.Refuse(*stated, "expected a whole number above 0");
  if (!ids_.insert(id).second)
    document_.Refuse(*stated, "another layer has the same id");
  return static_cast<AEGP_LayerIDVal>(id);
}

Item* CompositionReader::FindAsset(const Json& json, const Layer& layer)
{
  const Json* id = document_.Find(json, "refId");
  const auto found = id ? assets_.find(document_.Text(*id)) : assets_.end();
  if (found == assets_.end()) {
    Warn(layer, id ? "refId " + Quoted(document_.Text(*id)) + " names no asset" : "no refId names an asset");
    return nullptr;
  }
  NoteUse(*found->second, json);
  return found->second;
}

// The first layer that uses a composition may have to give it its size.
void CompositionReader::NoteUse(Item& item, const Json& layer)
{
  if (item.composition)
    firstUse_.try_emplace(&item, &layer);
}

Item* CompositionReader::ReadSource(const Json& json, const Layer& layer)
{
  switch (SourceOf(document_, json)) {
  case LayerSource::kAsset:
    return FindAsset(json, layer);
  case LayerSource::kSolid:
  case LayerSource::kNull: {
    Item& item = AddItem(ItemKind::kSolid);
    ReadSolid(document_, json, SourceOf(document_, json) == LayerSource::kNull, item);
    return &item;
  }
  case LayerSource::kNone:
    break;
  }
  return nullptr;
}

void CompositionReader::ReadLayers(LayerList& list)
{
  for (const Json* json : list.layers) {
    Layer& layer = project_.layers.emplace_back();
    layer.id = ReadId(*json);
    list.composition->layers.push_back(&layer);
    ReadLayer(document_, *json, layer);
    layer.source = ReadSource(*json, layer);
  }
  LinkParents(list);
}

void CompositionReader::LinkParents(LayerList& list)
{
  std::unordered_map<std::int64_t, Layer*> byIndex;
  for (std::size_t i = 0; i < list.layers.size(); ++i)
    if (const Json* index = document_.Find(*list.layers[i], "ind"))
      if (!byIndex.try_emplace(document_.WholeNumber(*index), list.composition->layers[i]).second)
        document_.Refuse(*index, "another layer of the list has the same ind");
  for (std::size_t i = 0; i < list.layers.size(); ++i) {
    const Json* parent = document_.Find(*list.layers[i], "parent");
    if (!parent)
      continue;
    Layer& layer = *list.composition->layers[i];
    const std::int64_t index = document_.WholeNumber(*parent);
    const auto found = byIndex.find(index);
    if (found == byIndex.end())
      Warn(layer, "parent " + std::to_string(index) + " names no layer");
    else
      layer.parent = found->second;
  }
  CheckParents(*list.composition, Refusal());
}

void CompositionReader::SettleSizes()
{
  for (Composition& composition : project_.compositions) {
    Item& item = *composition.item;
    const auto use = firstUse_.find(&item);
    const auto size = [&](const char* key, A_long otherwise) {
      const Json* found = use == firstUse_.end() ? nullptr : document_.Find(*use->second, key);
      return found ? ReadSize(document_, *found) : otherwise;
    };
    if (item.width == 0)
      item.width = size("w", project_.root->item->width);
    if (item.height == 0)
      item.height = size("h", project_.root->item->height);
  }
}

Project CompositionReader::Read()
{
  ReadRoot();
  ReadAssets();
  for (LayerList& list : lists_)
    ReadLayers(list);
  SettleSizes();
  CheckNesting(project_, Refusal());
  return std::move(project_);
}

} // namespace

Project ReadComposition(const JsonDocument& document, const std::filesystem::path& folder)
{
  return CompositionReader(document, folder).Read();
}

Project LoadCompositionText(std::string_view text, const std::string& name, const std::filesystem::path& folder)
{
  Project project = ReadComposition(JsonDocument(name, text), folder);
  WarnOfLostExpressions(project, OneLine(name));
  return project;
}

Composition* FindComposition(Project& project, std::string_view nameOrId)
{
  const auto find = [&](auto&& text) -> Composition* {
    for (Composition& composition : project.compositions)
      if (text(*composition.item) == nameOrId)
        return &composition;
    return nullptr;
  };
  if (Composition* named = find([](const Item& item) -> const std::string& { return item.name; }))
    return named;
  return nameOrId.empty() ? nullptr : find([](const Item& item) -> const std::string& { return item.id; });
}

} // namespace host
