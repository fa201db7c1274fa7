// Polygon objects: their corners as vertices, their polygons as triangles by material.
#include <algorithm>
#include <bit>
#include <cmath>
#include <cstring>
#include <map>
#include <unordered_map>
#include <unordered_set>

#include "gltf/shapes/meshes.h"
#include "gltf/text.h"
#include "torvane/objects/point_object.h"
#include "torvane/tags/selection_tag.h"
#include "torvane/tags/value_tags.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

// What is told apart at a corner beside its point.
struct Corner
{
  float uv[2] = {0.0F, 0.0F};
  float normal[3] = {0.0F, 0.0F, 0.0F};

  bool operator==(const Corner&) const = default;
};

class PolygonMesh
{
 public:
  PolygonMesh(Context& context, Materials& materials, BaseObject& object)
      : context_(context),
        materials_(materials),
        object_(object),
        pointCount_(GetPointCount(object)),
        polygonCount_(GetPolygonCount(object)),
        points_(GetPointTag(object)->GetArray()),
        polygons_(GetPolygonTag(object)->GetArray())
  {
    FindTags();
  }

  std::size_t Write()
  {
    std::vector<const TextureTag*> cover = CoverOf();
    for (Long i = 0; i < polygonCount_; ++i)
      AddPolygon(i, triangles_[cover[static_cast<std::size_t>(i)]]);
    if (vertices_.empty())
      return kNone;
    Json mesh = NewMesh(object_);
    Json& primitives = mesh["primitives"] = Json::array();
    AddPrimitives(primitives);
    AddExtras(mesh);
    return context_.output.meshes.Add(mesh);
  }

 private:
  struct Vertex
  {
    Long point;
    Corner corner;

    bool operator==(const Vertex&) const = default;
  };
  static constexpr std::uint32_t kFree = ~std::uint32_t{0};

  // The first tag of each kind whose array is long enough.
  template <class Tag>
  const Tag* TagWith(Long count, std::size_t& others)
  {
    const Tag* first = nullptr;
    for (const BaseTag* tag = object_.GetFirstTag(); tag; tag = tag->GetNext()) {
      const auto* candidate = NodeCast<Tag>(tag);
      if (!candidate)
        continue;
      if (candidate->GetCount() < count)
        context_.output.account.Tell(Loss::kBrokenTag);
      else if (first)
        ++others;
      else
        first = candidate;
    }
    return first;
  }

  void FindTags()
  {
    std::size_t more = 0;
    std::size_t ignored = 0;
    uvw_ = TagWith<UVWTag>(polygonCount_, more);
    normals_ = TagWith<NormalTag>(polygonCount_, ignored);
    if (more > 0)
      context_.output.account.Tell(Loss::kMoreCoordinates);
    for (const BaseTag* tag = object_.GetFirstTag(); tag; tag = tag->GetNext()) {
      if (tag->GetType() == kTagSmoothing && !normals_)
        context_.output.account.Tell(Loss::kSmoothing);
      const auto* selection = NodeCast<SelectionTag>(tag);
      if (selection && tag->GetDiskType() == kTagPolygonSelection)
        selections_.emplace(ToUtf8(tag->GetName()), selection); // the first of a name
    }
    materials_.TellTagLosses(object_);
  }

  // The texture tag that shows on each polygon, or null: later tags over earlier ones.
  std::vector<const TextureTag*> CoverOf()
  {
    std::vector<const TextureTag*> cover(static_cast<std::size_t>(polygonCount_), nullptr);
    for (const BaseTag* tag = object_.GetFirstTag(); tag; tag = tag->GetNext()) {
      const auto* texture = NodeCast<TextureTag>(tag);
      if (!texture)
        continue;
      const String restriction = tag->GetDataInstance().GetString(kTextureOldName);
      if (!restriction.Content())
        std::fill(cover.begin(), cover.end(), texture);
      else
        CoverSelection(ToUtf8(restriction), texture, cover);
    }
    return cover;
  }

  void CoverSelection(const std::string& name, const TextureTag* texture, std::vector<const TextureTag*>& cover)
  {
    const auto found = selections_.find(name);
    if (found == selections_.end()) {
      context_.output.account.Tell(Loss::kTextureSelection);
      return;
    }
    drawn_.insert(found->second);
    const BaseSelect& selected = found->second->GetSelect();
    for (Long i = 0; i < selected.SegmentCount(); ++i) {
      const SelectSegment& run = selected.SegmentArray()[i];
      for (Long polygon = std::max(run.first, 0); polygon <= std::min(run.last, polygonCount_ - 1); ++polygon)
        cover[static_cast<std::size_t>(polygon)] = texture;
    }
  }

