// What the program tells beside its results, all of it on standard error: failures, warnings, and words on the way. On
// a terminal the first word has a colour, unless NO_COLOR is set or the terminal is a dumb one.
#pragma once

#include <stdexcept>
#include <string>

namespace q7r
{

// What the program, or its work on one of many files, ends with.
enum ExitStatus : int
{
  kDone = 0,
  kProblems = 1, // done, but something was warned of
  kNotDone = 2,
};

// A verb that can't do its work throws this. what() is one line: the file, as it was given, and the reason.
class Failure : public std::runtime_error
{
 public:
  explicit Failure(const std::string& line) : std::runtime_error(line), message_(line) {}
  // With its parts, for programs. `offset` is a place in the file, or -1; `path` leads there: the chunks around it, or
  // a JSON pointer. `message` tells both in words.
  Failure(const std::string& file, const std::string& message, long long offset = -1, std::string path = {})
      : std::runtime_error(file + ": " + message),
        file_(file),
        message_(message),
        path_(std::move(path)),
        offset_(offset)
  {}

  const std::string& File() const { return file_; } // empty where it isn't known apart
  const std::string& Message() const { return message_; }
  const std::string& Path() const { return path_; }
  long long Offset() const { return offset_; }

 private:
  std::string file_;
  std::string message_;
  std::string path_;
  long long offset_ = -1;
};

// How much is told, by --quiet and --verbose. To be set before any thread is started.
struct Talk
{
  bool quiet = false;   // failures alone
  bool json = false;    // failures, and what was written, as JSON on standard output
  bool verbose = false; // every warning, where else one stands for all of its kind
};
Talk& TheTalk();

// The one way by which a failure, of the whole program or of one of many files, reaches the user. To be called where an
// exception was caught, whichever it is; gives kNotDone.
int TellFailure();

void TellWarning(const std::string& text);
void TellNote(const std::string& text); // of one or several lines

// While one of these lives, what its thread tells is kept, and told in one piece by Flush: what several threads tell
// doesn't mingle.
class ToldTogether
{
 public:
  ToldTogether();
  ~ToldTogether() { Flush(); }
  void Flush();
  static bool IsInForce(); // for this thread
  ToldTogether(const ToldTogether&) = delete;
  ToldTogether& operator=(const ToldTogether&) = delete;

 private:
  std::string text_;
};

} // namespace q7r
