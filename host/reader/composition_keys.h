// Where the properties of a layer stand in a composition file.
#pragma once

#include "exporter/host_api/aegp_types.h"

namespace host
{

enum class Holder // the object in which a property stands
{
  kTransform, // "ks"
  kLayer,
  kCamera,
  kLight,
};

struct StreamKey
{
  AEGP_LayerStream id;
  Holder holder;
  const char* key;
  const char* otherKey = nullptr; // read when there is no `key`
};

// The zoom stands before the focus distance, whose default it is.
inline constexpr StreamKey kStreamKeys[] = {
    {AEGP_LayerStream_ANCHORPOINT, Holder::kTransform, "a"},
    {AEGP_LayerStream_POSITION, Holder::kTransform, "p"},
    {AEGP_LayerStream_SCALE, Holder::kTransform, "s"},
    {AEGP_LayerStream_ROTATE_Z, Holder::kTransform, "rz", "r"},
    {AEGP_LayerStream_ROTATE_X, Holder::kTransform, "rx"},
    {AEGP_LayerStream_ROTATE_Y, Holder::kTransform, "ry"},
    {AEGP_LayerStream_ORIENTATION, Holder::kTransform, "or"},
    {AEGP_LayerStream_ZOOM, Holder::kLayer, "pe"},
    {AEGP_LayerStream_FOCUS_DISTANCE, Holder::kCamera, "focusDistance"},
    {AEGP_LayerStream_INTENSITY, Holder::kLight, "intensity"},
    {AEGP_LayerStream_COLOR, Holder::kLight, "color"},
    {AEGP_LayerStream_CONE_ANGLE, Holder::kLight, "coneAngle"},
    {AEGP_LayerStream_CONE_FEATHER, Holder::kLight, "coneFeather"},
    {AEGP_LayerStream_SHADOW_DARKNESS, Holder::kLight, "shadowDarkness"},
    {AEGP_LayerStream_CASTS_SHADOWS, Holder::kLight, "castsShadows"},
};

struct Word
{
  const char* text;
  A_long value;
};

inline constexpr Word kCameraTypes[] = {{"perspective", AEGP_CameraType_PERSPECTIVE},
                                        {"orthographic", AEGP_CameraType_ORTHOGRAPHIC}};
inline constexpr Word kFilmSizeUnits[] = {{"horizontal", AEGP_FilmSizeUnits_HORIZONTAL},
                                          {"vertical", AEGP_FilmSizeUnits_VERTICAL},
                                          {"diagonal", AEGP_FilmSizeUnits_DIAGONAL}};
inline constexpr Word kLightTypes[] = {{"parallel", AEGP_LightType_PARALLEL},
                                       {"spot", AEGP_LightType_SPOT},
                                       {"point", AEGP_LightType_POINT},
                                       {"ambient", AEGP_LightType_AMBIENT}};

} // namespace host
