#include "torvane/bytes/base_file.h"

#include <limits>

#include "k2v_file/bytes/disk_file.h"
#include "torvane/bytes/file_stream.h"
#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

// A description with one of these flags makes a name one of memory.
Long MemoryFlagsFor(Long mode) { return mode == kFileRead ? kMemoryMayRead | kMemoryMayWrite : kMemoryMayWrite; }

} // namespace

BaseFile::BaseFile() = default;

BaseFile::~BaseFile() { Close(); }

Bool BaseFile::Refuse(Long line, const char* message)
{
  ReportAssertion("k2v_file", line, message);
  SetError(FILEERROR_INVALID);
  return false;
}

Bool BaseFile::Open(const Filename& name, Long mode, Bool /*errorDialog*/, Long order, ULong /*type*/,
                    ULong /*creator*/)
{
  Close();
  name_ = name;
  error_ = FILEERROR_NONE;
  systemError_ = 0;
  order_ = order;
  mode_ = mode == kFileReadAlias || mode == kFileReadShared ? Long{kFileRead} : mode;
  cachedLength_ = -1;
  capacity_ = 0;
  handlePosition_ = 0;
  handleUse_ = HandleUse::kNone;
  windowPosition_ = 0;
  if (mode < kFileReadWriteAtEnd || mode > kFileReadShared)
    return Refuse(__LINE__, "a file was opened in an unknown mode");
  SetError(OpenTarget(mode));
  return error_ == FILEERROR_NONE;
}

Long BaseFile::OpenTarget(Long mode)
{
  memory_ = name_.GetMemoryDescription();
  if (memory_ && (memory_->flags & MemoryFlagsFor(mode_)) != 0)
    return mode_ == kFileRead ? OpenMemoryRead() : OpenMemoryWrite();
  memory_ = nullptr;
  connection_ = name_.GetIpConnection();
  if (connection_)
    return OpenNetwork();
  stream_ = name_.GetStream();
  if (!stream_)
    return OpenDisk(mode);
  target_ = Target::kStream;
  return FILEERROR_NONE;
}

Long BaseFile::OpenMemoryRead()
{
  // What was written to a description lies in its blocks until they are joined.
  if (memory_->writer.GetBlockCount() != 0 && !memory_->Join())
    return FILEERROR_MEMORY;
  if (!memory_->data)
    return FILEERROR_OPEN;
  target_ = Target::kMemoryRead;
  capacity_ = memory_->size > 0 ? memory_->size : 0;
  window_ = static_cast<UChar*>(const_cast<void*>(memory_->data));
  cursor_ = window_;
  readLeft_ = capacity_;
  return FILEERROR_NONE;
}

Long BaseFile::OpenMemoryWrite()
{
  memory_->Clear();
  memory_->flags |= kMemoryOwnsBlock;
  target_ = Target::kMemoryWrite;
  return FILEERROR_NONE;
}

Bool BaseFile::Close()
{
  const Long problem = CloseTarget();
  EmptyWindow(GetPosition());
  window_ = nullptr;
  cursor_ = nullptr;
  GeFree(buffer_);
  bufferSize_ = 0;
  memory_ = nullptr;
  connection_ = nullptr;
  stream_ = nullptr;
  target_ = Target::kNone;
  if (error_ == FILEERROR_NONE)
    error_ = problem;
  return error_ == FILEERROR_NONE;
}

Long BaseFile::CloseTarget()
{
  switch (target_) {
  case Target::kDisk:
    return CloseDisk();
  case Target::kNetwork:
    return CloseNetwork();
  default:
    return FILEERROR_NONE;
  }
}

void BaseFile::SetError(Long error)
{
  if (error_ != FILEERROR_NONE || error == FILEERROR_NONE)
    return;
  error_ = error;
  MemoryDescription* written = target_ == Target::kMemoryWrite ? memory_ : nullptr;
  Close();
  if (written)
    written->Clear();
}

// Takes what the window holds, up to `count` bytes.
LLong BaseFile::TakeWindow(void* destination, LLong count)
{
  const LLong taken = readLeft_ < count ? readLeft_ : count;
  GeCopyFewBytes(destination, cursor_, taken);
  CommitRead(taken);
  return taken;
}

// Puts `count` bytes, for which there is room, behind the cursor.
void BaseFile::FillWindow(const void* source, LLong count)
{
  GeCopyFewBytes(cursor_, source, count);
  cursor_ += count;
}

// A window at `position` that holds nothing.
void BaseFile::EmptyWindow(LLong position)
{
  window_ = buffer_;
  cursor_ = buffer_;
  windowPosition_ = position;
  readLeft_ = 0;
  writeLeft_ = 0;
}

LLong BaseFile::ReadBytes(void* destination, LLong count, Bool allowShort)
{
  if (error_ != FILEERROR_NONE)
    return 0;
  const Bool readable = target_ != Target::kNone && target_ != Target::kMemoryWrite;
  if (!readable || (mode_ != kFileRead && mode_ != kFileReadWrite) || count < 0) {
    Refuse(__LINE__, "a file was read that is not open for it, or by a negative count");
    return 0;
  }
  if (count == 0)
    return allowShort ? 0 : 1;
  Long problem = FILEERROR_NONE;
  LLong got = TakeWindow(destination, count);
  if (got < count)
    got += ReadTarget(static_cast<UChar*>(destination) + got, count - got, problem);
  if (got < count && !allowShort && problem == FILEERROR_NONE)
    problem = FILEERROR_READ;
  SetError(problem);
  return error_ == FILEERROR_NONE ? got : 0;
}

