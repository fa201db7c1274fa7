// Values with a length: text, memory blocks, pictures.
#include <bit>
#include <cstring>

#include "k2v_file/stream/value_forms.h"
#include "torvane/pictures/bitmap.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

namespace
{

constexpr LLong kTextPiece = 512;          // characters that are converted at a time
constexpr LLong kFirstStep = 65536;        // first allocation for a block whose size can't be checked
constexpr LLong kLargestShort = INT32_MAX; // larger memory blocks have a 64-bit length
constexpr LLong kSmallBlock = 64;
constexpr LLong kBlockHead = StoredSize(kTagMemory); // a tag, and a 32-bit length

void PackText(UChar* place, const UniChar* text, LLong count)
{
  for (LLong i = 0; i < count; ++i)
    bytes::PutBig(place + i * 2, text[i]);
}

void UnpackText(UniChar* text, const UChar* place, LLong count)
{
  // Four characters at a time in the bytes of one number.
  constexpr LLong kStep = sizeof(ULLong) / sizeof(UniChar);
  constexpr ULLong kLowBytes = 0x00FF00FF00FF00FF;
  LLong i = 0;
  for (; i + kStep <= count; i += kStep) {
    ULLong characters = 0;
    std::memcpy(&characters, place + i * 2, sizeof characters);
    if constexpr (std::endian::native == std::endian::little)
      characters = (characters & kLowBytes) << 8 | (characters >> 8 & kLowBytes);
    std::memcpy(text + i, &characters, sizeof characters);
  }
  for (; i < count; ++i)
    text[i] = bytes::GetBig<UniChar>(place + i * 2);
}

void PackBlockHead(UChar* place, UChar tag, LLong length)
{
  place[0] = tag;
  bytes::PutBig(place + 1, static_cast<ULong>(length));
}

// The quick way: only if the head stands in the buffer and has the tag.
Bool TakeBlockHead(BaseFile& file, UChar tag, LLong& length)
{
  const UChar* place = file.ReadWindow(kBlockHead);
  if (!place || place[0] != tag)
    return false;
  length = bytes::GetBig<ULong>(place + 1);
  file.CommitRead(kBlockHead);
  return true;
}

} // namespace

Bool HyperFile::PutBlockHead(UChar tag, ULong length)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  UChar raw[kBlockHead];
  UChar* place = TakeRoom(raw, sizeof raw);
  PackBlockHead(place, tag, length);
  return FinishRoom(place, raw, sizeof raw) || FailFromFile(start);
}

Bool HyperFile::GetBlockHead(UChar tag, LLong& length)
{
  if (error_ == FILEERROR_NONE && TakeBlockHead(file_, tag, length))
    return true;
  Long stored = 0;
  if (!ExpectTag(tag) || !ReadPlainLong(stored))
    return false;
  length = static_cast<ULong>(stored);
  return true;
}

Bool HyperFile::PutText(UChar tag, const String& text)
{
  LLong count = text.GetLength();
  LLong start = file_.GetPosition();
  if (!PutBlockHead(tag, static_cast<ULong>(count * 2)))
    return false;
  const UniChar* characters = text.Data();
  if (UChar* place = count > 0 ? file_.WriteWindow(count * 2) : nullptr) {
    PackText(place, characters, count);
    file_.CommitWrite(count * 2);
    count = 0;
  }
  while (count > 0) {
    UChar piece[kTextPiece * 2];
    LLong now = count < kTextPiece ? count : kTextPiece;
    PackText(piece, characters, now);
    if (!file_.WriteBytes(piece, now * 2))
      return FailFromFile(start);
    characters += now;
    count -= now;
  }
  TickWrite();
  return true;
}

Bool HyperFile::GetText(UChar tag, String& text)
{
  LLong length = 0;
  if (!GetBlockHead(tag, length))
    return false;
  // The last byte of an odd length means nothing.
  Long count = static_cast<Long>(length / 2);
  const UChar* place = file_.ReadWindow(length);
  void* block = nullptr;
  if (!place) {
    if (!ReadBlock(block, length))
      return false;
    place = static_cast<const UChar*>(block);
  }
  UniChar* characters = text.SetLengthNC(count);
  Bool room = characters || count == 0;
  if (room && count > 0)
    UnpackText(characters, place, count);
  if (!block && length > 0)
    file_.CommitRead(length);
  GeFree(block);
  if (!room)
    return Fail(FILEERROR_MEMORY, file_.GetPosition());
  TickRead();
  return true;
}

Bool HyperFile::WriteString(const String& value) { return PutText(kTagString, value); }
Bool HyperFile::WriteFilename(const Filename& value) { return PutText(kTagFilename, value.GetString()); }

Bool HyperFile::ReadString(String& value) { return GetText(kTagString, value); }

Bool HyperFile::SkipString()
{
  LLong length = 0;
  if (!GetBlockHead(kTagString, length) || !Drop(length, file_.GetPosition()))
    return false;
  TickRead();
  return true;
}

Bool HyperFile::ReadFilename(Filename& value)
{
  String text;
  if (!GetText(kTagFilename, text))
    return false;
  value = Filename(text);
  return true;
}

Bool HyperFile::HasRoomFor(LLong count, LLong bytesEach)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong remaining = file_.GetRemaining();
  if (count >= 0 && (remaining < 0 || bytesEach <= 0 || count <= remaining / bytesEach))
    return true;
  return Fail(FILEERROR_WRONG_VALUE, file_.GetPosition());
}

