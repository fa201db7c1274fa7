// q7r dump: every value of a scene file.
#include <memory>
#include <utility>

#include "file_list.h"
#include "listing/value_lines.h"
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
this program doesn't know are listed like all others. Of blocks of more than 16 bytes the
first 16 and a check sum of all are shown; --bytes shows all of them.

With --json each line is an object: schema, offset, tag, kind, depth, the value, and as
"parent" the offset of the chunk that it stands in (null outside all chunks).

Use it to see what a file really holds, or to compare two files value by value.

Example: q7r dump shot.q7r | less)";

struct Options : FileList
{
  bool bytes = false;
};

// A walk through a file: begins each line when the value, or the first piece of its bytes, is there.
class Walk
{
 public:
  Walk(ValueLines& lines, StreamWalker& walker) : lines_(lines), walker_(walker)
  {
    walker.ReadBlocksInto(
        [](void* walk, const UChar* bytes, LLong size) { static_cast<Walk*>(walk)->Take(bytes, size); }, this);
  }

  void Run()
  {
    while (walker_.Next(value_)) {
      nesting_.Leave(value_.tag);
      Begin();
      lines_.End(value_);
      nesting_.Enter(value_);
      isBegun_ = false;
    }
  }

 private:
  void Begin()
  {
    if (!std::exchange(isBegun_, true))
      lines_.Begin(value_, nesting_);
  }

  void Take(const UChar* bytes, LLong size)
  {
    Begin();
    lines_.Bytes(bytes, size);
  }

  ValueLines& lines_;
  StreamWalker& walker_;
  StreamValue value_;
  Nesting nesting_;
  bool isBegun_ = false;
};

int Dump(const std::string& file, const Options& options)
{
  const std::unique_ptr<ValueLines> lines = options.json ? MakeJsonLines(options.bytes) : MakeTextLines(options.bytes);
  StreamWalker walker;
  if (walker.Open(ToFilename(file)))
    Walk(*lines, walker).Run();
  lines->Finish();
  if (walker.GetProblem().code != FILEERROR_NONE)
    throw SceneFailure(file, walker);
  return kDone;
}

} // namespace

void AddDump(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("dump", kHelp);
  AddFileList(*verb, *options, "a scene file", "one JSON object a line (docs/json.md)");
  verb->add_flag("--bytes", options->bytes, "show all bytes of blocks, in hexadecimal digits");
  verb->callback([options, &status] {
    status = ShowEach(*options, [&](const std::string& file) { return Dump(file, *options); });
  });
}

} // namespace q7r
