// Measured light distributions in listings.
#pragma once

#include "json_text.h"
#include "torvane/objects/ies_light.h"

namespace q7r
{

// Everything that a distribution holds, and its lumens.
Json IESJson(const _torvane_::IESLight& light);

} // namespace q7r
