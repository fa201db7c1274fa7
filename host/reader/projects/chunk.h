// The tree of chunks that a project file is made of. Nothing is read before it is asked for.
#pragma once

#include "host/model/ratio.h"

#include <bit>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>
#include <vector>

namespace host::projects
{

// The four characters that tell what a chunk is, or the kind of a list.
using Tag = std::uint32_t;

constexpr Tag MakeTag(std::string_view text)
{
  Tag tag = 0;
  for (std::size_t i = 0; i < 4; ++i)
    tag = (tag << 8) | static_cast<unsigned char>(i < text.size() ? text[i] : ' ');
  return tag;
}

constexpr Tag operator""_tag(const char* text, std::size_t length) { return MakeTag({text, length}); }

inline constexpr Tag kList = "LIST"_tag;

// A value at a fixed place in the data of a chunk.
template <class T>
struct Field
{
  std::size_t offset;
};

// A quotient in two fields, numerator and divisor.
template <class T>
struct RatioField
{
  std::size_t offset;
};

class ChunkDocument;
class ChunkRange;

// A view of one chunk; its document must outlive it.
class Chunk
{
 public:
  Chunk(const ChunkDocument& document, Tag id, Tag kind, std::size_t offset, std::size_t size)
      : document_(&document), id_(id), kind_(kind), offset_(offset), size_(size)
  {}

  Tag Id() const { return id_; }
  Tag Kind() const { return kind_; } // of a list, else 0
  bool IsList(Tag kind) const { return id_ == kList && kind_ == kind; }
  std::size_t Size() const { return size_; }
  std::string_view Bytes() const;

  // The chunks in a list, or in what else holds chunks. The range refuses the file where one passes the end.
  ChunkRange Children() const;
  std::optional<Chunk> Find(Tag id) const;
  std::optional<Chunk> FindList(Tag kind) const;
  Chunk Require(Tag id) const;
  Chunk RequireList(Tag kind) const;

  // Big-endian. Refuses the file where the chunk is too short.
  template <class T>
  T Get(Field<T> field) const
  {
    const std::uint64_t number = Number(field.offset, sizeof(T));
    if constexpr (std::is_same_v<T, double>)
      return std::bit_cast<double>(number);
    else if constexpr (std::is_same_v<T, float>)
      return std::bit_cast<float>(static_cast<std::uint32_t>(number));
    else
      return static_cast<T>(number);
  }
  // 0 where the divisor is 0.
  template <class T>
  Ratio Get(RatioField<T> field) const
  {
    return {Get(Field<T>{field.offset}), Get(Field<std::uint32_t>{field.offset + 4})};
  }
  double RealAt(std::size_t offset) const { return Get(Field<double>{offset}); }
  // The same as a little-endian number.
  double LittleEndianRealAt(std::size_t offset) const;
  // The bytes from `offset` up to a NUL or the end; empty behind the end.
  std::string_view TextAt(std::size_t offset) const;

  // Every refusal names the file, this chunk's place and path, and the reason. Throws CompositionError.
  [[noreturn]] void Refuse(const std::string& reason) const;

 private:
  std::uint64_t Number(std::size_t offset, std::size_t bytes) const;

  const ChunkDocument* document_;
  Tag id_;
  Tag kind_;
  std::size_t offset_; // of the data, behind the kind of a list
  std::size_t size_;   // of the data from there
};

// A file as chunks. `bytes` begin with the header of the binary form.
class ChunkDocument
{
 public:
  // Where the chunks of another form stood there, in the order of their places here.
  using Places = std::vector<std::pair<std::size_t, std::size_t>>; // offset here, offset there

  // A binary file. The bytes must outlive the document. Throws CompositionError when they are no project.
  ChunkDocument(std::string name, std::string_view bytes);
  // Chunks made of a text, whose lines stand in messages.
  ChunkDocument(std::string name, std::string bytes, Places places, std::string_view text);
  ChunkDocument(const ChunkDocument&) = delete;
  ChunkDocument& operator=(const ChunkDocument&) = delete;

  const std::string& Name() const { return name_; }
  std::string_view Bytes() const { return bytes_; }
  // What holds the chunks of the top.
  Chunk Root() const;
  // All refusals pass through here. `offset` lies in these bytes.
  [[noreturn]] void Refuse(std::size_t offset, const std::string& reason) const;

 private:
  void CheckHeader() const;
  std::string Place(std::size_t offset) const;
  std::string Path(std::size_t offset) const;

  std::string name_;
  std::string owned_;
  std::string_view bytes_;
  Places places_;
  std::string_view text_;
};

class ChunkRange
{
 public:
  ChunkRange(const ChunkDocument& document, std::size_t begin, std::size_t end)
      : document_(&document), begin_(begin), end_(end)
  {}

  struct End
  {};

  class Iterator
  {
   public:
    Iterator(const ChunkDocument& document, std::size_t at, std::size_t end) : document_(&document), at_(at), end_(end)
    {
      Read();
    }
    const Chunk& operator*() const { return *chunk_; }
    const Chunk* operator->() const { return &*chunk_; }
    Iterator& operator++()
    {
      at_ = next_;
      Read();
      return *this;
    }
    friend bool operator==(const Iterator& iterator, End) { return !iterator.chunk_; }

   private:
    void Read();

    const ChunkDocument* document_;
    std::size_t at_;
    std::size_t end_;
    std::size_t next_ = 0;
    std::optional<Chunk> chunk_;
  };

  Iterator begin() const { return {*document_, begin_, end_}; }
  End end() const { return {}; }

 private:
  const ChunkDocument* document_;
  std::size_t begin_;
  std::size_t end_;
};

} // namespace host::projects
