// The default client: hooks (hooks.h) that are ready to link, for programs that have no classes of their own behind the
// library's. CMake: find_package(torvane COMPONENTS client), target torvane::client; pkg-config: torvane-client.
//
// Memory comes from the C library. Nodes get every class that the library has; what it has none for keeps its bytes.
// BaseDocument::BuildScene does nothing and gives true. Each of these groups, and the writer, stands in an object file
// of its own: a program that defines all hooks of a group itself gets its own ones.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// Who GetWriterInfo tells from now on; 0 and "torvane" until then. `utf8Name` isn't copied: it has to stay for as long
// as files are written. Not to be called while another thread writes.
void SetWriterInfo(Long id, const char* utf8Name);

} // namespace _torvane_
