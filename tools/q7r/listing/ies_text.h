// Measured light distributions in listings.
#pragma once

#include "json_text.h"
#include "torvane/objects/ies_light.h"

namespace q7r
{

// Everything that a distribution holds. Its lumens are apart: the table of a light in a scene is multiplied by the
// lamp's power, which the scene doesn't tell.
Json IESJson(const _torvane_::IESLight& light);

} // namespace q7r