Bool HyperFile::ReadBlock(void*& block, LLong size)
{
  block = nullptr;
  if (error_ != FILEERROR_NONE)
    return false;
  if (size == 0)
    return true;
  LLong start = file_.GetPosition();
  LLong remaining = file_.GetRemaining();
  if (size < 0 || (remaining >= 0 && size > remaining)) {
    file_.SetError(FILEERROR_READ);
    return Fail(FILEERROR_READ, start);
  }
  // Where the rest of the file is unknown, memory is taken as bytes come.
  LLong room = remaining < 0 && size > kFirstStep ? kFirstStep : size;
  for (LLong done = 0; done < size;) {
    void* larger = GeRealloc(block, room);
    if (!larger) {
      GeFree(block);
      return Fail(FILEERROR_MEMORY, start);
    }
    block = larger;
    if (file_.ReadBytes(static_cast<UChar*>(block) + done, room - done) != room - done) {
      GeFree(block);
      return FailFromFile(start);
    }
    done = room;
    room = size - room < room ? size : room * 2;
  }
  return true;
}

Bool HyperFile::WriteMemory(const void* data, LLong size)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  if (size < 0 || (size > 0 && !data))
    return Fail(FILEERROR_INVALID, start);
  // Small blocks, as those of links and goals, go into the buffer in one go.
  UChar* place = size > 0 && size <= kSmallBlock ? file_.WriteWindow(kBlockHead + size) : nullptr;
  if (place) {
    PackBlockHead(place, kTagMemory, size);
    GeCopyMem(place + kBlockHead, data, size);
    file_.CommitWrite(kBlockHead + size);
    TickWrite();
    return true;
  }
  Bool head = size > kLargestShort ? file_.WriteUChar(kTagLargeMemory) && file_.WriteLLong(size)
                                   : file_.WriteUChar(kTagMemory) && file_.WriteULong(static_cast<ULong>(size));
  if (!head || !file_.WriteBytes(data, size))
    return FailFromFile(start);
  TickWrite();
  return true;
}

// The length of a Memory value of either tag.
Bool HyperFile::GetMemoryLength(LLong& length)
{
  if (error_ == FILEERROR_NONE && TakeBlockHead(file_, kTagMemory, length))
    return true;
  LLong start = file_.GetPosition();
  UChar tag = 0;
  if (!ReadValueHeader(tag))
    return false;
  ULong shortLength = 0;
  if (tag != kTagMemory && tag != kTagLargeMemory)
    return Fail(FILEERROR_WRONG_VALUE, start);
  if (!(tag == kTagMemory ? file_.ReadULong(shortLength) : file_.ReadLLong(length)))
    return FailFromFile(start);
  if (tag == kTagMemory)
    length = shortLength;
  return true;
}

Bool HyperFile::ReadMemory(void*& data, LLong& size)
{
  data = nullptr;
  size = 0;
  LLong length = 0;
  if (!GetMemoryLength(length) || !ReadBlock(data, length))
    return false;
  size = length;
  TickRead();
  return true;
}

Bool HyperFile::ReadMemoryInto(void* buffer, LLong capacity, LLong& size)
{
  LLong start = file_.GetPosition();
  size = 0;
  LLong length = 0;
  if (!GetMemoryLength(length))
    return false;
  if (length < 0)
    return Fail(FILEERROR_WRONG_VALUE, start);
  LLong wanted = length < capacity ? length : capacity;
  if (const UChar* place = length <= capacity ? file_.ReadWindow(length) : nullptr) {
    GeCopyMem(buffer, place, length);
    file_.CommitRead(length);
    size = length;
    TickRead();
    return true;
  }
  if (wanted > 0 && file_.ReadBytes(buffer, wanted) != wanted)
    return FailFromFile(start);
  if (length > wanted && !Drop(length - wanted, start))
    return false;
  size = length;
  TickRead();
  return true;
}

Bool HyperFile::WriteImage(Bitmap* image, Long format, BaseContainer* settings, Long flags)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  Bool written = false;
  if (image && image->GetEncodedSize() > 0)
    written = PutBlockHead(kTagImage, static_cast<ULong>(image->GetEncodedSize())) &&
              file_.WriteBytes(image->GetEncoded(), image->GetEncodedSize());
  else if (image && image->GetBw() >= 1)
    written = SaveImage(*image, format, settings, flags);
  else
    written = PutBlockHead(kTagImage, 0);
  if (!written)
    return FailFromFile(start);
  TickWrite();
  return true;
}

// The picture saved into memory and copied from there. A failed save leaves the tag alone, which counts as written.
Bool HyperFile::SaveImage(Bitmap& image, Long format, BaseContainer* settings, Long flags)
{
  if (!file_.WriteUChar(kTagImage))
    return false;
  MemoryDescription memory;
  Filename target;
  target.SetMemoryWrite(&memory);
  if (image.Save(target, format, settings, flags) != IMAGERESULT_OK)
    return true;
  LLong size = 0;
  const void* block = nullptr;
  LLong blockSize = 0;
  for (Long i = 0; target.GetMemory(i, block, blockSize); ++i)
    size += blockSize;
  Bool written = file_.WriteULong(static_cast<ULong>(size));
  for (Long i = 0; written && target.GetMemory(i, block, blockSize); ++i)
    written = file_.WriteBytes(block, blockSize);
  return written;
}

Bool HyperFile::ReadImage(Bitmap& image)
{
  LLong length = 0;
  void* block = nullptr;
  if (!GetBlockHead(kTagImage, length) || !ReadBlock(block, length))
    return false;
  if (length > 0)
    image.AdoptEncoded(block, length);
  TickRead();
  return true;
}

} // namespace _torvane_
