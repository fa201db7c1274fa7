// q7r dump: every value of a scene file.
#include <cstdio>
#include <memory>

#include <nlohmann/json.hpp>

#include "file_list.h"
#include "listing/json_text.h"
#include "output/standard_output.h"
#include "scene_file.h"
#include "torvane/stream/stream_walker.h"
#include "verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr const char* kHelp =
    R"(Lists every value of a scene file: its byte offset, its kind and the value itself, indented
by the chunks around it; below the twentieth the depth is told in parentheses. Chunks that
this program doesn't know are listed like all others.

With --json each line is an object: offset, tag, kind, depth, the value, and as "parent" the
offset of the chunk that it stands in (null outside all chunks).

Use it to see what a file really holds, or to compare two files value by value.

Example: q7r dump shot.q7r | less)";

struct Options : FileList
{};

const char* const kArrayNames[] = {"?", "byte", "16-bit", "32-bit", "64-bit", "float", "double"};

std::string HexOf(const StreamValue& value)
{
  std::string text;
  char buffer[4];
  for (Long i = 0; i < value.headCount; ++i) {
    std::snprintf(buffer, sizeof buffer, " %02X", value.head[i]);
    text += buffer;
  }
  return text;
}

std::string BodyText(const StreamValue& value)
{
  switch (value.tag) {
  case kTagChunkStart:
    return std::to_string(value.chunk.id) + " level " + std::to_string(value.chunk.level);
  case kTagChunkEnd:
    return {};
  case kTagString:
  case kTagFilename:
    return JsonText(ToUtf8(value.text));
  case kTagArray:
    return std::to_string(value.size) + " x " +
           (value.integer >= 1 && value.integer <= 6 ? kArrayNames[value.integer] : kArrayNames[0]) + HexOf(value);
  default:
    break;
  }
  if (value.tag >= kTagMemory)
    return std::to_string(value.size) + " bytes" + HexOf(value);
  if (value.realCount == 0)
    return value.tag == kTagULLong ? std::to_string(static_cast<std::uint64_t>(value.integer))
                                   : std::to_string(value.integer);
  std::string text;
  for (Long i = 0; i < value.realCount; ++i)
    text += (i == 0 ? "" : " ") + JsonText(value.reals[i]);
  return text;
}

// The chunks that enclose a value, by the offsets of their starts. A line tells the innermost one alone: with all of
// them the output would grow with the square of the depth.
class Nesting
{
 public:
  // To be told each value before it is printed and behind.
  void Leave(const StreamValue& value)
  {
    if (value.tag == _torvane_::kTagChunkEnd)
      starts_.pop_back();
  }
  void Enter(const StreamValue& value)
  {
    if (value.tag == _torvane_::kTagChunkStart)
      starts_.push_back(value.offset);
  }

  std::size_t Depth() const { return starts_.size(); }
  nlohmann::json Parent() const { return starts_.empty() ? nlohmann::json() : nlohmann::json(starts_.back()); }
  std::string Indent() const
  {
    constexpr std::size_t kMost = 20;
    if (Depth() <= kMost)
      return std::string(2 * Depth(), ' ');
    return std::string(2 * kMost, ' ') + "(" + std::to_string(Depth()) + ") ";
  }

 private:
  std::vector<std::int64_t> starts_;
};

void PrintJson(const Nesting& nesting, const StreamValue& value)
{
  nlohmann::json line = {{"offset", value.offset},
                         {"tag", value.tag},
                         {"kind", GetValueTagName(value.tag)},
                         {"depth", nesting.Depth()},
                         {"parent", nesting.Parent()}};
  if (value.tag == kTagChunkStart)
    line["chunk"] = {value.chunk.id, value.chunk.level};
  else if (value.tag == kTagString || value.tag == kTagFilename)
    line["value"] = ToUtf8(value.text);
  else if (value.tag >= kTagMemory)
    line["size"] = value.size;
  else if (value.realCount == 1)
    line["value"] = value.reals[0];
  else if (value.realCount > 0)
    line["value"] = std::vector<double>(value.reals, value.reals + value.realCount);
  else if (value.tag != kTagChunkEnd)
    line["value"] = value.integer;
  PrintLine(line.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace));
}

int Dump(const std::string& file, const Options& options)
{
  StreamWalker walker;
  const Bool good = walker.Open(ToFilename(file));
  StreamValue value;
  Nesting nesting;
  while (good && walker.Next(value)) {
    nesting.Leave(value);
    if (options.json)
      PrintJson(nesting, value);
    else
      PrintFormatted("%10lld  %s%s %s\n", static_cast<long long>(value.offset), nesting.Indent().c_str(),
                     GetValueTagName(value.tag), BodyText(value).c_str());
    nesting.Enter(value);
  }
  if (walker.GetProblem().code != FILEERROR_NONE)
    throw SceneFailure(file, walker);
  return kDone;
}

} // namespace

void AddDump(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("dump", kHelp);
  AddFileList(*verb, *options, "a scene file", "one JSON object a line");
  verb->callback([options, &status] {
    status = ShowEach(*options, [&](const std::string& file) { return Dump(file, *options); });
  });
}

} // namespace q7r
