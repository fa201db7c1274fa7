// Timing and size of the exported composition.
#pragma once

#include "exporter/walk/export_context.h"

namespace exporter
{

// Puts the composition's frame rate, work area, size and aspect into the context, the document and its active render
// settings (new ones if it has none), and gives the size in pixels. A value that the host fails to give keeps its
// default, and so do those that would be asked for behind it. False for a null item and when there are no render
// settings to be had.
//
// The document's range ends at the last frame of the work area, that of the render settings at its end, one frame
// later.
bool ReadCompositionSettings(ExportContext& context, AEGP_CompH composition, AEGP_ItemH compositionItem, A_long& width,
                             A_long& height);

} // namespace exporter
