#include "scene_json.h"

#include "geometry_details.h"
#include "node_details.h"
#include "scene_file.h"
#include "torvane/animation/ctrack.h"
#include "torvane/objects/unit_factors.h"
#include "torvane/tags/base_tag.h"
#include "type_names.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

Json KeyJson(CKey& key)
{
  Json bits = Json::array();
  for (Long word = 1; word <= 4; ++word)
    bits.push_back(key.GetNBit(-word));
  return {{"time", ToJson(key.GetTime())},
          {"value", key.GetValue()},
          {"leftTime", ToJson(key.GetLeftTime())},
          {"rightTime", ToJson(key.GetRightTime())},
          {"leftValue", key.GetLeftValue()},
          {"rightValue", key.GetRightValue()},
          {"interpolation", key.GetInterpolation()},
          {"data", ToJson(key.GetGeData())},
          {"nbits", std::move(bits)}};
}

Json KeysJson(const CCurve& curve)
{
  Json keys = Json::array();
  for (Long i = 0; i < curve.GetKeyCount(); ++i)
    keys.push_back(KeyJson(*curve.GetKey(i)));
  return keys;
}

// The main curve is "keys"; those of further numbers stand in "curves" where they have keys.
Json TrackJson(CTrack& track)
{
  Json path = Json::array();
  for (Long i = 0; i < track.GetPath().GetLevelCount(); ++i) {
    const ParameterLevel& level = track.GetPath()[i];
    path.push_back({level.id, level.dtype, level.creator});
  }
  Json json = {{"name", ToJson(track.GetName())}, {"path", std::move(path)},
               {"kind", track.GetKind()},         {"before", track.GetBefore()},
               {"after", track.GetAfter()},       {"keys", KeysJson(*track.GetCurve(1, 0))}};
  for (Long number = kCurveFirst; number <= kCurveLast; ++number) {
    const CCurve* curve = track.GetCurve(number, 0);
    if (curve && curve->GetKeyCount() > 0)
      json["curves"][std::to_string(number)] = KeysJson(*curve);
  }
  return json;
}

Json TracksJson(const BaseList2D& node)
{
  Json tracks = Json::array();
  for (CTrack* track = node.GetFirstTrack(); track; track = track->GetNext())
    tracks.push_back(TrackJson(*track));
  return tracks;
}

Json TagJson(BaseTag& tag, NodeIndex& index)
{
  Json json = {{"type", tag.GetType()},
               {"name", ToJson(tag.GetName())},
               {"data", ToJson(tag.GetDataInstance())},
               {"links", index.LinksOf(tag.GetDataInstance())}};
  Json values = TagValues(tag);
  if (!values.is_null())
    json["values"] = std::move(values);
  return json;
}

Json FrozenJson(const BaseObject& object)
{
  return {{"pos", ToJson(object.GetFrozenPos())},
          {"scale", ToJson(object.GetFrozenScale())},
          {"rot", ToJson(object.GetFrozenRot())}};
}

Json ParameterJson(BaseObject& object, Long id)
{
  GeData value;
  object.GetParameterById(id, value);
  return ToJson(value);
}

// `up` is the global matrix of the object above.
Json ObjectJson(BaseObject& object, const Matrix& up, NodeIndex& index)
{
  const Matrix global = Multiply(up, object.GetLocalMatrix());
  Json tags = Json::array();
  for (BaseTag* tag = object.GetFirstTag(); tag; tag = tag->GetNext())
    tags.push_back(TagJson(*tag, index));
  Json children = Json::array();
  for (BaseObject* child = object.GetDown(); child; child = child->GetNext())
    children.push_back(ObjectJson(*child, global, index));
  const BaseList2D* layer = object.GetLayer();
  Json json = {{"type", object.GetType()},
               {"typeName", TypeName(object.GetType())},
               {"name", ToJson(object.GetName())},
               {"pos", ToJson(object.GetRelPos())},
               {"scale", ToJson(object.GetRelScale())},
               {"rot", ToJson(object.GetRelRot())},
               {"rotationOrder", object.GetRotationOrder()},
               {"frozen", FrozenJson(object)},
               {"global", ToJson(global)},
               {"disabled", object.GetDisabled()},
               {"displayColor", ParameterJson(object, kObjectDisplayColor)},
               {"colorMode", ParameterJson(object, kObjectColorMode)},
               {"editorMode", object.GetEditorMode()},
               {"renderMode", object.GetRenderMode()},
               {"layer", layer ? ToJson(layer->GetName()) : Json()},
               {"layerIndex", index.PathOf(layer)},
               {"data", ToJson(object.GetDataInstance())},
               {"links", index.LinksOf(object.GetDataInstance())},
               {"params", ObjectParams(object)},
               {"tags", std::move(tags)},
               {"tracks", TracksJson(object)},
               {"children", std::move(children)}};
  AddGeometry(object, json);
  Json ies = ObjectIES(object);
  if (!ies.is_null())
    json["ies"] = std::move(ies);
  return json;
}

Json LayerJson(LayerObject& layer)
{
  Json flags = Json::array();
  for (Long i = 0; i < kLayerFlagCount; ++i)
    flags.push_back(layer.GetFlag(i));
  Json children = Json::array();
  for (LayerObject* child = layer.GetDown(); child; child = child->GetNext())
    children.push_back(LayerJson(*child));
  return {{"name", ToJson(layer.GetName())},
          {"flags", std::move(flags)},
          {"color", ToJson(layer.GetColor())},
          {"children", std::move(children)}};
}

Json RenderJson(RenderData& data)
{
  Json json = {{"name", ToJson(data.GetName())}, {"data", ToJson(data.GetDataInstance())}};
  for (RenderData* child = data.GetDown(); child; child = child->GetNext())
    json["children"].push_back(RenderJson(*child));
  return json;
}

// The length of one unit of the scene; null where the document doesn't say it.
Json UnitJson(const BaseDocument& document)
{
  const auto* unit =
      NodeCast<UnitScaleData>(document.GetDataInstance().GetCustomDataType(kKeyDocumentUnit, kCustomUnitScale));
  if (!unit)
    return nullptr;
  return {{"factor", unit->scale}, {"code", unit->unit}, {"metres", GetUnitFactor(unit)}};
}

Json DocumentJson(BaseDocument& document)
{
  const DocumentPref& pref = document.GetPref();
  return {{"name", ToJson(document.GetName())},   {"fps", pref.GetFps()},
          {"min", ToJson(pref.GetMinTime())},     {"max", ToJson(pref.GetMaxTime())},
          {"loopMin", ToJson(pref.GetLoopMin())}, {"loopMax", ToJson(pref.GetLoopMax())},
          {"unit", UnitJson(document)},           {"container", ToJson(document.GetDataInstance())}};
}

} // namespace

Json SceneJson(BaseDocument& document)
{
  NodeIndex index;
  Json objects = Json::array();
  for (BaseObject* object = document.GetFirstObject(); object; object = object->GetNext())
    objects.push_back(ObjectJson(*object, Matrix(), index));
  Json layers = Json::array();
  for (LayerObject* layer = document.GetFirstLayer(); layer; layer = layer->GetNext())
    layers.push_back(LayerJson(*layer));
  Json render = Json::array();
  for (RenderData* data = document.GetFirstRenderData(); data; data = data->GetNext())
    render.push_back(RenderJson(*data));
  return {{"document", DocumentJson(document)},
          {"objects", std::move(objects)},
          {"materials", MaterialsJson(document, index)},
          {"layers", std::move(layers)},
          {"renderData", std::move(render)},
          {"views", ViewsJson(document, index)}};
}

} // namespace q7r
