#include "geometry_details.h"

#include "node_details.h"
#include "torvane/objects/point_object.h"
#include "torvane/objects/point_object_data.h"
#include "torvane/tags/selection_tag.h"
#include "torvane/tags/value_tags.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

// One entry of an array.
Json EntryJson(const Vector& point) { return ToJson(point); }
Json EntryJson(const PolygonCorners& polygon) { return {polygon.a, polygon.b, polygon.c, polygon.d}; }
Json EntryJson(const SplineSegment& segment) { return {segment.points, segment.closed != 0}; }
Json EntryJson(const TangentPair& pair) { return {ToJson(pair.left), ToJson(pair.right)}; }
Json EntryJson(SReal weight) { return weight; }
Json EntryJson(const PackedNormals& normals) { return normals.components; }
Json EntryJson(const SelectSegment& segment) { return {segment.first, segment.last}; }

Json EntryJson(const PackedUVWQuad& quad)
{
  Json corners = Json::array();
  for (const PackedUVW& corner : quad.corners)
    corners.push_back(ToJson(UnpackUVW(corner)));
  return corners;
}

template <class Entry>
Json ArrayJson(const Entry* entries, Long count)
{
  Json array = Json::array();
  for (Long i = 0; i < count; ++i)
    array.push_back(EntryJson(entries[i]));
  return array;
}

Json SelectionJson(const BaseSelect& selection)
{
  return ArrayJson(selection.SegmentArray(), selection.SegmentCount());
}

Json ValuesOf(const SelectionTag& tag) { return SelectionJson(tag.GetSelect()); }
LLong CountOf(const SelectionTag& tag) { return tag.GetSelect().SelectedCount(); }

template <class Tag>
Json ValuesOf(const Tag& tag)
{
  return ArrayJson(tag.GetArray(), tag.GetCount());
}

template <class Tag>
LLong CountOf(const Tag& tag)
{
  return tag.GetCount();
}

struct ArrayKind
{
  const NodeKind& kind;
  Json (*values)(const BaseTag& tag);
  LLong (*count)(const BaseTag& tag);
  const char* one;
  const char* many;
};

template <class Tag>
constexpr ArrayKind KindOf(const char* one, const char* many)
{
  return {Tag::kNodeKind, [](const BaseTag& tag) { return ValuesOf(*NodeCast<Tag>(&tag)); },
          [](const BaseTag& tag) { return CountOf(*NodeCast<Tag>(&tag)); }, one, many};
}

constexpr ArrayKind kArrayKinds[] = {
    KindOf<PointTag>("point", "points"),       KindOf<PolygonTag>("polygon", "polygons"),
    KindOf<TangentTag>("point", "points"),     KindOf<UVWTag>("polygon", "polygons"),
    KindOf<SegmentTag>("segment", "segments"), KindOf<SelectionTag>("selected", "selected"),
    KindOf<VertexMapTag>("weight", "weights"), KindOf<NormalTag>("polygon", "polygons"),
};

const ArrayKind* FindKind(const BaseTag& tag)
{
  for (const ArrayKind& row : kArrayKinds) {
    if (tag.GetNodeKind().Is(row.kind))
      return &row;
  }
  return nullptr;
}

std::string Counted(LLong count, const char* one, const char* many)
{
  return std::to_string(count) + " " + (count == 1 ? one : many);
}

struct NamedSelection
{
  const char* name;
  const char* one;
  const char* many;
  BaseSelect* selection;
};

// The selections of an object's own data that hold something.
std::vector<NamedSelection> SelectionsOf(const BaseObject& object)
{
  std::vector<NamedSelection> all;
  if (auto* points = NodeCast<PointObjectData>(object.GetObjectData())) {
    all = {{"pointSelection", "point selected", "points selected", &points->GetPointSelection()},
           {"hiddenPoints", "point hidden", "points hidden", &points->GetHiddenPoints()}};
  }
  if (PolygonObjectData* polygons = GetPolygonData(object)) {
    all.insert(all.end(),
               {{"polygonSelection", "polygon selected", "polygons selected", &polygons->GetPolygonSelection()},
                {"hiddenPolygons", "polygon hidden", "polygons hidden", &polygons->GetHiddenPolygons()},
                {"edgeSelection", "edge selected", "edges selected", &polygons->GetEdgeSelection()},
                {"hiddenEdges", "edge hidden", "edges hidden", &polygons->GetHiddenEdges()},
                {"phongBreakEdges", "phong break", "phong breaks", &polygons->GetPhongBreakEdges()}});
  }
  std::erase_if(all, [](const NamedSelection& one) { return one.selection->SegmentCount() == 0; });
  return all;
}

const NgonData* NgonsOf(const BaseObject& object)
{
  const PolygonObjectData* polygons = GetPolygonData(object);
  const NgonData* ngons = polygons ? polygons->GetNgons() : nullptr;
  return ngons && ngons->GetCount() > 0 ? ngons : nullptr;
}

} // namespace

Json TagValues(BaseTag& tag)
{
  const ArrayKind* kind = FindKind(tag);
  return kind ? kind->values(tag) : Json();
}

std::string TagCountWords(BaseTag& tag)
{
  const ArrayKind* kind = FindKind(tag);
  return kind ? Counted(kind->count(tag), kind->one, kind->many) : std::string();
}

std::string GeometryWords(BaseObject& object)
{
  std::string words;
  auto add = [&](LLong count, const char* one, const char* many) {
    if (count > 0)
      words += (words.empty() ? "" : ", ") + Counted(count, one, many);
  };
  add(GetPointCount(object), "point", "points");
  add(GetPolygonCount(object), "polygon", "polygons");
  const NgonData* ngons = NgonsOf(object);
  add(ngons ? ngons->GetCount() : 0, "n-gon", "n-gons");
  for (const NamedSelection& one : SelectionsOf(object))
    add(one.selection->SelectedCount(), one.one, one.many);
  return words;
}

void AddGeometry(BaseObject& object, Json& json)
{
  for (const NamedSelection& one : SelectionsOf(object))
    json["selections"][one.name] = SelectionJson(*one.selection);
  const NgonData* ngons = NgonsOf(object);
  for (Long i = 0; ngons && i < ngons->GetCount(); ++i) {
    const NgonEntry& entry = *ngons->GetEntry(i);
    json["ngons"].push_back(std::vector<ULong>(entry.edges, entry.edges + entry.count));
  }
}

} // namespace q7r
