#pragma once

#include "torvane/values/base_container.h"

namespace _torvane_
{

// Appends every default of new render settings, in the order in which a file holds them. `container` is empty.
void SetRenderDefaults(BaseContainer& container);

} // namespace _torvane_
