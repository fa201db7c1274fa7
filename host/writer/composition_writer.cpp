#include "host/writer/composition_writer.h"

#include <algorithm>
#include <cmath>
#include <unordered_map>
#include <unordered_set>

#include "host/model/layer_streams.h"
#include "host/model/timing.h"
#include "host/reader/composition_keys.h"
#include "host/text.h"
#include "host/writer/property_writer.h"

namespace host
{

namespace
{

constexpr double kLastSecond = 10000; // an export reads no values beyond

template <std::size_t N>
const char* WordOf(const Word (&words)[N], A_long value)
{
  const auto found = std::find_if(std::begin(words), std::end(words), [&](const Word& w) { return w.value == value; });
  return found == std::end(words) ? words[0].text : found->text;
}

// The nearest of the 16 million colours, "#rrggbb".
std::string HexColor(const std::array<double, 3>& color)
{
  constexpr const char* kDigits = "0123456789abcdef";
  std::string text = "#";
  for (const double part : color) {
    const auto byte = static_cast<std::size_t>(std::lround(std::clamp(part, 0.0, 1.0) * 255));
    text += {kDigits[byte / 16], kDigits[byte % 16]};
  }
  return text;
}

bool IsAmongHexColors(const std::array<double, 3>& color)
{
  return std::all_of(color.begin(), color.end(),
                     [](double part) { return part == static_cast<double>(std::lround(part * 255)) / 255.0; });
}

class CompositionWriter
{
 public:
  explicit CompositionWriter(const Project& project) : project_(project) {}

  CompositionText Write();

 private:
  void Collect();
  void AddAsset(const Item& item);
  OrderedJson WriteSettings(const Composition& composition);
  OrderedJson WriteAsset(const Item& item);
  OrderedJson WriteFootage(const Item& item) const;
  OrderedJson WriteLayers(const Composition& composition) const;
  OrderedJson WriteLayer(const Layer& layer) const;
  void WriteKind(const Layer& layer, OrderedJson& json, OrderedJson& ae) const;
  void WriteSolid(const Layer& layer, OrderedJson& json, OrderedJson& ae) const;
  void WriteStreams(const Layer& layer, OrderedJson& json) const;
  double FrameOf(A_Time time, const Composition& composition);

