// Scene files as the verbs use them: loaded or refused with a message that says which file, where and why.
#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "torvane/document/base_document.h"

namespace q7r
{

struct DocumentDeleter
{
  void operator()(_torvane_::BaseDocument* document) const { _torvane_::BaseDocument::Free(document); }
};
using DocumentPtr = std::unique_ptr<_torvane_::BaseDocument, DocumentDeleter>;

// A path of the command line, UTF-8.
_torvane_::Filename ToFilename(const std::string& path);

// Text of the library as UTF-8; unpaired surrogates become U+FFFD.
std::string ToUtf8(const _torvane_::String& text);

// "scene.q7r: byte 1234: a read came short".
std::string ProblemText(const std::string& path, const _torvane_::FileProblem& problem);

// Loads a scene file; throws Failure.
DocumentPtr LoadScene(const std::string& path);

// Lets `write` make the file under a name beside `path` and then moves it there, so that a failure, which it tells by a
// Failure, leaves an existing file alone.
void WriteWhole(const std::string& path, const std::function<void(const std::string& partial)>& write);

// Saves a document so and tells the file's size on standard output; throws Failure.
void WriteScene(_torvane_::BaseDocument& document, const std::string& path);

// Walks every value of a written file once, from the header to the last byte; throws Failure at the first fault. So a
// disk that ran full or a file that was cut is found even though its writer didn't say so.
void VerifyScene(const std::string& path);

// The size of a file as people read it: "12.3 KB".
std::string SizeText(std::uintmax_t bytes);

// Refuses to replace an existing file unless `force` is set; on a terminal the user is asked. Throws Failure.
void RequireReplaceable(const std::string& path, bool force);

// Asks on the terminal whether a file may be replaced; false without one.
bool AskReplace(const std::string& path);

} // namespace q7r
