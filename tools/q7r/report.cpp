#include "report.h"

#include <cstdio>
#include <cstdlib>
#include <new>
#include <string_view>
#include <utility>

#include "host/model/composition.h"
#include "output/json_output.h"
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

// The failure that was caught, with its parts where they are known.
Failure Caught()
{
  try {
    throw;
  } catch (const Failure& failure) {
    return failure;
  } catch (const host::CompositionError& error) {
    return Failure(error.File(), error.Message(), error.Offset(), error.Path());
  } catch (const std::bad_alloc&) {
    return Failure("not enough memory");
  } catch (const std::exception& error) {
    return Failure(error.what());
  }
}

void TellTextOrNull(ValueSink& json, const char* name, const std::string& text)
{
  if (text.empty())
    json.Key(name), json.Null();
  else
    json.Member(name, text);
}

void PrintFailure(const Failure& failure)
{
  PrintJson([&failure](ValueSink& json) {
    json.Key("error");
    json.BeginObject();
    TellTextOrNull(json, "file", failure.File());
    if (failure.Offset() < 0)
      json.Key("offset"), json.Null();
    else
      json.Member("offset", failure.Offset());
    TellTextOrNull(json, "path", failure.Path());
    json.Member("message", failure.Message());
    json.EndObject();
  });
  FlushStandardOutput();
}

// False where standard output takes nothing: then the failure is to be told elsewhere.
bool TriedToPrint(const Failure& failure)
{
  if (!TheTalk().json || IsStandardOutputBroken())
    return false;
  try {
    PrintFailure(failure);
  } catch (const Failure&) {
    return false;
  }
  return true;
}

} // namespace

Talk& TheTalk()
{
  static Talk talk;
  return talk;
}

int TellFailure()
{
  const Failure failure = Caught();
  if (!TriedToPrint(failure))
    Tell(Coloured("q7r:", kRed) + " " + failure.what() + "\n");
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
