// A curve: keys in ascending time, with their evaluation.
#pragma once

#include "torvane/animation/ckey.h"

namespace _torvane_
{

// How CCurve::FindKey answers when no key stands at the time.
inline constexpr Long kFindExact = 0;
inline constexpr Long kFindBefore = 1; // the key before
inline constexpr Long kFindAfter = 2;  // the key after

// The tangents of a key as its curve uses them: offsets from the key, in seconds and in value.
struct KeyTangents
{
  Real leftTime = 0.0;
  Real leftValue = 0.0;
  Real rightTime = 0.0;
  Real rightValue = 0.0;
};

class CCurve : public BaseList2D
{
 public:
  static constexpr NodeKindOf<CCurve> kNodeKind{"curve", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  CCurve() { keyRoot_.SetOwner(this); }
  ~CCurve() override = default;

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;

  // The key at `time`, made if there is none; a key that is there is reset to its defaults. Null for a time beyond
  // 10000 seconds either way and when memory is short. `index`, if given, is the key's place, or -1.
  CKey* AddKey(const BaseTime& time, Long* index = nullptr);
  // Puts a key in its place; the curve then owns it. A key that already stands at that time is reset and given back
  // instead: `key` then stays the caller's. Null when memory is short: the same.
  CKey* InsertKey(CKey* key, Long* index = nullptr);
  // Binary search. `index` gets the key's place, or -1.
  CKey* FindKey(const BaseTime& time, Long* index = nullptr, Long mode = kFindExact) const;
  Long GetKeyCount() const { return keys_.GetCount(); }
  CKey* GetKey(Long index) const; // null out of range
  // Removes and frees a key; false out of range.
  Bool DelKey(Long index);

  // The tangents that the key's bits ask for: stored, automatic, clamped or zero.
  KeyTangents GetTangents(Long index) const;
  // The curve's value at a time in seconds; 0 for a curve without keys.
  Real GetValue(Real time) const;
  Real GetValue(const BaseTime& time) const { return GetValue(time.Get()); }

 protected:
  GeListNode* MakeEmpty() const override { return NewObj<CCurve>(); }

 private:
  friend class CKey; // tells when it goes or changes its time

  Bool RebuildIndex();
  void ForgetKey(const CKey& key);
  Bool MoveKey(CKey& key, const BaseTime& time);
  Long PlaceOf(const BaseTime& time) const;
  KeyTangents AutomaticTangents(Long index) const;
  Bool IsClamped(Long index) const;

  // The keys in order, and the list that owns the same keys in the same order. Keys beyond the range of times that a
  // file held are in the list alone.
  GeToolDynArray keys_;
  RootCKey keyRoot_;
};

} // namespace _torvane_
