// q7r dump: every value of a scene file.
#include <cstdio>
#include <memory>
#include <vector>

#include "file_list.h"
#include "listing/json_text.h"
#include "listing/values.h"
#include "output/json_output.h"
#include "output/standard_output.h"
#include "scene_file.h"
#include "torvane/math/crc.h"
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

const char* const kElementNames[] = {"?", "byte", "16-bit", "32-bit", "64-bit", "float", "double"};

const char* ElementName(const StreamValue& value)
{
  return value.integer >= 1 && value.integer <= 6 ? kElementNames[value.integer] : kElementNames[0];
}

bool IsBlock(const StreamValue& value)
{
  return value.tag >= kTagMemory && value.tag != kTagString && value.tag != kTagFilename;
}

// The chunks that enclose a value, by the offsets of their starts. A line tells the innermost one alone: with all of
// them the output would grow with the square of the depth.
class Nesting
{
 public:
  // To be told each value before it is printed and behind.
  void Leave(UChar tag)
  {
    if (tag == kTagChunkEnd)
      starts_.pop_back();
  }
  void Enter(const StreamValue& value)
  {
    if (value.tag == kTagChunkStart)
      starts_.push_back(value.offset);
  }

  std::size_t Depth() const { return starts_.size(); }
  void TellParent(ValueSink& sink) const
  {
    sink.Key("parent");
    if (starts_.empty())
      sink.Null();
    else
      sink.Integer(starts_.back());
  }
  std::string Indent() const
  {
    constexpr std::size_t kMost = 20;
    if (Depth() <= kMost)
      return std::string(2 * Depth(), ' ');
    return std::string(2 * kMost, ' ') + "(" + std::to_string(Depth()) + ") ";
  }

 private:
  std::vector<LLong> starts_;
};

// How a value becomes a line. The bytes of a block come in pieces, before the walker gives the value itself.
class Form
{
 public:
  virtual ~Form() = default;
  virtual void Begin(const StreamValue& value, const Nesting& nesting) = 0;
  virtual void Bytes(const UChar* bytes, LLong size) = 0;
  virtual void End(const StreamValue& value) = 0;
  virtual void Finish() {}
};

void AppendHex(std::string& text, const UChar* bytes, LLong size, const char* gap)
{
  constexpr char kDigits[] = "0123456789ABCDEF";
  for (LLong i = 0; i < size; ++i) {
    text += gap;
    text += kDigits[bytes[i] >> 4];
    text += kDigits[bytes[i] & 15];
  }
}

class TextForm final : public Form
{
 public:
  explicit TextForm(bool allBytes) : allBytes_(allBytes) {}

  void Begin(const StreamValue& value, const Nesting& nesting) override
  {
    char offset[24];
    std::snprintf(offset, sizeof offset, "%10lld  ", static_cast<long long>(value.offset));
    line_ = offset + nesting.Indent() + GetValueTagName(value.tag) + " ";
    if (!IsBlock(value))
      return;
    line_ += std::to_string(value.size);
    line_ += value.tag == kTagArray ? std::string(" x ") + ElementName(value) : " bytes";
    sum_.Reset();
    passed_ = 0;
  }

  void Bytes(const UChar* bytes, LLong size) override
  {
    sum_.Update(bytes, size);
    const LLong shown = allBytes_ ? size : std::min(size, std::max(StreamValue::kHeadBytes - passed_, LLong{0}));
    AppendHex(line_, bytes, shown, " ");
    passed_ += size;
    if (line_.size() > kFullLine)
      Print(std::exchange(line_, {}));
  }

  void End(const StreamValue& value) override
  {
    if (!IsBlock(value))
      AppendBody(value);
    else if (passed_ > StreamValue::kHeadBytes && !allBytes_)
      line_ += " ... crc64 " + HexText(sum_.GetCrc());
    line_ += '\n';
    Print(line_);
  }

 private:
  static constexpr std::size_t kFullLine = 1 << 14;

  void AppendBody(const StreamValue& value)
  {
    if (value.tag == kTagChunkStart)
      line_ += std::to_string(value.chunk.id) + " level " + std::to_string(value.chunk.level);
    else if (value.tag == kTagString || value.tag == kTagFilename)
      line_ += JsonText(ToUtf8(value.text));
    else if (value.realCount == 0 && value.tag != kTagChunkEnd)
      line_ +=
          value.tag == kTagULLong ? std::to_string(static_cast<ULLong>(value.integer)) : std::to_string(value.integer);
    for (Long i = 0; i < value.realCount; ++i)
      line_ += (i == 0 ? "" : " ") + JsonText(value.reals[i]);
  }

