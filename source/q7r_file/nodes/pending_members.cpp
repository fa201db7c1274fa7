// Members whose classes don't exist yet: their chunks are passed over on reading.
#include "q7r_file/nodes/member_makers.h"
#include "torvane/base_document.h"

namespace _torvane_
{

BaseList2D* MakeMaterial(Long) { return nullptr; }
BaseList2D* MakeViewPanel() { return nullptr; }
BaseList2D* MakeBaseDraw() { return nullptr; }
BaseList2D* MakeEmptyShader() { return nullptr; }
Bool BaseDocument::SetSceneCamera(BaseObject*) { return false; }

} // namespace _torvane_
