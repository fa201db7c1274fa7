// Makers of objects and object data whose classes stand beside the factory. Each is defined with its class; each gives
// a new thing that the caller owns, or null when memory is short.
#pragma once

#include "q7r_file/types/member_makers.h" // MakePointObject, MakePointObjectData
#include "torvane/types.h"

namespace _torvane_
{

class BaseObject;
class NodeData;

BaseObject* MakePolygonObject();
BaseObject* MakeSplineObject();
NodeData* MakeLightObjectData();
NodeData* MakeCameraObjectData();

} // namespace _torvane_
