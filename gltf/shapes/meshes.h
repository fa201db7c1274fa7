// What objects draw: planes, polygons, splines and points as meshes.
#pragma once

#include <map>
#include <tuple>
#include <utility>

#include "gltf/context.h"
#include "gltf/materials/materials.h"

namespace gltf
{

class Meshes
{
 public:
  explicit Meshes(Context& context) : context_(context), materials_(context) {}

  // The mesh of an object; kNone for one that draws nothing.
  std::size_t Find(_torvane_::BaseObject& object);

 private:
  using Quad = std::tuple<float, float, std::size_t>; // width and height in metres, material

  std::size_t FindQuad(_torvane_::BaseObject& object);
  std::size_t AddQuad(float width, float height, const Surface& surface);
  std::size_t CornersOf(float width, float height);
  std::size_t CoordinatesOfQuads();

  Context& context_;
  Materials materials_;
  std::map<Quad, std::size_t> quads_;                      // of equal size and material one mesh
  std::map<std::pair<float, float>, std::size_t> corners_; // accessors, as below
  std::size_t quadNormals_ = kNone;
  std::size_t quadIndices_ = kNone;
  std::size_t quadCoordinates_ = kNone;
};

// The mesh of an object with polygons; kNone if none of them can be drawn.
std::size_t AddPolygons(Context& context, Materials& materials, _torvane_::BaseObject& object);

// The mesh of a spline: lines, a primitive each segment; kNone for one without lines.
std::size_t AddSpline(Context& context, Materials& materials, const _torvane_::BaseObject& object);

// The mesh of points that nothing joins; kNone without points.
std::size_t AddPoints(Context& context, Materials& materials, const _torvane_::BaseObject& object);

// What every mesh of an object's own has: its name.
Json NewMesh(const _torvane_::BaseObject& object);

} // namespace gltf
