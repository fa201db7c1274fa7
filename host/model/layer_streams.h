// Which streams a layer has, by its kind.
#pragma once

#include "host/model/composition.h"

namespace host
{

inline bool IsAudioVideo(const Layer& layer) { return layer.type == AEGP_ObjectType_AV; }
inline bool IsCamera(const Layer& layer) { return layer.type == AEGP_ObjectType_CAMERA; }
inline bool IsLight(const Layer& layer) { return layer.type == AEGP_ObjectType_LIGHT; }

// A camera, or a light that shines one way: it can look at a point of interest.
bool CanLookAt(const Layer& layer);

// Whether a layer of this kind has the stream. A camera or light whose file knows no point of interest lacks its anchor
// point nevertheless.
bool HasStream(const Layer& layer, AEGP_LayerStream id);

// Whether the layer becomes an object of a scene: it is 3D, and a camera, a light, or something with a source.
bool IsExported(const Layer& layer);

} // namespace host
