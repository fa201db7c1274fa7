// What must hold between the layers of a project.
#pragma once

#include "host/model/composition.h"

#include <functional>
#include <limits>

namespace host
{

// Refuses the file, by throwing, for a layer of a composition or for the whole composition (kNoLayer). `member` is what
// of the layer is at fault: "parent" or "source".
using RefuseLayer = std::function<void(const Composition& composition, std::size_t layer, const char* member,
                                       const std::string& reason)>;
inline constexpr std::size_t kNoLayer = std::numeric_limits<std::size_t>::max();

// A composition may be nested this deep, and unfold, each nested one counted as often as it is used, to this many
// layers. Both go far beyond what a person makes; they keep a small file from becoming a scene without end.
inline constexpr std::size_t kMaxNesting = 1000;
inline constexpr std::size_t kMaxUnfoldedLayers = 1000000;

// Refuses a composition in which a chain of parents loops.
void CheckParents(const Composition& composition, const RefuseLayer& refuse);

// Refuses a project in which a composition contains itself, or unfolds beyond the limits.
void CheckNesting(const Project& project, const RefuseLayer& refuse);

} // namespace host
