#include "torvane/objects/light_object_data.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/nodes/node_tools.h"
#include "q7r_file/types/object_data_makers.h"
#include "torvane/objects/base_object.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

namespace
{

constexpr Long kLevelLeast = 5;

// Entries of the light's object.
constexpr Long kKeyMapSize = 100006;

constexpr Long kOldRecordCount = 5;
constexpr Real kOldSmallestMap = 16.0;
constexpr Real kOldLargestMap = 2147483647.0;
constexpr Real kOldMapFactor = 100.0;

// True when the next value has this tag; the stream stays where it is.
Bool NextTagIs(HyperFile& file, UChar tag)
{
  BaseFile& bytes = file.GetFile();
  if (const UChar* next = bytes.ReadWindow(1))
    return *next == tag;
  UChar next = 0;
  return bytes.ReadBytes(&next, 1, true) == 1 && bytes.Seek(-1, kSeekRelative) && next == tag;
}

// Tells whether the values that came with `level`, of which the first has `tag`, stand here. A chunk below level 5 may
// still hold all that level 5 has: it does when that tag is the next one, as nothing else has it at these places.
template <class Visitor>
Bool HoldsLevel(Visitor& v, Long level, [[maybe_unused]] UChar tag)
{
  if (v.Level() >= level)
    return true;
  if constexpr (Visitor::kReading)
    return level <= kLevelLeast && v.Good() && NextTagIs(v.File(), tag);
  return false;
}

template <class Visitor>
void VisitKnot(Visitor& v, LightKnot& knot)
{
  v.Real(knot.position);
  v.Real(knot.value);
  v.Vector(knot.color);
  v.Long(knot.mode);
}

Long ClampKnotCount(Long count) { return count < 0 ? 0 : count > kMaxLightKnots ? kMaxLightKnots : count; }

} // namespace

// The factor of a shadow map's size, which old files hold in the place of the size itself.
struct LightObjectData::OldFactor
{
  Bool present = false;
  Real value = 0.0;
};

LightObjectData::LightObjectData()
{
  for (const LightParameterRange& range : kLightParameters) {
    for (Long id = range.first; id <= range.last; ++id) {
      const LightSlot slot = FindLightSlot(id);
      switch (slot.kind) {
      case LightKind::kLong:
        settings_.longs[slot.index] = static_cast<Long>(range.number);
        break;
      case LightKind::kReal:
        settings_.reals[slot.index] = range.number;
        break;
      case LightKind::kBool:
        settings_.bools[slot.index] = range.number != 0.0;
        break;
      case LightKind::kVector:
        settings_.vectors[slot.index] = Vector(range.number, range.number, range.number);
        break;
      case LightKind::kNone:
        break;
      }
    }
  }
}

LightObjectData::~LightObjectData() { DeleteObj(iesLight_); }

NodeData* MakeLightObjectData() { return NewObj<LightObjectData>(); }

void LightObjectData::AdoptIES(IESLight* light)
{
  if (light == iesLight_)
    return;
  DeleteObj(iesLight_);
  iesLight_ = light;
}

Bool LightObjectData::GetParameter(const ParameterPath& path, GeData& value)
{
  const LightSlot slot = FindLightSlot(path[0].id);
  switch (slot.kind) {
  case LightKind::kLong:
    value = GeData(settings_.longs[slot.index]);
    return true;
  case LightKind::kReal:
    value = GeData(settings_.reals[slot.index]);
    return true;
  case LightKind::kBool:
    value = GeData(settings_.bools[slot.index]);
    return true;
  case LightKind::kVector:
    return GetVectorParameter(settings_.vectors[slot.index], path, value);
  default:
    return NodeData::GetParameter(path, value);
  }
}

Bool LightObjectData::SetParameter(const ParameterPath& path, const GeData& value)
{
  const LightSlot slot = FindLightSlot(path[0].id);
  switch (slot.kind) {
  case LightKind::kLong:
    settings_.longs[slot.index] = path[0].id == kLightKnotCount ? ClampKnotCount(value.GetLong()) : value.GetLong();
    return true;
  case LightKind::kReal:
    settings_.reals[slot.index] = value.GetReal();
    return true;
  case LightKind::kBool:
    settings_.bools[slot.index] = value.GetBool();
    return true;
  case LightKind::kVector:
    return SetVectorParameter(settings_.vectors[slot.index], path, value);
  default:
    return NodeData::SetParameter(path, value);
  }
}

