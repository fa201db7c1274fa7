// Values of properties that were worked out elsewhere: by a script in After Effects, for example, which can run
// expressions.
#pragma once

#include "host/model/composition.h"

namespace host
{

// Gives properties of the project the `samples` that a composition file has for them, in place of keyframes and
// expressions. Compositions are found by name; layers by their place, where the names there don't differ, else by name.
// Warns of samples that find no property. Throws CompositionError.
void AddSamples(Project& project, const std::filesystem::path& file);

} // namespace host
