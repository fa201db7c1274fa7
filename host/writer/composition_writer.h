// Writes a project's root composition, and what it nests, as a composition file.
#pragma once

#include "host/model/composition.h"

#include <string>
#include <vector>

namespace host
{

struct CompositionText
{
  std::string text;                  // JSON, UTF-8
  std::vector<std::string> warnings; // what the file says differently, a line each
};

// The file reads back as a project that answers the same at every whole frame of the root: keyframes as they are where
// a composition file can say them, and beside them one sample for each frame where it can't.
CompositionText WriteComposition(const Project& project);

} // namespace host
