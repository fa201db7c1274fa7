// The keys of a curve as the list that owns them: as rows while they are plain and nobody asked for one as a node, else
// as nodes.
#pragma once

#include "torvane/animation/ckey.h"

namespace _torvane_
{

// A key by its values alone.
struct KeyValues
{
  BaseTime time;
  BaseTime leftTime; // the tangents: offsets from the key
  BaseTime rightTime;
  Real value = 0.0;
  Real leftValue = 0.0;
  Real rightValue = 0.0;
  Long interpolation = kInterpolationSpline;
  ULong switches = 0; // node bits 32 to 63, as GetNBit(-2) gives them: kKeyMaskAutomatic and the like
};

// All that a plain key has but for its tangents. A plain key is one without a name, parameters, data, links or anything
// else that most keys lack (BaseList2D::IsBare), and with the last word of its node bits 0.
struct KeyRow
{
  BaseTime time;
  Real value = 0.0;
  NodeMarker marker = {};
  ULong info = 0;
  ULong nbits[3] = {0, 0, 0};
  Long interpolation = kInterpolationSpline;
  Bool markerDrawn = false;
};
static_assert(sizeof(KeyRow) <= 64);

struct KeyRowTangents
{
  BaseTime leftTime;
  BaseTime rightTime;
  Real leftValue = 0.0;
  Real rightValue = 0.0;
};

// Rows in the order of the list. Tangents take room only when a key of the list has any.
class KeyRows
{
 public:
  Long GetCount() const { return rows_.GetCount(); }
  KeyRow& operator[](Long index) { return rows_[index]; }
  const KeyRow& operator[](Long index) const { return rows_[index]; }
  KeyRowTangents GetTangents(Long index) const
  {
    return tangents_.GetCount() > 0 ? tangents_[index] : KeyRowTangents();
  }
  // These are false, with nothing changed, when memory is short.
  Bool SetTangents(Long index, const KeyRowTangents& tangents);
  Bool Insert(Long index, const KeyRow& row, const KeyRowTangents& tangents);
  // Makes room for `count` more.
  Bool ReserveMore(LLong count);
  Bool CopyTo(KeyRows& destination, ULong flags) const; // with the markers still to be drawn
  void Remove(Long index);
  void Flush();
  void Trim()
  {
    rows_.Trim();
    tangents_.Trim();
  }

 private:
  GeTempDynArray<KeyRow> rows_;
  GeTempDynArray<KeyRowTangents> tangents_; // as many as rows, or none
};

class KeyList : public RootCKey
{
 public:
  static constexpr NodeKindOf<KeyList> kNodeKind{"key list", &RootList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  Bool EntersChunk(Long id) override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  Bool HasContent() const override { return GetRowCount() > 0 || RootCKey::HasContent(); }

  // There are rows only while the list has no nodes.
  Long GetRowCount() const { return rows_.GetCount(); }
  KeyRows& GetRows() { return rows_; }
  const KeyRows& GetRows() const { return rows_; }
  // Makes a node of each row. False when memory is short: the rows stay.
  Bool MakeNodes();

 protected:
  void WriteMembers(HyperFile& file) override;

 private:
  Bool TakeRecords(HyperFile& file);
  Bool ReadKey(HyperFile& file);

  KeyRows rows_;
};

} // namespace _torvane_
