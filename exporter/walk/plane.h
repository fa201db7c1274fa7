// Solids, footage and nested compositions.
#pragma once

#include "exporter/walk/export_context.h"

namespace exporter
{

// Makes the object of an audio-video layer with that source: a null object for the host's null layers, else a plane of
// the source's size, with a material for a solid or for footage. `footage` is null for a nested composition. Null when
// the item is null, the host fails, or memory is short; what was made until then stays in the document.
_torvane_::BaseObject* ExportPlane(ExportContext& context, AEGP_ItemH item, AEGP_FootageH footage, bool isSolid,
                                   bool isComposition);

} // namespace exporter
