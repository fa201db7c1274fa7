// The keys of a curve as the list that owns them: as rows while they are plain and nobody asked for one as a node, else
// as nodes.
#pragma once

#include <cstring>

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
};
static_assert(sizeof(KeyRow) <= 24);

struct KeyRowTangents
{
  BaseTime leftTime;
  BaseTime rightTime;
  Real leftValue = 0.0;
  Real rightValue = 0.0;
};

// What most keys of a curve have in common.
struct KeyRowBits
{
  Long interpolation = kInterpolationSpline;
  ULong info = 0;
  ULong nbits[3] = {0, 0, 0}; // node bits 0 to 95
  ULong markerDrawn = 0;      // 1 once there is a marker: a new node needs none before it is written
};

// All of a plain key.
struct PlainKey
{
  KeyRow row;
  KeyRowTangents tangents;
  KeyRowBits bits;
  NodeMarker marker = {};
};

// One part of all rows. As long as it is the same in all of them it takes no room.
template <class Part>
class KeyParts
{
 public:
  Part Get(Long index) const { return each_.GetCount() > 0 ? each_[index] : common_; }
  Bool IsNew() const { return isNew_; } // all are as a new key has them
  Bool IsCommon(const Part& part) const { return each_.GetCount() == 0 && IsSame(part, common_); }

  // Makes ready for `part` to be put or inserted beside those of `rows` rows, with room for `capacity`. False, with
  // nothing changed, when memory is short.
  Bool Prepare(const Part& part, Long rows, Long capacity);
  void Put(Long index, const Part& part);
  void Insert(Long index, const Part& part, Long rows);
  void Remove(Long index) { each_.Remove(index); }
  // Changes all of them.
  template <class Change>
  void ForEach(Change&& change)
  {
    change(common_);
    for (Part& part : each_)
      change(part);
    isNew_ = each_.GetCount() == 0 && IsSame(common_, Part());
  }

  Bool Reserve(Long capacity) { return each_.GetCount() == 0 || each_.Reserve(capacity); }
  void Trim() { each_.Trim(); }
  void Flush();
  Bool CopyTo(KeyParts& destination) const;

 private:
  // By the bits, since what isn't kept must come back as it was.
  static Bool IsSame(const Part& a, const Part& b)
  {
    return std::memcmp(&a, &b, sizeof a) == 0; // NOLINT(bugprone-suspicious-memory-comparison)
  }

  Part common_ = {};
  GeTempDynArray<Part> each_; // empty while all are `common_`
  Bool isNew_ = true;
};

// Rows in the order of the list. Tangents, markers and bits take room only where the keys of the list differ in them.
class KeyRows
{
 public:
  Long GetCount() const { return rows_.GetCount(); }
  const KeyRow& operator[](Long index) const { return rows_[index]; }
  PlainKey Get(Long index) const { return {rows_[index], tangents_.Get(index), bits_.Get(index), markers_.Get(index)}; }
  KeyRowTangents GetTangents(Long index) const { return tangents_.Get(index); }
  KeyRowBits GetBits(Long index) const { return bits_.Get(index); }
  NodeMarker GetMarker(Long index) const { return markers_.Get(index); }
  // These are false, with nothing changed, when memory is short.
  Bool Set(Long index, const PlainKey& key);
  Bool Insert(Long index, const PlainKey& key);
  // A key without tangents behind all others.
  Bool Append(const KeyRow& row, const KeyRowBits& bits)
  {
    const Bool isRowAlone = GetCount() > 0 && tangents_.IsNew() && markers_.IsNew() && bits_.IsCommon(bits);
    return isRowAlone ? rows_.Append(row) : Insert(GetCount(), {row, {}, bits, {}});
  }
  // Makes room for `count` more.
  Bool ReserveMore(LLong count);
  // Gives a marker to each key that has none yet. False when memory is short.
  Bool DrawMarkers();
  Bool CopyTo(KeyRows& destination, ULong flags) const; // with the markers still to be drawn
  void Remove(Long index);
  void Flush();
  void Trim();

 private:
  Bool Prepare(const PlainKey& key);

  GeTempDynArray<KeyRow> rows_;
  KeyParts<KeyRowTangents> tangents_;
  KeyParts<KeyRowBits> bits_;
  KeyParts<NodeMarker> markers_;
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
