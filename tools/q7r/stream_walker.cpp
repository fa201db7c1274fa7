#include "stream_walker.h"

#include <algorithm>

#include "scene_file.h"
#include "verbs/verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

// How the body of each tag is laid out.
enum class Body
{
  kNone,
  kChunkStart,
  kInteger, // `size` bytes, `isSigned` or not
  kReals,   // `size` Reals by the file's precision
  kFloats,  // `size` floats
  kDoubles, // `size` doubles
  kText,
  kBlock, // a length and that many bytes
};

struct TagForm
{
  ValueTag tag;
  const char* name;
  Body body;
  int size;
};

constexpr TagForm kForms[] = {
    {kTagChunkStart, "chunk", Body::kChunkStart, 0},
    {kTagChunkEnd, "end", Body::kNone, 0},
    {kTagChar, "Char", Body::kInteger, -1},
    {kTagUChar, "UChar", Body::kInteger, 1},
    {kTagWord, "Word", Body::kInteger, -2},
    {kTagUWord, "UWord", Body::kInteger, 2},
    {kTagLong, "Long", Body::kInteger, -4},
    {kTagULong, "ULong", Body::kInteger, 4},
    {kTagLLong, "LLong", Body::kInteger, -8},
    {kTagULLong, "ULLong", Body::kInteger, 8},
    {kTagReal, "Real", Body::kReals, 1},
    {kTagLReal, "LReal", Body::kDoubles, 1},
    {kTagBool, "Bool", Body::kInteger, 1},
    {kTagTime, "Time", Body::kReals, 2},
    {kTagVector, "Vector", Body::kReals, 3},
    {kTagLVector, "LVector", Body::kDoubles, 3},
    {kTagMatrix, "Matrix", Body::kReals, 12},
    {kTagLMatrix, "LMatrix", Body::kDoubles, 12},
    {kTagSVector, "SVector", Body::kFloats, 3},
    {kTagSMatrix, "SMatrix", Body::kFloats, 12},
    {kTagSReal, "SReal", Body::kFloats, 1},
    {kTagMemory, "Memory", Body::kBlock, 4},
    {kTagImage, "Image", Body::kBlock, 4},
    {kTagString, "String", Body::kText, 0},
    {kTagFilename, "Filename", Body::kText, 0},
    {kTagLegacyContainer, "old container", Body::kBlock, 4},
    {kTagLegacyPointArray, "old points", Body::kBlock, 4},
    {kTagLegacyPolygonArray, "old polygons", Body::kBlock, 4},
    {kTagLegacyWordArray, "old words", Body::kBlock, 4},
    {kTagLegacyArray, "old array", Body::kBlock, 4},
    {kTagLegacyFloatArray, "old floats", Body::kBlock, 4},
    {kTagReserved, "reserved", Body::kBlock, 4},
    {kTagLargeMemory, "Memory", Body::kBlock, 8},
    {kTagArray, "Array", Body::kBlock, 4},
};

const TagForm* FormOf(std::uint8_t tag)
{
  const auto* form =
      std::find_if(std::begin(kForms), std::end(kForms), [tag](const TagForm& f) { return f.tag == tag; });
  return form == std::end(kForms) ? nullptr : form;
}

constexpr std::int64_t kHeadBytes = 16;

} // namespace

std::string TagName(std::uint8_t tag)
{
  const TagForm* form = FormOf(tag);
  return form ? form->name : "tag " + std::to_string(tag);
}

std::string PathText(const std::vector<ChunkPlace>& path)
{
  std::string text;
  for (const ChunkPlace& chunk : path)
    text += (text.empty() ? "" : "/") + std::to_string(chunk.id);
  return text.empty() ? "-" : text;
}

StreamWalker::StreamWalker(const std::string& path) : name_(path)
{
  if (!file_.Open(kSceneIdent, ToFilename(path), kHyperFileRead))
    throw Failure(ProblemText(path, file_.GetProblem()));
}

void StreamWalker::Fail(const StreamValue& value, const std::string& what) const
{
  throw Failure(name_ + ": byte " + std::to_string(value.offset) + ", in chunk " + PathText(path_) + ": " + what);
}

