// One key of an animated value: a time, a value and two tangents.
#pragma once

#include "torvane/nodes/base_list.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/time/base_time.h"

namespace _torvane_
{

class CCurve;
struct PlainKey;

// How a curve runs from one key to the next.
inline constexpr Long kInterpolationSpline = 1;
inline constexpr Long kInterpolationLinear = 2;
inline constexpr Long kInterpolationStep = 3;

// Parameters of a key. The node bits that stand behind its switches are listed in ckey.cpp.
inline constexpr Long kKeyTime = 901;
inline constexpr Long kKeyLeftTime = 911;
inline constexpr Long kKeyRightTime = 912;
inline constexpr Long kKeyLeftValue = 913;
inline constexpr Long kKeyRightValue = 914;
inline constexpr Long kKeyInterpolation = 924;

// Node bits of a key that its curve looks at, and the same as masks of GetNBit(-2).
inline constexpr Long kKeyBitClamp = 41;
inline constexpr Long kKeyBitAutomatic = 46;
inline constexpr ULong kKeyMaskClamp = 0x200;       // flat tangents at a turning point or beside an equal value
inline constexpr ULong kKeyMaskAutomatic = 0x4000;  // tangents follow the neighbours
inline constexpr ULong kKeyMaskZeroValue = 0x10000; // the tangents' value parts are zero
inline constexpr ULong kKeyMaskZero = 0x20000;      // the tangents are zero

// What a key has besides its time and its data, which are copied, compared and reset in one piece.
class KeyShape
{
 public:
  bool operator==(const KeyShape&) const = default;

 protected:
  Real value_ = 0.0;
  Real leftValue_ = 0.0;
  Real rightValue_ = 0.0;
  BaseTime leftTime_;
  BaseTime rightTime_;
  Long interpolation_ = kInterpolationSpline;
};

class CKey : public BaseList2D, protected KeyShape
{
 public:
  static constexpr NodeKindOf<CKey> kNodeKind{"key", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  CKey();
  ~CKey() override;

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;
  GeListNode* MakeClone(ULong flags, TransArray* translation) override;
  Bool ChangeNBit(Long bit, Long mode) override;
  void RemoveFromList() override; // takes the key out of its curve; the caller owns it then

  CKey* GetNext() const { return NodeCast<CKey>(BaseList2D::GetNext()); }

  const BaseTime& GetTime() const { return time_; }
  // A key that stands in a curve moves to its place there, before one of the same time; false, with nothing changed,
  // for a time at which a curve takes no keys.
  Bool SetTime(const BaseTime& time);
  // The curve that the key stands in, or null.
  CCurve* GetCurve() const;
  Real GetValue() const { return value_; }
  // The curve that holds the key is not looked at; an equal value isn't stored again.
  void SetValue(CCurve* curve, Real value);
  // A value that isn't a number, for tracks that hold such values. Stored only when it differs.
  void SetGeData(CCurve* curve, const GeData& data);
  const GeData& GetGeData() const { return keyData_; }
  Long GetInterpolation() const { return interpolation_; }
  void SetInterpolation(CCurve* curve, Long type);

  // Offsets of the tangents from the key.
  const BaseTime& GetLeftTime() const { return leftTime_; }
  const BaseTime& GetRightTime() const { return rightTime_; }
  Real GetLeftValue() const { return leftValue_; }
  Real GetRightValue() const { return rightValue_; }
  void SetLeft(const BaseTime& time, Real value);
  void SetRight(const BaseTime& time, Real value);

  // Everything but the time goes back to its default.
  void Reset();
  // All fields and the data are equal.
  Bool IsEqual(const CKey& other) const;

  // The key as a row of its curve; false for a key that has more than a row holds, or a time at which a curve takes no
  // keys.
  Bool ToPlain(PlainKey& key) const;
  // Takes all that a row holds. For a key that stands in no curve.
  void FromPlain(const PlainKey& key);

 private:
  friend class CCurve; // sets the time of a key that it moves
  friend struct ChunkFields<CKey>;

  BaseTime time_;
  GeData keyData_;
};

} // namespace _torvane_
