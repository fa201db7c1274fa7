// What types are called in listings.
#pragma once

#include <string>

#include "torvane/types.h"

namespace q7r
{

// The name of an object, tag, material or shader type; "type N" for one without.
std::string TypeName(_torvane_::Long type);

} // namespace q7r
