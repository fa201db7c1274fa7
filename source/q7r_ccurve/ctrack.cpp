#include "torvane/animation/ctrack.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/nodes/node_tools.h"
#include "torvane/animation/animation_ids.h"

namespace _torvane_
{

namespace
{

constexpr Long kTimeTrackId = -1;
constexpr Long kLastPlainId = 10; // paths that begin above this number drive a Real

// Node bits behind the flag parameters, in word 0.
constexpr Long kBitFlagA = 17;
constexpr Long kBitFlagB = 18;

constexpr Long kAlwaysWritten = 3; // curves 2, 3 and 4 stand in every file

} // namespace

CTrack::CTrack() : BaseList2D(kLabelTrack) {}

CTrack::~CTrack()
{
  for (CCurve*& curve : extraCurves_)
    DeleteObj(curve);
}

CTrack* CTrack::Alloc(BaseList2D* node, const ParameterPath& path, const String& name)
{
  AllocationWatch watch;
  auto* track = node ? NewObj<CTrack>() : nullptr;
  if (!track)
    return nullptr;
  track->SetName(name);
  if (!track->InitPath(*node, path))
    DeleteObj(track);
  return watch.Whole(track);
}

Bool CTrack::InitPath(BaseList2D& node, const ParameterPath& path)
{
  kind_ = 0;
  id_ = -1;
  if (path[0].id == 0)
    return false;
  path_ = path;
  if (node.GetDiskType() == kDiskTypePluginNode) {
    kind_ = kTrackPlugin;
  } else if (path == ParameterPath(kTimeTrackId)) {
    path_ = ParameterPath(ParameterLevel{kTimeTrackId, kDataReal, 0});
    kind_ = kTrackValue;
    name_ = String("Time Track");
  } else if (path[0].id > kLastPlainId) {
    kind_ = kTrackValue;
  } else {
    kind_ = path[-1].dtype == kDataReal ? kTrackValue : kTrackData;
  }
  return true;
}

// Curves 9 and 10 are crossed in the store, and so in the file.
CCurve** CTrack::SlotOf(Long number)
{
  switch (number) {
  case 9:
    return &extraCurves_[8];
  case 10:
    return &extraCurves_[7];
  default:
    return &extraCurves_[number - kCurveFirst];
  }
}

CCurve* CTrack::GetCurve(Long number, Long create)
{
  if (number < kCurveFirst || number > kCurveLast)
    return &curve_;
  CCurve*& curve = *SlotOf(number);
  if (!curve && create)
    curve = NewObj<CCurve>();
  return curve;
}

void CTrack::WriteCurves(HyperFile& file)
{
  file.WriteChunkStart(kChunkCurves, kLevelCurves);
  curve_.WriteAsChunk(file, kChunkCurve);
  for (Long slot = 0; slot < kExtraCurves; ++slot) {
    CCurve* curve = extraCurves_[slot];
    if (slot >= kAlwaysWritten) {
      file.WriteBool(curve != nullptr);
    } else if (!curve) {
      CCurve empty;
      empty.WriteAsChunk(file, kChunkCurve);
    }
    if (curve)
      curve->WriteAsChunk(file, kChunkCurve);
  }
  file.WriteChunkEnd();
}

// Reads a curve chunk with its start into a slot.
Bool CTrack::ReadCurve(HyperFile& file, CCurve*& curve)
{
  Long id = 0;
  Long level = 0;
  if (!file.ExpectTag(kTagChunkStart) || !file.ReadChunkStart(id, level))
    return false;
  if (id != kChunkCurve) {
    file.SetError(FILEERROR_WRONG_VALUE);
    return false;
  }
  if (!curve)
    curve = NewObj<CCurve>();
  if (!curve) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  return curve->ReadChunkLoop(file, true);
}

Bool CTrack::ReadCurves(HyperFile& file, Long level)
{
  if (level < kLevelCurves)
    return ReadOldCurves(file);
  CCurve* main = &curve_;
  if (!ReadCurve(file, main))
    return false;
  for (Long slot = 0; slot < kExtraCurves; ++slot) {
    Bool present = slot < kAlwaysWritten;
    if (!present && !file.ReadBool(present))
      return false;
    if (present && !ReadCurve(file, extraCurves_[slot]))
      return false;
  }
  return file.SkipToEndChunk();
}

// Older chunks: curves 1 to 4 as far as they come, in order; whatever else stands there is passed over.
Bool CTrack::ReadOldCurves(HyperFile& file)
{
  Long next = 0;
  UChar tag = 0;
  while (file.ReadValueHeader(tag)) {
    if (tag == kTagChunkEnd)
      return true;
    if (tag != kTagChunkStart) {
      if (!file.SkipValue(tag))
        return false;
      continue;
    }
    Long id = 0;
    Long level = 0;
    if (!file.ReadChunkStart(id, level))
      return false;
    CCurve* curve = id == kChunkCurve && next <= kAlwaysWritten ? GetCurve(next + 1, 1) : nullptr;
    if (curve)
      ++next;
    if (!(curve ? curve->ReadChunkLoop(file, true) : file.SkipToEndChunk()))
      return false;
  }
  return false;
}

template <>
struct ChunkFields<CTrack>
{
  template <class Visitor>
  static Bool VisitSettings(CTrack& track, Visitor& v)
  {
    v.Long(track.before_);
    v.Long(track.after_);
    // Below &track level other things stood behind the two numbers.
    if (v.Level() < kLevelTrackSettings)
      return v.Good();
    v.Link(track.trackLink_);
    if constexpr (Visitor::kReading)
      v.Note(v.Good() && track.path_.Read(v.File()));
    else
      v.Note(v.Good() && track.path_.Write(v.File()));
    v.Long(track.kind_);
    for (ULong& number : track.extra_)
      v.LongInto(number);
    return v.Good();
  }
};

void CTrack::WriteChunks(HyperFile& file)
{
  BaseList2D::WriteChunks(file);
  WriteCurves(file);
  WriteChunk(file, kChunkTrackSettings, kLevelTrackSettings,
             [this](ChunkWriter& v) { return ChunkFields<CTrack>::VisitSettings(*this, v); });
}

Bool CTrack::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList2D::ReadChunk(file, id, level))
    return true;
  switch (id) {
  case kChunkCurves:
    return ReadCurves(file, level);
  case kChunkTrackSettings:
    return ReadChunkBody(file, level, [this](ChunkReader& v) { return ChunkFields<CTrack>::VisitSettings(*this, v); });
  default:
    return false;
  }
}

