// Below what lengths a direction has no meaning.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

inline constexpr Real kNoRadius = 1e-5; // a direction shorter than this across the second axis points along it

} // namespace _torvane_
