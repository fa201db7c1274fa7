// Splines as lines, and points that nothing joins.
#include "gltf/shapes/meshes.h"
#include "torvane/objects/point_object.h"
#include "torvane/objects/spline_object.h"
#include "torvane/tags/value_tags.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

constexpr int kModePoints = 0;
constexpr int kModeLoop = 2;
constexpr int kModeStrip = 3;
constexpr int kSteps = 16; // of a piece with tangents

Vector BezierPoint(const Vector& a, const Vector& b, const Vector& c, const Vector& d, Real t)
{
  const Real r = 1.0 - t;
  return a * (r * r * r) + b * (3.0 * r * r * t) + c * (3.0 * r * t * t) + d * (t * t * t);
}

class SplineMesh
{
 public:
  SplineMesh(Context& context, Materials& materials, const BaseObject& object)
      : context_(context),
        materials_(materials),
        object_(object),
        points_(GetPointTag(object)->GetArray()),
        pointCount_(GetPointCount(object))
  {
    const Long type = object.GetDataInstance().GetLong(kSplineType);
    const TangentTag* tangents = GetTangentTag(object);
    if (tangents && tangents->GetCount() >= pointCount_ && type != kSplineLinear)
      tangents_ = tangents->GetArray();
    else if (type != kSplineLinear)
      context.output.account.Tell(Loss::kSplineType);
  }

  std::size_t Write()
  {
    Json mesh = NewMesh(object_);
    Json& primitives = mesh["primitives"] = Json::array();
    const SegmentTag* segments = GetSegmentTag(object_);
    const Long count = segments ? segments->GetCount() : 0;
    Long first = 0;
    for (Long i = 0; i < count && first < pointCount_; ++i) {
      const SplineSegment& segment = segments->GetArray()[i];
      const Long length = std::clamp(segment.points, 0, pointCount_ - first);
      AddSegment(primitives, first, length, segment.closed != 0);
      first += length;
    }
    if (count == 0)
      AddSegment(primitives, 0, pointCount_, false);
    return primitives.empty() ? kNone : context_.output.meshes.Add(mesh);
  }

 private:
  void AddSegment(Json& primitives, Long first, Long count, bool closed)
  {
    if (count < 2)
      return;
    std::vector<float> line;
    for (Long i = 0; i < count; ++i) {
      AddPoint(line, points_[first + i]);
      const bool isLast = i + 1 == count;
      if (tangents_ && (!isLast || closed))
        AddBetween(line, first + i, isLast ? first : first + i + 1);
    }
    primitives.push_back(
        {{"attributes", {{"POSITION", context_.output.AddFloats(line, 3, ViewTarget::kVertices, true)}}},
         {"material", materials_.Find(nullptr, false).material},
         {"mode", closed ? kModeLoop : kModeStrip}});
  }

  // The points of a curve between its ends; none where it has no tangents.
  void AddBetween(std::vector<float>& line, Long from, Long to)
  {
    const Vector right = tangents_[from].right;
    const Vector left = tangents_[to].left;
    if (right == Vector() && left == Vector())
      return;
    for (int step = 1; step < kSteps; ++step)
      AddPoint(line, BezierPoint(points_[from], points_[from] + right, points_[to] + left, points_[to],
                                 static_cast<Real>(step) / kSteps));
  }

  void AddPoint(std::vector<float>& line, const Vector& point)
  {
    const Vector place = ToPlace(point, context_.settings.unit);
    for (const Real number : {place.x, place.y, place.z})
      line.push_back(context_.output.ToSingle(number));
  }

  Context& context_;
  Materials& materials_;
  const BaseObject& object_;
  const Vector* points_;
  Long pointCount_;
  const TangentPair* tangents_ = nullptr; // null for straight lines
};

} // namespace

std::size_t AddSpline(Context& context, Materials& materials, const BaseObject& object)
{
  return SplineMesh(context, materials, object).Write();
}

std::size_t AddPoints(Context& context, Materials& materials, const BaseObject& object)
{
  Output& output = context.output;
  const PointTag& points = *GetPointTag(object);
  std::vector<float> values;
  values.reserve(3 * static_cast<std::size_t>(points.GetCount()));
  for (Long i = 0; i < points.GetCount(); ++i) {
    const Vector place = ToPlace(points.GetArray()[i], context.settings.unit);
    for (const Real number : {place.x, place.y, place.z})
      values.push_back(output.ToSingle(number));
  }
  Json mesh = NewMesh(object);
  const Json attributes = {{"POSITION", output.AddFloats(values, 3, ViewTarget::kVertices, true)}};
  mesh["primitives"] = Json::array(
      {{{"attributes", attributes}, {"material", materials.Find(nullptr, false).material}, {"mode", kModePoints}}});
  return output.meshes.Add(mesh);
}

} // namespace gltf
