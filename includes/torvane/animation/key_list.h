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

// What every plain key has. A plain key is one without a name, parameters, data, links or anything else that most keys
// lack (BaseList2D::IsBare), and with the last word of its node bits 0.
struct KeyRow
{
  BaseTime time;
  Real value = 0.0;
  Long interpolation = kInterpolationSpline;
  ULong switches = 0; // node bits 32 to 63
};
static_assert(sizeof(KeyRow) <= 32);

struct KeyRowTangents
{
  BaseTime leftTime;
  BaseTime rightTime;
  Real leftValue = 0.0;
  Real rightValue = 0.0;
};

// What a key has as a node: nothing that a new one needs before it is written.
struct KeyRowNode
{
  NodeMarker marker = {};
  ULong info = 0;
  ULong nbits[2] = {0, 0}; // node bits 0 to 31 and 64 to 95
  ULong markerDrawn = 0;   // 1 once there is a marker
};
static_assert(sizeof(KeyRow) + sizeof(KeyRowNode) <= 64);

// All of a plain key.
struct PlainKey
{
  KeyRow row;
  KeyRowTangents tangents;
  KeyRowNode node;
};

// Rows in the order of the list. Tangents, and what keys have as nodes, take room only when a key of the list has any.
class KeyRows
{
 public:
  Long GetCount() const { return rows_.GetCount(); }
  const KeyRow& operator[](Long index) const { return rows_[index]; }
  PlainKey Get(Long index) const { return {rows_[index], At(tangents_, index), At(nodes_, index)}; }
  KeyRowTangents GetTangents(Long index) const { return At(tangents_, index); }
  // These are false, with nothing changed, when memory is short.
  Bool Set(Long index, const PlainKey& key);
  Bool Insert(Long index, const PlainKey& key);
  Bool Append(const KeyRow& row)
  {
    const Bool isBare = tangents_.GetCount() == 0 && nodes_.GetCount() == 0;
    return isBare ? rows_.Append(row) : Insert(GetCount(), {row, {}, {}});
  }
  // Makes room for `count` more.
  Bool ReserveMore(LLong count);
  Bool CopyTo(KeyRows& destination, ULong flags) const; // with the markers still to be drawn
  void Remove(Long index);
  void Flush();
  void Trim();

 private:
  // Parts that keys rarely have: as many as rows, or none.
  template <class Part>
  static Part At(const GeTempDynArray<Part>& parts, Long index)
  {
    return parts.GetCount() > 0 ? parts[index] : Part();
  }
  template <class Part>
  Bool Need(GeTempDynArray<Part>& parts, const Part& part);

  GeTempDynArray<KeyRow> rows_;
  GeTempDynArray<KeyRowTangents> tangents_;
  GeTempDynArray<KeyRowNode> nodes_;
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
