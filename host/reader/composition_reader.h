// Reads a composition file into a project.
#pragma once

#include "host/model/composition.h"
#include "host/reader/json_document.h"

namespace host
{

// Footage is looked for relative to `folder`. Of expressions that nothing stands in for the project doesn't warn yet.
// Throws CompositionError.
Project ReadComposition(const JsonDocument& document, const std::filesystem::path& folder);

} // namespace host
