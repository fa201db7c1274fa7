#include "q7r_file/types/node_types.h"

#include <algorithm>
#include <iterator>
#include <type_traits>

#include "q7r_file/objects/opaque_object_data.h"
#include "torvane/hooks.h"
#include "torvane/nodes/type_name.h"
#include "torvane/torvane.h"

namespace _torvane_
{

namespace
{

template <class Thing>
Thing* NewOfType(Long type)
{
  if constexpr (std::is_constructible_v<Thing, Long>)
    return NewObj<Thing>(type);
  else
    return NewObj<Thing>();
}

template <class Node>
BaseList2D* MakeNode(const NodeType&, Long type)
{
  return NewOfType<Node>(type);
}

// Nodes whose real type stands beside their label, as it does for all that plug-ins define. A number that is the label
// itself leaves the type to the file.
template <class Node>
BaseList2D* MakePluginNode(const NodeType& row, Long type)
{
  return NewObj<Node>(row.label, type == row.label ? -1 : type);
}

// An old spline becomes a present one.
BaseList2D* MakeSpline(const NodeType&, Long) { return NewObj<SplineObject>(); }
BaseList2D* MakePolygons(const NodeType&, Long) { return AllocObject(kObjectPolygon); }

template <class Data>
NodeData* MakeData(const NodeType&, Long type)
{
  return NewOfType<Data>(type);
}

// What the library doesn't interpret: new data write an empty body at level 0.
NodeData* MakeOpaqueData(const NodeType& row, Long type) { return NewObj<OpaqueObjectData>(type, 0, row.label); }

// The client's own polygon data, or the library's for a client that has none, whether it says that it knows the type or
// not: without data a file's polygon object would be lost. A lack of memory is noticed by the watch of who asks.
NodeData* MakePolygonData(const NodeType&, Long type)
{
  Bool known = false;
  NodeData* data = AllocNodeData(type, known);
  return data ? data : NewObj<PolygonObjectData>();
}

using DataMaker = NodeData* (*)(const NodeType& row, Long type);

template <class Node>
constexpr NodeType Row(Long type, const char* name, DataMaker makeData = nullptr, Long label = 0)
{
  return {type, type, label ? label : type, name, &Node::kNodeKind, MakeNode<Node>, makeData};
}

constexpr NodeType Object(Long type, const char* name, DataMaker makeData, Long label = kObjectGeneric)
{
  return Row<BaseObject>(type, name, makeData, label);
}

// Objects that have nothing but their container.
constexpr NodeType PlainObjects(Long first, Long last, const char* name = nullptr)
{
  NodeType row = Object(first, name, MakeData<NodeData>);
  row.last = last;
  return row;
}

constexpr NodeType PluginTag(Long type, const char* name = nullptr, DataMaker makeData = nullptr)
{
  return {type, type, kTagPlugin, name, &BaseTag::kNodeKind, MakePluginNode<BaseTag>, makeData};
}

constexpr NodeType ObjectLabel(Long label, const char* name, BaseList2D* (*make)(const NodeType&, Long))
{
  return {label, label, label, name, &BaseObject::kNodeKind, make, nullptr, NodeNumber::kLabel};
}

constexpr NodeType Spline(Long type, const char* name)
{
  return {type, type, kObjectSpline, name, &SplineObject::kNodeKind, MakeSpline, MakeData<PointObjectData>};
}

constexpr NodeType kNodeTypes[] = {
    // Objects.
    Row<PolygonObject>(kObjectPolygon, "Polygon", MakePolygonData, kObjectPolygonLabel),
    Spline(kObjectSpline, "Spline"),
    Object(kObjectLight, "Light", MakeData<LightObjectData>),
    Object(kObjectCamera, "Camera", MakeData<CameraObjectData>),
    PlainObjects(5104, 5107),
    Object(kObjectPointBased, nullptr, MakeData<PointObjectData>, kObjectPoint),
    PlainObjects(5109, 5126),
    PlainObjects(5128, 5129),
    PlainObjects(5131, 5131),
    PlainObjects(5133, 5134),
    PlainObjects(5136, 5136),
    Spline(kObjectOldSpline, nullptr),
    PlainObjects(kObjectNull, kObjectNull, "Null"),
    PlainObjects(5142, 5143),
    PlainObjects(5145, 5150),
    PlainObjects(5153, 5153),
    Object(kObjectGeneric, "Object", nullptr),
    ObjectLabel(kObjectPoint, "Points", MakeNode<PointObject>),
    PlainObjects(5159, 5167),
    PlainObjects(kObjectPlane, kObjectPlane, "Plane"),
    PlainObjects(5169, 5186),
    // Animation.
    Row<CTrack>(kLabelTrack, nullptr),
    Row<CKey>(kLabelKey, nullptr),
    // Tags.
    Row<PointTag>(kTagPoint, "Points"),
    Row<PolygonTag>(kTagPolygon, "Polygons"),
    Row<DisplayTag>(kTagDisplay, "Display"),
    Row<TextureTag>(kTagTexture, "Texture"),
    Row<TangentTag>(kTagTangent, "Tangents"),
    Row<BaseTag>(kTagProtection, "Protection"),
    Row<CompositingTag>(kTagCompositing, "Compositing"),
    Row<UVWTag>(kTagUVW, "UVW"),
    Row<SegmentTag>(kTagSegment, "Segments"),
    Row<SelectionTag>(kTagPolygonSelection, "Polygon Selection"),
    Row<SelectionTag>(kTagPointSelection, "Point Selection"),
    Row<BaseTag>(kTagTarget, "Target"),
    PluginTag(5678),
    Row<VertexMapTag>(kTagVertexMap, "Vertex Map"),
    PluginTag(kTagPlugin, "Plug-in Tag"),
    PluginTag(5698),
    PluginTag(5699),
    PluginTag(5700),
    Row<SelectionTag>(kTagEdgeSelection, "Edge Selection"),
    // Materials and shaders.
    Row<Material>(kMaterialStandard, "Material"),
    {kMaterialPlugin, kMaterialPlugin, kMaterialPlugin, "Plug-in Material", &BaseMaterial::kNodeKind,
     MakePluginNode<BaseMaterial>},
    Row<BaseShader>(kShaderLabel, "Shader"),
    Row<NormalTag>(kTagNormal, "Normals"),
    Row<BaseShader>(kShaderBitmap, "Bitmap", nullptr, kShaderLabel),
    // Render settings and views.
    Row<BaseVideoPost>(kTypeVideoPost, nullptr),
    Row<RenderData>(kTypeRenderData, "Render Settings"),
    Row<BaseDraw>(kTypeBaseDraw, "Draw"),
    Row<ViewPanel>(kTypeViewPanel, "View"),
    // Objects and tags of plug-ins, and what else has a number from a million on.
    PluginTag(1001001),
    PlainObjects(1001002, 1001003),
    ObjectLabel(kObjectPolygonLabel, nullptr, MakePolygons),
    PlainObjects(1001253, 1001253),
    PlainObjects(1002603, 1002603),
    PlainObjects(1007455, 1007455),
    PluginTag(1007579),
    PlainObjects(1008796, 1008796),
    PlainObjects(1008982, 1008982),
    PluginTag(1009891),
    PlainObjects(1010865, 1010865),
    PluginTag(1011012),
    Object(kObjectSky, "Sky", MakeOpaqueData),
    Object(kObjectCloudGroup, "Cloud Group", MakeOpaqueData),
    Object(kObjectCloud, "Cloud", MakeOpaqueData),
    PluginTag(1016641),
    Object(kObjectJoint, "Joint", MakeOpaqueData, kObjectPolygonLabel),
    Object(kObjectSkin, "Skin", MakeOpaqueData),
    PluginTag(kTagWeight, "Weights", MakeData<WeightTagData>),
    PluginTag(1019597),
    PlainObjects(100004007, 100004007),
    Row<LayerObject>(kTypeLayer, "Layer"),
    PlainObjects(200000118, 200000118),
    Row<MultipassObject>(kTypeMultipass, nullptr),
    PluginTag(465000402),
    PluginTag(465000404),
};

constexpr Bool IsAscending()
{
  Long before = -1;
  for (const NodeType& row : kNodeTypes) {
    if (row.first <= before || row.last < row.first)
      return false;
    before = row.last;
  }
  return true;
}
static_assert(IsAscending(), "the search halves the table");

// The rows of the numbers that most nodes have, by number.
struct RowsByNumber
{
  static constexpr Long kFirst = 5100;
  static constexpr Long kLast = 5699;

