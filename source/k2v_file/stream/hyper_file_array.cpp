// Array values: many elements behind one tag, converted a piece at a time.
#include "k2v_file/stream/array_elements.h"
#include "k2v_file/stream/value_forms.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

namespace
{

constexpr LLong kPieceSize = 65536;     // converted on the way
constexpr LLong kInPlacePiece = 524288; // more than the buffer of a file, so that it is passed by
constexpr LLong kLargestArray = UINT32_MAX - 1;

Bool IsFloatType(Long type) { return type == kArraySReal || type == kArrayLReal; }

// How many elements to convert at once: those that the file's buffer has, or has room for, so that none is copied there
// and back; one that lies across its end; without a buffer as many as the own one holds.
LLong PieceOf(LLong count, LLong size, LLong left)
{
  const LLong piece = left >= size ? left / size : left > 0 ? 1 : kPieceSize / size;
  return piece < count ? piece : count;
}

Long PlainType(Long type) { return type == kArrayReal ? static_cast<Long>(kArrayLReal) : type; }

} // namespace

Bool HyperFile::WriteArray(const void* data, Long type, LLong stride, LLong count)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  type = PlainType(type);
  LLong size = GetElementSize(type);
  if (size == 0 || count < 0 || count > kLargestArray / size)
    return Fail(FILEERROR_WRONG_VALUE, start);
  if (!PutBlockHead(kTagArray, static_cast<ULong>(count * size + 1)))
    return false;
  if (!file_.WriteUChar(static_cast<UChar>(type)))
    return FailFromFile(start);
  PackElements pack = FindPackElements(type);
  const UChar* memory = static_cast<const UChar*>(data);
  while (count > 0) {
    UChar buffer[kPieceSize];
    const LLong now = LimitToTick(PieceOf(count, size, file_.GetWriteLeft()));
    UChar* place = TakeRoom(buffer, now * size);
    pack(place, memory, stride, now);
    if (!FinishRoom(place, buffer, now * size))
      return FailFromFile(start);
    memory += now * stride;
    count -= now;
    TickMany(now);
  }
  return true;
}

Bool HyperFile::ReadArray(void* data, Long type, LLong stride, LLong count)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  type = PlainType(type);
  if (GetElementSize(type) == 0)
    return Fail(FILEERROR_WRONG_VALUE, start);
  if (!ExpectTag(kTagArray))
    return false;
  UChar storedType = 0;
  ULong storedLength = 0;
  Bool behind = version_ >= kVersionArrayOrder;
  if (!(behind ? file_.ReadULong(storedLength) && file_.ReadUChar(storedType)
               : file_.ReadUChar(storedType) && file_.ReadULong(storedLength)))
    return FailFromFile(start);
  LLong length = static_cast<LLong>(storedLength) - (behind ? 1 : 0);
  LLong storedSize = GetElementSize(storedType);
  Bool fits = storedType == type || (IsFloatType(type) && IsFloatType(storedType));
  if (!fits || length < 0 || length / storedSize != count)
    return Fail(FILEERROR_WRONG_VALUE, start);
  LLong remaining = file_.GetRemaining();
  if (remaining >= 0 && count * storedSize > remaining) {
    file_.SetError(FILEERROR_READ);
    return FailFromFile(start);
  }
  return ReadElements(data, type, storedType, stride, count);
}

Bool HyperFile::ReadElements(void* data, Long type, Long storedType, LLong stride, LLong count)
{
  LLong start = file_.GetPosition();
  LLong size = GetElementSize(storedType);
  UnpackElements unpack = FindUnpackElements(type, storedType);
  UChar* memory = static_cast<UChar*>(data);
  // Elements that stand in memory as in the file are read to their place and swapped there.
  Bool inPlace = GetElementSize(type) == size && stride == size;
  while (count > 0) {
    UChar buffer[kPieceSize];
    const LLong inPlacePiece = kInPlacePiece / size < count ? kInPlacePiece / size : count;
    const LLong now = LimitToTick(inPlace ? inPlacePiece : PieceOf(count, size, file_.GetReadLeft()));
    const UChar* place = TakeBytes(inPlace ? memory : buffer, now * size);
    if (!place)
      return FailFromFile(start);
    unpack(memory, place, stride, now);
    memory += now * stride;
    count -= now;
    TickMany(now);
  }
  return true;
}

} // namespace _torvane_
