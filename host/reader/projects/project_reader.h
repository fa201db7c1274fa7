// After Effects projects, binary and XML, as files that the host can open.
#pragma once

#include "host/file_bytes.h"
#include "host/reader/project_file.h"

namespace host::projects
{

// Whether these bytes begin like a project of either form.
bool IsBinaryProject(std::string_view bytes);
bool IsXmlProject(std::string_view bytes);

// `name` stands in messages, and `isXml` tells the form. Throws CompositionError.
std::unique_ptr<ProjectFile> OpenProject(const std::string& name, FileBytes bytes, bool isXml);

} // namespace host::projects
