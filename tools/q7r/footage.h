// The pictures that exported layers show, as paths.
#pragma once

#include <filesystem>
#include <string>
#include <vector>

#include "host/model/composition.h"

namespace q7r
{

// The paths that lead to no file here, once each, in the order of the project's items. Of a sequence the first picture
// counts. Data inside of a composition file has no path.
std::vector<std::string> MissingPictures(const host::Project& project);

// Makes the paths relative to `folder`. Those of Windows stay as they are on other systems, and so do those of another
// drive.
void MakeRelative(host::Project& project, const std::filesystem::path& folder);

} // namespace q7r
