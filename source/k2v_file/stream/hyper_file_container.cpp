// Containers: the chunk form.
#include <algorithm>
#include <cstring>

#include "k2v_file/stream/value_forms.h"
#include "k2v_file/stream/write_in_memory.h"
#include "k2v_file/values/container_defaults.h"
#include "k2v_file/values/container_index.h"
#include "torvane/ids.h"
#include "torvane/memory/spin_lock.h"
#include "torvane/stream/prepared_record.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

constexpr LLong kElementTicks = 3;     // written: of its id, its type and its value
constexpr LLong kReadElementTicks = 2; // the id's goes uncounted
constexpr Long kMostExpected = 64;     // elements that get room before they are read

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

// How many of the first bytes are the same.
LLong CountSame(const UChar* a, const UChar* b, LLong count)
{
  constexpr LLong kRun = 32;
  LLong same = 0;
  for (; same + kRun <= count && std::memcmp(a + same, b + same, kRun) == 0; same += kRun) {
  }
  for (; same + 8 <= count && std::memcmp(a + same, b + same, 8) == 0; same += 8) {
  }
  while (same < count && a[same] == b[same])
    ++same;
  return same;
}

// The general way.
Bool WriteElement(HyperFile& file, Long id, const GeData& value) { return file.WriteLong(id) && value.Write(file); }

// Keeps shared elements as the general way writes them. False when memory is short.
Bool LearnDefaults(const BaseContainer::Defaults& defaults)
{
  static ReadWriteSpinLock lock;
  if (defaults.isStored.load(std::memory_order_acquire))
    return true;
  const WriteGuard guard(lock);
  if (defaults.isStored.load(std::memory_order_relaxed))
    return true;
  const auto write = [&defaults](HyperFile& file) {
    const LLong start = file.GetPosition();
    Long* end = defaults.ends;
    for (const auto* element = defaults.first; element; element = element->next) {
      if (element->value.GetRawType() != kDataContainer)
        WriteElement(file, element->id, element->value);
      *end++ = static_cast<Long>(file.GetPosition() - start);
    }
  };
  return WriteInMemory(write, [&defaults](const UChar* file, LLong size, LLong header) {
    if (size - header > defaults.count * BaseContainer::Defaults::kLargestStored)
      return false;
    std::memcpy(defaults.bytes, file + header, static_cast<std::size_t>(size - header));
    defaults.isStored.store(true, std::memory_order_release);
    return true;
  });
}

} // namespace

Bool HyperFile::WriteContainer(const BaseContainer& container)
{
  if (!EnterLoop())
    return false;
  WriteChunkStart(kChunkContainer, kLevelContainer);
  WriteLong(container.GetId());
  if (!container.IsShared() || !WriteShared(container))
    WriteElements(container);
  LeaveLoop();
  return WriteChunkEnd();
}

void HyperFile::WriteElements(const BaseContainer& container)
{
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
    } else if (value->IsStored()) {
      WriteElement(*this, id, *value);
    }
  }
}

// Elements that are shared go out as they are kept, as many in a row as there are. False, and nothing is written, where
// the general way is to be taken.
Bool HyperFile::WriteShared(const BaseContainer& container)
{
  const BaseContainer::Defaults& defaults = *container.defaults_;
  if (!TakesRecords(kElementTicks * defaults.count) || !LearnDefaults(defaults))
    return false;
  const LLong start = file_.GetPosition();
  Long written = 0; // bytes of `defaults` that are dealt with
  Long waiting = 0; // elements behind them that are to be written
  const auto writeWaiting = [&](Long end) {
    if (error_ == FILEERROR_NONE && !file_.WriteBytes(defaults.bytes + written, end - written))
      FailFromFile(start);
    TickMany(kElementTicks * std::exchange(waiting, 0));
  };
  Long before = 0;
  const Long* end = defaults.ends;
  for (const auto* place = defaults.first; place; place = place->next, before = *end++) {
    const GeData& value = container.Shown(place)->value;
    if (&value == &place->value && *end > before) {
      ++waiting;
      continue;
    }
    writeWaiting(before);
    written = *end;
    if (value.IsStored())
      WriteElement(*this, place->id, value);
  }
  writeWaiting(before);
  return true;
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
  if (flush && !MayHoldShared(target.GetContainer()))
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
  if (id != kChunkContainer)
    return Fail(FILEERROR_WRONG_VALUE, start);
  if (level < kLevelContainer)
    return true;
  if (!ReadLong(id))
    return false;
  container.SetId(id);
  if (flush && container.IsShared() && !ReadShared(container))
    return false;
  // Most elements are numbers: these are taken straight out of the buffer, as long as it holds the longest of them.
  const Bool numbersInBuffer = flush && !singlePrecision_;
  const UChar* first = container.IsShared() ? nullptr : file_.ReadWindow(1);
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

// True if a chunk comes whose elements are to be compared with those that the container shares: ReadShared is sure to
// be called then.
Bool HyperFile::MayHoldShared(const BaseContainer& container) const
{
  constexpr LLong kHead = StoredSize(kTagLong) + PreparedRecord::kHeadSize;
  if (!container.IsShared() || version_ < kVersionCurrent ||
      !TakesRecords(kReadElementTicks * (container.GetCount() + 1)) || !LearnDefaults(*container.defaults_))
    return false;
  const UChar* head = file_.ReadWindow(kHead);
  return head && head[0] == kTagChunkStart && bytes::GetBig<ULong>(head + 1) == kChunkContainer &&
         bytes::GetBig<ULong>(head + 5) == kLevelContainer && head[PreparedRecord::kHeadSize] == kTagLong;
}

// Passes over elements that stand in the file as the container shares them, and reads those of them that have other
// values, up to the first that is something else.
Bool HyperFile::ReadShared(BaseContainer& container)
{
  const BaseContainer::Defaults& defaults = *container.defaults_;
  container.Flush();
  container.Share(defaults);
  const Long size = defaults.count > 0 ? defaults.ends[defaults.count - 1] : 0;
  Bool read = true;
  Long count = 0;   // elements that were dealt with
  Long before = 0;  // their bytes
  LLong passed = 0; // elements that were passed over
  for (const auto* place = defaults.first; place && read;) {
    const LLong left = std::min<LLong>(size - before, file_.GetReadLeft());
    const UChar* next = file_.ReadWindow(left);
    const LLong same = before + (next ? CountSame(next, defaults.bytes + before, left) : 0);
    const Long first = before;
    for (; place && defaults.ends[count] > before && defaults.ends[count] <= same; place = place->next, ++passed)
      before = defaults.ends[count++];
    file_.CommitRead(before - first);
    if (!place)
      break;
    next = file_.ReadWindow(kElementType);
    if (!next || next[0] != kTagLong || static_cast<Long>(bytes::GetBig<ULong>(next + 1)) != place->id ||
        !container.TakesChange())
      break;
    GeData* value = container.ReplaceShared(place->id);
    if (!value)
      return Fail(FILEERROR_MEMORY, file_.GetPosition());
    file_.CommitRead(kElementType);
    read = value->Read(*this);
    before = defaults.ends[count++];
    place = place->next;
  }
  TickMany(kReadElementTicks * passed);
  container.dirty_ = static_cast<UWord>(container.dirty_ - (defaults.count - count));
  if (count < defaults.count && !container.TakeFirst(count))
    return Fail(FILEERROR_MEMORY, file_.GetPosition());
  return read;
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
