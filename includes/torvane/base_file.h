// The byte stream under HyperFile: one interface over a disk file, a memory block, a network connection and a
// read-only stream, chosen by the Filename that is opened.
#pragma once

#include <cstring>

#include "torvane/file_errors.h"
#include "torvane/filename.h"
#include "torvane/memory.h"
#include "torvane/types.h"

namespace _torvane_
{

class FileStream;
class MemoryBlockWriter;
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

template <class Bits>
inline void PutBig(UChar* place, Bits value)
{
  for (std::size_t i = 0; i < sizeof(Bits); ++i)
    place[i] = static_cast<UChar>(value >> (8 * (sizeof(Bits) - 1 - i)));
}

template <class Bits>
inline Bits GetBig(const UChar* place)
{
  Bits value = 0;
  for (std::size_t i = 0; i < sizeof(Bits); ++i)
    value = static_cast<Bits>(static_cast<Bits>(value << 8) | place[i]);
  return value;
}

template <>
inline UChar GetBig<UChar>(const UChar* place)
{
  return *place;
}

template <class Bits>
inline void PutLittle(UChar* place, Bits value)
{
  for (std::size_t i = 0; i < sizeof(Bits); ++i)
    place[i] = static_cast<UChar>(value >> (8 * i));
}

template <class Bits>
inline Bits GetLittle(const UChar* place)
{
  Bits value = 0;
  for (std::size_t i = sizeof(Bits); i-- > 0;)
    value = static_cast<Bits>(static_cast<Bits>(value << 8) | place[i]);
  return value;
}

template <>
inline UChar GetLittle<UChar>(const UChar* place)
{
  return *place;
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

  // Moves to `offset`, from the start or from the present position.
  Bool Seek(LLong offset, Long mode = kSeekStart);

  LLong GetPosition() const { return windowPosition_ + (cursor_ - window_); }

  // The length in bytes; reading modes only (any other sets FILEERROR_INVALID and gives 0). A network file answers
  // 2147483647 until its end was seen.
  LLong GetLength();

  // The bytes that are certainly left to read, or -1 where that can't be told (network). Sets no error.
  LLong GetRemaining();

  // Reads `count` bytes and gives how many came. Fewer than `count` is an error (FILEERROR_READ, result 0) unless
  // `allowShort` is set. A count of 0 gives 0 with `allowShort`, else 1 while no error is set.
  LLong ReadBytes(void* destination, LLong count, Bool allowShort = false);

  // Writes `count` bytes. A count of 0 gives true unless an error is set.
  Bool WriteBytes(const void* source, LLong count);

  void SetOrder(Long order) { order_ = order; }
  Long GetOrder() const { return order_; }
  Long GetError() const { return error_; }
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
  // The target's handle: the C stream of a disk file; exactly one of the pointers below stands for the target.
  void* handle_ = nullptr;
  MemoryBlockWriter* memoryWriter_ = nullptr; // of the Filename's target description; not owned
  NetworkConnection* connection_ = nullptr;   // not owned
  FileStream* stream_ = nullptr;              // not owned

  Filename name_;
  Long error_ = FILEERROR_NONE;
  Long order_ = kByteOrderBig;
  Long mode_ = kFileRead;
  Bool memory_ = false;
  LLong capacity_ = 0;      // a memory block's size, or the size of a network block buffer
  LLong cachedLength_ = -1; // -1 until known

  // The window is the part of the file that is in memory: the read-ahead or write-behind buffer of a disk file, or
  // the whole of a memory block. `window_` is its first byte, at the file position `windowPosition_`; `cursor_` is the
  // next byte. Without a window both pointers are null and `windowPosition_` is the position.
  UChar* buffer_ = nullptr; // owned
  LLong bufferSize_ = 0;
  UChar* window_ = nullptr;
  UChar* cursor_ = nullptr;
  LLong windowPosition_ = 0;
  LLong readLeft_ = 0;  // bytes ready behind the cursor
  LLong writeLeft_ = 0; // room behind the cursor
  LLong handlePosition_ = 0;

  friend struct BaseFileTargets; // the opening, reading and writing of each kind of target, in base_file.cpp
};

// True when `name` is the path of an existing directory (`directory` set) or of an existing file (`directory` clear).
Bool GeFExist(const Filename& name, Bool directory = false);

// True when a file exists under that name: what the exporter asks before it replaces one.
inline Bool GeFileExists(const Filename& name) { return GeFExist(name, false); }

// True when `name` holds a scene file: its first number is one of the six magics and its second the scene ident.
// `flags` without bit 1 gives false. The file is closed in any case.
Bool IdentifyFile(const Filename& name, ULong flags);

} // namespace _torvane_
