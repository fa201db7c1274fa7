#include "torvane/stream/stream_walker.h"

#include "k2v_file/stream/array_elements.h"
#include "k2v_file/stream/value_forms.h"

namespace _torvane_
{

namespace
{

LLong GetInteger(const UChar* body, const ValueForm& form)
{
  ULLong bits = 0;
  for (LLong i = 0; i < form.size; ++i)
    bits = bits << 8 | body[i];
  if (form.part == ValuePart::kSigned && form.size > 0 && form.size < 8 && (bits >> (8 * form.size - 1)) != 0)
    bits |= ~ULLong{0} << (8 * form.size);
  return static_cast<LLong>(bits);
}

} // namespace

const char* GetValueTagName(UChar tag)
{
  const ValueForm* form = FindValueForm(tag);
  return form ? form->name : nullptr;
}

Bool StreamWalker::Open(const Filename& name, ULong ident)
{
  depth_ = 0;
  reason_ = String();
  return file_.Open(ident, name, kHyperFileRead);
}

Bool StreamWalker::Fail(const StreamValue& value, Long error, const String& reason, Long line)
{
  reason_ = reason;
  return file_.Fail(error, value.offset, line);
}

Bool StreamWalker::FailCut(const StreamValue& value, Long line)
{
  return Fail(value, FILEERROR_READ, "the file ends inside a value", line);
}

String StreamWalker::GetProblemText() const
{
  const FileProblem& problem = file_.GetProblem();
  return reason_.Content() ? _torvane_::GetProblemText(problem, reason_) : _torvane_::GetProblemText(problem);
}

String StreamWalker::GetPathText() const
{
  String text;
  for (Long i = 0; i < depth_; ++i)
    text += (i > 0 ? String("/") : String()) + String::FromLong(GetChunk(i).id);
  return text.Content() ? text : String("-");
}

Bool StreamWalker::Next(StreamValue& value)
{
  value = StreamValue();
  if (file_.GetError() != FILEERROR_NONE)
    return false;
  value.offset = file_.GetPosition();
  depth_ = file_.GetChunkDepth();
  if (value.offset >= file_.GetLength())
    return depth_ > 0 && Fail(value, FILEERROR_PREMATURE_END, "the file ends inside a chunk");
  if (!file_.ReadValueHeader(value.tag))
    return false;
  const ValueForm* form = FindValueForm(value.tag);
  if (!form)
    return Fail(value, FILEERROR_WRONG_VALUE, String("no value begins with the byte ") + String::FromLong(value.tag));
  if (value.tag == kTagChunkStart)
    return file_.ReadChunkStart(value.chunk.id, value.chunk.level) ||
           Fail(value, FILEERROR_READ, "the file ends inside a chunk's start");
  if (value.tag == kTagChunkEnd) {
    if (depth_ <= 0)
      return Fail(value, FILEERROR_CHUNK_STRUCTURE, "a chunk ends that never began");
    depth_ = file_.GetChunkDepth();
    return true;
  }
  return ReadBody(value, *form);
}

Bool StreamWalker::ReadBody(StreamValue& value, const ValueForm& form)
{
  const FileForm layout = FormOf(file_);
  BaseFile& bytes = file_.GetFile();
  UChar head[kLargestValueHead];
  const LLong headSize = GetValueHeadSize(form, layout);
  if (headSize == 0)
    return ReadNumbers(value, form);
  if (bytes.ReadBytes(head, headSize) != headSize)
    return FailCut(value);
  const LLong left = GetValueBodySize(form, layout, head) - headSize;
  const Bool isText = form.part == ValuePart::kText;
  if (left < 0 || left > bytes.GetRemaining())
    return Fail(value, FILEERROR_READ, isText ? "a text is longer than the file" : "a block is longer than the file");
  if (isText)
    return ReadText(value, left);
  // What the head holds of an Array belongs to its body.
  const Bool isOld = IsOldArray(form, layout, head);
  if (isOld)
    value.integer = head[0];
  return ReadBlock(value, head + form.size, isOld ? 0 : headSize - form.size, left);
}

Bool StreamWalker::ReadNumbers(StreamValue& value, const ValueForm& form)
{
  const FileForm layout = FormOf(file_);
  const LLong size = GetValueBodySize(form, layout, nullptr);
  UChar body[kLargestValueParts * sizeof(Real)];
  if (file_.GetFile().ReadBytes(body, size) != size)
    return FailCut(value);
  if (form.part == ValuePart::kSigned || form.part == ValuePart::kUnsigned) {
    value.integer = GetInteger(body, form);
    return true;
  }
  const LLong partSize = size / form.count;
  value.realCount = form.count;
  for (Long i = 0; i < form.count; ++i) {
    const UChar* part = body + i * partSize;
    value.reals[i] = partSize == sizeof(SReal) ? static_cast<Real>(bytes::CleanReal(bytes::GetBig<ULong>(part)))
                                               : bytes::CleanReal(bytes::GetBig<ULLong>(part));
  }
  return true;
}

Bool StreamWalker::ReadText(StreamValue& value, LLong size)
{
  void* block = nullptr;
  if (!file_.ReadBlock(block, size))
    return false;
  const Long count = static_cast<Long>(size / 2);
  UniChar* place = value.text.SetLengthNC(count);
  for (Long i = 0; place && i < count; ++i)
    place[i] = bytes::GetBig<UniChar>(static_cast<const UChar*>(block) + i * 2);
  GeFree(block);
  value.size = size;
  return place || count == 0 || file_.Fail(FILEERROR_MEMORY, value.offset);
}

// A block of which `size` bytes are to come; `start` was read already.
Bool StreamWalker::ReadBlock(StreamValue& value, const UChar* start, LLong startSize, LLong size)
{
  BaseFile& bytes = file_.GetFile();
  if (value.tag == kTagArray && value.integer == 0 && size > 0) {
    UChar type = 0;
    if (startSize > 0)
      type = start[0];
    else if (bytes.ReadUChar(type))
      --size;
    value.integer = type;
  }
  const LLong elementSize = value.tag == kTagArray ? GetElementSize(static_cast<Long>(value.integer)) : 1;
  value.size = size / (elementSize > 0 ? elementSize : 1);
  value.headCount = static_cast<Long>(size < StreamValue::kHeadBytes ? size : StreamValue::kHeadBytes);
  if (size > 0 && bytes.ReadBytes(value.head, value.headCount) != value.headCount)
    return FailCut(value);
  if (takeBlock_)
    takeBlock_(blockContext_, value.head, value.headCount);
  return PassBlock(size - value.headCount) || FailCut(value);
}

Bool StreamWalker::PassBlock(LLong size)
{
  BaseFile& bytes = file_.GetFile();
  if (!takeBlock_)
    return size == 0 || bytes.Seek(size, kSeekRelative);
  UChar piece[4096];
  while (size > 0) {
    const LLong count = size < LLong{sizeof piece} ? size : LLong{sizeof piece};
    if (bytes.ReadBytes(piece, count) != count)
      return false;
    takeBlock_(blockContext_, piece, count);
    size -= count;
  }
  return true;
}

} // namespace _torvane_