// Reads on behind the window, which is used up.
LLong BaseFile::ReadTarget(void* destination, LLong count, Long& problem)
{
  switch (target_) {
  case Target::kDisk:
    return ReadDisk(destination, count, problem);
  case Target::kNetwork:
    return ReadNetwork(destination, count, problem);
  case Target::kStream:
    return ReadStream(destination, count, problem);
  default:
    return 0; // all of a memory block lies in the window
  }
}

LLong BaseFile::ReadStream(void* destination, LLong count, Long& problem)
{
  const LLong got = stream_->Read(destination, count);
  if (got < 0 || got > count) {
    problem = FILEERROR_READ;
    return 0;
  }
  windowPosition_ += got;
  return got;
}

Bool BaseFile::WriteBytes(const void* source, LLong count)
{
  if (error_ != FILEERROR_NONE)
    return false;
  const Bool writable = target_ == Target::kDisk || target_ == Target::kMemoryWrite || target_ == Target::kNetwork;
  if (!writable || mode_ == kFileRead || count < 0) {
    SetError(FILEERROR_INVALID);
    return false;
  }
  if (count == 0)
    return true;
  if (writeLeft_ >= count) {
    FillWindow(source, count);
    writeLeft_ -= count;
    return true;
  }
  SetError(WriteTarget(source, count));
  return error_ == FILEERROR_NONE;
}

Long BaseFile::WriteTarget(const void* source, LLong count)
{
  switch (target_) {
  case Target::kDisk:
    return WriteDisk(source, count);
  case Target::kNetwork:
    return WriteNetwork(source, count);
  default:
    return WriteMemory(source, count);
  }
}

Long BaseFile::WriteMemory(const void* source, LLong count)
{
  if (!memory_->writer.Write(source, count))
    return FILEERROR_MEMORY;
  windowPosition_ += count;
  if (capacity_ < windowPosition_)
    capacity_ = windowPosition_;
  return FILEERROR_NONE;
}

Bool BaseFile::Seek(LLong offset, Long mode)
{
  if (mode == kSeekRelative && offset == 0)
    return true;
  if (error_ != FILEERROR_NONE)
    return false;
  if (mode != kSeekStart && mode != kSeekRelative)
    return Refuse(__LINE__, "a file was positioned in an unknown mode");
  const LLong base = mode == kSeekRelative ? GetPosition() : 0;
  if (offset > std::numeric_limits<LLong>::max() - base || base + offset < 0)
    return Refuse(__LINE__, "a file was positioned before its start");
  SetError(SeekTarget(base + offset));
  return error_ == FILEERROR_NONE;
}

Long BaseFile::SeekTarget(LLong position)
{
  switch (target_) {
  case Target::kDisk:
    return SeekDisk(position);
  case Target::kNetwork:
    return SeekNetwork(position);
  case Target::kStream:
    if (!stream_->Seek(position))
      return FILEERROR_SEEK;
    windowPosition_ = position;
    return FILEERROR_NONE;
  case Target::kMemoryRead:
    if (position > capacity_)
      return FILEERROR_INVALID;
    cursor_ = window_ + position;
    readLeft_ = capacity_ - position;
    return FILEERROR_NONE;
  case Target::kMemoryWrite:
    // Moves the count alone: the next bytes go to the end of the blocks all the same.
    if (position > capacity_)
      return FILEERROR_INVALID;
    windowPosition_ = position;
    return FILEERROR_NONE;
  case Target::kNone:
    break;
  }
  return FILEERROR_INVALID;
}

Bool BaseFile::MayLeaveHoles()
{
  return kFilesHaveHoles && target_ == Target::kDisk && mode_ == kFileWrite && SeekDiskFile(handle_, handlePosition_);
}

LLong BaseFile::GetLength()
{
  constexpr LLong kUnseenEnd = std::numeric_limits<Long>::max();
  if (error_ != FILEERROR_NONE)
    return 0;
  LLong length = 0;
  if (mode_ != kFileRead && mode_ != kFileReadWrite) {
    SetError(FILEERROR_INVALID);
    return 0;
  }
  switch (target_) {
  case Target::kDisk:
    if (!MeasureDisk())
      SetError(FILEERROR_SEEK);
    return error_ == FILEERROR_NONE ? cachedLength_ : 0;
  case Target::kNetwork:
    return cachedLength_ < 0 ? kUnseenEnd : cachedLength_;
  case Target::kStream:
    if (stream_->Stat(length))
      return length;
    SetError(FILEERROR_SEEK);
    return 0;
  case Target::kMemoryRead:
  case Target::kMemoryWrite:
    return capacity_;
  case Target::kNone:
    break;
  }
  SetError(FILEERROR_INVALID);
  return 0;
}

LLong BaseFile::GetRemaining()
{
  LLong length = -1;
  switch (target_) {
  case Target::kNone:
    return 0;
  case Target::kMemoryRead:
    return readLeft_;
  case Target::kDisk:
    if ((mode_ == kFileRead || mode_ == kFileReadWrite) && MeasureDisk())
      length = cachedLength_;
    break;
  case Target::kNetwork:
    length = mode_ == kFileRead ? cachedLength_ : -1;
    break;
  case Target::kStream:
    if (!stream_->Stat(length))
      length = -1;
    break;
  case Target::kMemoryWrite:
    break;
  }
  if (length < 0)
    return -1;
  return length > GetPosition() ? length - GetPosition() : 0;
}

} // namespace _torvane_
