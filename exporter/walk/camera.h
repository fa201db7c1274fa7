// Camera layers.
#pragma once

#include "exporter/walk/export_context.h"

namespace exporter
{

// Makes the object of a camera layer and makes it the scene camera, so that the last camera of a walk stays that.
// `width` and `height` are those of the composition that holds the layer. False when the host fails or memory is
// short.
bool ExportCamera(ExportContext& context, A_long width, A_long height);

// The aperture in millimetres of a film `size` pixels long in the direction that the units name, behind a composition
// of that width and height. 36 for other units and where less than a millimetre comes out.
_torvane_::Real ApertureWidth(AEGP_FilmSizeUnits units, _torvane_::Real size, _torvane_::Real width,
                              _torvane_::Real height);

} // namespace exporter
