// What single classes of nodes have to tell.
#include "geometry_details.h"
#include "node_details.h"
#include "parameter_names.h"
#include "scene_file.h"
#include "scene_teller.h"
#include "torvane/materials/material.h"
#include "torvane/objects/unit_factors.h"
#include "torvane/tags/weight_tag_data.h"
#include "values.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

void TellParameter(ValueSink& sink, const char* name, BaseList2D& node, Long id)
{
  GeData value;
  node.GetParameterById(id, value);
  Tell(sink, name, value);
}

void TellTransform(ValueSink& sink, const Vector& pos, const Vector& scale, const Vector& rot)
{
  Tell(sink, "pos", pos);
  Tell(sink, "scale", scale);
  Tell(sink, "rot", rot);
}

// The length of one unit of the scene; null where the document doesn't say it.
void TellUnit(ValueSink& sink, const BaseDocument& document)
{
  sink.Key("unit");
  const auto* unit =
      NodeCast<UnitScaleData>(document.GetDataInstance().GetCustomDataType(kKeyDocumentUnit, kCustomUnitScale));
  if (!unit)
    return sink.Null();
  sink.BeginObject(ValueSink::Layout::kLine);
  sink.Member("factor", unit->scale);
  sink.Member("code", unit->unit);
  sink.Member("metres", GetUnitFactor(unit));
  sink.EndObject();
}

// The switches in the order of a file: channels 0 to 12, then -1. Empty for a material without channels.
void TellChannels(ValueSink& sink, BaseMaterial& material)
{
  sink.Key("channels");
  sink.BeginArray(ValueSink::Layout::kLine);
  const Material* standard = NodeCast<Material>(&material);
  for (Long channel = 0; standard && channel <= kLastChannel; ++channel)
    sink.Integer(standard->ChannelIsOn(channel));
  if (standard)
    sink.Integer(standard->ChannelIsOn(kFirstChannel));
  sink.EndArray();
}

void TellPath(ValueSink& sink, const ParameterPath& path)
{
  sink.Key("path");
  sink.BeginArray(ValueSink::Layout::kLine);
  for (Long i = 0; i < path.GetLevelCount(); ++i) {
    sink.BeginArray();
    for (const Long number : {path[i].id, path[i].dtype, path[i].creator})
      sink.Integer(number);
    sink.EndArray();
  }
  sink.EndArray();
}

// The joints of a weight tag, and a check sum of all that it says about them.
void TellWeights(ValueSink& sink, const WeightTagData& weights)
{
  sink.Key("joints");
  sink.BeginArray();
  for (Long i = 0; i < weights.GetJointCount(); ++i) {
    if (const GeAliasLink* joint = weights.GetJoint(i)->joint)
      Tell(sink, *joint);
    else
      sink.Null();
  }
  sink.EndArray();
  sink.Key("weights");
  sink.BeginObject(ValueSink::Layout::kLine);
  TellWritten(
      sink, weights.GetChunkLevel(),
      [](const void* what, HyperFile& file) {
        // Writing changes nothing; the library's operation is no const one.
        const_cast<WeightTagData*>(static_cast<const WeightTagData*>(what))->WriteChunks(file);
      },
      &weights);
  sink.EndObject();
}

} // namespace

void SceneTeller::TellObject(BaseObject& object)
{
  TellTransform(sink_, object.GetRelPos(), object.GetRelScale(), object.GetRelRot());
  sink_.Member("editorMode", object.GetEditorMode());
  sink_.Member("renderMode", object.GetRenderMode());
  if (!scope_.data)
    return;
  sink_.Member("rotationOrder", object.GetRotationOrder());
  sink_.Key("frozen");
  sink_.BeginObject();
  TellTransform(sink_, object.GetFrozenPos(), object.GetFrozenScale(), object.GetFrozenRot());
  sink_.EndObject();
  if (scope_.places)
    Tell(sink_, "global", Multiply(up_, object.GetLocalMatrix()));
  sink_.Member("disabled", object.GetDisabled());
  TellParameter(sink_, "displayColor", object, kObjectDisplayColor);
  TellParameter(sink_, "colorMode", object, kObjectColorMode);
  TellParameter(sink_, "displayFlag", object, kObjectDisplayFlag);
  TellParameter(sink_, "storedVector", object, kObjectStoredVector);
  TellParameter(sink_, "storedMode", object, kObjectStoredMode);
  Tell(sink_, "storedMatrix", object.GetStoredMatrix());
}

void SceneTeller::TellObjectData(BaseObject& object)
{
  TellObjectParams(sink_, object);
  TellLightLists(sink_, object);
  TellObjectIES(sink_, object);
  TellGeometry(sink_, object);
  TellRaw(sink_, object.GetRawLevel(), object.GetRawData(), object.GetRawSize());
}

void SceneTeller::TellTag(BaseTag& tag)
{
  TellTagValues(sink_, tag);
  if (const auto* weights = NodeCast<WeightTagData>(tag.GetNodeData()))
    TellWeights(sink_, *weights);
  TellRaw(sink_, tag.GetRawLevel(), tag.GetRawData(), tag.GetRawSize());
}

