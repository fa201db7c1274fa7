// Reads one property of a layer from JSON.
#pragma once

#include "host/model/property.h"
#include "host/reader/json_document.h"

#include <memory>

namespace host
{

// `json` may be null: then the property is the default. A component that is missing takes the default's. Throws
// CompositionError.
std::unique_ptr<Property> ReadProperty(const JsonDocument& document, const StreamInfo& info, const Json* json,
                                       const Value& defaults);

} // namespace host
