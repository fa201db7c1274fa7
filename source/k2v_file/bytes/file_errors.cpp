#include "torvane/bytes/file_errors.h"

namespace _torvane_
{

namespace
{

struct ErrorText
{
  Long code;
  const char* text;
};

constexpr ErrorText kErrorTexts[] = {
    {FILEERROR_NONE, "no error"},
    {FILEERROR_OPEN, "the file could not be opened"},
    {FILEERROR_CLOSE, "the file could not be closed"},
    {FILEERROR_READ, "a read came short"},
    {FILEERROR_WRITE, "a write came short"},
    {FILEERROR_SEEK, "positioning failed"},
    {FILEERROR_INVALID, "the operation does not fit the state of the file"},
    {FILEERROR_MEMORY, "not enough memory"},
    {FILEERROR_WRONG_VALUE, "a value is not of the expected kind"},
    {FILEERROR_CHUNK_STRUCTURE, "the chunk structure is damaged"},
    {FILEERROR_PREMATURE_END, "the file ends inside a chunk"},
    {FILEERROR_OLD_VERSION, "the file is of an older version than is asked for"},
    {FILEERROR_TOO_DEEP, "the content nests too deep"},
};

} // namespace

const char* GetFileErrorText(Long code)
{
  for (const ErrorText& error : kErrorTexts) {
    if (error.code == code)
      return error.text;
  }
  return "unknown error";
}

String GetChunkPathText(const FileProblem& problem)
{
  constexpr Long kKept = FileProblem::kChunks;
  String text;
  for (Long i = 0; i < problem.depth && i < kKept; ++i) {
    if (i > 0)
      text += problem.depth > kKept && i == kKept / 2 ? String("/.../") : String("/");
    text += String::FromLong(problem.chunks[i]);
  }
  return text.Content() ? text : String("-");
}

String GetProblemText(const FileProblem& problem)
{
  return GetProblemText(problem, String(GetFileErrorText(problem.code)));
}

String GetProblemText(const FileProblem& problem, const String& reason)
{
  if (problem.code == FILEERROR_OPEN)
    return reason;
  const String place = String("byte ") + String::FromLLong(problem.position);
  return place + (problem.depth > 0 ? String(", in chunk ") + GetChunkPathText(problem) : String()) + ": " + reason;
}

} // namespace _torvane_
