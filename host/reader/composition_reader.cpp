// Reads a composition file into a project.
#include "host/model/composition.h"

#include "host/model/timing.h"
#include "host/reader/composition_checks.h"
#include "host/reader/json_document.h"
#include "host/reader/layer_reader.h"
#include "host/text.h"

#include <cmath>
#include <fstream>
#include <optional>
#include <unordered_map>

namespace host
{

namespace
{

constexpr A_long kNullSize = 100;
constexpr A_long kDefaultSolidSize = 100;
constexpr double kLargestFrame = 1e9; // so that rounding fits; times are tested exactly

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
    A_long start, end;
  };

  void ReadRoot();
  void ReadAssets();
  void ReadAsset(const Json& json);
  void ReadFootage(const Json& json, Item& item);
  void ReadSettings(const Json& json, Composition& composition);
  Composition& AddComposition(const Json& json, const Json& layers);
  Item& AddItem(ItemKind kind);

  void ReadLayers(LayerList& list);
  Item* ReadSource(const Json& json, const Layer& layer);
  Item* MakeSolid(const Json& json);
  Item* MakeNull(const Json& json);
  Item* FindAsset(const Json& json, const Layer& layer);
  void NoteUse(Item& item, const Json& layer);
  void LinkParents(LayerList& list);
  void SettleSizes();

  Frames ReadFrames(const Json& start, const Json& end, bool mayBeEmpty) const;
  void Warn(const Layer& layer, const std::string& text);

  const JsonDocument& document_;
  std::filesystem::path folder_;
  Project project_;
  Frames rootFrames_{0, 0};
  std::vector<LayerList> lists_; // in the order of project_.compositions
  std::unordered_map<std::string, Item*> assets_;
  std::unordered_map<const Item*, const Json*> firstUse_; // of compositions, by layers
};

// --- Settings

CompositionReader::Frames CompositionReader::ReadFrames(const Json& start, const Json& end, bool mayBeEmpty) const
{
  const double first = document_.Number(start), last = document_.Number(end);
  for (const Json* json : {&start, &end})
    if (std::abs(document_.Number(*json)) > kLargestFrame)
      document_.Refuse(*json, "beyond what the host can count");
  if (last < first || (last == first && !mayBeEmpty))
    document_.Refuse(end, "the end is not after the start");
  const Frames frames{static_cast<A_long>(std::lround(first)), static_cast<A_long>(std::lround(last))};
  if (!FramesToTime(frames.start, project_.frameDuration))
    document_.Refuse(start, "beyond what the host can count");
  if (!FramesToTime(std::int64_t{frames.end} - frames.start, project_.frameDuration))
    document_.Refuse(end, "beyond what the host can count");
  return frames;
}

void CompositionReader::ReadSettings(const Json& json, Composition& composition)
{
  composition.workAreaStart = rootFrames_.start;
  composition.workAreaEnd = rootFrames_.end;
  const Json* ae = document_.Find(json, "ae");
  if (!ae)
    return;
  const auto pair = [&](const char* key) -> const Json* {
    const Json* found = document_.Find(*ae, key);
    if (found && (!found->is_array() || found->size() != 2))
      document_.Refuse(*found, "expected an array of two numbers");
    return found;
  };
  if (const Json* area = pair("workArea")) {
    const Frames frames = ReadFrames((*area)[0], (*area)[1], true);
    composition.workAreaStart = frames.start;
    composition.workAreaEnd = frames.end;
  }
  if (const Json* aspect = pair("pixelAspect")) {
    const auto part = [&](const Json& number) {
      const std::int64_t value = document_.WholeNumber(number);
      if (value < 1 || value > 0x7FFFFFFF)
        document_.Refuse(number, "expected a whole number above 0");
      return static_cast<A_long>(value);
    };
    composition.pixelAspect = {part((*aspect)[0]), static_cast<A_u_long>(part((*aspect)[1]))};
  }
}

void CompositionReader::ReadRoot()
{
  const Json& json = document_.Object(document_.Root());
  const A_long width = ReadSize(document_, document_.Require(json, "w"));
  const A_long height = ReadSize(document_, document_.Require(json, "h"));
  const Json& rate = document_.Require(json, "fr");
  project_.frameRate = document_.Number(rate);
  if (!(project_.frameRate > 0 && project_.frameRate <= 999))
    document_.Refuse(rate, "expected a rate above 0 and not above 999");
  project_.frameDuration = FrameDuration(project_.frameRate);
  rootFrames_ = ReadFrames(document_.Require(json, "ip"), document_.Require(json, "op"), false);
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
    ReadFootage(json, *item);
  else
    item->name = document_.TextOr(json, "nm", item->id);
  if (!item->id.empty())
    assets_.try_emplace(item->id, item);
}