  const bool allBytes_;
  std::string line_;
  Crc64 sum_;
  LLong passed_ = 0;
};

class JsonForm final : public Form
{
 public:
  explicit JsonForm(bool allBytes) : json_(Print), allBytes_(allBytes) {}

  void Begin(const StreamValue& value, const Nesting& nesting) override
  {
    json_.BeginObject(ValueSink::Layout::kLine);
    json_.Member("schema", kJsonSchema);
    json_.Member("offset", value.offset);
    json_.Member("tag", value.tag);
    json_.Member("kind", GetValueTagName(value.tag));
    json_.Member("depth", nesting.Depth());
    nesting.TellParent(json_);
    if (IsBlock(value))
      BeginBlock(value);
  }

  void Bytes(const UChar* bytes, LLong size) override
  {
    sum_.Update(bytes, size);
    if (!isShown_)
      return;
    hex_.clear();
    AppendHex(hex_, bytes, size, "");
    json_.AppendText(hex_);
  }

  void End(const StreamValue& value) override
  {
    if (!IsBlock(value))
      TellBody(value);
    else if (isShown_)
      json_.EndText();
    else
      json_.Member("crc64", HexText(sum_.GetCrc()));
    json_.EndObject();
    json_.NextLine();
  }

  void Finish() override { json_.Flush(); }

 private:
  void BeginBlock(const StreamValue& value)
  {
    json_.Member("size", value.size);
    if (value.tag == kTagArray)
      json_.Member("elements", ElementName(value));
    isShown_ = allBytes_ || value.size <= StreamValue::kHeadBytes;
    sum_.Reset();
    if (!isShown_)
      return;
    json_.Key("bytes");
    json_.BeginText();
  }

  void TellBody(const StreamValue& value)
  {
    if (value.tag == kTagChunkEnd)
      return;
    json_.Key(value.tag == kTagChunkStart ? "chunk" : "value");
    if (value.tag == kTagChunkStart) {
      json_.BeginArray();
      json_.Integer(value.chunk.id);
      json_.Integer(value.chunk.level);
      json_.EndArray();
    } else if (value.tag == kTagString || value.tag == kTagFilename) {
      json_.Text(ToUtf8(value.text));
    } else if (value.realCount > 0) {
      TellReals(value);
    } else if (value.tag == kTagULLong) {
      json_.Unsigned(static_cast<ULLong>(value.integer));
    } else {
      json_.Integer(value.integer);
    }
  }

  void TellReals(const StreamValue& value)
  {
    if (value.realCount == 1)
      return json_.Real(value.reals[0]);
    json_.BeginArray();
    for (Long i = 0; i < value.realCount; ++i)
      json_.Real(value.reals[i]);
    json_.EndArray();
  }

  JsonWriter json_;
  const bool allBytes_;
  bool isShown_ = false;
  std::string hex_;
  Crc64 sum_;
};

// A walk through a file: begins each line when the value, or the first piece of its bytes, is there.
class Walk
{
 public:
  Walk(Form& form, StreamWalker& walker) : form_(form), walker_(walker)
  {
    walker.ReadBlocksInto(
        [](void* walk, const UChar* bytes, LLong size) { static_cast<Walk*>(walk)->Take(bytes, size); }, this);
  }

  void Run()
  {
    while (walker_.Next(value_)) {
      nesting_.Leave(value_.tag);
      Begin();
      form_.End(value_);
      nesting_.Enter(value_);
      isBegun_ = false;
    }
  }

 private:
  void Begin()
  {
    if (!std::exchange(isBegun_, true))
      form_.Begin(value_, nesting_);
  }

  void Take(const UChar* bytes, LLong size)
  {
    Begin();
    form_.Bytes(bytes, size);
  }

  Form& form_;
  StreamWalker& walker_;
  StreamValue value_;
  Nesting nesting_;
  bool isBegun_ = false;
};

int Dump(const std::string& file, const Options& options)
{
  TextForm text(options.bytes);
  JsonForm json(options.bytes);
  Form& form = options.json ? static_cast<Form&>(json) : text;
  StreamWalker walker;
  if (walker.Open(ToFilename(file)))
    Walk(form, walker).Run();
  form.Finish();
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
