#include "report.h"

#include <cstdio>
#include <cstdlib>
#include <new>
#include <string_view>
#include <utility>

#include "output/terminal.h"

namespace q7r
{

namespace
{

constexpr const char* kRed = "1;31";
constexpr const char* kYellow = "1;33";

thread_local std::string* together = nullptr; // where the thread's words go meanwhile

bool HasColour()
{
  static const bool has = [] {
    const char* const none = std::getenv("NO_COLOR");
    const char* const kind = std::getenv("TERM");
    const bool isDumb = kind && std::string_view(kind) == "dumb";
    return IsTerminal(StandardStream::kError) && !(none && *none) && !isDumb;
  }();
  return has;
}

void Tell(const std::string& text)
{
  if (together) {
    *together += text;
    return;
  }
  std::fwrite(text.data(), 1, text.size(), stderr);
  std::fflush(stderr);
}

std::string Coloured(const char* word, const char* colour)
{
  return HasColour() ? std::string("\033[") + colour + "m" + word + "\033[0m" : word;
}

} // namespace

Talk& TheTalk()
{
  static Talk talk;
  return talk;
}

int TellFailure()
{
  std::string line;
  try {
    throw;
  } catch (const std::bad_alloc&) {
    line = "not enough memory";
  } catch (const std::exception& error) {
    line = error.what();
  }
  Tell(Coloured("q7r:", kRed) + " " + line + "\n");
  return kNotDone;
}

void TellWarning(const std::string& text)
{
  if (!TheTalk().quiet)
    Tell(Coloured("warning:", kYellow) + " " + text + "\n");
}

void TellNote(const std::string& text)
{
  if (!TheTalk().quiet)
    Tell(text + "\n");
}

ToldTogether::ToldTogether() { together = &text_; }

void ToldTogether::Flush()
{
  together = nullptr;
  Tell(std::exchange(text_, {}));
}

bool ToldTogether::IsInForce() { return together != nullptr; }

} // namespace q7r
