#include "host/reader/layer_reader.h"

#include "host/reader/property_reader.h"

#include <algorithm>
#include <cmath>
#include <limits>

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

struct Word
{
  const char* text;
  A_long value;
};

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

constexpr Word kCameraTypes[] = {{"perspective", AEGP_CameraType_PERSPECTIVE},
                                 {"orthographic", AEGP_CameraType_ORTHOGRAPHIC}};
constexpr Word kFilmSizeUnits[] = {{"horizontal", AEGP_FilmSizeUnits_HORIZONTAL},
                                   {"vertical", AEGP_FilmSizeUnits_VERTICAL},
                                   {"diagonal", AEGP_FilmSizeUnits_DIAGONAL}};
constexpr Word kLightTypes[] = {{"parallel", AEGP_LightType_PARALLEL},
                                {"spot", AEGP_LightType_SPOT},
                                {"point", AEGP_LightType_POINT},
                                {"ambient", AEGP_LightType_AMBIENT}};

// --- Which streams a layer has

bool IsLight(const Layer& layer) { return layer.type == AEGP_ObjectType_LIGHT; }
bool IsCamera(const Layer& layer) { return layer.type == AEGP_ObjectType_CAMERA; }
bool IsSpot(const Layer& layer) { return IsLight(layer) && layer.lightType == AEGP_LightType_SPOT; }
bool IsAudioVideo(const Layer& layer) { return layer.type == AEGP_ObjectType_AV; }
bool IsAmbient(const Layer& layer) { return IsLight(layer) && layer.lightType == AEGP_LightType_AMBIENT; }
bool HasPlace(const Layer& layer) { return !IsAmbient(layer); }
bool TurnsInSpace(const Layer& layer) { return HasPlace(layer) && layer.is3D; }
bool CastsShadows(const Layer& layer) { return IsLight(layer) && !IsAmbient(layer); }

// A camera, or a light that shines one way.
bool CanLookAt(const Layer& layer)
{
  return IsCamera(layer) || IsSpot(layer) || (IsLight(layer) && layer.lightType == AEGP_LightType_PARALLEL);
}

enum class Holder // the object in which a property stands
{
  kTransform, // "ks"
  kLayer,
  kCamera,
  kLight,
};

struct StreamRule
{
  AEGP_LayerStream id;
  Holder holder;
  const char* key;
  const char* otherKey; // taken when there is no `key`
  bool (*isLegal)(const Layer&);
};

// The anchor point has a rule of its own beside these.
constexpr StreamRule kStreamRules[] = {
    {AEGP_LayerStream_POSITION, Holder::kTransform, "p", nullptr, HasPlace},
    {AEGP_LayerStream_SCALE, Holder::kTransform, "s", nullptr, IsAudioVideo},
    {AEGP_LayerStream_ROTATE_Z, Holder::kTransform, "rz", "r", HasPlace},
    {AEGP_LayerStream_ROTATE_X, Holder::kTransform, "rx", nullptr, TurnsInSpace},
    {AEGP_LayerStream_ROTATE_Y, Holder::kTransform, "ry", nullptr, TurnsInSpace},
    {AEGP_LayerStream_ORIENTATION, Holder::kTransform, "or", nullptr, TurnsInSpace},
    {AEGP_LayerStream_ZOOM, Holder::kLayer, "pe", nullptr, IsCamera},
    {AEGP_LayerStream_FOCUS_DISTANCE, Holder::kCamera, "focusDistance", nullptr, IsCamera},
    {AEGP_LayerStream_INTENSITY, Holder::kLight, "intensity", nullptr, IsLight},
    {AEGP_LayerStream_COLOR, Holder::kLight, "color", nullptr, IsLight},
    {AEGP_LayerStream_CONE_ANGLE, Holder::kLight, "coneAngle", nullptr, IsSpot},
    {AEGP_LayerStream_CONE_FEATHER, Holder::kLight, "coneFeather", nullptr, IsSpot},
    {AEGP_LayerStream_SHADOW_DARKNESS, Holder::kLight, "shadowDarkness", nullptr, CastsShadows},
    {AEGP_LayerStream_CASTS_SHADOWS, Holder::kLight, "castsShadows", nullptr, CastsShadows},
};

class LayerReader
{
 public:
  LayerReader(const JsonDocument& document, const Json& json, Layer& layer, std::vector<const char*>& lostExpressions)
      : document_(document),
        layer_(layer),
        lostExpressions_(lostExpressions),
        transform_(document.Find(json, "ks")),
        json_(json)
  {}

  void Read();

 private:
  void ReadFlags(LayerSource source);
  void ReadCamera();
  void ReadLight();
  void ReadStreams();
  void ReadStream(AEGP_LayerStream id, const Json* json);
  const Json* HolderOf(const StreamRule& rule) const;

  const JsonDocument& document_;
  Layer& layer_;
  std::vector<const char*>& lostExpressions_;
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

const Json* LayerReader::HolderOf(const StreamRule& rule) const
{
  switch (rule.holder) {
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
  const Json* anchor = transform_ ? document_.Find(*transform_, "a") : nullptr;
  if (IsAudioVideo(layer_) || (CanLookAt(layer_) && anchor))
    ReadStream(AEGP_LayerStream_ANCHORPOINT, anchor);
  for (const StreamRule& rule : kStreamRules) {
    if (!rule.isLegal(layer_))
      continue;
    const Json* holder = HolderOf(rule);
    const Json* json = holder ? document_.Find(*holder, rule.key) : nullptr;
    if (!json && holder && rule.otherKey)
      json = document_.Find(*holder, rule.otherKey);
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
  if (property->IsExpressionLost())
    lostExpressions_.push_back(info.name);
}

} // namespace

LayerSource SourceOf(const JsonDocument& document, const Json& json) { return KindOf(document, json).source; }

void ReadLayer(const JsonDocument& document, const Json& json, Layer& layer, std::vector<const char*>& lostExpressions)
{
  LayerReader(document, json, layer, lostExpressions).Read();
}

A_long ReadSize(const JsonDocument& document, const Json& json, A_long smallest)
{
  const double size = document.Number(json);
  if (size < smallest || size > kLargestSize)
    document.Refuse(json, "expected a size from " + std::to_string(smallest) + " to 30000");
  return static_cast<A_long>(std::lround(size));
}

} // namespace host