void SceneTeller::TellMaterial(BaseMaterial& material)
{
  if (!scope_.data)
    return;
  TellChannels(sink_, material);
  const RawChunkBody& raw = material.GetRawBody();
  TellRaw(sink_, raw.GetLevel(), raw.GetData(), raw.GetSize());
}

void SceneTeller::TellDocument(BaseDocument& document)
{
  const DocumentPref& pref = document.GetPref();
  sink_.Member("fps", pref.GetFps());
  Tell(sink_, "min", pref.GetMinTime());
  Tell(sink_, "max", pref.GetMaxTime());
  Tell(sink_, "loopMin", pref.GetLoopMin());
  Tell(sink_, "loopMax", pref.GetLoopMax());
  if (!scope_.data)
    return;
  TellUnit(sink_, document);
  sink_.Key("state");
  sink_.BeginObject();
  Tell(sink_, "time", document.GetTime());
  sink_.Member("mode", document.GetMode());
  sink_.Member("tool", document.GetActiveTool());
  constexpr Long kStates[] = {kDocumentPrefReal,          kDocumentPrefLastBool,      kDocumentPrefFirstBool,
                              kDocumentPrefFirstBool + 1, kDocumentPrefFirstBool + 2, kDocumentPrefFirstBool + 3,
                              kDocumentFirstAxisLock,     kDocumentFirstAxisLock + 1, kDocumentFirstAxisLock + 2,
                              kDocumentFirstAxisLock + 3, kDocumentInverseSwitch};
  for (const Long id : kStates)
    TellParameter(sink_, std::to_string(id).c_str(), document, id);
  sink_.EndObject();
  constexpr Long kSettings = 6;
  sink_.Key("settings");
  sink_.BeginArray();
  for (Long i = 0; i < kSettings; ++i)
    Tell(sink_, document.GetSettings(i), nullptr);
  sink_.EndArray();
}

void SceneTeller::TellDraw(BaseDraw& draw)
{
  Tell(sink_, "sceneCamera", draw.GetSceneCamera());
  if (!scope_.data)
    return;
  if (scope_.places) {
    sink_.Key("sceneCameraIndex");
    index_.TellPath(sink_, draw.GetSceneCamera().GetLink());
  }
  BaseDraw plain;
  BaseObject& editor = EditorCameraOf(draw, plain);
  sink_.Key("camera");
  sink_.BeginObject();
  TellTransform(sink_, editor.GetRelPos(), editor.GetRelScale(), editor.GetRelRot());
  TellEntries(sink_, editor.GetDataInstance());
  if (scope_.words)
    TellNamed(sink_, editor);
  sink_.EndObject();
}

void SceneTeller::TellKey(const CKey& key)
{
  sink_.BeginObject(ValueSink::Layout::kLine);
  Tell(sink_, "time", key.GetTime());
  sink_.Member("value", key.GetValue());
  Tell(sink_, "leftTime", key.GetLeftTime());
  Tell(sink_, "rightTime", key.GetRightTime());
  sink_.Member("leftValue", key.GetLeftValue());
  sink_.Member("rightValue", key.GetRightValue());
  sink_.Member("interpolation", key.GetInterpolation());
  Tell(sink_, "data", key.GetGeData());
  sink_.Key("nbits");
  sink_.BeginArray();
  for (Long word = 1; word <= 4; ++word)
    sink_.Unsigned(key.GetNBit(-word));
  sink_.EndArray();
  sink_.EndObject();
}

void SceneTeller::TellKeys(const CCurve& curve)
{
  CKey scratch;
  sink_.BeginArray();
  for (Long i = 0; i < curve.GetKeyCount(); ++i)
    TellKey(*curve.PeekKey(i, scratch));
  sink_.EndArray();
}

// The main curve is "keys"; those of further numbers stand in "curves" where they have keys.
void SceneTeller::TellCurves(CTrack& track)
{
  sink_.Key("keys");
  TellKeys(*track.GetCurve(1, 0));
  bool isFirst = true;
  for (Long number = kCurveFirst; number <= kCurveLast; ++number) {
    const CCurve* curve = track.GetCurve(number, 0);
    if (!curve || curve->GetKeyCount() == 0)
      continue;
    if (std::exchange(isFirst, false)) {
      sink_.Key("curves");
      sink_.BeginObject();
    }
    sink_.Key(std::to_string(number));
    TellKeys(*curve);
  }
  if (!isFirst)
    sink_.EndObject();
}

void SceneTeller::TellTrack(CTrack& track)
{
  TellPath(sink_, track.GetPath());
  sink_.Member("kind", track.GetKind());
  sink_.Member("before", track.GetBefore());
  sink_.Member("after", track.GetAfter());
  if (scope_.words)
    sink_.Member("keyCount", track.GetCurve(1, 0)->GetKeyCount());
  if (scope_.keys)
    TellCurves(track);
}

} // namespace q7r
