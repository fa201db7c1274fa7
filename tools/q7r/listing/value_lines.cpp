#include "value_lines.h"

#include <algorithm>
#include <cstdio>
#include <utility>

#include "json_text.h"
#include "output/json_output.h"
#include "output/standard_output.h"
#include "scene_file.h"
#include "torvane/math/crc.h"
#include "values.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

const char* const kElementNames[] = {"?", "byte", "16-bit", "32-bit", "64-bit", "float", "double"};

const char* ElementName(const StreamValue& value)
{
  return value.integer >= 1 && value.integer <= 6 ? kElementNames[value.integer] : kElementNames[0];
}

bool IsBlock(const StreamValue& value)
{
  return value.tag >= kTagMemory && value.tag != kTagString && value.tag != kTagFilename;
}

void AppendHex(std::string& text, const UChar* bytes, LLong size, const char* gap)
{
  constexpr char kDigits[] = "0123456789ABCDEF";
  for (LLong i = 0; i < size; ++i) {
    text += gap;
    text += kDigits[bytes[i] >> 4];
    text += kDigits[bytes[i] & 15];
  }
}

class TextLines final : public ValueLines
{
 public:
  explicit TextLines(bool allBytes) : allBytes_(allBytes) {}

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

class JsonLines final : public ValueLines
{
 public:
  explicit JsonLines(bool allBytes) : json_(Print), allBytes_(allBytes) {}

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

} // namespace

void Nesting::TellParent(ValueSink& sink) const
{
  sink.Key("parent");
  if (starts_.empty())
    sink.Null();
  else
    sink.Integer(starts_.back());
}

std::string Nesting::Indent() const
{
  constexpr std::size_t kMost = 20;
  if (Depth() <= kMost)
    return std::string(2 * Depth(), ' ');
  return std::string(2 * kMost, ' ') + "(" + std::to_string(Depth()) + ") ";
}

std::unique_ptr<ValueLines> MakeTextLines(bool allBytes) { return std::make_unique<TextLines>(allBytes); }
std::unique_ptr<ValueLines> MakeJsonLines(bool allBytes) { return std::make_unique<JsonLines>(allBytes); }

} // namespace q7r
