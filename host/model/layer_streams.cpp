#include "host/model/layer_streams.h"

#include <algorithm>

namespace host
{

namespace
{

bool IsLightOf(const Layer& layer, AEGP_LightType type) { return IsLight(layer) && layer.lightType == type; }
bool IsSpot(const Layer& layer) { return IsLightOf(layer, AEGP_LightType_SPOT); }
bool HasPlace(const Layer& layer) { return !IsLightOf(layer, AEGP_LightType_AMBIENT); }
bool TurnsInSpace(const Layer& layer) { return HasPlace(layer) && layer.is3D; }
bool CastsShadows(const Layer& layer) { return IsLight(layer) && HasPlace(layer); }
bool HasAnchor(const Layer& layer) { return IsAudioVideo(layer) || CanLookAt(layer); }

struct StreamRule
{
  AEGP_LayerStream id;
  bool (*isLegal)(const Layer&);
};

constexpr StreamRule kRules[] = {
    {AEGP_LayerStream_ANCHORPOINT, HasAnchor},
    {AEGP_LayerStream_POSITION, HasPlace},
    {AEGP_LayerStream_SCALE, IsAudioVideo},
    {AEGP_LayerStream_ROTATE_Z, HasPlace},
    {AEGP_LayerStream_ROTATE_X, TurnsInSpace},
    {AEGP_LayerStream_ROTATE_Y, TurnsInSpace},
    {AEGP_LayerStream_ORIENTATION, TurnsInSpace},
    {AEGP_LayerStream_ZOOM, IsCamera},
    {AEGP_LayerStream_FOCUS_DISTANCE, IsCamera},
    {AEGP_LayerStream_INTENSITY, IsLight},
    {AEGP_LayerStream_COLOR, IsLight},
    {AEGP_LayerStream_CONE_ANGLE, IsSpot},
    {AEGP_LayerStream_CONE_FEATHER, IsSpot},
    {AEGP_LayerStream_SHADOW_DARKNESS, CastsShadows},
    {AEGP_LayerStream_CASTS_SHADOWS, CastsShadows},
};

} // namespace

bool CanLookAt(const Layer& layer)
{
  return IsCamera(layer) || IsSpot(layer) || IsLightOf(layer, AEGP_LightType_PARALLEL);
}

bool HasStream(const Layer& layer, AEGP_LayerStream id)
{
  const auto rule = std::find_if(std::begin(kRules), std::end(kRules), [id](const auto& r) { return r.id == id; });
  return rule != std::end(kRules) && rule->isLegal(layer);
}

bool IsExported(const Layer& layer)
{
  return layer.is3D && (IsCamera(layer) || IsLight(layer) || (IsAudioVideo(layer) && layer.source));
}

} // namespace host
