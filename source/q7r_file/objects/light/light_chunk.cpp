// A light in a file: its settings in their order, with what old files hold otherwise.
#include "k2v_file/stream/chunk_visitor.h"
#include "torvane/objects/base_object.h"
#include "torvane/objects/light_object_data.h"

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

} // namespace

// The body of a light in a file: the settings in their order.
struct LightBody
{
  LightObjectData& light;
  LightObjectData::Settings& settings;
  // The factor of a shadow map's size, which old files hold in the place of the size itself.
  Bool hasOldFactor = false;
  Real oldFactor = 0.0;

  template <class Visitor>
  Bool VisitBody(Visitor& visitor);
  template <class Visitor>
  void VisitKnots(Visitor& visitor);
  template <class Visitor>
  void VisitFirstGroups(Visitor& visitor);
  template <class Visitor>
  void VisitMainGroup(Visitor& visitor);
  template <class Visitor>
  void VisitLaterGroups(Visitor& visitor);
  template <class Visitor>
  void VisitExtraBlock(Visitor& visitor);
  template <class Visitor>
  void VisitIES(Visitor& visitor);
  template <Long... ids, class Visitor>
  void VisitFields(Visitor& visitor);
  template <Long id, class Visitor>
  void VisitField(Visitor& visitor);
  template <Long id>
  Long& LongOf();
  template <Long id>
  Real& RealOf();
  void TakeOldFactor();
  void SplitOldVector();
};

template <Long id>
Real& LightBody::RealOf()
{
  constexpr LightSlot kSlot = FindLightSlot(id);
  static_assert(kSlot.kind == LightKind::kReal);
  return settings.reals[kSlot.index];
}

template <Long id>
Long& LightBody::LongOf()
{
  constexpr LightSlot kSlot = FindLightSlot(id);
  static_assert(kSlot.kind == LightKind::kLong);
  return settings.longs[kSlot.index];
}

template <Long id, class Visitor>
void LightBody::VisitField(Visitor& v)
{
  constexpr LightSlot kSlot = FindLightSlot(id);
  static_assert(kSlot.kind != LightKind::kNone, "no parameter has this id");
  if constexpr (kSlot.kind == LightKind::kLong)
    v.Long(settings.longs[kSlot.index]);
  else if constexpr (kSlot.kind == LightKind::kReal)
    v.Real(settings.reals[kSlot.index]);
  else if constexpr (kSlot.kind == LightKind::kBool)
    v.Bool(settings.bools[kSlot.index]);
  else
    v.Vector(settings.vectors[kSlot.index]);
}

template <Long... ids, class Visitor>
void LightBody::VisitFields(Visitor& v)
{
  (VisitField<ids>(v), ...);
}

// The records that kLightKnotCount counts. What a file holds beyond the places for them is dropped.
template <class Visitor>
void LightBody::VisitKnots(Visitor& v)
{
  Long& count = LongOf<kLightKnotCount>();
  for (Long i = 0; i < count && v.Good(); ++i) {
    LightKnot beyond;
    VisitKnot(v, i < kMaxLightKnots ? settings.knots[i] : beyond);
  }
  count = ClampLightKnotCount(count);
}

template <class Visitor>
void LightBody::VisitFirstGroups(Visitor& v)
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
void LightBody::VisitMainGroup(Visitor& v)
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
void LightBody::VisitLaterGroups(Visitor& v)
{
  if (HoldsLevel(v, 1, kTagBool)) {
    VisitFields<70022>(v);
    oldFactor = RealOf<90032>();
    hasOldFactor = v.Real(oldFactor);
  } else {
    settings.bools[FindLightSlot(70022).index] = true;
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
void LightBody::VisitExtraBlock(Visitor& v)
{
  VisitKnot(v, settings.extraBlock.head);
  for (LightExtraBlock::Layer& layer : settings.extraBlock.layers) {
    for (Bool& flag : layer.flags)
      v.Bool(flag);
    for (Long& mode : layer.modes)
      v.Long(mode);
    for (Real& number : layer.numbers)
      v.Real(number);
    v.Vector(layer.color);
    v.Long(layer.last);
  }
  for (LightKnot& knot : settings.extraBlock.knots)
    VisitKnot(v, knot);
}

// A distribution that reads badly is left out, and the light is read all the same; one that could not be read again
// isn't written.
template <class Visitor>
void LightBody::VisitIES(Visitor& v)
{
  Bool present = light.iesLight_ && light.iesLight_->IsComplete();
  if (!v.Bool(present) || !present)
    return;
  if constexpr (Visitor::kReading) {
    light.AdoptIES(NewObj<IESLight>());
    if (light.iesLight_ && !light.iesLight_->Read(v.File()))
      DeleteObj(light.iesLight_);
  } else {
    v.Note(light.iesLight_->Write(v.File()));
  }
}

template <class Visitor>
Bool LightBody::VisitBody(Visitor& v)
{
  VisitFirstGroups(v);
  VisitMainGroup(v);
  VisitLaterGroups(v);
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

void LightBody::TakeOldFactor()
{
  Real size = oldFactor * kOldMapFactor;
  size = !(size > kOldSmallestMap) ? kOldSmallestMap : size > kOldLargestMap ? kOldLargestMap : size;
  if (light.node_)
    light.node_->GetDataInstance().SetLong(kKeyMapSize, static_cast<Long>(size));
}

// The oldest files hold a strength and a colour as one Vector.
void LightBody::SplitOldVector()
{
  constexpr LightSlot kSlot = FindLightSlot(70028);
  Vector& color = settings.vectors[kSlot.index];
  const Real largest =
      color.x > color.y ? (color.x > color.z ? color.x : color.z) : (color.y > color.z ? color.y : color.z);
  RealOf<70027>() = largest;
  if (largest > 0.0)
    color = Vector(color.x / largest, color.y / largest, color.z / largest);
}

void LightObjectData::WriteChunks(HyperFile& file)
{
  ChunkWriter writer(file, kLevelLight);
  Settings settings = GetSettings(); // the body may be read into; a light of the defaults alone stays one
  LightBody{*this, settings}.VisitBody(writer);
}

Bool LightObjectData::ReadData(HyperFile& file, Long id, Long level)
{
  if (id != kChunkNodeData)
    return false;
  if (!NeedSettings()) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  ChunkReader reader(file, level);
  LightBody body{*this, *settings_};
  const Bool read = body.VisitBody(reader);
  if (body.hasOldFactor && file.GetFileVersion() < kVersionLightSize)
    body.TakeOldFactor();
  if (read && file.GetFileVersion() < kVersionNodeHeader)
    body.SplitOldVector();
  return read;
}

} // namespace _torvane_