  // The mirror turns the winding: a, c, b and a, d, c.
  void AddPolygon(Long index, std::vector<std::uint32_t>& indices)
  {
    const PolygonCorners& polygon = polygons_[index];
    const Long corners[4] = {polygon.a, polygon.b, polygon.c, polygon.d};
    for (const Long corner : corners) {
      if (corner < 0 || corner >= pointCount_) {
        context_.output.account.Tell(Loss::kBrokenPolygon);
        return;
      }
    }
    Corner details[4];
    ReadCorners(index, corners, details);
    auto add = [&](int first, int second, int third) {
      const Long a = corners[first], b = corners[second], c = corners[third];
      if (a == b || b == c || a == c)
        return;
      for (const int corner : {first, second, third})
        indices.push_back(VertexOf(corners[corner], details[corner]));
    };
    add(0, 2, 1);
    if (polygon.c != polygon.d)
      add(0, 3, 2);
  }

  void ReadCorners(Long index, const Long (&corners)[4], Corner (&details)[4])
  {
    if (uvw_) {
      for (int i = 0; i < 4; ++i) {
        const Vector uvw = UnpackUVW(uvw_->GetArray()[index].corners[i]);
        details[i].uv[0] = context_.output.ToSingle(uvw.x);
        details[i].uv[1] = context_.output.ToSingle(uvw.y);
      }
    }
    Vector quad[4];
    if (!normals_ || !normals_->ReadPolygonNormals(index, quad))
      return;
    for (int i = 0; i < 4; ++i) {
      const Vector normal = ToDirection(Length(quad[i]) > 0.0 ? Normalize(quad[i]) : FaceNormal(corners));
      details[i].normal[0] = static_cast<float>(normal.x);
      details[i].normal[1] = static_cast<float>(normal.y);
      details[i].normal[2] = static_cast<float>(normal.z) + 0.0F;
    }
  }

  // For a corner without a normal, in the scene's axes.
  Vector FaceNormal(const Long (&corners)[4]) const
  {
    const Vector across = points_[corners[2]] - points_[corners[0]];
    const Vector normal = Normalize(Cross(points_[corners[1]] - points_[corners[0]], across));
    const bool isUnit = std::fabs(Length(normal) - 1.0) < 1e-6; // not of no area, nor of points beyond all measure
    return isUnit ? normal : Vector(0.0, 0.0, -1.0);
  }

  std::uint32_t VertexOf(Long point, const Corner& corner)
  {
    if (2 * vertices_.size() >= places_.size())
      GrowTable();
    std::uint32_t& place = PlaceOf({point, corner});
    if (place == kFree) {
      place = static_cast<std::uint32_t>(vertices_.size());
      vertices_.push_back({point, corner});
    }
    return place;
  }

  std::uint32_t& PlaceOf(const Vertex& vertex)
  {
    std::size_t place = HashOf(vertex);
    for (;; ++place) {
      std::uint32_t& index = places_[place & (places_.size() - 1)];
      if (index == kFree || vertices_[index] == vertex)
        return index;
    }
  }

  static std::size_t HashOf(const Vertex& vertex)
  {
    std::uint64_t hash = static_cast<std::uint64_t>(vertex.point) + 1;
    auto add = [&hash](float number) {
      hash = (hash ^ std::bit_cast<std::uint32_t>(number + 0.0F)) * 0x9E3779B97F4A7C15U;
      hash ^= hash >> 29;
    };
    for (const float number : vertex.corner.uv)
      add(number);
    for (const float number : vertex.corner.normal)
      add(number);
    return static_cast<std::size_t>(hash);
  }

  void GrowTable()
  {
    places_.assign(std::max<std::size_t>(1024, 2 * places_.size()), kFree);
    for (std::size_t i = 0; i < vertices_.size(); ++i)
      PlaceOf(vertices_[i]) = static_cast<std::uint32_t>(i);
  }

  // An attribute of `width` floats a vertex, which `read(vertex, values)` gives.
  template <class Read>
  std::size_t AddAttribute(std::size_t width, bool bounds, Read&& read)
  {
    std::vector<float> values(vertices_.size() * width);
    for (std::size_t i = 0; i < vertices_.size(); ++i)
      read(vertices_[i], values.data() + i * width);
    return context_.output.AddFloats(values, width, ViewTarget::kVertices, bounds);
  }

