// Measured light distributions in listings.
#pragma once

#include "output/value_sink.h"
#include "torvane/objects/ies_light.h"

namespace q7r
{

// The members that tell everything that a distribution holds. Its lumens are apart: the table of a light in a scene is
// multiplied by the lamp's power, which the scene doesn't tell.
void TellIES(ValueSink& sink, const _torvane_::IESLight& light);

} // namespace q7r
