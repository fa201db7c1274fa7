// Values of custom types: what a GeData of a type id from 1000000 points at.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/nodes/node_kind.h"
#include "torvane/stream/raw_chunk_body.h"
#include "torvane/types.h"

namespace _torvane_
{

class GeData;
class HyperFile;
class ParameterPath;
class TransArray;

class CustomData : public GeMemory
{
 public:
  static constexpr NodeKindOf<CustomData> kNodeKind{"custom value", nullptr};
  // As that of a node: what NodeCast goes by.
  virtual const NodeKind& GetNodeKind() const { return kNodeKind; }

  virtual ~CustomData() = default;

  virtual Long GetTypeId() const = 0;
  // The level of the chunk that this value writes.
  virtual Long GetChunkLevel() const = 0;
  // Of a value of another class: false.
  virtual Bool IsEqual(const CustomData& other) const = 0;
  // Makes `destination` equal to this value. False for one of another class, and when memory is short: the destination
  // then is valid but may hold a part.
  virtual Bool CopyTo(CustomData& destination, TransArray* translation) const = 0;
  // Reads the body of the value's chunk at `level` and the chunk's end.
  virtual Bool Read(HyperFile& file, Long level) = 0;
  // Writes the body; the caller writes the chunk around it.
  virtual void Write(HyperFile& file) const = 0;
  // A part of the value by the path below the value's own level: true with kParameterAnswered in the flags. One that is
  // passed over gives true without it, an unknown one false.
  virtual Bool GetValue(const ParameterPath& path, GeData& value, ULong& flags) const;
  virtual Bool SetValue(const ParameterPath& path, const GeData& value, ULong& flags);

  // The same with an answer alone. False for a part that the value hasn't.
  Bool GetParameter(const ParameterPath& path, GeData& value) const;
  Bool SetParameter(const ParameterPath& path, const GeData& value);
};

inline constexpr ULong kParameterAnswered = 2;

// One row of the table of custom types.
struct CustomDataType
{
  Long id;
  Long level;                                      // the level that current files hold
  CustomData* (*make)(const CustomDataType& type); // a new value; null when memory is short
};

// A value of class T for the table.
template <class T>
CustomData* MakeCustomData(const CustomDataType& type)
{
  return NewObj<T>(type);
}

// The row of a type id, or null for a type that the library doesn't know.
const CustomDataType* FindCustomDataType(Long id);

// A value that takes its type and level from a row of the table.
class ListedCustomData : public CustomData
{
 public:
  explicit ListedCustomData(const CustomDataType& type) : type_(type) {}

  Long GetTypeId() const override { return type_.id; }
  Long GetChunkLevel() const override { return type_.level; }

 protected:
  const CustomDataType& type_;
};

// A value whose inner form the library doesn't interpret: it keeps the bytes and the level that it was read with.
class OpaqueCustomData : public ListedCustomData
{
 public:
  static constexpr NodeKindOf<OpaqueCustomData> kNodeKind{"opaque value", &CustomData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  explicit OpaqueCustomData(const CustomDataType& type) : ListedCustomData(type) { body_.SetEmpty(type.level); }

  Long GetChunkLevel() const override { return body_.GetLevel(); }
  Bool IsEqual(const CustomData& other) const override;
  Bool CopyTo(CustomData& destination, TransArray* translation) const override;
  Bool Read(HyperFile& file, Long level) override;
  void Write(HyperFile& file) const override;

 protected:
  RawChunkBody body_;
};

inline constexpr Long kCustomGradient = 1000481;
inline constexpr Long kCustomThreeNumbers = 1009369;
inline constexpr Long kCustomJointTree = 1024869;
inline constexpr Long kCustomUnitScale = 200000275;

// A length unit with a factor.
struct UnitScale
{
  Real scale = 1.0;
  Long unit = 3;

  bool operator==(const UnitScale&) const = default;
};

// Type 200000275.
class UnitScaleData : public OpaqueCustomData, public UnitScale
{
 public:
  static constexpr NodeKindOf<UnitScaleData> kNodeKind{"unit scale", &OpaqueCustomData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  explicit UnitScaleData(const CustomDataType& type) : OpaqueCustomData(type) {}

  Bool IsEqual(const CustomData& other) const override;
  Bool CopyTo(CustomData& destination, TransArray* translation) const override;
  // A body of another form than scale and unit is kept as bytes and leaves both at their defaults.
  Bool Read(HyperFile& file, Long level) override;
  void Write(HyperFile& file) const override;

 private:
  Bool TakeBody();
};

// Three numbers without a meaning of their own here.
struct ThreeNumbers
{
  Long first = 0;
  Long second = 0;
  Bool third = false;

  bool operator==(const ThreeNumbers&) const = default;
};

// Type 1009369.
class ThreeNumbersData : public ListedCustomData, public ThreeNumbers
{
 public:
  static constexpr NodeKindOf<ThreeNumbersData> kNodeKind{"three numbers", &CustomData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  explicit ThreeNumbersData(const CustomDataType& type) : ListedCustomData(type) {}

  Bool IsEqual(const CustomData& other) const override;
  Bool CopyTo(CustomData& destination, TransArray* translation) const override;
  Bool Read(HyperFile& file, Long level) override;
  void Write(HyperFile& file) const override;
};

} // namespace _torvane_