  const NodeType* rows[kLast - kFirst + 1] = {};

  constexpr RowsByNumber()
  {
    for (const NodeType& row : kNodeTypes) {
      for (Long number = std::max(row.first, kFirst); number <= std::min(row.last, kLast); ++number)
        rows[number - kFirst] = &row;
    }
  }
};

constexpr RowsByNumber kRowsByNumber;

const NodeType* FindRow(Long number)
{
  if (number >= RowsByNumber::kFirst && number <= RowsByNumber::kLast)
    return kRowsByNumber.rows[number - RowsByNumber::kFirst];
  const NodeType* row = std::lower_bound(std::begin(kNodeTypes), std::end(kNodeTypes), number,
                                         [](const NodeType& each, Long wanted) { return each.last < wanted; });
  return row != std::end(kNodeTypes) && row->first <= number ? row : nullptr;
}

// A new node with its data, if the row has any.
template <class Node>
Node* MakeWhole(const NodeType& row, Long type, void (Node::*attach)(NodeData*))
{
  AllocationWatch watch;
  auto* node = NodeCast<Node>(row.make(row, type));
  if (!node || !row.makeData)
    return node;
  NodeData* data = row.makeData(row, type);
  (node->*attach)(data);
  if (!data || !data->Init())
    DeleteObj(node);
  return watch.Whole(node);
}

NodeData* DataOfType(Long type, const NodeKind& kind, Bool& known)
{
  const NodeType* row = FindNodeType(type, kind);
  known = row && row->makeData;
  return known ? row->makeData(*row, type) : nullptr;
}

} // namespace

const NodeType* FindNodeType(Long number, const NodeKind& kind)
{
  const NodeType* row = FindRow(number);
  return row && row->kind->Is(kind) ? row : nullptr;
}

const char* GetTypeName(Long type)
{
  const NodeType* row = FindRow(type);
  return row ? row->name : nullptr;
}

BaseObject* MakeObjectOfLabel(Long label)
{
  const NodeType* row = FindNodeType(label, BaseObject::kNodeKind);
  return row ? MakeWhole(*row, label, &BaseObject::SetObjectData) : nullptr;
}

BaseObject* AllocObject(Long type)
{
  const NodeType* row = FindNodeType(type, BaseObject::kNodeKind);
  return row && row->number == NodeNumber::kType ? MakeObjectOfLabel(type) : nullptr;
}

BaseTag* MakeTag(Long type)
{
  const NodeType* row = FindNodeType(type, BaseTag::kNodeKind);
  return row ? MakeWhole(*row, type, &BaseTag::SetNodeData) : NewObj<BaseTag>(type);
}

BaseMaterial* MakeMaterial(Long type)
{
  const NodeType* row = FindNodeType(type, BaseMaterial::kNodeKind);
  return row ? NodeCast<BaseMaterial>(row->make(*row, type)) : NewObj<BaseMaterial>(kMaterialPlugin, type);
}

NodeData* AllocLibraryNodeData(Long type, Bool& known)
{
  const NodeType* row = FindRow(type);
  // Neither plain data nor those of points read the chunk of a node's data: its bytes are kept without them.
  known = row && row->makeData && row->makeData != MakeData<NodeData> && row->makeData != MakeData<PointObjectData>;
  if (!known)
    return nullptr;
  return row->makeData == MakePolygonData ? NewObj<PolygonObjectData>() : row->makeData(*row, type);
}

NodeData* AllocObjectDataOfType(Long type, Bool& known) { return DataOfType(type, BaseObject::kNodeKind, known); }

NodeData* AllocTagDataOfType(Long pluginId, Bool& known) { return DataOfType(pluginId, BaseTag::kNodeKind, known); }

} // namespace _torvane_
