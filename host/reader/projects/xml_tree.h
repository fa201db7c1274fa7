// The XML form of a project, made into the same chunks as the binary form.
#pragma once

#include "host/reader/projects/chunk.h"

#include <memory>

namespace host::projects
{

// Throws CompositionError. The text must outlive the document, which counts its lines for messages.
std::unique_ptr<ChunkDocument> ReadXmlTree(const std::string& name, std::string_view text);

} // namespace host::projects
