// Reads footage and the solids of layers from a composition file.
#pragma once

#include "host/model/composition.h"
#include "host/reader/json_document.h"

namespace host
{

// What stands for a solid and for a null without a name.
inline constexpr const char* kUnnamedSolid = "Solid";
inline constexpr const char* kUnnamedNull = "Null";

// An asset with `p`. Its path is made absolute against `folder`, unless the asset states it as it is to be. Throws
// CompositionError.
void ReadFootage(const JsonDocument& document, const Json& json, const std::filesystem::path& folder, Item& item);

// The solid behind a layer, which for a null is 100 x 100 unless the layer says otherwise. Throws CompositionError.
void ReadSolid(const JsonDocument& document, const Json& layer, bool isNull, Item& item);

} // namespace host