void CompositionReader::ReadFootage(const Json& json, Item& item)
{
  const std::string& file = document_.Text(document_.Require(json, "p"));
  const bool isEmbedded = document_.FlagOr(json, "e", false) && file.starts_with("data:");
  if (isEmbedded) {
    item.path = item.id;
  } else {
    const std::filesystem::path path = folder_ / PathFromUtf8(document_.TextOr(json, "u", "") + file);
    item.path = PathToUtf8(path.lexically_normal().make_preferred());
  }
  // npos + 1 is 0
  item.name = document_.TextOr(json, "nm", isEmbedded ? item.id : file.substr(file.find_last_of("/\\") + 1));
  // Sounds have no size.
  if (const Json* width = document_.Find(json, "w"))
    item.width = ReadSize(document_, *width, 0);
  if (const Json* height = document_.Find(json, "h"))
    item.height = ReadSize(document_, *height, 0);
  const Json* ae = document_.Find(json, "ae");
  const Json* files = ae ? document_.Find(*ae, "files") : nullptr;
  if (files) {
    const std::int64_t count = document_.WholeNumber(*files);
    if (count < 1 || count > 0x7FFFFFFF)
      document_.Refuse(*files, "expected a whole number above 0");
    item.files = static_cast<A_long>(count);
  }
}

// "#rgb" or "#rrggbb"
std::optional<AEGP_ColorVal> ParseColor(const std::string& text)
{
  if ((text.size() != 4 && text.size() != 7) || text[0] != '#' ||
      text.find_first_not_of("0123456789abcdefABCDEF", 1) != std::string::npos)
    return std::nullopt;
  const std::size_t digits = text.size() / 3;
  const auto part = [&](std::size_t i) {
    const int number = std::stoi(text.substr(1 + i * digits, digits), nullptr, 16);
    return number / (digits == 1 ? 15.0 : 255.0);
  };
  return AEGP_ColorVal{.alphaF = 1, .redF = part(0), .greenF = part(1), .blueF = part(2)};
}

Item* CompositionReader::MakeSolid(const Json& json)
{
  Item& item = AddItem(ItemKind::kSolid);
  item.name = document_.TextOr(json, "nm", "Solid");
  const Json* width = document_.Find(json, "sw");
  const Json* height = document_.Find(json, "sh");
  item.width = width ? ReadSize(document_, *width) : kDefaultSolidSize;
  item.height = height ? ReadSize(document_, *height) : kDefaultSolidSize;
  if (const Json* text = document_.Find(json, "sc")) {
    const std::optional<AEGP_ColorVal> color = ParseColor(document_.Text(*text));
    if (!color)
      document_.Refuse(*text, "expected a colour, \"#rgb\" or \"#rrggbb\"");
    item.color = *color;
  }
  return &item;
}

Item* CompositionReader::MakeNull(const Json& json)
{
  Item& item = AddItem(ItemKind::kSolid);
  item.name = document_.TextOr(json, "nm", "Null");
  item.width = item.height = kNullSize;
  return &item;
}

// --- Layers

void CompositionReader::Warn(const Layer& layer, const std::string& text)
{
  const std::string label = layer.name.empty() ? "layer " + std::to_string(layer.id) : "layer " + Quoted(layer.name);
  project_.warnings.push_back(document_.Name() + ": " + label + ": " + text);
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
    return MakeSolid(json);
  case LayerSource::kNull:
    return MakeNull(json);
  case LayerSource::kNone:
    break;
  }
  return nullptr;
}

void CompositionReader::ReadLayers(LayerList& list)
{
  std::vector<const char*> lostExpressions;
  for (const Json* json : list.layers) {
    Layer& layer = project_.layers.emplace_back();
    layer.id = static_cast<AEGP_LayerIDVal>(project_.layers.size());
    list.composition->layers.push_back(&layer);
    lostExpressions.clear();
    ReadLayer(document_, *json, layer, lostExpressions);
    layer.source = ReadSource(*json, layer);
    for (const char* property : lostExpressions)
      Warn(layer, std::string("the expression of ") + property + " is not evaluated");
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
  CheckParents(document_, list);
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
  CheckNesting(document_, lists_);
  return std::move(project_);
}

} // namespace

Project LoadCompositionText(std::string_view text, const std::string& name, const std::filesystem::path& folder)
{
  const JsonDocument document(name, text);
  return CompositionReader(document, folder).Read();
}

Project LoadComposition(const std::filesystem::path& file)
{
  const std::string name = PathToUtf8(file.filename());
  errno = 0;
  std::ifstream stream(file, std::ios::binary);
  std::string text;
  std::vector<char> piece(65536);
  while (stream.read(piece.data(), static_cast<std::streamsize>(piece.size())) || stream.gcount() > 0)
    text.append(piece.data(), static_cast<std::size_t>(stream.gcount()));
  if (!stream.is_open() || stream.bad()) // a folder opens, but is bad to read
    throw CompositionError(OneLine(name) + ": " + (errno ? std::generic_category().message(errno) : "cannot be read"));
  return LoadCompositionText(text, name, std::filesystem::absolute(file).parent_path());
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
