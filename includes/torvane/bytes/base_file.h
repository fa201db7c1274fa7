// The byte stream under HyperFile: one interface over a disk file, a memory block, a network connection and a
// read-only stream, chosen by the Filename that is opened.
#pragma once

#include <cstdio>
#include <cstring>
#include <utility>

#include "torvane/bytes/file_errors.h"
#include "torvane/memory/memory.h"
#include "torvane/text/filename.h"
#include "torvane/types.h"

namespace _torvane_
{

class FileStream;
class NetworkConnection;

// How a file is opened. The share rule holds on Windows alone.
enum FileMode : Long
{
  kFileReadWriteAtEnd = 0, // read and write, positioned at the end; nobody else may open it
  kFileRead = 1,           // read; others may not write
  kFileWrite = 2,          // write, truncating; nobody else may open it
  kFileReadWrite = 3,      // read and write; shared
  kFileReadAlias = 4,      // the same as kFileRead
  kFileReadShared = 5,     // read; shared
};

enum ByteOrder : Long
{
  kByteOrderLittle = 0,
  kByteOrderBig = 1,
};

enum SeekMode : Long
{
  kSeekStart = 0,
  kSeekRelative = 2,
};

// Numbers in a file's byte order, built from single bytes so that the machine's own order plays no part.
namespace bytes
{

// Byte `Index` of so many that stand in a file from the highest (or the lowest) on. Written out in full, not as a
// loop, a number becomes one store or load and a swap.
template <class Bits, std::size_t... Index>
inline void PutBig(UChar* place, Bits value, std::index_sequence<Index...>)
{
  ((place[Index] = static_cast<UChar>(value >> (8 * (sizeof(Bits) - 1 - Index)))), ...);
}

template <class Bits, std::size_t... Index>
constexpr Bits GetBig(const UChar* place, std::index_sequence<Index...>)
{
  return static_cast<Bits>(((static_cast<ULLong>(place[Index]) << (8 * (sizeof(Bits) - 1 - Index))) | ...));
}

template <class Bits, std::size_t... Index>
inline void PutLittle(UChar* place, Bits value, std::index_sequence<Index...>)
{
  ((place[Index] = static_cast<UChar>(value >> (8 * Index))), ...);
}

template <class Bits, std::size_t... Index>
inline Bits GetLittle(const UChar* place, std::index_sequence<Index...>)
{
  return static_cast<Bits>(((static_cast<ULLong>(place[Index]) << (8 * Index)) | ...));
}

template <class Bits>
inline void PutBig(UChar* place, Bits value)
{
  PutBig(place, value, std::make_index_sequence<sizeof(Bits)>());
}

template <class Bits>
constexpr Bits GetBig(const UChar* place)
{
  return GetBig<Bits>(place, std::make_index_sequence<sizeof(Bits)>());
}

template <class Bits>
inline void PutLittle(UChar* place, Bits value)
{
  PutLittle(place, value, std::make_index_sequence<sizeof(Bits)>());
}

template <class Bits>
inline Bits GetLittle(const UChar* place)
{
  return GetLittle<Bits>(place, std::make_index_sequence<sizeof(Bits)>());
}

// The bits of a float, with a NaN or an infinity turned into 0.0: no file holds either.
inline ULLong CleanBits(Real value)
{
  ULLong bits = 0;
  std::memcpy(&bits, &value, sizeof bits);
  constexpr ULLong kExponent = 0x7FF0000000000000;
  return (bits & kExponent) == kExponent ? 0 : bits;
}

inline ULong CleanBits(SReal value)
{
  ULong bits = 0;
  std::memcpy(&bits, &value, sizeof bits);
  constexpr ULong kExponent = 0x7F800000;
  return (bits & kExponent) == kExponent ? 0 : bits;
}

// The float that bits from a file stand for, cleaned in the same way.
inline Real CleanReal(ULLong bits)
{
  Real value = 0;
  std::memcpy(&value, &bits, sizeof value);
  constexpr ULLong kExponent = 0x7FF0000000000000;
  return (bits & kExponent) == kExponent ? 0.0 : value;
}

inline SReal CleanReal(ULong bits)
{
  SReal value = 0;
  std::memcpy(&value, &bits, sizeof value);
  constexpr ULong kExponent = 0x7F800000;
  return (bits & kExponent) == kExponent ? 0.0F : value;
}

} // namespace bytes

// A byte stream with a sticky error. The first failure is kept, closes the file at once and makes every later
// operation fail. A BaseFile belongs to one thread at a time.
class BaseFile : public GeMemory
{
 public:
  BaseFile();
  ~BaseFile();
  BaseFile(const BaseFile&) = delete;
  BaseFile& operator=(const BaseFile&) = delete;

