#include "k2v_file/stream/chunk_visitor.h"
#include "torvane/document/base_document.h"

namespace _torvane_
{

namespace
{

constexpr Long kMinFps = 1;
constexpr Long kMaxFps = 1000;
constexpr Long kLongDefaultFps = 30; // the rate at which a new document is three seconds long, not four

const BaseTime& EarliestTime()
{
  static const BaseTime time(-600.0, 1.0);
  return time;
}

} // namespace

DocumentPref::DocumentPref()
{
  maxTime_ = BaseTime(fps_ == kLongDefaultFps ? 3.0 : 4.0, 1.0);
  loopMin_ = minTime_;
  loopMax_ = maxTime_;
}

template <>
struct ChunkFields<DocumentPref>
{
  template <class Visitor>
  static Bool VisitBody(DocumentPref& pref, Visitor& v)
  {
    v.ConstantLong(0);
    v.Long(pref.fps_);
    v.Time(pref.minTime_);
    v.Time(pref.maxTime_);
    v.Time(pref.loopMin_);
    v.Time(pref.loopMax_);
    for (Bool& flag : pref.bools_)
      v.Bool(flag);
    if (v.Level() >= 1)
      v.Real(pref.real_);
    if (v.Level() >= 2)
      v.Bool(pref.lastBool_);
    if (v.Level() >= 3)
      v.ConstantBool(false);
    if (v.Level() >= 4)
      v.ConstantBool(false);
    return v.Good();
  }
};

void DocumentPref::WriteChunks(HyperFile& file)
{
  WriteChunk(file, kChunkDocumentPref, kLevelDocumentPref,
             [this](ChunkWriter& v) { return ChunkFields<DocumentPref>::VisitBody(*this, v); });
}

Bool DocumentPref::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (id != kChunkDocumentPref)
    return false;
  Bool read =
      ReadChunkBody(file, level, [this](ChunkReader& v) { return ChunkFields<DocumentPref>::VisitBody(*this, v); });
  if (minTime_ < EarliestTime())
    minTime_ = EarliestTime();
  return read;
}

Bool DocumentPref::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<DocumentPref>(&destination);
  if (!target)
    return false;
  static_cast<DocumentPrefValues&>(*target) = *this;
  return GeListNode::CopyTo(destination, flags, translation);
}

void DocumentPref::SetFps(Long fps) { fps_ = fps < kMinFps ? kMinFps : fps > kMaxFps ? kMaxFps : fps; }

void DocumentPref::BringIntoRange(BaseTime& time) const
{
  if (time < minTime_)
    time = minTime_;
  else if (time > maxTime_)
    time = maxTime_;
}

void DocumentPref::SetMinTime(const BaseTime& time)
{
  minTime_ = time < EarliestTime() ? EarliestTime() : time;
  if (maxTime_ < minTime_)
    maxTime_ = minTime_;
  BringIntoRange(loopMin_);
  BringIntoRange(loopMax_);
}

void DocumentPref::SetMaxTime(const BaseTime& time)
{
  maxTime_ = time < minTime_ ? minTime_ : time;
  BringIntoRange(loopMin_);
  BringIntoRange(loopMax_);
}

void DocumentPref::SetLoopMin(const BaseTime& time)
{
  loopMin_ = time;
  BringIntoRange(loopMin_);
}

void DocumentPref::SetLoopMax(const BaseTime& time)
{
  loopMax_ = time;
  BringIntoRange(loopMax_);
}

} // namespace _torvane_
