// Compares two scene files value by value, apart from what differs between two runs or two machines.
#pragma once

#include <algorithm>
#include <cmath>
#include <cstring>
#include <map>
#include <string>
#include <vector>

#include "support/temp_folder.h"
#include "tools/q7r/scene_file.h"
#include "torvane/stream/stream_walker.h"

namespace scene_comparison
{

// The C libraries of two systems differ in the last bit of a sine.
inline bool IsNear(double a, double b)
{
  return a == b || std::abs(a - b) <= 1e-12 * std::max(std::abs(a), std::abs(b));
}

// Dates are Julian days, with the bits of a double in a whole number. Two files of one day's work are meant.
inline bool IsDate(std::int64_t integer)
{
  double day = 0;
  std::memcpy(&day, &integer, sizeof day);
  return day > 2451544 && day < 2561118; // from 2000 to 2299
}

inline std::string LastComponent(const std::string& path)
{
  const std::size_t separator = path.find_last_of("/\\");
  return separator == std::string::npos ? path : path.substr(separator + 1);
}

// A scene file with the bytes behind its values.
class Scene
{
 public:
  explicit Scene(const std::string& path) : bytes_(ReadWholeFile(path)) { walker_.Open(q7r::ToFilename(path)); }

  bool Next()
  {
    const bool found = walker_.Next(value_);
    chunk_ = q7r::ToUtf8(walker_.GetPathText());
    return found;
  }
  const _torvane_::StreamValue& Value() const { return value_; }
  const std::string& Chunk() const { return chunk_; }
  // A block with its tag and its length, which stands in front of it.
  std::vector<std::uint8_t> Bytes() const
  {
    const auto start = bytes_.begin() + static_cast<std::ptrdiff_t>(value_.offset);
    const std::ptrdiff_t head = value_.tag == _torvane_::kTagLargeMemory ? 9 : 5;
    std::ptrdiff_t length = 0;
    for (std::ptrdiff_t i = 1; i < head; ++i)
      length = length << 8 | start[i];
    return {start, start + head + length};
  }
  std::string Place() const { return "byte " + std::to_string(value_.offset) + " in chunk " + chunk_; }

 private:
  std::vector<std::uint8_t> bytes_;
  _torvane_::StreamWalker walker_;
  _torvane_::StreamValue value_;
  std::string chunk_;
};

// The markers of nodes are random, and what links lead to is counted through the process. The two files have other
// identifiers, but must have the same one in the same places.
class Identifiers
{
 public:
  // Whether the values hold identifiers that stand for one another.
  bool Match(const _torvane_::StreamValue& a, const _torvane_::StreamValue& b)
  {
    const std::string idA = IdOf(a);
    const std::string idB = IdOf(b);
    return KindOf(a) == KindOf(b) && toB_.try_emplace(idA, idB).first->second == idB &&
           toA_.try_emplace(idB, idA).first->second == idA;
  }

  static bool IsOne(const _torvane_::StreamValue& value)
  {
    return value.tag == _torvane_::kTagMemory &&
           (value.size == kMarkerSize ||
            (value.size == 14 && (KindOf(value) == "agoal1" || KindOf(value) == "alias2")));
  }

 private:
  // A marker is nothing but the identifier; those of links stand behind a word of six letters.
  static constexpr std::int64_t kMarkerSize = 16;
  static constexpr std::ptrdiff_t kWordSize = 6;

  static std::string KindOf(const _torvane_::StreamValue& value)
  {
    return value.size == kMarkerSize ? "" : std::string(value.head, value.head + kWordSize);
  }
  static std::string IdOf(const _torvane_::StreamValue& value)
  {
    return {value.head + (value.size == kMarkerSize ? 0 : kWordSize), value.head + value.headCount};
  }

  std::map<std::string, std::string> toA_;
  std::map<std::string, std::string> toB_;
};

inline bool IsSameValue(const Scene& sceneA, const Scene& sceneB, Identifiers& identifiers)
{
  const _torvane_::StreamValue& a = sceneA.Value();
  const _torvane_::StreamValue& b = sceneB.Value();
  if (a.tag != b.tag || sceneA.Chunk() != sceneB.Chunk())
    return false;
  if (a.tag == _torvane_::kTagChunkStart)
    return a.chunk.id == b.chunk.id && a.chunk.level == b.chunk.level;
  if (a.tag == _torvane_::kTagFilename)
    return LastComponent(q7r::ToUtf8(a.text)) == LastComponent(q7r::ToUtf8(b.text));
  if (a.tag == _torvane_::kTagString)
    return a.text == b.text;
  if (Identifiers::IsOne(a) && Identifiers::IsOne(b))
    return identifiers.Match(a, b);
  if (a.tag >= _torvane_::kTagMemory)
    return a.size == b.size && sceneA.Bytes() == sceneB.Bytes();
  return std::equal(a.reals, a.reals + a.realCount, b.reals, b.reals + b.realCount, IsNear) &&
         (a.integer == b.integer || (a.tag == _torvane_::kTagLLong && IsDate(a.integer) && IsDate(b.integer)));
}

// Where the first difference is; empty if there is none. `count` receives how many values were compared.
inline std::string FirstDifference(const std::string& pathA, const std::string& pathB, int& count)
{
  Scene a(pathA), b(pathB);
  Identifiers identifiers;
  for (count = 0;; ++count) {
    const bool moreInA = a.Next();
    if (moreInA != b.Next())
      return (moreInA ? pathA : pathB) + " goes on with " + (moreInA ? a : b).Place();
    if (!moreInA)
      return {};
    if (!IsSameValue(a, b, identifiers))
      return std::string(_torvane_::GetValueTagName(a.Value().tag)) + " at " + a.Place() + " against " +
             _torvane_::GetValueTagName(b.Value().tag) + " at " + b.Place();
  }
}

} // namespace scene_comparison
