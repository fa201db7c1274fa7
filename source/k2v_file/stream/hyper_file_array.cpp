// Array values: many elements behind one tag, converted a piece at a time.
#include <cstring>

#include "k2v_file/stream/array_elements.h"
#include "k2v_file/stream/value_forms.h"
#include "torvane/memory/owned.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

namespace
{

constexpr LLong kPieceSize = 65536;     // converted on the way
constexpr LLong kInPlacePiece = 524288; // more than the buffer of a file, so that it is passed by
constexpr LLong kColumnPiece = 327680;  // the same; with the rows that it goes to it stays in a processor's cache
constexpr LLong kArrayHead = 6;         // tag, length and type
constexpr LLong kLargestArray = UINT32_MAX - 1;

Bool IsFloatType(Long type) { return type == kArraySReal || type == kArrayLReal; }

// How many elements to convert at once: those that the file's buffer has, or has room for, so that none is copied there
// and back; one that lies across its end; without a buffer as many as the own one holds.
LLong PieceOf(LLong count, LLong size, LLong left)
{
  const LLong piece = left >= size ? left / size : left > 0 ? 1 : kPieceSize / size;
  return piece < count ? piece : count;
}

void PutArrayHead(UChar (&head)[kArrayHead], Long type, LLong size)
{
  head[0] = kTagArray;
  bytes::PutBig(head + 1, static_cast<ULong>(size + 1));
  head[kArrayHead - 1] = static_cast<UChar>(type);
}

// Columns that are worth being taken together.
Bool AreLongColumns(LLong size, LLong count, Long columns)
{
  return size > 0 && columns >= 2 && count >= 2 * kColumnPiece / size && count <= kLargestArray / size;
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

Bool HyperFile::WriteColumns(const void* data, Long type, LLong stride, LLong count, Long columns, LLong step)
{
  const auto* first = static_cast<const UChar*>(data);
  if (PutColumns(first, type, stride, count, columns, step))
    return true;
  for (Long column = 0; error_ == FILEERROR_NONE && column < columns; ++column)
    WriteArray(first + column * step, type, stride, count);
  return error_ == FILEERROR_NONE;
}

// Long columns a stretch of each in turn, so that rows are taken while they are at hand. False, with nothing written,
// for what isn't that plain, and after a failure.
Bool HyperFile::PutColumns(const UChar* first, Long type, LLong stride, LLong count, Long columns, LLong step)
{
  type = PlainType(type);
  const LLong size = GetElementSize(type);
  if (!AreLongColumns(size, count, columns) || error_ != FILEERROR_NONE || HasHook() || !file_.MayLeaveHoles())
    return false;
  UChar head[kArrayHead];
  PutArrayHead(head, type, count * size);
  const PackElements pack = FindPackElements(type);
  const LLong start = file_.GetPosition();
  const LLong columnSize = kArrayHead + count * size;
  for (LLong done = 0, rows = kPieceSize / size; done < count; done += rows) {
    const LLong now = rows < count - done ? rows : count - done;
    for (Long column = 0; column < columns; ++column) {
      const LLong place = start + column * columnSize + (done == 0 ? 0 : kArrayHead + done * size);
      UChar buffer[kPieceSize];
      if (!file_.Seek(place) || (done == 0 && !file_.WriteBytes(head, kArrayHead)))
        return FailFromFile(place);
      UChar* room = TakeRoom(buffer, now * size);
      pack(room, first + column * step + done * stride, stride, now);
      if (!FinishRoom(room, buffer, now * size))
        return FailFromFile(place);
    }
  }
  TickMany(columns * count);
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

Bool HyperFile::ReadColumns(void* data, Long type, LLong stride, LLong count, Long columns, LLong step)
{
  UChar* first = static_cast<UChar*>(data);
  if (TakeColumns(first, type, stride, count, columns, step))
    return true;
  for (Long column = 0; error_ == FILEERROR_NONE && column < columns; ++column)
    ReadArray(first + column * step, type, stride, count);
  return error_ == FILEERROR_NONE;
}

// Whether so many bytes are there, in a file in which one may go to and fro.
Bool HyperFile::MayTakeColumns(LLong size)
{
  const Filename& name = file_.GetName();
  const Bool moves = !name.GetStream() && !name.GetIpConnection();
  return error_ == FILEERROR_NONE && version_ >= kVersionArrayOrder && moves && !HasHook() &&
         file_.GetRemaining() >= size;
}

// Long columns a stretch of each in turn, so that rows are filled while they are at hand. False, with nothing read, for
// what isn't that plain: what is wrong then the other way tells.
Bool HyperFile::TakeColumns(UChar* first, Long type, LLong stride, LLong count, Long columns, LLong step)
{
  type = PlainType(type);
  const LLong size = GetElementSize(type);
  if (!AreLongColumns(size, count, columns))
    return false;
  const LLong columnSize = kArrayHead + count * size;
  if (!MayTakeColumns(columns * columnSize))
    return false;
  const Owned<UChar> block(static_cast<UChar*>(GeAllocNC(kArrayHead + kColumnPiece)));
  if (!block)
    return false;
  UChar head[kArrayHead];
  PutArrayHead(head, type, count * size);
  const UnpackElements unpack = FindUnpackElements(type, type);
  const LLong start = file_.GetPosition();
  for (LLong done = 0, rows = kColumnPiece / size; done < count; done += rows) {
    const LLong now = rows < count - done ? rows : count - done;
    const LLong before = done == 0 ? kArrayHead : 0; // the first stretch is read with the head
    for (Long column = 0; column < columns; ++column) {
      const LLong place = start + column * columnSize + kArrayHead - before + done * size;
      if (!file_.Seek(place) || file_.ReadBytes(block.get(), before + now * size) == 0)
        return FailFromFile(place);
      if (before > 0 && std::memcmp(block.get(), head, kArrayHead) != 0) {
        file_.Seek(start);
        return false;
      }
      unpack(first + column * step + done * stride, block.get() + before, stride, now);
    }
  }
  TickMany(columns * count);
  return true;
}

} // namespace _torvane_
