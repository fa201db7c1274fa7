#include "host/reader/layer_reader.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "host/model/layer_streams.h"
#include "host/reader/composition_keys.h"
#include "host/reader/property_reader.h"

namespace host
{

namespace
{

constexpr double kLargestSize = 30000;
constexpr double kDefaultFilmSize = 102.047244094488; // 36 mm at 72 pixels an inch

enum class ThreeD
{
  kNever,
  kByFlag,
  kAlways,
};

struct LayerKind
{
  double ty;
  AEGP_ObjectType type;
  LayerSource source;
  ThreeD threeD;
};

constexpr LayerKind kKinds[] = {
    {0, AEGP_ObjectType_AV, LayerSource::kAsset, ThreeD::kByFlag}, // nested composition
    {1, AEGP_ObjectType_AV, LayerSource::kSolid, ThreeD::kByFlag},
    {2, AEGP_ObjectType_AV, LayerSource::kAsset, ThreeD::kByFlag}, // image
    {3, AEGP_ObjectType_AV, LayerSource::kNull, ThreeD::kByFlag},
    {4, AEGP_ObjectType_VECTOR, LayerSource::kNone, ThreeD::kByFlag},
    {5, AEGP_ObjectType_TEXT, LayerSource::kNone, ThreeD::kByFlag},
    {6, AEGP_ObjectType_AV, LayerSource::kAsset, ThreeD::kNever},  // audio
    {8, AEGP_ObjectType_AV, LayerSource::kAsset, ThreeD::kByFlag}, // image sequence
    {9, AEGP_ObjectType_AV, LayerSource::kAsset, ThreeD::kByFlag}, // video
    {13, AEGP_ObjectType_CAMERA, LayerSource::kNone, ThreeD::kAlways},
    {14, AEGP_ObjectType_LIGHT, LayerSource::kNone, ThreeD::kAlways},
};
constexpr LayerKind kOtherKind{-1, AEGP_ObjectType_NONE, LayerSource::kNone, ThreeD::kNever};

const LayerKind& KindOf(const JsonDocument& document, const Json& json)
{
  const Json* ty = document.Find(json, "ty");
  if (!ty)
    return kOtherKind;
  const double number = document.Number(*ty);
  const auto found = std::find_if(std::begin(kKinds), std::end(kKinds), [&](const auto& k) { return k.ty == number; });
  return found == std::end(kKinds) ? kOtherKind : *found;
}

// The value of a member that holds one of a few words.
template <std::size_t N>
A_long ReadWord(const JsonDocument& document, const Json& json, const char* key, const Word (&words)[N],
                A_long otherwise)
{
  const Json* value = document.Find(json, key);
  if (!value)
    return otherwise;
  std::string expected = "expected one of";
  for (const Word& word : words) {
    if (document.Text(*value) == word.text)
      return word.value;
    expected += std::string(" \"") + word.text + '"';
  }
  document.Refuse(*value, expected);
}

class LayerReader
{
 public:
  LayerReader(const JsonDocument& document, const Json& json, Layer& layer)
      : document_(document), layer_(layer), transform_(document.Find(json, "ks")), json_(json)
  {}

  void Read();

 private:
  void ReadFlags(LayerSource source);
  void ReadCamera();
  void ReadLight();
  void ReadStreams();
  void ReadStream(AEGP_LayerStream id, const Json* json);
  const Json* HolderOf(Holder holder) const;

