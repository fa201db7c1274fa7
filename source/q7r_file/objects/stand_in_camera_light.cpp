// Data that keep their bytes, in the place of the camera's and the light's.
#include "q7r_file/objects/object_data_makers.h"
#include "q7r_file/objects/opaque_object_data.h"
#include "torvane/ids.h"

namespace _torvane_
{

NodeData* MakeLightObjectData() { return NewObj<OpaqueObjectData>(kObjectLight, 0, kObjectGeneric); }

NodeData* MakeCameraObjectData() { return NewObj<OpaqueObjectData>(kObjectCamera, 0, kObjectGeneric); }

} // namespace _torvane_
