// What the readers of the host warn of alike.
#pragma once

#include "host/model/composition.h"

namespace host
{

// How a message names a layer: by its name, else by its id.
std::string LayerLabel(const Layer& layer);

// Warns once of each property that has an expression and no samples that stand in for it. `file` begins the message.
void WarnOfLostExpressions(Project& project, const std::string& file);

} // namespace host
