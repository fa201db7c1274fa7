// Error codes of the byte and value streams. 0 is no error; a file keeps its first error (see BaseFile, HyperFile).
#pragma once

#include "torvane/text/ge_string.h"
#include "torvane/types.h"

namespace _torvane_
{

inline constexpr Long FILEERROR_NONE = 0;
inline constexpr Long FILEERROR_OPEN = -1;              // the byte file could not be opened
inline constexpr Long FILEERROR_CLOSE = -2;             // closing failed
inline constexpr Long FILEERROR_READ = -3;              // a read came short
inline constexpr Long FILEERROR_WRITE = -4;             // a write came short
inline constexpr Long FILEERROR_SEEK = -5;              // positioning failed
inline constexpr Long FILEERROR_INVALID = -6;           // the operation does not fit the file's state or mode
inline constexpr Long FILEERROR_MEMORY = -7;            // no memory
inline constexpr Long FILEERROR_WRONG_VALUE = -100;     // bad magic, ident, header, tag, array size or type
inline constexpr Long FILEERROR_CHUNK_STRUCTURE = -103; // a value where only a chunk start or end may stand
inline constexpr Long FILEERROR_PREMATURE_END = -104;   // the walk to a chunk's end stopped on an error
inline constexpr Long FILEERROR_OLD_VERSION = -105;     // the file is older than the caller takes
inline constexpr Long FILEERROR_TOO_DEEP = -106;        // things nest deeper than a reader follows

// Where and why reading or writing a file failed.
struct FileProblem
{
  static constexpr Long kChunks = 16;

  Long code = FILEERROR_NONE;
  LLong position = 0;   // byte position at which the failure was met
  Long systemError = 0; // what the operating system answered (errno), if it was the one that failed, else 0
  // The chunks around it, for a file that is read: how many, and their ids, outermost first. Of more than kChunks only
  // the outermost and the innermost halves are told.
  Long depth = 0;
  Long chunks[kChunks] = {};
};

// The path of chunks as people see it: "110059/110107/5100", with "..." for those that aren't told; "-" outside of all.
String GetChunkPathText(const FileProblem& problem);

// All that people are told: "byte 1234, in chunk 110059/110107: a read came short". A file that could not be opened has
// no place.
String GetProblemText(const FileProblem& problem);
// The same with a reason that is more exact than that of the code.
String GetProblemText(const FileProblem& problem, const String& reason);

// A short English phrase for an error code, such as "a read came short".
const char* GetFileErrorText(Long code);

} // namespace _torvane_
