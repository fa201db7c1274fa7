// Builds the host's project from one composition of a project file and what it nests.
#pragma once

#include "host/reader/projects/composition_settings.h"
#include "host/reader/projects/layer_properties.h"
#include "host/reader/projects/project_items.h"

namespace host::projects
{

// `root` is a composition. Throws CompositionError.
Project BuildProject(const ChunkDocument& document, const ItemIndex& items, const ProjectItem& root);

} // namespace host::projects
