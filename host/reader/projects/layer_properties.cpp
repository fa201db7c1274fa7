#include "host/reader/projects/layer_properties.h"

#include <algorithm>
#include <limits>

#include "host/model/layer_streams.h"
#include "host/reader/projects/layouts.h"

namespace host::projects
{

namespace
{

enum class Unit
{
  kAsStored,
  kPercent,  // stored as fractions of 1
  kOfSource, // an anchor point: fractions of its source's width, height and height
  kColor,    // alpha, red, green and blue from 0 to 255
  kAngles,   // three that turn together
};

struct PropertySource
{
  AEGP_LayerStream id;
  const char* group;
  const char* matchName;
  Unit unit;
};

constexpr const char* kTransform = "ADBE Transform Group";
constexpr const char* kCamera = "ADBE Camera Options Group";
constexpr const char* kLight = "ADBE Light Options Group";

// The zoom stands before the position, whose default it is.
constexpr PropertySource kSources[] = {
    {AEGP_LayerStream_ZOOM, kCamera, "ADBE Camera Zoom", Unit::kAsStored},
    {AEGP_LayerStream_FOCUS_DISTANCE, kCamera, "ADBE Camera Focus Distance", Unit::kAsStored},
    {AEGP_LayerStream_ANCHORPOINT, kTransform, "ADBE Anchor Point", Unit::kOfSource},
    {AEGP_LayerStream_POSITION, kTransform, "ADBE Position", Unit::kAsStored},
    {AEGP_LayerStream_SCALE, kTransform, "ADBE Scale", Unit::kPercent},
    {AEGP_LayerStream_ORIENTATION, kTransform, "ADBE Orientation", Unit::kAngles},
    {AEGP_LayerStream_ROTATE_X, kTransform, "ADBE Rotate X", Unit::kAsStored},
    {AEGP_LayerStream_ROTATE_Y, kTransform, "ADBE Rotate Y", Unit::kAsStored},
    {AEGP_LayerStream_ROTATE_Z, kTransform, "ADBE Rotate Z", Unit::kAsStored},
    {AEGP_LayerStream_INTENSITY, kLight, "ADBE Light Intensity", Unit::kAsStored},
    {AEGP_LayerStream_COLOR, kLight, "ADBE Light Color", Unit::kColor},
    {AEGP_LayerStream_CONE_ANGLE, kLight, "ADBE Light Cone Angle", Unit::kAsStored},
    {AEGP_LayerStream_CONE_FEATHER, kLight, "ADBE Light Cone Feather 2", Unit::kAsStored},
    {AEGP_LayerStream_SHADOW_DARKNESS, kLight, "ADBE Light Shadow Darkness", Unit::kAsStored},
    {AEGP_LayerStream_CASTS_SHADOWS, kLight, "ADBE Casts Shadows", Unit::kAsStored},
};

constexpr const char* kSeparated[] = {"ADBE Position_0", "ADBE Position_1", "ADBE Position_2"};
constexpr StreamInfo kSeparatedInfo{AEGP_LayerStream_POSITION, "position", AEGP_StreamType_OneD, {0}};

// Some value between two keyframes is one that a frame can show.
bool ShowsTurns(const Property& property)
{
  const std::vector<Keyframe>& keys = property.Keyframes();
  for (std::size_t i = 0; i + 1 < keys.size(); ++i)
    if (keys[i].hold == Hold::kNone && keys[i].value != keys[i + 1].value && keys[i + 1].time - keys[i].time > 1)
      return true;
  return false;
}

// The zoom of a 50 mm lens on 36 mm film is 50/36 of the composition's width in square pixels.
double DefaultZoom(const CompositionSettings& composition)
{
  return composition.width * 25.0 / 18 * composition.pixelAspect.num / composition.pixelAspect.den;
}

class StreamReader
{
 public:
  StreamReader(const PropertyGroup& properties, const LayerContext& context, Layer& layer)
      : properties_(properties), context_(context), layer_(layer)
  {}

  void Read();

 private:
  std::unique_ptr<Property> ReadProperty(const PropertySource& source, const PropertyGroup& group);
  std::unique_ptr<Property> Make(const StreamInfo& info, PropertyRecord record, Unit unit, const Value& defaults);
  std::unique_ptr<Property> NoteKeyedOption(const PropertySource& source, std::unique_ptr<Property> property) const;
  Property ReadSeparated(const PropertyGroup& group, std::size_t component);
  bool IsSeparated(const PropertyGroup& group) const;
  void Convert(PropertyRecord& record, Unit unit, std::size_t dimensions, const Value& defaults) const;
  void ConvertColor(PropertyRecord& record) const;
  Components Factors(Unit unit) const;
  Value DefaultOf(const StreamInfo& info) const;
  Value DefaultAnchor() const;
  Value DefaultPosition() const;
  void DoubtDefaultPosition() const;
  const Property& Zoom() const { return *layer_.streams[StreamIndex(*FindStreamInfo(AEGP_LayerStream_ZOOM))]; }
  void Doubt(const char* text) const { context_.doubts.insert(text); }

