// What types of nodes are called in listings.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// The English name of an object, tag, material, shader, layer, render setting or view type, or of a label of these in a
// file; null for a number without one. The text is constant.
const char* GetTypeName(Long type);

} // namespace _torvane_