  // Opens `name` (a path, a memory block, a network connection or a stream) in a FileMode. The error-dialog flag and
  // the two four-character codes have no effect. False on failure, with the reason in GetError. A file that is still
  // open is closed first.
  Bool Open(const Filename& name, Long mode, Bool errorDialog = false, Long order = kByteOrderBig, ULong type = 0,
            ULong creator = 0);

  // Writes what is pending and closes. True if no error is set. A closed file stays closed.
  Bool Close();

  // Moves to `offset`, from the start or from the present position. A network file only moves forward, reading what
  // it passes; memory has no position behind its end, and what is written to it goes to its end wherever the position
  // is. Moving by 0 is true at once, whatever the state.
  Bool Seek(LLong offset, Long mode = kSeekStart);

  // Whether one may write behind the end of what is written and fill the hole later at no cost: on disks, where the
  // system has files with holes, but not to a pipe. Sets no error.
  Bool MayLeaveHoles();

  LLong GetPosition() const { return windowPosition_ + (cursor_ - window_); }

  // The length in bytes; reading modes only (any other sets FILEERROR_INVALID and gives 0). A disk file that is only
  // read keeps the length that it had when it was opened, whatever becomes of it meanwhile. A network file answers
  // 2147483647 until its end was seen.
  LLong GetLength();

  // How many bytes are left to read: no more than that will come. -1 where that can't be told (a network file whose
  // end was not seen, a file that is only written); 0 when closed. Sets no error.
  LLong GetRemaining();

  // Reads `count` bytes and gives how many came. Fewer than `count` is an error (FILEERROR_READ, result 0) unless
  // `allowShort` is set and the file is at its end; a device or connection that fails is one in any case. A count of
  // 0 gives 0 with `allowShort`, else 1 while no error is set.
  LLong ReadBytes(void* destination, LLong count, Bool allowShort = false);

  // Writes `count` bytes. A count of 0 gives true unless an error is set.
  Bool WriteBytes(const void* source, LLong count);

  void SetOrder(Long order) { order_ = order; }
  Long GetOrder() const { return order_; }
  Long GetError() const { return error_; }
  // The operating system's number (errno) of the failure on a disk; 0 when the failure is of another kind.
  Long GetSystemError() const { return systemError_; }
  Long GetMode() const { return mode_; }
  const Filename& GetName() const { return name_; }

  // Stores the first error, closes the file and drops what a memory target has received. Later errors do nothing.
  void SetError(Long error);

  // One number in the file's byte order. Floats are cleaned: a NaN or an infinity becomes 0.0, in both directions.
  Bool ReadChar(Char& value);
  Bool ReadUChar(UChar& value);
  Bool ReadWord(Word& value);
  Bool ReadUWord(UWord& value);
  Bool ReadLong(Long& value);
  Bool ReadULong(ULong& value);
  Bool ReadLLong(LLong& value);
  Bool ReadULLong(ULLong& value);
  Bool ReadSReal(SReal& value);
  Bool ReadReal(Real& value);
  Bool WriteChar(Char value);
  Bool WriteUChar(UChar value);
  Bool WriteWord(Word value);
  Bool WriteUWord(UWord value);
  Bool WriteLong(Long value);
  Bool WriteULong(ULong value);
  Bool WriteLLong(LLong value);
  Bool WriteULLong(ULLong value);
  Bool WriteSReal(SReal value);
  Bool WriteReal(Real value);

  // The quick way for small values: direct access to the buffer. ReadWindow gives `count` bytes that are ready to be
  // read, WriteWindow room for `count` bytes; null when the buffer has not that many, in another mode, and after an
  // error: the caller then takes ReadBytes or WriteBytes. What was used is told by the Commit operation.
  const UChar* ReadWindow(LLong count) const { return readLeft_ >= count ? cursor_ : nullptr; }
  UChar* WriteWindow(LLong count) { return writeLeft_ >= count ? cursor_ : nullptr; }
  // The most that they give now.
  LLong GetReadLeft() const { return readLeft_; }
  LLong GetWriteLeft() const { return writeLeft_; }
  void CommitRead(LLong count)
  {
    cursor_ += count;
    readLeft_ -= count;
  }
  void CommitWrite(LLong count)
  {
    cursor_ += count;
    writeLeft_ -= count;
  }

