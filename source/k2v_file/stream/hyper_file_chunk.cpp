// Walking by tags: skipping values and chunks, raw chunks, containers.
#include <algorithm>

#include "k2v_file/stream/value_forms.h"
#include "k2v_file/values/container_index.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

constexpr Long kContainerChunk = 132;
constexpr Long kContainerLevel = 1;
constexpr LLong kElementTicks = 3; // of its id, its type and its value
constexpr Long kMostExpected = 64; // elements that get room before they are read

// Where the type and the value of a container's element stand, with their tags, behind its id, and the sizes of whole
// elements.
constexpr LLong kElementType = StoredSize(kTagLong);
constexpr LLong kElementValue = StoredSize(kTagLong, kTagLong);
constexpr LLong kLongElementSize = StoredSize(kTagLong, kTagLong, kTagLong);
constexpr LLong kRealElementSize = StoredSize(kTagLong, kTagLong, kTagReal);
static_assert(kElementType == 5 && kElementValue == 10 && kLongElementSize == 15 && kRealElementSize == 19);

// Writes an element that is a Long or a double, and gives its size; 0 for any other value. `place` is null or has room
// for kRealElementSize bytes.
LLong PutNumberElement(UChar* place, Long id, const GeData& number)
{
  const Long type = number.GetRawType();
  if (!place || (type != kDataLong && type != kDataReal))
    return 0;
  place[0] = place[kElementType] = kTagLong;
  bytes::PutBig(place + 1, static_cast<ULong>(id));
  bytes::PutBig(place + kElementType + 1, static_cast<ULong>(type));
  UChar* value = place + kElementValue + 1;
  if (type == kDataLong) {
    place[kElementValue] = kTagLong;
    bytes::PutBig(value, static_cast<ULong>(number.GetLong()));
    return kLongElementSize;
  }
  place[kElementValue] = kTagReal;
  bytes::PutBig(value, bytes::CleanBits(number.GetReal()));
  return kRealElementSize;
}

// The id and value of an element that is a Long or a double, and its size; 0 for any other one. `next` is null or the
// place of kRealElementSize bytes.
LLong GetNumberElement(const UChar* next, Long& id, GeData& number)
{
  if (!next || next[0] != kTagLong || next[kElementType] != kTagLong)
    return 0;
  const auto type = static_cast<Long>(bytes::GetBig<ULong>(next + kElementType + 1));
  const UChar tag = next[kElementValue];
  const UChar* value = next + kElementValue + 1;
  if (type == kDataLong && tag == kTagLong)
    number = GeData(static_cast<Long>(bytes::GetBig<ULong>(value)));
  else if (type == kDataReal && tag == kTagReal)
    number = GeData(bytes::CleanReal(bytes::GetBig<ULLong>(value)));
  else
    return 0;
  id = static_cast<Long>(bytes::GetBig<ULong>(next + 1));
  return type == kDataLong ? kLongElementSize : kRealElementSize;
}

} // namespace

Bool HyperFile::WriteChunkStart(Long id, Long level)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  UChar raw[9];
  UChar* place = TakeRoom(raw, sizeof raw);
  place[0] = kTagChunkStart;
  bytes::PutBig(place + 1, static_cast<ULong>(id));
  bytes::PutBig(place + 5, static_cast<ULong>(level));
  if (!FinishRoom(place, raw, sizeof raw))
    return FailFromFile(start);
  TickWrite();
  return true;
}

Bool HyperFile::WriteChunkEnd()
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  UChar raw[1];
  UChar* place = TakeRoom(raw, sizeof raw);
  place[0] = kTagChunkEnd;
  if (!FinishRoom(place, raw, sizeof raw))
    return FailFromFile(start);
  TickWrite();
  return true;
}

Bool HyperFile::ReadChunkStart(Long& id, Long& level)
{
  if (error_ != FILEERROR_NONE)
    return false;
  if (!ReadChunkHead(id, level))
    return false;
  TickRead();
  return true;
}

// The chunk counts as one that encloses what follows once its id and level are known.
Bool HyperFile::ReadChunkHead(Long& id, Long& level)
{
  --chunkDepth_;
  if (!ReadPlainLong(id) || !ReadPlainLong(level))
    return false;
  ++chunkDepth_;
  if (chunkDepth_ <= 0)
    return true;
  if (chunkDepth_ > chunkRoom_ && !GrowChunks())
    return Fail(FILEERROR_MEMORY, file_.GetPosition());
  chunks_[chunkDepth_ - 1] = {id, level};
  return true;
}