template <Long id>
Real& LightObjectData::RealOf()
{
  constexpr LightSlot kSlot = FindLightSlot(id);
  static_assert(kSlot.kind == LightKind::kReal);
  return settings_.reals[kSlot.index];
}

template <Long id>
Long& LightObjectData::LongOf()
{
  constexpr LightSlot kSlot = FindLightSlot(id);
  static_assert(kSlot.kind == LightKind::kLong);
  return settings_.longs[kSlot.index];
}

template <Long id, class Visitor>
void LightObjectData::VisitField(Visitor& v)
{
  constexpr LightSlot kSlot = FindLightSlot(id);
  static_assert(kSlot.kind != LightKind::kNone, "no parameter has this id");
  if constexpr (kSlot.kind == LightKind::kLong)
    v.Long(settings_.longs[kSlot.index]);
  else if constexpr (kSlot.kind == LightKind::kReal)
    v.Real(settings_.reals[kSlot.index]);
  else if constexpr (kSlot.kind == LightKind::kBool)
    v.Bool(settings_.bools[kSlot.index]);
  else
    v.Vector(settings_.vectors[kSlot.index]);
}

template <Long... ids, class Visitor>
void LightObjectData::VisitFields(Visitor& v)
{
  (VisitField<ids>(v), ...);
}

// The records that kLightKnotCount counts. What a file holds beyond the places for them is dropped.
template <class Visitor>
void LightObjectData::VisitKnots(Visitor& v)
{
  Long& count = LongOf<kLightKnotCount>();
  for (Long i = 0; i < count && v.Good(); ++i) {
    LightKnot beyond;
    VisitKnot(v, i < kMaxLightKnots ? settings_.knots[i] : beyond);
  }
  count = ClampKnotCount(count);
}

template <class Visitor>
void LightObjectData::VisitFirstGroups(Visitor& v)
{
  const Bool oldest = v.VersionBelow(kVersionNodeHeader);
  VisitFields<80002, 80003, 80000, 80001, kLightKnotCount, 80014, 80015, 80007, 80008, 80009, 80010>(v);
  if (oldest)
    v.template Skip<Real, Real, Vector, Long>();
  VisitKnots(v);
  if (oldest) {
    for (Long i = 0; i < kOldRecordCount; ++i)
      v.template Skip<Bool, Bool, Bool, Long, Long, Long, Real, Real, Real, Real, Real, Vector, Long>();
    for (Long i = 0; i < kOldRecordCount; ++i)
      v.template Skip<Real, Real, Vector, Long>();
  }
  VisitFields<80004, 80005, 80006, 80011, 80012>(v);

  VisitFields<50016, 50001, 50002>(v);
  v.ConstantReal(RealOf<50004>());
  VisitFields<50003, 50005, 50006, 50007, 50008, 50009, 50010, 50011, 50012, 50013>(v);

  VisitFields<60000, 60001, 60002>(v);
  v.ConstantReal(1.0);
  VisitFields<60004, 60005, 60006, 60007, 60008>(v);

  VisitFields<70000, 70001, 70002, 70003, 70004, 70005, 70006>(v);
  v.ConstantVector(Vector(1.0, 1.0, 1.0));
  v.ConstantVector(Vector(1.0, 1.0, 1.0));
  VisitFields<70009, 70028>(v);
  v.ConstantBool(true);
  v.ConstantBool(true);
  VisitFields<70023>(v);
  v.ConstantBool(false);
  for (Real number : {RealOf<70009>(), 10.0, 90.0, 100.0})
    v.ConstantReal(number);
  VisitFields<70019, 70020, 70021>(v);
}

template <class Visitor>
void LightObjectData::VisitMainGroup(Visitor& v)
{
  VisitFields<kLightColor, kLightBrightness, kLightType, kLightShadow, 90004, 90005>(v);
  VisitFields<90006, 90008, 90007, 90009>(v);
  VisitFields<kLightInnerAngle, kLightOuterAngle, 90012, 90013, 90014>(v);
  VisitFields<90015, 90016, 90017, 90018, 90019, 90020, 90021, 90022>(v);
  v.ConstantReal(RealOf<90022>());
  VisitFields<90024, 90025>(v);
  v.ConstantVector(Vector());
  VisitFields<90027, 90028, 90029, 90030, 90031, 90032>(v);
}

