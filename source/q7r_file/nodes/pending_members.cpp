// Members whose classes don't exist yet: their chunks are passed over on reading.
#include "q7r_file/nodes/member_makers.h"

namespace _torvane_
{

BaseList2D* MakeMaterial(Long) { return nullptr; }
BaseList2D* MakeEmptyShader() { return nullptr; }

} // namespace _torvane_