  const PropertyGroup& properties_;
  const LayerContext& context_;
  Layer& layer_;
};

void StreamReader::Read()
{
  const char* name = nullptr;
  PropertyGroup group;
  for (const PropertySource& source : kSources) {
    if (!HasStream(layer_, source.id))
      continue;
    if (source.group != name)
      group = properties_.Group(name = source.group);
    layer_.streams[StreamIndex(*FindStreamInfo(source.id))] = ReadProperty(source, group);
  }
}

std::unique_ptr<Property> StreamReader::ReadProperty(const PropertySource& source, const PropertyGroup& group)
{
  const StreamInfo& info = *FindStreamInfo(source.id);
  if (source.id == AEGP_LayerStream_POSITION && IsSeparated(group)) {
    auto property = std::make_unique<Property>(info);
    std::vector<Property> components;
    for (std::size_t c = 0; c < 3; ++c)
      components.push_back(ReadSeparated(group, c));
    property->SetSplit(std::move(components));
    return property;
  }
  const Value defaults = DefaultOf(info);
  const Chunk* chunk = group.Find(source.matchName);
  if (chunk && (chunk->IsList("tdbs"_tag) || chunk->IsList("otst"_tag)))
    return NoteKeyedOption(source, Make(info, ReadPropertyRecord(*chunk), source.unit, defaults));
  if (source.id == AEGP_LayerStream_POSITION)
    DoubtDefaultPosition();
  auto property = std::make_unique<Property>(info);
  property->SetConstant(defaults);
  return property;
}

std::unique_ptr<Property> StreamReader::NoteKeyedOption(const PropertySource& source,
                                                        std::unique_ptr<Property> property) const
{
  if (source.group == kLight && property->KeyframeCount() > 1)
    Doubt("options of lights that have keyframes were never seen: read as other properties are");
  return property;
}

std::unique_ptr<Property> StreamReader::Make(const StreamInfo& info, PropertyRecord record, Unit unit,
                                             const Value& defaults)
{
  const std::size_t dimensions = unit == Unit::kAngles ? 3 : static_cast<std::size_t>(info.Dimensions());
  if (unit == Unit::kAngles)
    record.components = 3;
  Convert(record, unit, dimensions, defaults);
  auto property = std::make_unique<Property>(info);
  property->SetExpression(std::move(record.expression));
  if (record.keys.empty()) {
    Value value = defaults;
    if (record.hasValue)
      std::copy_n(record.value.begin(), dimensions, value.begin());
    property->SetConstant(value);
    return property;
  }
  std::size_t leftOut = 0;
  KeyframeDoubts doubts;
  property->SetKeyframes(BuildKeyframes(record, dimensions, context_.clock, leftOut, doubts));
  property->CountKeyframes(leftOut);
  if (unit == Unit::kAngles) {
    property->SetTurning();
    if (ShowsTurns(*property))
      Doubt("orientations between keyframes turn by the shortest way, which was never held against After Effects");
  }
  if (doubts.overshootsPath)
    Doubt("eases that overshoot the end of a path were never seen: taken as straight on");
  if (doubts.hasSpeedWithoutPath)
    Doubt("eases with a speed of orientations and colours were never seen: a speed of 1 is taken as the average one");
  return property;
}

// --- Separated dimensions

bool StreamReader::IsSeparated(const PropertyGroup& group) const
{
  const Chunk* position = group.Find("ADBE Position");
  if (!position || !position->IsList("tdbs"_tag))
    return false;
  const std::optional<Chunk> switches = position->Find("tdsb"_tag);
  return switches && (switches->Get(tdsb::kSwitches) & tdsb::kSeparated) != 0;
}

Property StreamReader::ReadSeparated(const PropertyGroup& group, std::size_t component)
{
  const Chunk* chunk = group.Find(kSeparated[component]);
  const bool isFlat = component == 2 && !layer_.is3D;
  const double middle[] = {context_.composition.width / 2.0, context_.composition.height / 2.0, 0};
  const Value defaults{isFlat ? 0 : middle[component]};
  if (chunk && chunk->IsList("tdbs"_tag) && !isFlat)
    return std::move(*Make(kSeparatedInfo, ReadPropertyRecord(*chunk), Unit::kAsStored, defaults));
  if (!isFlat)
    Doubt("separated positions that lack a dimension were never seen: taken as the composition's centre");
  Property property(kSeparatedInfo);
  property.SetConstant(defaults);
  return property;
}

// --- Units

Components StreamReader::Factors(Unit unit) const
{
  switch (unit) {
  case Unit::kPercent:
    return {100, 100, 100, 100};
  case Unit::kOfSource: {
    if (!IsAudioVideo(layer_))
      break;
    const double width = layer_.source ? layer_.source->width : 0, height = layer_.source ? layer_.source->height : 0;
    return {width, height, height, 1};
  }
  default:
    break;
  }
  return {1, 1, 1, 1};
}

// Alpha goes, and what is left is 0 to 1. A colour moves along no path: its ease has no unit.
void StreamReader::ConvertColor(PropertyRecord& record) const
{
  const auto convert = [](Components& values) { values = {values[1] / 255, values[2] / 255, values[3] / 255, 0}; };
  convert(record.value);
  for (KeyRecord& key : record.keys)
    convert(key.value);
}

void StreamReader::Convert(PropertyRecord& record, Unit unit, std::size_t dimensions, const Value& defaults) const
{
  if (unit == Unit::kColor && record.components == kMaxComponents)
    return ConvertColor(record);
  const Components factors = Factors(unit);
  const auto scale = [&](Components& values) {
    for (std::size_t c = 0; c < dimensions; ++c)
      values[c] *= factors[c];
  };
  const auto complete = [&](Components& values) {
    scale(values);
    for (std::size_t c = record.components; c < dimensions; ++c)
      values[c] = defaults[c];
  };
  // The depth of a 2D layer stays as it is whatever the file says.
  const bool isFlatScale = unit == Unit::kPercent && !layer_.is3D;
  complete(record.value);
  if (isFlatScale)
    record.value[2] = defaults[2];
  for (KeyRecord& key : record.keys) {
    complete(key.value);
    scale(key.tangentIn);
    scale(key.tangentOut);
    if (!record.hasTangents) { // the speed along a path is in pixels already
      scale(key.speedIn);
      scale(key.speedOut);
    }
    if (isFlatScale) {
      key.value[2] = defaults[2];
      key.speedIn[2] = key.speedOut[2] = 0;
    }
  }
}

// --- Defaults

Value StreamReader::DefaultOf(const StreamInfo& info) const
{
  switch (info.id) {
  case AEGP_LayerStream_ZOOM:
  case AEGP_LayerStream_FOCUS_DISTANCE:
    return {DefaultZoom(context_.composition)};
  case AEGP_LayerStream_ANCHORPOINT:
    return DefaultAnchor();
  case AEGP_LayerStream_POSITION:
    return DefaultPosition();
  default:
    return info.defaults;
  }
}

Value StreamReader::DefaultAnchor() const
{
  if (!IsAudioVideo(layer_))
    return {context_.composition.width / 2.0, context_.composition.height / 2.0, 0};
  if (!layer_.source || (layer_.flags & AEGP_LayerFlag_NULL_LAYER) != 0)
    return {};
  return {layer_.source->width / 2.0, layer_.source->height / 2.0, 0};
}

Value StreamReader::DefaultPosition() const
{
  const double x = context_.composition.width / 2.0, y = context_.composition.height / 2.0;
  if (IsCamera(layer_))
    return {x, y, -Zoom().At(-std::numeric_limits<double>::infinity())[0]};
  if (!IsLight(layer_))
    return {x, y, 0};
  const double z = DefaultZoom(context_.composition);
  return {x + 0.03 * z, y - 0.03 * z, -z / 4};
}

void StreamReader::DoubtDefaultPosition() const
{
  if (IsCamera(layer_) && Zoom().KeyframeCount() > 1)
    Doubt("the position of an untouched camera with a keyed zoom was never seen: taken from its first zoom");
  if (!IsLight(layer_))
    return;
  if (layer_.lightType != AEGP_LightType_SPOT)
    Doubt("the position of an untouched light other than a spot light was never seen: taken as a spot light's");
  if (context_.composition.pixelAspect.num != static_cast<A_long>(context_.composition.pixelAspect.den))
    Doubt("the position of an untouched light among pixels that aren't square was never seen: taken by their width");
}

} // namespace

void ReadStreams(const PropertyGroup& properties, const LayerContext& context, Layer& layer)
{
  StreamReader(properties, context, layer).Read();
}

} // namespace host::projects
