// Makers of list members whose classes stand above the root lists. Each is defined beside its class; each gives a new
// node that the caller owns, or null when memory is short.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

class BaseList2D;
class BaseObject;
class NodeData;

BaseList2D* MakeViewPanel();
BaseList2D* MakeBaseDraw();
BaseList2D* MakeMultipass();
BaseList2D* MakeVideoPost();
BaseList2D* MakeEmptyShader();
BaseList2D* MakeEmptyTrack();
BaseList2D* MakeEmptyKey();
BaseObject* MakePointObject();
NodeData* MakePointObjectData();

} // namespace _torvane_
