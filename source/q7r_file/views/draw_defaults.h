// Settings of new views.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

class BaseContainer;
class BaseDraw;

// The display settings of a new draw.
void SetDrawDefaults(BaseContainer& settings);

inline constexpr Long kDrawCount = 4; // of a panel

// What makes a new draw the `index`th view of its panel: 0 is the perspective view.
void SetViewOfIndex(BaseDraw& draw, Long index);

} // namespace _torvane_
