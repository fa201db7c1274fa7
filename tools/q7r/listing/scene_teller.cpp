#include "scene_teller.h"

#include <algorithm>

#include "name_pattern.h"
#include "node_details.h"
#include "parameter_names.h"
#include "scene_file.h"
#include "torvane/layers/layer_object.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/compositing_tag.h"
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

} // namespace

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