  const JsonDocument& document_;
  Layer& layer_;
  const Json* transform_; // may be null
  const Json& json_;
};

void LayerReader::Read()
{
  const LayerKind& kind = KindOf(document_, json_);
  layer_.name = document_.TextOr(json_, "nm", "");
  layer_.type = kind.type;
  layer_.is3D =
      kind.threeD == ThreeD::kAlways || (kind.threeD == ThreeD::kByFlag && document_.FlagOr(json_, "ddd", false));
  if (IsCamera(layer_))
    ReadCamera();
  if (IsLight(layer_))
    ReadLight();
  ReadFlags(kind.source);
  ReadStreams();
}

void LayerReader::ReadFlags(LayerSource source)
{
  const Json* ae = document_.Find(json_, "ae");
  const bool isLocked = ae && document_.FlagOr(*ae, "locked", false);
  const bool mayLookAt = !ae || document_.FlagOr(*ae, "autoOrient", true);
  const bool hasPointOfInterest = transform_ && document_.Find(*transform_, "a");
  if (!document_.FlagOr(json_, "hd", false))
    layer_.flags |= AEGP_LayerFlag_VIDEO_ACTIVE;
  if (isLocked)
    layer_.flags |= AEGP_LayerFlag_LOCKED;
  if (layer_.is3D)
    layer_.flags |= AEGP_LayerFlag_LAYER_IS_3D;
  if (CanLookAt(layer_) && hasPointOfInterest && mayLookAt)
    layer_.flags |= AEGP_LayerFlag_LOOK_AT_POI;
  if (source == LayerSource::kNull)
    layer_.flags |= AEGP_LayerFlag_NULL_LAYER;
}

void LayerReader::ReadCamera()
{
  layer_.filmSize = kDefaultFilmSize;
  const Json* camera = document_.Find(json_, "camera");
  if (!camera)
    return;
  layer_.cameraType =
      static_cast<AEGP_CameraType>(ReadWord(document_, *camera, "type", kCameraTypes, AEGP_CameraType_PERSPECTIVE));
  layer_.filmSizeUnits = ReadWord(document_, *camera, "filmSizeUnits", kFilmSizeUnits, AEGP_FilmSizeUnits_HORIZONTAL);
  if (const Json* size = document_.Find(*camera, "filmSize"))
    layer_.filmSize = document_.Number(*size);
}

void LayerReader::ReadLight()
{
  if (const Json* light = document_.Find(json_, "light"))
    layer_.lightType =
        static_cast<AEGP_LightType>(ReadWord(document_, *light, "type", kLightTypes, AEGP_LightType_POINT));
}

const Json* LayerReader::HolderOf(Holder holder) const
{
  switch (holder) {
  case Holder::kTransform:
    return transform_;
  case Holder::kCamera:
    return document_.Find(json_, "camera");
  case Holder::kLight:
    return document_.Find(json_, "light");
  case Holder::kLayer:
    break;
  }
  return &json_;
}

void LayerReader::ReadStreams()
{
  for (const StreamKey& rule : kStreamKeys) {
    if (!HasStream(layer_, rule.id))
      continue;
    const Json* holder = HolderOf(rule.holder);
    const Json* json = holder ? document_.Find(*holder, rule.key) : nullptr;
    if (!json && holder && rule.otherKey)
      json = document_.Find(*holder, rule.otherKey);
    if (rule.id != AEGP_LayerStream_ANCHORPOINT || IsAudioVideo(layer_) || json)
      ReadStream(rule.id, json);
  }
}

void LayerReader::ReadStream(AEGP_LayerStream id, const Json* json)
{
  const StreamInfo& info = *FindStreamInfo(id);
  Value defaults = info.defaults;
  if (id == AEGP_LayerStream_FOCUS_DISTANCE) {
    const auto& zoom = layer_.streams[StreamIndex(*FindStreamInfo(AEGP_LayerStream_ZOOM))];
    defaults = zoom->At(-std::numeric_limits<double>::infinity()); // its first value
  }
  auto& property = layer_.streams[StreamIndex(info)];
  property = ReadProperty(document_, info, json, defaults);
}

} // namespace

LayerSource SourceOf(const JsonDocument& document, const Json& json) { return KindOf(document, json).source; }

void ReadLayer(const JsonDocument& document, const Json& json, Layer& layer)
{
  LayerReader(document, json, layer).Read();
}

A_long ReadSize(const JsonDocument& document, const Json& json, A_long smallest)
{
  const double size = document.Number(json);
  if (size < smallest || size > kLargestSize)
    document.Refuse(json, "expected a size from " + std::to_string(smallest) + " to 30000");
  return static_cast<A_long>(std::lround(size));
}

} // namespace host
