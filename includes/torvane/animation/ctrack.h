// A track: binds one parameter of a node to a curve, and special kinds of track to more curves.
#pragma once

#include "torvane/animation/ccurve.h"
#include "torvane/stream/chunk_fields.h"

namespace _torvane_
{

// What a track drives.
inline constexpr Long kTrackValue = 1;  // a Real
inline constexpr Long kTrackData = 2;   // a value of another type
inline constexpr Long kTrackPlugin = 3; // whatever a node of disk type 5353 makes of it

// Parameters of a track.
inline constexpr Long kTrackFlagA = 904; // the opposite of a node bit
inline constexpr Long kTrackFlagB = 905;
inline constexpr Long kTrackLink = 909;
inline constexpr Long kTrackBefore = 910;
inline constexpr Long kTrackAfter = 911;

inline constexpr Long kCurveFirst = 2; // numbers of the extra curves
inline constexpr Long kCurveLast = 10;

// What a track has besides its curves and its link: a copy takes it over in one piece.
class TrackSettings
{
 protected:
  static constexpr Long kExtraNumbers = 4;

  ParameterPath path_;
  Long before_ = 1;
  Long after_ = 1;
  Long id_ = -1;
  ULong extra_[kExtraNumbers] = {~0U, ~0U, ~0U, ~0U};
  Long kind_ = 0;
};

class CTrack : public BaseList2D, protected TrackSettings
{
 public:
  static constexpr NodeKindOf<CTrack> kNodeKind{"track", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  CTrack();
  ~CTrack() override;

  // A new track for a parameter of `node`, which the caller owns and puts into the node's list. Null for a null node,
  // an empty path and when memory is short.
  static CTrack* Alloc(BaseList2D* node, const ParameterPath& path, const String& name);

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;

  CTrack* GetNext() const { return NodeCast<CTrack>(BaseList2D::GetNext()); }

  // The curve of a number from 2 to 10; any other number gives the main curve. With `create` a missing one is made.
  CCurve* GetCurve(Long number, Long create);
  // Sets path and kind for a parameter of `node`. False for a path that can't be driven (an empty one).
  Bool InitPath(BaseList2D& node, const ParameterPath& path);

  const ParameterPath& GetPath() const { return path_; }
  Long GetKind() const { return kind_; }
  Long GetBefore() const { return before_; }
  Long GetAfter() const { return after_; }

 protected:
  GeListNode* MakeEmpty() const override { return NewObj<CTrack>(); }

 private:
  friend struct ChunkFields<CTrack>;

  void WriteCurves(HyperFile& file);
  Bool ReadCurves(HyperFile& file, Long level);
  Bool ReadOldCurves(HyperFile& file);
  static Bool ReadCurve(HyperFile& file, CCurve*& curve);
  CCurve** SlotOf(Long number);

  static constexpr Long kExtraCurves = 9;

  CCurve curve_;
  CCurve* extraCurves_[kExtraCurves] = {}; // owned, made on demand
  GeAliasLink trackLink_;
};

} // namespace _torvane_
