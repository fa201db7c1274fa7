// The address of a parameter: one or more levels from a node's parameter down to a part of its value.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/types.h"

namespace _torvane_
{

class HyperFile;

// Kinds of value, as a GeData names its type and a path level its data type.
inline constexpr Long kDataNil = 0;
inline constexpr Long kDataColorAlias = 3; // becomes kDataVector
inline constexpr Long kDataGroup = 5;      // a path level that steps into a nested container
inline constexpr Long kDataStringAlias1 = 7;
inline constexpr Long kDataStringAlias2 = 12;
inline constexpr Long kDataPointer = 14;
inline constexpr Long kDataLong = 15;
inline constexpr Long kDataReal = 19;
inline constexpr Long kDataTime = 22;
inline constexpr Long kDataVector = 23;
inline constexpr Long kDataMatrix = 25;
inline constexpr Long kDataLLong = 26;
inline constexpr Long kDataOldMemory = 128; // in old files only: passed over
inline constexpr Long kDataString = 130;
inline constexpr Long kDataFilename = 131;
inline constexpr Long kDataContainer = 132;
inline constexpr Long kDataLink = 133;
inline constexpr Long kDataRawBlock = 256;
inline constexpr Long kDataUnknown = 257;
inline constexpr Long kDataBoolAlias = 400006001; // becomes kDataLong
inline constexpr Long kDataFirstCustom = 1000000;

// Components of a Vector parameter, as the id of the level below it.
inline constexpr Long kVectorX = 1000;
inline constexpr Long kVectorY = 1001;
inline constexpr Long kVectorZ = 1002;

struct ParameterLevel
{
  Long id = 0;
  Long dtype = 0;
  Long creator = 0;

  // Equal ids, and data types and creators that are equal or of which one is zero.
  constexpr Bool Matches(const ParameterLevel& other) const
  {
    return id == other.id && (dtype == other.dtype || dtype == 0 || other.dtype == 0) &&
           (creator == other.creator || creator == 0 || other.creator == 0);
  }
  constexpr Bool operator==(const ParameterLevel& other) const = default; // no wildcards
};

class ParameterPath
{
 public:
  ParameterPath() = default;
  ParameterPath(Long id) : ParameterPath(ParameterLevel{id, 0, 0}) {} // NOLINT: an id is a path of one level
  explicit ParameterPath(ParameterLevel first);
  ParameterPath(ParameterLevel first, ParameterLevel second);
  ParameterPath(ParameterLevel first, ParameterLevel second, ParameterLevel third);
  ParameterPath(const ParameterPath& other);
  ParameterPath(ParameterPath&& other) noexcept;
  ParameterPath& operator=(const ParameterPath& other);
  ParameterPath& operator=(ParameterPath&& other) noexcept;
  ~ParameterPath();

  // Level `index`; out of range gives a level of three zeros. -1 gives the last level whose id is not zero, or level 0
  // if there is none.
  const ParameterLevel& operator[](Long index) const;
  // The number of leading levels with a non-zero id.
  Long GetLevelCount() const;
  // The number of levels that are stored, zero ids included.
  Long GetStoredCount() const { return count_; }
  // Appends a level; false when memory is short.
  Bool Append(const ParameterLevel& level);
  void Clear();
  // The path without its first `count` levels: how a value's own parameter is addressed.
  ParameterPath WithoutFirst(Long count) const;

  // Levels match one by one, with zero as a wildcard for data type and creator, up to and including the first level of
  // `other` whose id is zero.
  Bool operator==(const ParameterPath& other) const;
  // The same without wildcards.
  Bool IsExactly(const ParameterPath& other) const;

  // Chunk (1, 2): the count, and for each level its id, data type and creator.
  Bool Write(HyperFile& file) const;
  // Reads the chunk with its start; older levels hold fewer values. Fails on another chunk id.
  Bool Read(HyperFile& file);

 private:
  const ParameterLevel* Levels() const { return heap_ ? heap_ : inline_; }
  ParameterLevel* Levels() { return heap_ ? heap_ : inline_; }
  ParameterLevel* LevelsForWriting(Long count);

  // Paths are one to three levels deep nearly always: those need no memory of their own.
  static constexpr Long kInline = 3;
  static constexpr Long kMaxLevels = 1 << 24;
  ParameterLevel inline_[kInline];
  ParameterLevel* heap_ = nullptr; // owned; null while the levels are inline
  Long count_ = 0;
  Long capacity_ = kInline;
};

} // namespace _torvane_
