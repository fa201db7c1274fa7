// The name of a file: a path, or the description of memory, a network connection or a stream to use in its place.
#pragma once

#include "torvane/bytes/memory_block_writer.h"
#include "torvane/text/ge_string.h"
#include "torvane/types.h"

namespace _torvane_
{

class FileStream;
class NetworkConnection;

// Names that begin with "preset://" use "/" on every platform.
#ifdef _WIN32
inline constexpr UniChar kPathSeparator = u'\\';
#else
inline constexpr UniChar kPathSeparator = u'/';
#endif

// Flags of a memory description.
inline constexpr Long kMemoryMayRead = 1;
inline constexpr Long kMemoryMayWrite = 2;
inline constexpr Long kMemoryOwnsBlock = 4; // the block is freed with the description

// Memory that a file is read from or written to. Written bytes lie in the writer's blocks; joined or foreign ones in
// `data`, which comes before them.
struct MemoryDescription
{
  Long flags = kMemoryOwnsBlock;
  LLong size = 0; // bytes at `data`
  const void* data = nullptr;
  MemoryBlockWriter writer;

  MemoryDescription() noexcept = default;
  ~MemoryDescription() { Clear(); }
  MemoryDescription(const MemoryDescription&) = delete;
  MemoryDescription& operator=(const MemoryDescription&) = delete;

  // Frees what it owns and forgets what it doesn't. The flags stay.
  void Clear() noexcept;

  // The number of blocks and the n-th of them; false for a number out of range. The blocks stay the description's.
  Long GetBlockCount() const noexcept { return (data ? 1 : 0) + writer.GetBlockCount(); }
  Bool GetBlock(Long n, const void*& block, LLong& blockSize) const noexcept;

  // Joins all blocks into one, which takes their place and stays the description's. False when memory is short
  // (nothing has changed then) and when there are no bytes.
  Bool Join() noexcept;
};

class Filename
{
 public:
  Filename() noexcept = default;
  // Decoded as UTF-8.
  Filename(const char* path) noexcept : Filename(String(path, STRINGENCODING_UTF8)) {}
  Filename(const String& path) noexcept { SetString(path); }
  // A copy shares memory to read and a description to write: neither belongs to a Filename, both must outlive all
  // that name them.
  Filename(const Filename& other) noexcept;
  Filename(Filename&& other) noexcept;
  Filename& operator=(const Filename& other) noexcept;
  Filename& operator=(Filename&& other) noexcept;

  // True if the text is not empty.
  Bool Content() const noexcept { return text_.Content(); }
  const String& GetString() const noexcept { return text_; }
  // Drops one separator at the end, then all blanks at the end. A memory target stays as it is.
  void SetString(const String& text) noexcept;

  // This path, a separator and the other name's file part; just that file part when this path is empty.
  [[nodiscard]] Filename Concat(const Filename& other) const noexcept;
  void Append(const Filename& other) noexcept;
  friend Filename operator+(const Filename& a, const Filename& b) noexcept { return a.Concat(b); }

  // All before the last separator; empty without one.
  [[nodiscard]] Filename GetDirectory() const noexcept;
  // All behind the last separator; the whole text without one.
  [[nodiscard]] Filename GetFile() const noexcept { return Filename(GetFileString()); }
  [[nodiscard]] String GetFileString() const noexcept;

  // Cuts the suffix with its dot if it has at most 6 characters.
  void ClearSuffix() noexcept;
  // Cuts a suffix of any length.
  void ClearSuffixComplete() noexcept;
  // True if the name ends with a dot and this suffix, in lower case.
  Bool CheckSuffix(const String& suffix) const noexcept;
  // ClearSuffix, then a dot and the new suffix.
  void SetSuffix(const String& suffix) noexcept;

  // Equal texts, case ignored as String::LexCompare does.
  Bool IsEqual(const Filename& other) const noexcept { return text_.LexCompare(other.text_) == 0; }
  friend Bool operator==(const Filename& a, const Filename& b) noexcept { return a.IsEqual(b); }

  // True for a name, not of memory, that begins with "preset://".
  Bool IsPreset() const noexcept;

  // Reads come from these bytes, which stay the caller's and must outlive all copies of the name.
  void SetMemoryRead(const void* data, LLong size) noexcept;
  // Writes go into this description, which stays the caller's; null takes the memory target away.
  void SetMemoryWrite(MemoryDescription* description) noexcept;
  Bool IsMemory() const noexcept { return memory_ && memory_->flags != 0; }
  // The description in force, or null.
  MemoryDescription* GetMemoryDescription() const noexcept { return memory_; }
  // The blocks of the memory target: their number (0 without a target), and the n-th of them.
  Long GetMemory() const noexcept { return memory_ ? memory_->GetBlockCount() : 0; }
  Bool GetMemory(Long n, const void*& data, LLong& size) const noexcept
  {
    return memory_ && memory_->GetBlock(n, data, size);
  }
  // All bytes as one block, which stays the description's (see MemoryDescription::Join).
  Bool GetMemoryContinuous(const void*& data, LLong& size) const noexcept;
  // Makes the name a plain path again. A description to write keeps its blocks.
  void ClearMemory() noexcept;

  // The text becomes a sign and the address of the object, which stays the caller's. The getters give null for any
  // other text.
  void SetIpConnection(const NetworkConnection* connection) noexcept;
  NetworkConnection* GetIpConnection() const noexcept;
  void SetStream(const FileStream* stream) noexcept;
  FileStream* GetStream() const noexcept;

 private:
  UniChar GetSeparator() const noexcept;
  Long FindSuffix(Long limit) const noexcept;
  void SetPointer(const char* sign, const void* pointer) noexcept;
  void* GetPointer(const char* sign) const noexcept;
  void ShareMemory(const Filename& other) noexcept;

  String text_;
  MemoryDescription* memory_ = nullptr;
  MemoryDescription inline_;
};

} // namespace _torvane_
