// Finds the files of footage that aren't where the project says.
#pragma once

#include "host/model/composition.h"

namespace host
{

// A path that leads to no file is looked for below `folder`: first by as many of its last folders as are there too,
// then by the file's name alone, at any depth, in any case. What isn't found keeps its path and is warned of; `name`
// begins the message. Throws CompositionError when there is no such folder.
void FindMovedFootage(Project& project, const std::filesystem::path& folder, const std::string& name);

} // namespace host