bool StreamWalker::Next(StreamValue& value)
{
  value = {};
  if (pending_)
    path_.push_back(opened_);
  pending_ = false;
  BaseFile& bytes = file_.GetFile();
  value.offset = bytes.GetPosition();
  if (value.offset >= file_.GetLength()) {
    if (!path_.empty())
      Fail(value, "the file ends inside a chunk");
    return false;
  }
  if (!bytes.ReadUChar(value.tag))
    Fail(value, GetFileErrorText(bytes.GetError()));
  ReadBody(value);
  return true;
}

void StreamWalker::ReadBody(StreamValue& value)
{
  const TagForm* form = FormOf(value.tag);
  if (!form)
    Fail(value, "no value begins with the byte " + std::to_string(value.tag));
  BaseFile& bytes = file_.GetFile();
  switch (form->body) {
  case Body::kNone:
    if (path_.empty())
      Fail(value, "a chunk ends that never began");
    path_.pop_back();
    return;
  case Body::kChunkStart:
    if (!bytes.ReadLong(value.chunk.id) || !bytes.ReadLong(value.chunk.level))
      Fail(value, "the file ends inside a chunk's start");
    opened_ = value.chunk;
    pending_ = true;
    return;
  case Body::kInteger: {
    int size = std::abs(form->size);
    UChar body[8] = {};
    if (bytes.ReadBytes(body, size) != size)
      Fail(value, "the file ends inside a value");
    std::uint64_t bits = 0;
    for (int i = 0; i < size; ++i)
      bits = (bits << 8) | body[i];
    if (form->size < 0 && size < 8 && (bits >> (8 * size - 1)))
      bits |= ~std::uint64_t{0} << (8 * size);
    value.integer = static_cast<std::int64_t>(bits);
    return;
  }
  case Body::kReals:
    return ReadReals(value, form->size, file_.IsSinglePrecision());
  case Body::kFloats:
    return ReadReals(value, form->size, true);
  case Body::kDoubles:
    return ReadReals(value, form->size, false);
  case Body::kText:
    return ReadText(value);
  case Body::kBlock:
    return ReadBlock(value);
  }
}

void StreamWalker::ReadReals(StreamValue& value, int count, bool floats)
{
  BaseFile& bytes = file_.GetFile();
  for (int i = 0; i < count; ++i) {
    SReal single = 0;
    Real real = 0;
    if (!(floats ? bytes.ReadSReal(single) : bytes.ReadReal(real)))
      Fail(value, "the file ends inside a value");
    value.reals.push_back(floats ? static_cast<double>(single) : real);
  }
}

void StreamWalker::ReadText(StreamValue& value)
{
  BaseFile& bytes = file_.GetFile();
  ULong length = 0;
  if (!bytes.ReadULong(length) || length > bytes.GetRemaining())
    Fail(value, "a text is longer than the file");
  std::vector<UChar> body(length);
  bytes.ReadBytes(body.data(), length);
  String text;
  if (UniChar* place = text.SetLengthNC(static_cast<Long>(length / 2))) {
    for (ULong i = 0; i < length / 2; ++i)
      place[i] = bytes::GetBig<UniChar>(&body[2 * i]);
  }
  value.size = length;
  value.text = ToUtf8(text);
}

void StreamWalker::ReadBlock(StreamValue& value)
{
  BaseFile& bytes = file_.GetFile();
  LLong length = 0;
  ULong shortLength = 0;
  if (!(value.tag == kTagLargeMemory ? bytes.ReadLLong(length) : bytes.ReadULong(shortLength)))
    Fail(value, "the file ends inside a value");
  if (value.tag != kTagLargeMemory)
    length = shortLength;
  if (length < 0 || length > bytes.GetRemaining())
    Fail(value, "a block is longer than the file");
  LLong body = length;
  if (value.tag == kTagArray && length > 0) {
    UChar type = 0;
    bytes.ReadUChar(type);
    --body;
    value.integer = type;
    constexpr int kSizes[] = {1, 1, 2, 4, 8, 4, 8};
    value.size = type < std::size(kSizes) ? body / kSizes[type] : body;
  } else {
    value.size = length;
  }
  value.head.resize(static_cast<std::size_t>(std::min<LLong>(body, kHeadBytes)));
  bytes.ReadBytes(value.head.data(), static_cast<LLong>(value.head.size()));
  bytes.Seek(body - static_cast<LLong>(value.head.size()), kSeekRelative);
}

} // namespace q7r
