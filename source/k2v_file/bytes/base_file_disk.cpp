// The disk target of BaseFile: a C stream without a buffer of its own under a buffer that this layer keeps, except
// where a file is both read and written.
#include <cerrno>

#include "k2v_file/bytes/disk_file.h"
#include "torvane/bytes/base_file.h"

namespace _torvane_
{

namespace
{

constexpr LLong kBufferSize = 262144;            // fewer calls of the system; more brings nothing
constexpr std::size_t kStreamBufferSize = 32768; // of the C library, in kFileReadWrite
constexpr LLong kSpare = 2;                      // a shorter file's buffer is longer than the file by this

} // namespace

// To be called right behind the call that failed. The first failure counts: those that follow are its consequences.
void BaseFile::NoteSystemError()
{
  if (systemError_ == 0)
    systemError_ = errno;
}

Long BaseFile::OpenDisk(Long mode)
{
  // A writer has its buffer before it makes or empties the file.
  const Bool writes = mode_ == kFileWrite || mode_ == kFileReadWriteAtEnd;
  if (writes && !MakeDiskBuffer(kBufferSize))
    return FILEERROR_MEMORY;
  handle_ = OpenDiskFile(name_.GetString(), mode);
  if (!handle_) {
    NoteSystemError();
    return FILEERROR_OPEN;
  }
  target_ = Target::kDisk;
  if (mode_ == kFileReadWrite) {
    std::setvbuf(handle_, nullptr, _IOFBF, kStreamBufferSize);
    return FILEERROR_NONE;
  }
  std::setvbuf(handle_, nullptr, _IONBF, 0);
  if (mode_ != kFileWrite && !MeasureDisk())
    return FILEERROR_SEEK;
  if (!writes && !MakeDiskBuffer(cachedLength_ < kBufferSize ? cachedLength_ + kSpare : kBufferSize))
    return FILEERROR_MEMORY;
  EmptyWindow(mode_ == kFileReadWriteAtEnd ? cachedLength_ : 0);
  if (mode_ != kFileRead)
    writeLeft_ = bufferSize_;
  return FILEERROR_NONE;
}

Bool BaseFile::MakeDiskBuffer(LLong size)
{
  buffer_ = static_cast<UChar*>(GeAlloc(size));
  bufferSize_ = size;
  return buffer_ != nullptr;
}

// Learns the file's length once; the C stream is brought back by the next read or write.
Bool BaseFile::MeasureDisk()
{
  if (cachedLength_ >= 0)
    return true;
  LLong length = 0;
  if (!MeasureDiskFile(handle_, length)) {
    NoteSystemError();
    return false;
  }
  cachedLength_ = length;
  handlePosition_ = length;
  handleUse_ = HandleUse::kNone;
  return true;
}

// Makes the C stream ready for reading or writing at `position`.
Bool BaseFile::MoveHandle(LLong position, HandleUse use)
{
  const Bool turned = handleUse_ != HandleUse::kNone && use != handleUse_;
  if (handlePosition_ != position || turned) {
    if (!SeekDiskFile(handle_, position)) {
      NoteSystemError();
      return false;
    }
    handlePosition_ = position;
  }
  handleUse_ = use;
  return true;
}

// Reads past the buffer. A file that is only read ends where it ended when it was opened.
LLong BaseFile::ReadHandle(void* destination, LLong position, LLong count, Long& problem)
{
  const Bool ends = mode_ == kFileRead && count > cachedLength_ - position;
  const LLong wanted = ends ? cachedLength_ - position : count;
  if (wanted <= 0)
    return 0;
  if (!MoveHandle(position, HandleUse::kRead)) {
    problem = FILEERROR_SEEK;
    return 0;
  }
  const auto got = static_cast<LLong>(std::fread(destination, 1, static_cast<std::size_t>(wanted), handle_));
  handlePosition_ += got;
  if (got < wanted && std::ferror(handle_)) {
    NoteSystemError();
    problem = FILEERROR_READ;
  }
  return got;
}

LLong BaseFile::WriteHandle(const void* source, LLong position, LLong count)
{
  if (!MoveHandle(position, HandleUse::kWrite))
    return 0;
  const auto written = static_cast<LLong>(std::fwrite(source, 1, static_cast<std::size_t>(count), handle_));
  handlePosition_ += written;
  if (written < count)
    NoteSystemError();
  return written;
}

LLong BaseFile::ReadDisk(void* destination, LLong count, Long& problem)
{
  const LLong position = GetPosition();
  if (count > bufferSize_) {
    const LLong got = ReadHandle(destination, position, count, problem);
    EmptyWindow(position + got);
    return got;
  }
  EmptyWindow(position);
  readLeft_ = ReadHandle(buffer_, position, bufferSize_, problem);
  return TakeWindow(destination, count);
}

// Writes what is pending. Nothing is pending after it, whether or not it went well.
Bool BaseFile::FlushDisk()
{
  const LLong pending = cursor_ - window_;
  if (pending == 0)
    return true;
  const LLong written = WriteHandle(window_, windowPosition_, pending);
  EmptyWindow(windowPosition_ + written);
  writeLeft_ = bufferSize_;
  return written == pending;
}

Long BaseFile::WriteDisk(const void* source, LLong count)
{
  if (!FlushDisk())
    return FILEERROR_WRITE;
  if (count <= bufferSize_) {
    FillWindow(source, count);
    writeLeft_ -= count;
    return FILEERROR_NONE;
  }
  const LLong written = WriteHandle(source, windowPosition_, count);
  windowPosition_ += written;
  if (cachedLength_ >= 0 && cachedLength_ < windowPosition_)
    cachedLength_ = windowPosition_;
  return written == count ? FILEERROR_NONE : FILEERROR_WRITE;
}

Long BaseFile::SeekDisk(LLong position)
{
  if (mode_ == kFileRead) {
    // The C stream follows at the next read from it.
    const LLong offset = position - windowPosition_;
    const LLong held = (cursor_ - window_) + readLeft_;
    if (offset < 0 || offset > held) {
      EmptyWindow(position);
      return FILEERROR_NONE;
    }
    cursor_ = window_ + offset;
    readLeft_ = held - offset;
    return FILEERROR_NONE;
  }
  if (buffer_ && !FlushDisk())
    return FILEERROR_WRITE;
  handleUse_ = HandleUse::kNone;
  if (!SeekDiskFile(handle_, position)) {
    NoteSystemError();
    return FILEERROR_SEEK;
  }
  handlePosition_ = position;
  windowPosition_ = position;
  return FILEERROR_NONE;
}

Long BaseFile::CloseDisk()
{
  Long problem = FILEERROR_NONE;
  if (mode_ != kFileRead && buffer_ && !FlushDisk())
    problem = FILEERROR_WRITE;
  if (std::fclose(handle_) != 0) {
    NoteSystemError();
    if (problem == FILEERROR_NONE)
      problem = FILEERROR_CLOSE;
  }
  handle_ = nullptr;
  return problem;
}

} // namespace _torvane_
