// Light layers.
#pragma once

#include "exporter/walk/export_context.h"

namespace exporter
{

// Makes the object of a light layer. False when the host fails or memory is short.
bool ExportLight(ExportContext& context);

} // namespace exporter
