// Values of properties that were worked out elsewhere, by a script in After Effects for example.
#pragma once

#include "host/model/composition.h"

namespace host
{

// Gives properties of the project the samples of the file, which stand in for keyframes and expressions;
// docs/projects.md tells the format. Entries for compositions that the project doesn't have are passed over; those for
// layers or properties that a composition doesn't have are warned of. Throws CompositionError.
void AddSamples(Project& project, const std::filesystem::path& file);

} // namespace host
