// Name, flags, identity, place and animation of the object of a layer.
#pragma once

#include "exporter/walk/export_context.h"

namespace exporter
{

// Reads the transform of `context.layer` into `context.object`, which stands in the document, and everything else that
// objects of all kinds share: name, layer id, visibility, the scene layer of locked layers, the target that a camera
// or spot light looks at. `width` and `height` are the pixels of the layer's source; 0 for cameras and lights. False
// when the host fails and when the target can't be made.
bool ExportTransform(ExportContext& context, A_long width, A_long height);

} // namespace exporter
