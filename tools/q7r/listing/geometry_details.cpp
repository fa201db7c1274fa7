#include "geometry_details.h"

#include <algorithm>
#include <vector>

#include "torvane/objects/point_object.h"
#include "torvane/objects/point_object_data.h"
#include "torvane/tags/selection_tag.h"
#include "torvane/tags/value_tags.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

// The numbers of one entry, and how many there are.
template <class Entry>
struct EntryForm;

template <>
struct EntryForm<Vector>
{
  static constexpr NumberRows kForm = {nullptr, 0, 3, 0, false, true, nullptr};
  static void Get(const Vector& point, double* row) { row[0] = point.x, row[1] = point.y, row[2] = point.z; }
};

template <>
struct EntryForm<PolygonCorners>
{
  static constexpr NumberRows kForm = {nullptr, 0, 4, 0, true, true, nullptr};
  static void Get(const PolygonCorners& polygon, double* row)
  {
    row[0] = polygon.a, row[1] = polygon.b, row[2] = polygon.c, row[3] = polygon.d;
  }
};

template <>
struct EntryForm<TangentPair>
{
  static constexpr NumberRows kForm = {nullptr, 0, 6, 3, false, true, nullptr};
  static void Get(const TangentPair& pair, double* row)
  {
    EntryForm<Vector>::Get(pair.left, row);
    EntryForm<Vector>::Get(pair.right, row + 3);
  }
};

template <>
struct EntryForm<SReal>
{
  static constexpr NumberRows kForm = {nullptr, 0, 1, 0, false, true, nullptr};
  static void Get(SReal weight, double* row) { *row = static_cast<double>(weight); }
};

template <>
struct EntryForm<ULong>
{
  static constexpr NumberRows kForm = {nullptr, 0, 1, 0, true, true, nullptr};
  static void Get(ULong number, double* row) { *row = number; }
};

template <>
struct EntryForm<PackedNormals>
{
  static constexpr NumberRows kForm = {nullptr, 0, 12, 0, true, true, nullptr};
  static void Get(const PackedNormals& normals, double* row) { std::copy_n(normals.components, 12, row); }
};

template <>
struct EntryForm<SelectSegment>
{
  static constexpr NumberRows kForm = {nullptr, 0, 2, 0, true, true, nullptr};
  static void Get(const SelectSegment& segment, double* row) { row[0] = segment.first, row[1] = segment.last; }
};

template <>
struct EntryForm<PackedUVWQuad>
{
  static constexpr NumberRows kForm = {nullptr, 0, 12, 3, false, true, nullptr};
  static void Get(const PackedUVWQuad& quad, double* row)
  {
    for (std::size_t corner = 0; corner < 4; ++corner)
      EntryForm<Vector>::Get(UnpackUVW(quad.corners[corner]), row + 3 * corner);
  }
};

template <class Entry>
void TellArray(ValueSink& sink, const Entry* entries, Long count)
{
  NumberRows rows = EntryForm<Entry>::kForm;
  rows.entries = entries;
  rows.count = count;
  rows.get = [](const void* all, long long index, double* row) {
    EntryForm<Entry>::Get(static_cast<const Entry*>(all)[index], row);
  };
  sink.Rows(rows);
}

// The second of the two is a truth value.
void TellArray(ValueSink& sink, const SplineSegment* segments, Long count)
{
  sink.BeginArray(ValueSink::Layout::kLine);
  for (Long i = 0; i < count; ++i) {
    sink.BeginArray();
    sink.Integer(segments[i].points);
    sink.Bool(segments[i].closed != 0);
    sink.EndArray();
  }
  sink.EndArray();
}

void TellSelection(ValueSink& sink, const BaseSelect& selection)
{
  TellArray(sink, selection.SegmentArray(), selection.SegmentCount());
}

void TellValuesOf(ValueSink& sink, const SelectionTag& tag) { TellSelection(sink, tag.GetSelect()); }
LLong CountOf(const SelectionTag& tag) { return tag.GetSelect().SelectedCount(); }

template <class Tag>
void TellValuesOf(ValueSink& sink, const Tag& tag)
{
  TellArray(sink, tag.GetArray(), tag.GetCount());
}

template <class Tag>
LLong CountOf(const Tag& tag)
{
  return tag.GetCount();
}

struct ArrayKind
{
  const NodeKind& kind;
  void (*tell)(ValueSink& sink, const BaseTag& tag);
  LLong (*count)(const BaseTag& tag);
  const char* one;
  const char* many;
};

template <class Tag>
constexpr ArrayKind KindOf(const char* one, const char* many)
{
  return {Tag::kNodeKind, [](ValueSink& sink, const BaseTag& tag) { TellValuesOf(sink, *NodeCast<Tag>(&tag)); },
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

void TellTagValues(ValueSink& sink, BaseTag& tag)
{
  if (const ArrayKind* kind = FindKind(tag)) {
    sink.Key("values");
    kind->tell(sink, tag);
  }
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

void TellGeometry(ValueSink& sink, BaseObject& object)
{
  const std::vector<NamedSelection> selections = SelectionsOf(object);
  if (!selections.empty()) {
    sink.Key("selections");
    sink.BeginObject();
    for (const NamedSelection& one : selections) {
      sink.Key(one.name);
      TellSelection(sink, *one.selection);
    }
    sink.EndObject();
  }
  const NgonData* ngons = NgonsOf(object);
  if (!ngons)
    return;
  sink.Key("ngons");
  sink.BeginArray();
  for (Long i = 0; i < ngons->GetCount(); ++i)
    TellArray(sink, ngons->GetEntry(i)->edges, ngons->GetEntry(i)->count);
  sink.EndArray();
}

} // namespace q7r
