// A curve: keys in ascending time, with their evaluation.
#pragma once

#include "torvane/animation/key_list.h"

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

// A curve holds its keys as rows of 32 to 64 bytes until somebody asks for one as a CKey; then all of them become
// nodes, of some hundred bytes each, and stay nodes. A pointer to a CKey is good until that key is deleted. Whoever has
// many keys to make or to look at takes SetKeyValues and GetKeyValues, which need no nodes.
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
  Long GetKeyCount() const { return keyRoot_.GetRowCount() + keys_.GetCount(); }
  CKey* GetKey(Long index) const; // null out of range and when memory is short
  // A key to look at, for which the curve's keys need not become nodes: the node if it is one, else `scratch`, which
  // then has all that the key holds and must stand in no curve. Null out of range.
  const CKey* PeekKey(Long index, CKey& scratch) const;
  // A key's values; false out of range.
  Bool GetKeyValues(Long index, KeyValues& values) const;
  // Puts a key with these values at its time, in place of one that stands there. False, with nothing changed, for a
  // time beyond 10000 seconds either way and when memory is short. `index`, if given, is the key's place, or -1.
  Bool SetKeyValues(const KeyValues& values, Long* index = nullptr);
  // The same for a key without tangents that mostly comes behind all others, as those of samples do.
  Bool SetKeyValue(const BaseTime& time, Real value, ULong switches);
  // Removes and frees a key; false out of range.
  Bool DelKey(Long index);
  // Makes room for `count` more keys, so that they aren't moved as they come; a curve whose keys are nodes needs none.
  // Trim gives back what room was not used.
  Bool Reserve(Long count) { return !keyRoot_.IsEmpty() || keyRoot_.GetRows().ReserveMore(count); }
  void Trim() { keyRoot_.GetRows().Trim(); }

  // The tangents that the key's bits ask for: stored, automatic, clamped or zero.
  KeyTangents GetTangents(Long index) const;
  // The curve's value at a time in seconds; 0 for a curve without keys.
  Real GetValue(Real time) const;
  Real GetValue(const BaseTime& time) const { return GetValue(time.Get()); }

 protected:
  GeListNode* MakeEmpty() const override { return NewObj<CCurve>(); }

 private:
  friend class CKey; // tells when it goes or changes its time

  Bool HasRows() const { return keyRoot_.GetRowCount() > 0; }
  Bool NeedNodes() const;
  Bool RebuildIndex() const;
  const BaseTime& TimeOf(Long index) const;
  Real ValueOf(Long index) const;
  CKey* NodeAt(Long index) const { return keys_[index]; }
  Bool SetNodeValues(Long place, const KeyValues& values, Bool isNew);
  Bool SetRowValues(Long place, const KeyValues& values, Bool isNew);
  void ForgetKey(const CKey& key);
  Bool MoveKey(CKey& key, const BaseTime& time);
  Long PlaceOf(const BaseTime& time) const;
  KeyTangents AutomaticTangents(Long index) const;
  Bool IsClamped(Long index) const;

  // The nodes in order, none while the keys are rows, and the list that owns the same keys in the same order. Nodes
  // beyond the range of times that a file held are in the list alone. Who asks for a node changes the form of what the
  // curve holds, but not what it holds.
  mutable GeTempDynArray<CKey*> keys_;
  mutable KeyList keyRoot_;
};

} // namespace _torvane_
