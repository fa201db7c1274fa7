#include "scene_teller.h"

#include <algorithm>

#include "geometry_details.h"
#include "node_details.h"
#include "parameter_names.h"
#include "scene_file.h"
#include "torvane/layers/layer_object.h"
#include "torvane/materials/material.h"
#include "torvane/objects/unit_factors.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/compositing_tag.h"
#include "torvane/tags/weight_tag_data.h"
#include "type_names.h"
#include "values.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

// Entries that tell who wrote a file and when, or what was so at that moment.
bool IsOrigin(Long id)
{
  return (id >= kInfoCreatorName && id <= kInfoWriterId) || id == kInfoCreationDate || id == kInfoSaveDate;
}

EntryFilter OriginFilterOf(const BaseList2D& node)
{
  if (NodeCast<BaseDocument>(&node))
    return IsOrigin;
  if (NodeCast<BaseObject>(&node))
    return [](Long id) { return id == kKeyModelCheckSum; };
  if (NodeCast<BaseTag>(&node) && node.GetType() == kTagCompositing)
    return [](Long id) { return id == kCompositingClock; };
  return nullptr;
}

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

// "raw": what a node of an unknown type keeps.
void TellRaw(ValueSink& sink, Long level, const void* data, LLong size)
{
  if (size == 0)
    return;
  sink.Key("raw");
  sink.BeginObject(ValueSink::Layout::kLine);
  TellBytes(sink, level, data, size);
  sink.EndObject();
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

void TellKeptChunks(ValueSink& sink, const char* in, const KeptChunks& chunks)
{
  for (const KeptChunks::Chunk* chunk = chunks.GetFirst(); chunk; chunk = chunk->next) {
    sink.BeginObject(ValueSink::Layout::kLine);
    sink.Member("in", in);
    sink.Member("id", chunk->id);
    TellBytes(sink, chunk->body);
    sink.EndObject();
  }
}

std::string MarkerText(const NodeMarker& marker)
{
  unsigned long long halves[2] = {};
  for (std::size_t i = 0; i < std::size(marker.bytes); ++i)
    halves[i / 8] = halves[i / 8] << 8 | marker.bytes[i];
  return HexText(halves[0]) + HexText(halves[1]);
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

// Also of layers, render settings and so on, whose children hang in lists of different classes.
const RootList2D* ChildrenOf(BaseList2D& node)
{
  const auto* inTree = NodeCast<BaseList4D>(&node);
  return inTree ? inTree->GetChildRoot() : nullptr;
}

} // namespace

bool Fits(std::string_view name, std::string_view pattern)
{
  std::size_t n = 0;
  std::size_t p = 0;
  std::size_t star = std::string_view::npos; // where a "*" stood last, and where its text ends
  std::size_t end = 0;
  while (n < name.size()) {
    if (p < pattern.size() && pattern[p] == '*') {
      star = p++;
      end = n;
    } else if (p < pattern.size() && (pattern[p] == '?' || pattern[p] == name[n])) {
      ++p;
      // One character of UTF-8 for "?".
      for (++n; pattern[p - 1] == '?' && n < name.size() && (static_cast<unsigned char>(name[n]) & 0xC0) == 0x80;)
        ++n;
    } else if (star != std::string_view::npos) {
      p = star + 1;
      n = ++end;
    } else {
      return false;
    }
  }
  return pattern.find_first_not_of('*', p) == std::string_view::npos;
}

void NodeLists::Add(const char* name, const RootList2D* root, bool always)
{
  if (always || (root && root->HasContent()))
    lists_[count_++] = {name, root};
}

NodeLists::NodeLists(BaseList2D& node)
{
  auto* object = NodeCast<BaseObject>(&node);
  auto* document = NodeCast<BaseDocument>(&node);
  const bool isShader = NodeCast<BaseShader>(&node) != nullptr;
  const bool isLayer = NodeCast<LayerObject>(&node) != nullptr;
  if (object)
    Add("tags", &object->GetTagRoot(), true);
  Add("tracks", node.GetTrackRoot(), object != nullptr);
  Add("shaders", node.GetShaders() ? node.GetShaderRoot() : nullptr, NodeCast<BaseMaterial>(&node) != nullptr);
  if (auto* settings = NodeCast<RenderData>(&node)) {
    Add("videoPosts", &settings->GetVideoPosts(), false);
    Add("multipasses", &settings->GetMultipasses(), false);
  }
  if (auto* panel = NodeCast<ViewPanel>(&node))
    Add("draws", &panel->GetDraws(), true);
  if (document) {
    Add("objects", document->GetObjectRoot(), true);
    Add("materials", document->GetMaterialRoot(), true);
    Add("layers", document->GetLayerRoot(), true);
    Add("renderData", document->GetRenderDataRoot(), true);
    Add("views", document->GetViewPanelRoot(), true);
  }
  Add("children", ChildrenOf(node), object || isShader || isLayer);
}

void SceneTeller::TellScene(BaseDocument& document)
{
  sink_.Key("document");
  sink_.BeginObject();
  TellOwn(document);
  const NodeLists lists(document);
  for (const NodeList& list : lists) {
    if (std::string_view(list.name) == "tracks" || std::string_view(list.name) == "shaders")
      TellList(list, scope_.depth);
  }
  sink_.EndObject();
  if (!scope_.objects.empty()) {
    sink_.Key("objects");
    sink_.BeginArray();
    TellMatches(document.GetFirstObject(), "");
    return sink_.EndArray();
  }
  for (const NodeList& list : lists) {
    if (std::string_view(list.name) != "tracks" && std::string_view(list.name) != "shaders")
      TellList(list, scope_.depth);
  }
}

// The objects whose names fit, each with all below it; what lies below one isn't looked at again.
void SceneTeller::TellMatches(BaseList2D* first, const std::string& above)
{
  for (BaseList2D* node = first; node; node = node->GetNext()) {
    auto* object = NodeCast<BaseObject>(node);
    const std::string name = ToUtf8(node->GetName());
    if (!Fits(name, scope_.objects)) {
      const Matrix up = std::exchange(up_, Multiply(up_, object->GetLocalMatrix()));
      TellMatches(object->GetDown(), above.empty() ? name : above + "/" + name);
      up_ = up;
      continue;
    }
    sink_.BeginObject();
    sink_.Member("below", above);
    TellOwn(*node);
    TellLists(*node, scope_.depth);
    sink_.EndObject();
  }
}

void SceneTeller::TellList(const NodeList& list, int depth)
{
  sink_.Key(list.name);
  sink_.BeginArray();
  for (BaseList2D* node = list.root ? list.root->GetFirst() : nullptr; node; node = node->GetNext())
    TellNode(*node, depth);
  sink_.EndArray();
}

void SceneTeller::TellNode(BaseList2D& node, int depth)
{
  sink_.BeginObject();
  TellOwn(node);
  TellLists(node, depth);
  sink_.EndObject();
}

void SceneTeller::TellLists(BaseList2D& node, int depth)
{
  const auto* object = NodeCast<BaseObject>(&node);
  const Matrix up = up_;
  if (object && scope_.places)
    up_ = Multiply(up_, object->GetLocalMatrix());
  for (const NodeList& list : NodeLists(node)) {
    if (std::string_view(list.name) != "children")
      TellList(list, depth);
    else if (depth != 0)
      TellList(list, depth - 1);
    else if (list.root)
      sink_.Member("childCount", list.root->GetCount());
  }
  up_ = up;
}

void SceneTeller::TellOwn(BaseList2D& node)
{
  const bool isTyped = NodeCast<BaseObject>(&node) || NodeCast<BaseTag>(&node) || NodeCast<BaseMaterial>(&node) ||
                       NodeCast<BaseShader>(&node);
  if (isTyped) {
    sink_.Member("type", node.GetType());
    if (scope_.words)
      sink_.Member("typeName", TypeName(node.GetType()));
  }
  if (!NodeCast<ViewPanel>(&node) && !NodeCast<BaseDraw>(&node))
    Tell(sink_, "name", node.GetName());
  TellParticulars(node);
  const std::string summary = scope_.words ? SummaryOf(node) : std::string();
  if (!summary.empty())
    sink_.Member("summary", summary);
  if (scope_.data) {
    TellData(node);
    TellKept(node);
  }
  if (scope_.identity)
    TellIdentity(node);
}

void SceneTeller::TellParticulars(BaseList2D& node)
{
  const BaseList2D* layer = node.GetLayer();
  auto* object = NodeCast<BaseObject>(&node);
  if (object)
    TellObject(*object);
  if (object && !layer)
    sink_.Key("layer"), sink_.Null();
  if (layer) {
    sink_.Key("layer");
    sink_.Link(layer, ToUtf8(layer->GetName()));
  }
  if (scope_.places && (object || layer)) {
    sink_.Key("layerIndex");
    index_.TellPath(sink_, layer);
  }
  if (auto* document = NodeCast<BaseDocument>(&node))
    return TellDocument(*document);
  if (auto* track = NodeCast<CTrack>(&node))
    return TellTrack(*track);
  if (auto* draw = NodeCast<BaseDraw>(&node))
    return TellDraw(*draw);
  if (auto* material = NodeCast<BaseMaterial>(&node))
    return TellMaterial(*material);
  if (auto* scene = NodeCast<LayerObject>(&node)) {
    sink_.Key("flags");
    sink_.BeginArray(ValueSink::Layout::kLine);
    for (Long i = 0; i < kLayerFlagCount; ++i)
      sink_.Bool(scene->GetFlag(i));
    sink_.EndArray();
    Tell(sink_, "color", scene->GetColor());
  }
}

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
  BaseObject& editor = *draw.GetEditorCamera();
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

// What most classes keep, and what goes with it.
void SceneTeller::TellData(BaseList2D& node)
{
  const BaseContainer& data = node.GetDataInstance();
  const bool isDocument = NodeCast<BaseDocument>(&node) != nullptr;
  const bool isTrack = NodeCast<CTrack>(&node) != nullptr;
  if (!isTrack || data.GetCount() > 0) {
    sink_.Key(isDocument ? "container" : "data");
    Tell(sink_, data, scope_.origin ? nullptr : OriginFilterOf(node));
  }
  if (scope_.places && !isDocument && !isTrack) {
    sink_.Key("links");
    index_.TellLinks(sink_, data);
  }
  if (scope_.words)
    TellNamed(sink_, node);
  if (const BaseContainer* dynamic = node.GetDynamicParameters())
    Tell(sink_, "dynamic", *dynamic);
  if (auto* object = NodeCast<BaseObject>(&node))
    TellObjectData(*object);
  if (auto* tag = NodeCast<BaseTag>(&node))
    TellTag(*tag);
  if (auto* shader = NodeCast<BaseShader>(&node))
    TellRaw(sink_, shader->GetRawBody().GetLevel(), shader->GetRawBody().GetData(), shader->GetRawBody().GetSize());
  if (auto* settings = NodeCast<RenderData>(&node))
    Tell(sink_, "extra", settings->GetExtraData());
  if (auto* pass = NodeCast<MultipassObject>(&node))
    Tell(sink_, "settings", pass->GetSettings());
  if (auto* panel = NodeCast<ViewPanel>(&node))
    Tell(sink_, "settings", panel->GetSettings());
  if (auto* post = NodeCast<BaseVideoPost>(&node)) {
    sink_.Member("plugin", post->GetPluginId());
    Tell(sink_, "settings", post->GetSettings());
  }
}

// "kept": chunks of other programs, among the node's own and in its lists.
void SceneTeller::TellKept(BaseList2D& node)
{
  const NodeLists lists(node);
  const auto keeps = [](const NodeList& list) { return list.root && !list.root->GetKeptChunks().IsEmpty(); };
  if (node.GetKeptChunks().IsEmpty() && std::none_of(lists.begin(), lists.end(), keeps))
    return;
  sink_.Key("kept");
  sink_.BeginArray();
  TellKeptChunks(sink_, "node", node.GetKeptChunks());
  for (const NodeList& list : lists) {
    if (keeps(list))
      TellKeptChunks(sink_, list.name, list.root->GetKeptChunks());
  }
  sink_.EndArray();
}

void SceneTeller::TellIdentity(BaseList2D& node)
{
  sink_.Member("marker", MarkerText(node.GetMarker()));
  sink_.Key("info");
  sink_.Unsigned(node.GetInfo());
  sink_.Key("nodeBits");
  sink_.BeginArray(ValueSink::Layout::kLine);
  for (Long word = 1; word <= 4; ++word)
    sink_.Unsigned(node.GetNBit(-word));
  sink_.EndArray();
}

} // namespace q7r