template <class Visitor>
void LightObjectData::VisitLaterGroups(Visitor& v, OldFactor& factor)
{
  if (HoldsLevel(v, 1, kTagBool)) {
    VisitFields<70022>(v);
    factor.value = RealOf<90032>();
    factor.present = v.Real(factor.value);
  } else {
    settings_.bools[FindLightSlot(70022).index] = true;
  }
  if (HoldsLevel(v, 2, kTagVector))
    VisitFields<60009, 60003, 50015>(v);
  if (HoldsLevel(v, 3, kTagBool)) {
    VisitFields<91000, 91003>(v);
    v.ConstantBool(false);
    VisitFields<91001, 91004, 91007, 91008, 91002, 91005, 91006>(v);
  }
  if (HoldsLevel(v, 4, kTagBool))
    VisitFields<90033>(v);
}

template <class Visitor>
void LightObjectData::VisitExtraBlock(Visitor& v)
{
  VisitKnot(v, settings_.extraBlock.head);
  for (LightExtraBlock::Layer& layer : settings_.extraBlock.layers) {
    for (Bool& flag : layer.flags)
      v.Bool(flag);
    for (Long& mode : layer.modes)
      v.Long(mode);
    for (Real& number : layer.numbers)
      v.Real(number);
    v.Vector(layer.color);
    v.Long(layer.last);
  }
  for (LightKnot& knot : settings_.extraBlock.knots)
    VisitKnot(v, knot);
}

// A distribution that reads badly is left out, and the light is read all the same; one that could not be read again
// isn't written.
template <class Visitor>
void LightObjectData::VisitIES(Visitor& v)
{
  Bool present = iesLight_ && iesLight_->IsComplete();
  if (!v.Bool(present) || !present)
    return;
  if constexpr (Visitor::kReading) {
    AdoptIES(NewObj<IESLight>());
    if (iesLight_ && !iesLight_->Read(v.File()))
      DeleteObj(iesLight_);
  } else {
    v.Note(iesLight_->Write(v.File()));
  }
}

template <class Visitor>
Bool LightObjectData::VisitBody(Visitor& v, OldFactor& factor)
{
  VisitFirstGroups(v);
  VisitMainGroup(v);
  VisitLaterGroups(v, factor);
  if (v.VersionBelow(kVersionNodeHeader))
    return v.Good();
  VisitExtraBlock(v);
  VisitFields<50000, 70027>(v);
  if (HoldsLevel(v, 5, kTagLong))
    VisitFields<1002>(v);
  else
    LongOf<1002>() = 0;
  if (HoldsLevel(v, 6, kTagBool))
    VisitIES(v);
  return v.Good();
}

void LightObjectData::WriteChunks(HyperFile& file)
{
  ChunkWriter writer(file, kLevelLight);
  OldFactor factor;
  VisitBody(writer, factor);
}

void LightObjectData::TakeOldFactor(Real factor)
{
  Real size = factor * kOldMapFactor;
  size = !(size > kOldSmallestMap) ? kOldSmallestMap : size > kOldLargestMap ? kOldLargestMap : size;
  if (node_)
    node_->GetDataInstance().SetLong(kKeyMapSize, static_cast<Long>(size));
}

// The oldest files hold a strength and a colour as one Vector.
void LightObjectData::SplitOldVector()
{
  constexpr LightSlot kSlot = FindLightSlot(70028);
  Vector& color = settings_.vectors[kSlot.index];
  const Real largest =
      color.x > color.y ? (color.x > color.z ? color.x : color.z) : (color.y > color.z ? color.y : color.z);
  RealOf<70027>() = largest;
  if (largest > 0.0)
    color = Vector(color.x / largest, color.y / largest, color.z / largest);
}

Bool LightObjectData::ReadData(HyperFile& file, Long id, Long level)
{
  if (id != kChunkNodeData)
    return false;
  ChunkReader reader(file, level);
  OldFactor factor;
  const Bool read = VisitBody(reader, factor);
  if (factor.present && file.GetFileVersion() < kVersionLightSize)
    TakeOldFactor(factor.value);
  if (read && file.GetFileVersion() < kVersionNodeHeader)
    SplitOldVector();
  return read;
}

Bool LightObjectData::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<LightObjectData>(&destination);
  if (!target || !NodeData::CopyTo(destination, flags, translation))
    return false;
  if (target == this)
    return true;
  target->settings_ = settings_;
  target->AdoptIES(CopyIESLight(iesLight_));
  return !iesLight_ || target->iesLight_;
}

} // namespace _torvane_
