// Writes the active composition to a scene file.
#pragma once

#include "torvane/bytes/file_errors.h"

namespace exporter
{

// Of scene files, without its dot.
inline constexpr const char* kSceneSuffix = "q7r";

// `path` is UTF-8. False when the document can't be made or the file can't be opened, and for a null path. An empty
// path gives true and writes nothing. A write that fails later is not seen here: the result is still true.
bool WriteSceneFile(const char* path);

// What went wrong with the file of the last WriteSceneFile of this thread, for a host in the same program. After
// Effects isn't told.
const _torvane_::FileProblem& GetSceneFileProblem();

} // namespace exporter
