// Makers of list members whose classes stand above the root lists. Each is defined beside its class; each gives a new
// node that the caller owns, or null when memory is short.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

class BaseDraw;
class BaseObject;
class NodeData;

BaseDraw* MakeBaseDraw();
BaseObject* MakePointObject();
NodeData* MakePointObjectData();

} // namespace _torvane_
