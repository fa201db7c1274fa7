// Values of custom types: what a GeData of a type id from 1000000 points at.
#pragma once

#include "torvane/memory/memory.h"
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
  virtual ~CustomData() = default;

  virtual Long GetTypeId() const = 0;
  // The level of the chunk that this value writes.
  virtual Long GetChunkLevel() const = 0;
  // `other` is of the same type.
  virtual Bool IsEqual(const CustomData& other) const = 0;
  // Makes `destination`, of the same type, equal to this value. False when memory is short: the destination then is
  // valid but may hold a part.
  virtual Bool CopyTo(CustomData& destination, TransArray* translation) const = 0;
  // Reads the body of the value's chunk at `level` and the chunk's end.
  virtual Bool Read(HyperFile& file, Long level) = 0;
  // Writes the body; the caller writes the chunk around it.
  virtual void Write(HyperFile& file) const = 0;
  // A part of the value by the path below the value's own level. False for a part that the value hasn't.
  virtual Bool GetParameter(const ParameterPath& path, GeData& value) const;
  virtual Bool SetParameter(const ParameterPath& path, const GeData& value);
};

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

// A value whose inner form the library doesn't interpret: it keeps the bytes and the level that it was read with.
class OpaqueCustomData : public CustomData
{
 public:
  explicit OpaqueCustomData(const CustomDataType& type) : type_(type) { body_.SetLevel(type.level); }

  Long GetTypeId() const override { return type_.id; }
  Long GetChunkLevel() const override { return body_.GetLevel(); }
  Bool IsEqual(const CustomData& other) const override;
  Bool CopyTo(CustomData& destination, TransArray* translation) const override;
  Bool Read(HyperFile& file, Long level) override;
  void Write(HyperFile& file) const override;

 protected:
  const CustomDataType& type_;
  RawChunkBody body_;
};

inline constexpr Long kCustomGradient = 1000481;
inline constexpr Long kCustomThreeNumbers = 1009369;
inline constexpr Long kCustomJointTree = 1024869;
inline constexpr Long kCustomUnitScale = 200000275;

// Type 200000275: a length unit with a factor.
class UnitScaleData : public OpaqueCustomData
{
 public:
  explicit UnitScaleData(const CustomDataType& type) : OpaqueCustomData(type) {}

  Bool IsEqual(const CustomData& other) const override;
  Bool CopyTo(CustomData& destination, TransArray* translation) const override;
  // A body of another form than scale and unit is kept as bytes and leaves both at their defaults.
  Bool Read(HyperFile& file, Long level) override;
  void Write(HyperFile& file) const override;

  Real scale = 1.0;
  Long unit = 3;

 private:
  Bool TakeBody();
};

// Type 1009369: three numbers without a meaning of their own here.
class ThreeNumbersData : public CustomData
{
 public:
  explicit ThreeNumbersData(const CustomDataType& type) : type_(type) {}

  Long GetTypeId() const override { return type_.id; }
  Long GetChunkLevel() const override { return type_.level; }
  Bool IsEqual(const CustomData& other) const override;
  Bool CopyTo(CustomData& destination, TransArray* translation) const override;
  Bool Read(HyperFile& file, Long level) override;
  void Write(HyperFile& file) const override;

  Long first = 0;
  Long second = 0;
  Bool third = false;

 private:
  template <class Visitor, class Numbers>
  static void VisitBody(Visitor& visitor, Numbers& numbers);

  const CustomDataType& type_;
};

} // namespace _torvane_