Bool HyperFile::GrowChunks()
{
  constexpr Long kFirst = 32;
  const Long room = chunkDepth_ <= kFirst / 2 ? kFirst : 2 * chunkDepth_;
  void* grown = GeRealloc(chunks_, room * static_cast<LLong>(sizeof(ChunkPlace)));
  if (!grown)
    return false;
  chunks_ = static_cast<ChunkPlace*>(grown);
  for (; chunkRoom_ < room; ++chunkRoom_)
    chunks_[chunkRoom_] = ChunkPlace();
  return true;
}

Bool HyperFile::ReadChunkEndMark()
{
  if (error_ != FILEERROR_NONE)
    return false;
  return mode_ != kHyperFileWrite || Fail(FILEERROR_WRITE, file_.GetPosition());
}

// Moves over `count` bytes; a count past the end is the error of a read that comes short.
Bool HyperFile::Drop(LLong count, LLong position)
{
  if (file_.ReadWindow(count)) {
    file_.CommitRead(count);
    return true;
  }
  LLong remaining = file_.GetRemaining();
  if (remaining >= 0 && count > remaining)
    file_.SetError(FILEERROR_READ);
  else if (file_.Seek(count, kSeekRelative))
    return true;
  return FailFromFile(position);
}

Bool HyperFile::SkipValue(UChar tag)
{
  if (error_ != FILEERROR_NONE)
    return false;
  if (tag == kTagChunkStart) {
    Long id = 0;
    Long level = 0;
    return ReadChunkStart(id, level);
  }
  LLong start = file_.GetPosition() - 1;
  const ValueForm* form = FindSkippedForm(tag);
  if (!form)
    return Fail(FILEERROR_WRONG_VALUE, start);
  LLong left = 0;
  if (!ReadBodySize(*form, left))
    return false;
  if (!Drop(left, start))
    return false;
  TickRead();
  return true;
}

// Reads what tells the length of a body and gives the bytes that are left of it.
Bool HyperFile::ReadBodySize(const ValueForm& form, LLong& left)
{
  const FileForm layout = FormOf(*this);
  const LLong headSize = GetValueHeadSize(form, layout);
  const LLong start = file_.GetPosition();
  UChar spare[kLargestValueHead];
  const UChar* head = headSize > 0 ? TakeBytes(spare, headSize) : nullptr;
  if (headSize > 0 && !head)
    return FailFromFile(start);
  left = GetValueBodySize(form, layout, head) - headSize;
  return left >= 0 || Fail(FILEERROR_WRONG_VALUE, start);
}

Bool HyperFile::SkipToEndChunk()
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong depth = 0;
  do {
    UChar tag = 0;
    if (!ReadValueHeader(tag))
      break;
    if (tag == kTagChunkEnd && --depth < 0)
      return true;
    if (tag == kTagChunkStart)
      ++depth;
    if (tag != kTagChunkEnd)
      SkipValue(tag);
  } while (error_ == FILEERROR_NONE && file_.GetPosition() < length_);
  return error_ != FILEERROR_NONE && Fail(FILEERROR_PREMATURE_END, file_.GetPosition());
}

Bool HyperFile::ReadRawChunk(void*& data, LLong& size, Bool withoutEnd)
{
  data = nullptr;
  size = 0;
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  SkipToEndChunk();
  LLong count = file_.GetPosition() - start;
  if (withoutEnd && count > 0)
    --count;
  if (error_ != FILEERROR_NONE)
    return false;
  if (count == 0)
    return true;
  void* block = GeAllocNC(count);
  if (!block)
    return Fail(FILEERROR_MEMORY, start);
  if (!file_.Seek(start) || file_.ReadBytes(block, count) != count || (withoutEnd && !file_.Seek(1, kSeekRelative))) {
    GeFree(block);
    return Fail(FILEERROR_SEEK, start);
  }
  data = block;
  size = count;
  return true;
}

Bool HyperFile::WriteRawChunk(const void* data, LLong size, Bool withoutEnd)
{
  if (error_ != FILEERROR_NONE)
    return false;
  if (!data)
    return withoutEnd || WriteChunkEnd();
  LLong start = file_.GetPosition();
  return file_.WriteBytes(data, size) || FailFromFile(start);
}

