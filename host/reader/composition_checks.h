// What must hold between the layers of a project.
#pragma once

#include "host/model/composition.h"
#include "host/reader/json_document.h"

namespace host
{

// The layers of a composition as the file lists them.
struct LayerList
{
  Composition* composition;
  const Json* json;                // the array
  std::vector<const Json*> layers; // its entries, in the order of composition->layers
};

// A composition may be nested this deep, and unfold, each nested one counted as often as it is used, to this many
// layers. Both go far beyond what a person makes; they keep a small file from becoming a scene without end.
inline constexpr std::size_t kMaxNesting = 1000;
inline constexpr std::size_t kMaxUnfoldedLayers = 1000000;

// Refuses a list in which a chain of parents loops.
void CheckParents(const JsonDocument& document, const LayerList& list);

// Refuses a project in which a composition contains itself, or unfolds beyond the limits. `lists` holds one entry for
// each composition, in their order.
void CheckNesting(const JsonDocument& document, const std::vector<LayerList>& lists);

} // namespace host