Bool CTrack::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<CTrack>(&destination);
  if (!target)
    return false;
  if (target == this)
    return true;
  const AllocationWatch watch;
  if (!BaseList2D::CopyTo(destination, flags, translation) ||
      !curve_.CopyWithTranslation(target->curve_, flags, translation))
    return false;
  for (Long slot = 0; slot < kExtraCurves; ++slot) {
    DeleteObj(target->extraCurves_[slot]);
    if (!extraCurves_[slot])
      continue;
    target->extraCurves_[slot] = NodeCast<CCurve>(extraCurves_[slot]->MakeClone(flags, translation));
    if (!target->extraCurves_[slot])
      return false;
  }
  if (!trackLink_.CopyLinkTo(&target->trackLink_, translation))
    return false;
  static_cast<TrackSettings&>(*target) = *this;
  return !watch.Failed();
}

Bool CTrack::GetParameter(const ParameterPath& path, GeData& value)
{
  switch (path[0].id) {
  case kTrackFlagA:
    value = GeData(GetNBit(kBitFlagA) == 0);
    return true;
  case kTrackFlagB:
    value = GeData(GetNBit(kBitFlagB) != 0);
    return true;
  case kTrackLink:
    value = GeData(trackLink_);
    return value.GetType() == kDataLink;
  case kTrackBefore:
    value = GeData(before_);
    return true;
  case kTrackAfter:
    value = GeData(after_);
    return true;
  default:
    return BaseList2D::GetParameter(path, value);
  }
}

Bool CTrack::SetParameter(const ParameterPath& path, const GeData& value)
{
  switch (path[0].id) {
  case kTrackFlagA:
    ChangeNBit(kBitFlagA, value.GetBool() ? 2 : 1);
    return true;
  case kTrackFlagB:
    ChangeNBit(kBitFlagB, value.GetBool() ? 1 : 2);
    return true;
  case kTrackLink:
    trackLink_.SetLink(value.GetLink());
    return trackLink_.GetLink() == value.GetLink();
  case kTrackBefore:
    before_ = value.GetLong();
    return true;
  case kTrackAfter:
    after_ = value.GetLong();
    return true;
  default:
    return BaseList2D::SetParameter(path, value);
  }
}

} // namespace _torvane_