Bool HyperFile::WriteContainer(const BaseContainer& container)
{
  if (!EnterLoop())
    return false;
  WriteChunkStart(kContainerChunk, kContainerLevel);
  WriteLong(container.GetId());
  BaseContainer::Iterator iterator;
  Long id = 0;
  const GeData* value = nullptr;
  for (Bool more = container.BrowseFirst(iterator, id, value); more && error_ == FILEERROR_NONE;
       more = container.BrowseNext(iterator, id, value)) {
    // Most elements are numbers: these go straight into the buffer, unless progress is to be told within.
    const Bool quick = !singlePrecision_ && LimitToTick(kElementTicks + 1) > kElementTicks;
    UChar* place = quick ? file_.WriteWindow(kRealElementSize) : nullptr;
    if (const LLong size = PutNumberElement(place, id, *value); size > 0) {
      file_.CommitWrite(size);
      TickMany(kElementTicks);
      continue;
    }
    if (!value->IsStored())
      continue;
    WriteLong(id);
    value->Write(*this);
  }
  LeaveLoop();
  return WriteChunkEnd();
}

Bool HyperFile::ReadContainer(BaseContainer& container, Bool flush)
{
  if (error_ != FILEERROR_NONE)
    return false;
  ContainerIndex target(container, lookups_);
  return ReadContainer(target, flush);
}

Bool HyperFile::ReadContainer(ContainerIndex& target, Bool flush)
{
  if (!EnterLoop())
    return false;
  // What a file holds mostly has as many elements as the defaults that it takes the place of.
  const Long expected = flush ? std::min(target.GetContainer().GetCount(), kMostExpected) : 0;
  if (flush)
    target.GetContainer().Flush();
  LLong start = file_.GetPosition();
  UChar tag = 0;
  Bool read = false;
  if (ReadValueHeader(tag)) {
    if (tag == kTagChunkStart)
      read = ReadContainerChunk(target, flush, expected);
    else if (tag == kTagLegacyContainer)
      read = ReadContainerLegacy(target, flush);
    else
      Fail(FILEERROR_WRONG_VALUE, start);
  }
  LeaveLoop();
  return read && HasMemory();
}

Bool HyperFile::ReadContainerChunk(ContainerIndex& target, Bool flush, Long expected)
{
  BaseContainer& container = target.GetContainer();
  LLong start = file_.GetPosition() - 1;
  Long id = 0;
  Long level = 0;
  if (!ReadChunkHead(id, level))
    return false;
  if (id != kContainerChunk)
    return Fail(FILEERROR_WRONG_VALUE, start);
  if (level < kContainerLevel)
    return true;
  if (!ReadLong(id))
    return false;
  container.SetId(id);
  // Most elements are numbers: these are taken straight out of the buffer, as long as it holds the longest of them.
  const Bool numbersInBuffer = flush && !singlePrecision_;
  const UChar* first = file_.ReadWindow(1);
  if (expected > 0 && first && first[0] == kTagLong && !container.Reserve(expected))
    return Fail(FILEERROR_MEMORY, start);
  while (error_ == FILEERROR_NONE) {
    GeData number;
    const LLong size = numbersInBuffer ? GetNumberElement(file_.ReadWindow(kRealElementSize), id, number) : 0;
    if (size > 0 && container.InsertData(id, std::move(number))) {
      file_.CommitRead(size);
      TickRead(); // the type's
      TickRead();
      continue;
    }
    UChar tag = 0;
    if (!ReadValueHeader(tag) || tag == kTagChunkEnd)
      break;
    if (tag != kTagLong)
      return FailFromFile(file_.GetPosition());
    if (!ReadPlainLong(id))
      return false;
    GeData* value = PlaceElement(target, flush, id);
    if (!value || !value->Read(*this))
      return false;
  }
  return error_ == FILEERROR_NONE;
}

// The element that a value of that id is to be read into, empty.
GeData* HyperFile::PlaceElement(ContainerIndex& target, Bool flush, Long id)
{
  GeData* value = flush ? target.Append(id) : target.Set(id);
  if (!value)
    Fail(FILEERROR_MEMORY, file_.GetPosition());
  return value;
}

} // namespace _torvane_