  const Project& project_;
  std::size_t lastFrame_ = 0;
  std::vector<const Item*> assets_; // in the order in which layers name them
  std::unordered_map<const Item*, std::string> ids_;
  std::unordered_set<std::string> usedIds_;
  std::vector<const Composition*> compositions_; // the root first
  std::vector<std::string> warnings_;
};

// --- What there is to write

void CompositionWriter::AddAsset(const Item& item)
{
  if (item.kind == ItemKind::kSolid || ids_.count(&item) != 0)
    return;
  std::string id = item.id;
  for (std::size_t n = assets_.size(); id.empty() || usedIds_.count(id) != 0; ++n)
    id = "asset_" + std::to_string(n);
  usedIds_.insert(id);
  ids_[&item] = id;
  assets_.push_back(&item);
  if (item.composition)
    compositions_.push_back(item.composition);
}

void CompositionWriter::Collect()
{
  compositions_.push_back(project_.root);
  for (std::size_t i = 0; i < compositions_.size(); ++i)
    for (const Layer* layer : compositions_[i]->layers)
      if (layer->source)
        AddAsset(*layer->source);
  const Composition& root = *project_.root;
  const double areaEnd =
      FrameAt(root.workAreaStart, root.frameDuration) + FrameAt(root.workAreaDuration, root.frameDuration);
  const double most = kLastSecond * std::ceil(root.frameRate);
  lastFrame_ = static_cast<std::size_t>(std::min(most, std::max({1.0, std::ceil(root.frames), std::ceil(areaEnd)})));
}

// --- Compositions and footage

// Work areas are in whole frames of the root there.
double CompositionWriter::FrameOf(A_Time time, const Composition& composition)
{
  const double frame = FrameAt(time, project_.frameDuration);
  if (&composition == project_.root && frame != std::round(frame))
    warnings_.push_back("the work area's frame " + std::to_string(frame) + " is rounded to a whole one");
  return std::round(frame);
}

OrderedJson CompositionWriter::WriteSettings(const Composition& composition)
{
  const double start = FrameOf(composition.workAreaStart, composition);
  const double duration = FrameOf(composition.workAreaDuration, composition);
  OrderedJson ae;
  if (&composition == project_.root)
    ae["frameDuration"] = {project_.frameDuration.value, project_.frameDuration.scale};
  ae["workArea"] = {start, start + duration};
  ae["pixelAspect"] = {composition.pixelAspect.num, composition.pixelAspect.den};
  return ae;
}

OrderedJson CompositionWriter::WriteFootage(const Item& item) const
{
  OrderedJson json = {{"id", ids_.at(&item)}, {"nm", item.name}, {"w", item.width}, {"h", item.height}};
  json["u"] = "";
  json["p"] = item.path.substr(item.path.find_last_of("/\\") + 1); // npos + 1 is 0
  json["e"] = 0;
  json["ae"] = {{"path", item.path}, {"files", item.files}};
  return json;
}

OrderedJson CompositionWriter::WriteAsset(const Item& item)
{
  if (!item.composition)
    return WriteFootage(item);
  OrderedJson json = {{"id", ids_.at(&item)}, {"nm", item.name}, {"w", item.width}, {"h", item.height}};
  json["ae"] = WriteSettings(*item.composition);
  json["layers"] = WriteLayers(*item.composition);
  return json;
}

// --- Layers

OrderedJson CompositionWriter::WriteLayers(const Composition& composition) const
{
  std::unordered_map<const Layer*, std::size_t> indexOf;
  for (const Layer* layer : composition.layers)
    indexOf[layer] = indexOf.size() + 1;
  OrderedJson layers = OrderedJson::array();
  for (const Layer* layer : composition.layers) {
    OrderedJson json = WriteLayer(*layer);
    json["ind"] = indexOf[layer];
    if (layer->parent)
      json["parent"] = indexOf[layer->parent];
    layers.push_back(std::move(json));
  }
  return layers;
}

OrderedJson CompositionWriter::WriteLayer(const Layer& layer) const
{
  OrderedJson json = OrderedJson::object(), ae = {{"id", layer.id}};
  if (!layer.name.empty())
    json["nm"] = layer.name;
  WriteKind(layer, json, ae);
  json["ddd"] = layer.is3D ? 1 : 0;
  if ((layer.flags & AEGP_LayerFlag_VIDEO_ACTIVE) == 0)
    json["hd"] = true;
  if ((layer.flags & AEGP_LayerFlag_LOCKED) != 0)
    ae["locked"] = true;
  if (CanLookAt(layer) && (layer.flags & AEGP_LayerFlag_LOOK_AT_POI) == 0)
    ae["autoOrient"] = false;
  if (layer.span) {
    json["ip"] = layer.span->in;
    json["op"] = layer.span->out;
    json["st"] = layer.span->start;
    json["sr"] = layer.span->stretch;
  }
  WriteStreams(layer, json);
  json["ae"] = std::move(ae);
  return json;
}

void CompositionWriter::WriteSolid(const Layer& layer, OrderedJson& json, OrderedJson& ae) const
{
  const Item& solid = *layer.source;
  if (layer.name.empty())
    json["nm"] = solid.name;
  if ((layer.flags & AEGP_LayerFlag_NULL_LAYER) != 0) {
    json["ty"] = 3;
    ae["size"] = {solid.width, solid.height};
    return;
  }
  json["ty"] = 1;
  json["sw"] = solid.width;
  json["sh"] = solid.height;
  const std::array<double, 3> color{solid.color.redF, solid.color.greenF, solid.color.blueF};
  json["sc"] = HexColor(color);
  if (!IsAmongHexColors(color))
    ae["color"] = color;
}

int FootageType(const Item& footage)
{
  if (footage.width == 0)
    return 6; // a sound
  if (footage.files > 1)
    return 8; // an image sequence
  return footage.duration > 0 ? 9 : 2;
}

void CompositionWriter::WriteKind(const Layer& layer, OrderedJson& json, OrderedJson& ae) const
{
  switch (layer.type) {
  case AEGP_ObjectType_AV:
    if (layer.source && layer.source->kind == ItemKind::kSolid)
      return WriteSolid(layer, json, ae);
    json["ty"] = !layer.source ? 2 : layer.source->composition ? 0 : FootageType(*layer.source);
    if (layer.source)
      json["refId"] = ids_.at(layer.source);
    break;
  case AEGP_ObjectType_CAMERA:
    json["ty"] = 13;
    json["camera"] = {{"type", WordOf(kCameraTypes, static_cast<A_long>(layer.cameraType))},
                      {"filmSize", layer.filmSize},
                      {"filmSizeUnits", WordOf(kFilmSizeUnits, layer.filmSizeUnits)}};
    break;
  case AEGP_ObjectType_LIGHT:
    json["ty"] = 14;
    json["light"] = {{"type", WordOf(kLightTypes, static_cast<A_long>(layer.lightType))}};
    break;
  case AEGP_ObjectType_TEXT:
    json["ty"] = 5;
    break;
  case AEGP_ObjectType_VECTOR:
    json["ty"] = 4;
    break;
  default: // a layer without `ty` is one of no kind
    break;
  }
}

void CompositionWriter::WriteStreams(const Layer& layer, OrderedJson& json) const
{
  json["ks"] = OrderedJson::object();
  for (const StreamKey& key : kStreamKeys) {
    const auto& property = layer.streams[StreamIndex(*FindStreamInfo(key.id))];
    if (!property)
      continue;
    OrderedJson& holder = key.holder == Holder::kTransform ? json["ks"]
                          : key.holder == Holder::kCamera  ? json["camera"]
                          : key.holder == Holder::kLight   ? json["light"]
                                                           : json;
    holder[key.key] = WriteProperty(*property, lastFrame_);
  }
}

CompositionText CompositionWriter::Write()
{
  Collect();
  const Composition& root = *project_.root;
  OrderedJson json = {{"v", "5.7.0"}, {"nm", root.item->name}, {"w", root.item->width}, {"h", root.item->height}};
  json["fr"] = root.frameRate;
  json["ip"] = 0;
  json["op"] = root.frames > 0 ? root.frames : 1.0;
  json["ae"] = WriteSettings(root);
  json["assets"] = OrderedJson::array();
  for (const Item* item : assets_)
    json["assets"].push_back(WriteAsset(*item));
  json["layers"] = WriteLayers(root);
  return {json.dump(1, ' ', false, OrderedJson::error_handler_t::replace) + "\n", std::move(warnings_)};
}

} // namespace

CompositionText WriteComposition(const Project& project) { return CompositionWriter(project).Write(); }

} // namespace host
