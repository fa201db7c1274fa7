// Reads one entry of a list of layers.
#pragma once

#include "host/model/composition.h"
#include "host/reader/json_document.h"

namespace host
{

// Where the source item of a layer comes from.
enum class LayerSource
{
  kNone,
  kAsset, // `refId`
  kSolid,
  kNull,
};

// What the layer's `ty` says about its source.
LayerSource SourceOf(const JsonDocument& document, const Json& json);

// Fills all that the layer's own object states: everything but id, source and parent. Throws CompositionError.
void ReadLayer(const JsonDocument& document, const Json& json, Layer& layer);

// A size in pixels from 1 (or `smallest`) to 30000, rounded; a number outside refuses the file.
A_long ReadSize(const JsonDocument& document, const Json& json, A_long smallest = 1);

} // namespace host
