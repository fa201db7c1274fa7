// Plain objects and data in the place of the geometry classes.
#include "q7r_file/objects/object_data_makers.h"
#include "q7r_file/objects/opaque_object_data.h"
#include "torvane/base_object.h"

namespace _torvane_
{

BaseObject* MakePolygonObject() { return NewObj<BaseObject>(kObjectPolygon); }

BaseObject* MakeSplineObject() { return NewObj<BaseObject>(kObjectSpline); }

NodeData* MakePointObjectData() { return NewObj<OpaqueObjectData>(kObjectPoint, 0, kObjectPoint); }

} // namespace _torvane_
