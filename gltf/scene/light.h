// Light objects as lights (KHR_lights_punctual).
#pragma once

#include "gltf/context.h"
#include "gltf/motion/tracks.h"

namespace gltf
{

// Adds a light and the channels of its colour, intensity and cone. Its index.
std::size_t AddLight(Context& context, _torvane_::BaseObject& object, TrackSet& tracks);

} // namespace gltf
