// A whole scene as JSON: what `q7r tree --json` prints.
#pragma once

#include "json_text.h"

namespace q7r
{

Json SceneJson(_torvane_::BaseDocument& document);

} // namespace q7r
