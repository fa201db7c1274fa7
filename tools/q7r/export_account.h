// What an export tells about itself: the layers that it took and those that it left out, and what it was warned of.
#pragma once

#include <string>
#include <vector>

#include "host/model/composition.h"
#include "listing/scene_counts.h"

namespace q7r
{

// "14 layers: 1 camera, 3 image planes; left out: 9 shape layers, 1 layer with its 3D switch off", with the tracks and
// keys that the scene has; a second line when the scene is empty although the composition isn't. Layers of nested
// compositions count as often as those are used.
std::string AccountText(const host::Composition& composition, const SceneCounts& scene);

// The warnings, one line for those of a kind: warnings that differ in names and numbers alone are of one kind. The line
// is the first of them, with the number of the others.
std::vector<std::string> MergedWarnings(const std::vector<std::string>& warnings);

} // namespace q7r
