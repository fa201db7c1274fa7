// Camera objects as cameras.
#pragma once

#include "gltf/context.h"
#include "gltf/motion/tracks.h"

namespace gltf
{

// Adds a camera and the channels of its field of view. Its index.
std::size_t AddCamera(Context& context, const _torvane_::BaseObject& object, TrackSet& tracks);

} // namespace gltf