 private:
  enum class Target : UChar
  {
    kNone, // closed
    kDisk,
    kMemoryRead,
    kMemoryWrite,
    kNetwork,
    kStream,
  };
  // What was done last with the C stream: between reading and writing it must be positioned.
  enum class HandleUse : UChar
  {
    kNone,
    kRead,
    kWrite,
  };

  Bool Refuse(Long line, const char* message);
  template <class Value>
  Bool GetNumber(Value& value);
  template <class Value>
  Bool PutNumber(Value value);
  LLong TakeWindow(void* destination, LLong count);
  void FillWindow(const void* source, LLong count);
  void EmptyWindow(LLong position);

  // Each target's part of an operation. They give an error code or leave one in `problem`; SetError is called above
  // them.
  Long OpenTarget(Long mode);
  Long OpenDisk(Long mode);
  Long OpenMemoryRead();
  Long OpenMemoryWrite();
  Long OpenNetwork();
  LLong ReadTarget(void* destination, LLong count, Long& problem);
  LLong ReadDisk(void* destination, LLong count, Long& problem);
  LLong ReadNetwork(void* destination, LLong count, Long& problem);
  LLong ReadStream(void* destination, LLong count, Long& problem);
  Long WriteTarget(const void* source, LLong count);
  Long WriteDisk(const void* source, LLong count);
  Long WriteMemory(const void* source, LLong count);
  Long WriteNetwork(const void* source, LLong count);
  Long SeekTarget(LLong position);
  Long SeekDisk(LLong position);
  Long SeekNetwork(LLong position);
  Long CloseTarget();
  Long CloseDisk();
  Long CloseNetwork();

  void NoteSystemError();
  Bool MakeDiskBuffer(LLong size);
  Bool MeasureDisk();
  Bool FlushDisk();
  Bool MoveHandle(LLong position, HandleUse use);
  LLong ReadHandle(void* destination, LLong position, LLong count, Long& problem);
  LLong WriteHandle(const void* source, LLong position, LLong count);
  Bool ReceiveBlock(Long& problem);
  Bool GrowBlock(LLong limit);
  Bool SendBlock();

  Target target_ = Target::kNone;
  HandleUse handleUse_ = HandleUse::kNone;
  std::FILE* handle_ = nullptr;             // of a disk file
  LLong handlePosition_ = 0;                // where the C stream stands
  MemoryDescription* memory_ = nullptr;     // that a memory target writes to; not owned
  NetworkConnection* connection_ = nullptr; // not owned
  FileStream* stream_ = nullptr;            // not owned

  Filename name_;
  Long error_ = FILEERROR_NONE;
  Long systemError_ = 0;
  Long order_ = kByteOrderBig;
  Long mode_ = kFileRead;
  LLong capacity_ = 0;      // a memory target's size, or the size of a network connection's block buffer
  LLong cachedLength_ = -1; // -1 until known

  // The window is the part of the file that is in memory: the read-ahead or write-behind buffer of a disk file, the
  // block in hand of a network connection, or the whole of a memory block. `window_` is its first byte, at the file
  // position `windowPosition_`; `cursor_` is the next byte. Without a window both pointers are null and
  // `windowPosition_` is the position.
  UChar* buffer_ = nullptr; // owned
  LLong bufferSize_ = 0;    // of a disk file's buffer
  UChar* window_ = nullptr;
  UChar* cursor_ = nullptr;
  LLong windowPosition_ = 0;
  LLong readLeft_ = 0;  // bytes ready behind the cursor
  LLong writeLeft_ = 0; // room behind the cursor; 0 for what is not a disk file with a buffer
};

// True when `name` is the path of an existing directory (`directory` set) or of an existing file (`directory` clear).
Bool GeFExist(const Filename& name, Bool directory = false);

// True when a file exists under that name: what the exporter asks before it replaces one.
inline Bool GeFileExists(const Filename& name) { return GeFExist(name, false); }

} // namespace _torvane_
