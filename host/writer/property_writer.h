// Writes one property of a layer as JSON.
#pragma once

#include "host/model/property.h"

#include <nlohmann/json.hpp>

namespace host
{

using OrderedJson = nlohmann::ordered_json;

// `lastFrame` ends the samples of what keyframes can't say.
OrderedJson WriteProperty(const Property& property, std::size_t lastFrame);

} // namespace host
