// Scene files as the verbs use them: loaded or refused with a message that says which file, where and why.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "gltf/text.h"
#include "report.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/owned.h"
#include "torvane/stream/stream_walker.h"

namespace q7r
{

using DocumentPtr = _torvane_::Owned<_torvane_::BaseDocument>;

// A path of the command line as the library takes it: of a file that exists, UTF-8, or "-" for standard input.
_torvane_::Filename ToFilename(const std::string& path);

// The bytes of any file, or of standard input; throws Failure with the system's cause.
std::string ReadInput(const std::string& path);

using gltf::ToUtf8;

// Why a scene file can't be read: "scene.q7r: byte 1234, in chunk 110059/110107: a read came short"; the system's own
// words, "scene.q7r: Permission denied"; or "scene.q7r: not a scene file but a JPEG picture".
Failure SceneFailure(const std::string& path, const _torvane_::FileProblem& problem);
Failure SceneFailure(const std::string& path, const _torvane_::StreamWalker& walker);
std::string ProblemText(const std::string& path, const _torvane_::FileProblem& problem);
std::string ProblemText(const std::string& path, const _torvane_::StreamWalker& walker);

// Loads a scene file, its objects and materials into the sink if there is one; throws Failure.
DocumentPtr LoadScene(const std::string& path, _torvane_::NodeSink* sink = nullptr);

// The bytes of a file, or of standard input. Throws std::filesystem::filesystem_error.
std::uintmax_t InputSize(const std::string& path);

// The size of a file as people read it: "12.3 KB".
std::string SizeText(std::uintmax_t bytes);

} // namespace q7r