  Json AddAttributes()
  {
    Output& output = context_.output;
    Json attributes = {{"POSITION", AddAttribute(3, true, [&](const Vertex& vertex, float* out) {
                          const Vector place = ToPlace(points_[vertex.point], context_.settings.unit);
                          out[0] = output.ToSingle(place.x);
                          out[1] = output.ToSingle(place.y);
                          out[2] = output.ToSingle(place.z);
                        })}};
    if (normals_)
      attributes["NORMAL"] =
          AddAttribute(3, false, [](const Vertex& vertex, float* out) { std::memcpy(out, vertex.corner.normal, 12); });
    if (uvw_)
      attributes["TEXCOORD_0"] =
          AddAttribute(2, false, [](const Vertex& vertex, float* out) { std::memcpy(out, vertex.corner.uv, 8); });
    AddWeights(attributes);
    return attributes;
  }

  void AddWeights(Json& attributes)
  {
    for (const BaseTag* tag = object_.GetFirstTag(); tag; tag = tag->GetNext()) {
      const auto* map = NodeCast<VertexMapTag>(tag);
      if (!map)
        continue;
      if (map->GetCount() < pointCount_) {
        context_.output.account.Tell(Loss::kBrokenTag);
        continue;
      }
      attributes["_WEIGHT_" + std::to_string(weights_.size())] =
          AddAttribute(1, false, [&](const Vertex& vertex, float* out) {
            *out = context_.output.ToSingle(map->GetArray()[vertex.point]);
          });
      weights_.push_back(ToUtf8(tag->GetName()));
    }
  }

  void AddPrimitives(Json& primitives)
  {
    const Json attributes = AddAttributes();
    bool lacksCoordinates = false;
    std::unordered_map<std::size_t, std::vector<std::uint32_t>> byMaterial;
    std::vector<std::size_t> order;
    // In the order of the tags; what no tag covers comes first.
    auto add = [&](const TextureTag* tag) {
      const auto found = triangles_.find(tag);
      if (found == triangles_.end() || found->second.empty())
        return;
      lacksCoordinates = lacksCoordinates || (tag && !uvw_ && materials_.HasPicture(*tag));
      const std::size_t material = materials_.Find(tag, uvw_ != nullptr).material;
      const auto [part, isFirst] = byMaterial.try_emplace(material);
      if (isFirst)
        order.push_back(material);
      part->second.insert(part->second.end(), found->second.begin(), found->second.end());
    };
    add(nullptr);
    for (const BaseTag* tag = object_.GetFirstTag(); tag; tag = tag->GetNext()) {
      if (const auto* texture = NodeCast<TextureTag>(tag))
        add(texture);
    }
    for (const std::size_t material : order)
      primitives.push_back({{"attributes", attributes},
                            {"indices", context_.output.AddIndices(byMaterial[material], vertices_.size())},
                            {"material", material}});
    if (lacksCoordinates)
      context_.output.account.Tell(Loss::kNoCoordinates);
  }

  void AddExtras(Json& mesh)
  {
    if (!weights_.empty())
      mesh["extras"]["q7r"]["weights"] = weights_;
    for (const BaseTag* tag = object_.GetFirstTag(); tag; tag = tag->GetNext()) {
      const auto* selection = NodeCast<SelectionTag>(tag);
      if (!selection)
        continue;
      const Long type = tag->GetDiskType();
      if (drawn_.contains(selection))
        continue;
      context_.output.account.Tell(Loss::kSelection);
      const char* of = type == kTagPolygonSelection ? "polygons" : type == kTagPointSelection ? "points" : "edges";
      mesh["extras"]["q7r"]["selections"].push_back(
          {{"name", ToUtf8(tag->GetName())}, {"of", of}, {"count", selection->GetSelect().SelectedCount()}});
    }
  }

  Context& context_;
  Materials& materials_;
  BaseObject& object_;
  Long pointCount_;
  Long polygonCount_;
  const Vector* points_;
  const PolygonCorners* polygons_;
  const UVWTag* uvw_ = nullptr;
  const NormalTag* normals_ = nullptr;
  std::map<std::string, const SelectionTag*> selections_;
  std::unordered_set<const SelectionTag*> drawn_; // those that a texture tag draws
  std::vector<std::string> weights_;              // names of the vertex maps
  std::vector<Vertex> vertices_;
  std::vector<std::uint32_t> places_; // of the vertices: a hash table of a power of two
  std::map<const TextureTag*, std::vector<std::uint32_t>> triangles_;
};

} // namespace

std::size_t AddPolygons(Context& context, Materials& materials, BaseObject& object)
{
  return PolygonMesh(context, materials, object).Write();
}

} // namespace gltf
