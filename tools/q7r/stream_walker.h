// Walks the values of a scene file one by one, whatever chunks they stand in.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "torvane/stream/hyper_file.h"

namespace q7r
{

struct ChunkPlace
{
  std::int32_t id;
  std::int32_t level;
};

// One value of the stream. Which members hold something follows from the tag.
struct StreamValue
{
  std::int64_t offset = 0; // of the tag byte
  std::uint8_t tag = 0;
  std::vector<double> reals;      // floats of all kinds, vectors, matrices, times
  std::int64_t integer = 0;       // whole numbers; the element type of an Array
  std::string text;               // String and Filename, UTF-8
  std::int64_t size = 0;          // bytes of Memory, Image and the legacy forms, elements of an Array
  std::vector<std::uint8_t> head; // the first bytes of Memory, Image and Array
  ChunkPlace chunk{};             // of a chunk start
};

class StreamWalker
{
 public:
  // Opens the file; throws Failure if it is no scene file.
  explicit StreamWalker(const std::string& path);

  // The next value; false behind the last one. Throws Failure, with the place, for a value that can't be read.
  bool Next(StreamValue& value);

  // The chunks that enclose the value that Next gave last; a chunk start isn't among its own.
  const std::vector<ChunkPlace>& Path() const { return path_; }
  std::int32_t Version() const { return file_.GetFileVersion(); }
  bool IsSinglePrecision() const { return file_.IsSinglePrecision(); }
  std::int64_t Length() const { return file_.GetLength(); }

 private:
  void ReadBody(StreamValue& value);
  void ReadReals(StreamValue& value, int count, bool floats);
  void ReadText(StreamValue& value);
  void ReadBlock(StreamValue& value);
  [[noreturn]] void Fail(const StreamValue& value, const std::string& what) const;

  std::string name_;
  _torvane_::HyperFile file_;
  std::vector<ChunkPlace> path_;
  bool pending_ = false; // the last value was a chunk start: its chunk encloses what follows
  ChunkPlace opened_{};
};

// The name of a value tag: "Long", "Vector", ...; "tag N" for one that no file should hold.
std::string TagName(std::uint8_t tag);

// "110059/110107/110100", outermost first; "-" outside all chunks.
std::string PathText(const std::vector<ChunkPlace>& path);

} // namespace q7r
