#include "type_names.h"

#include <algorithm>
#include <iterator>

namespace q7r
{

namespace
{

struct Row
{
  _torvane_::Long type;
  const char* name;
};

// Ascending.
constexpr Row kNames[] = {
    {5100, "Polygon"},
    {5101, "Spline"},
    {5102, "Light"},
    {5103, "Camera"},
    {5140, "Null"},
    {5154, "Object"},
    {5156, "Points"},
    {5168, "Plane"},
    {5600, "Points"},
    {5604, "Polygons"},
    {5613, "Display"},
    {5616, "Texture"},
    {5617, "Tangents"},
    {5629, "Protection"},
    {5637, "Compositing"},
    {5671, "UVW"},
    {5672, "Segments"},
    {5673, "Polygon Selection"},
    {5674, "Point Selection"},
    {5676, "Target"},
    {5682, "Vertex Map"},
    {5691, "Plug-in Tag"},
    {5701, "Edge Selection"},
    {5703, "Material"},
    {5705, "Plug-in Material"},
    {5707, "Shader"},
    {5711, "Normals"},
    {5833, "Bitmap"},
    {110304, "Render Settings"},
    {110305, "Draw"},
    {110306, "View"},
    {1011146, "Sky"},
    {1011194, "Cloud Group"},
    {1011196, "Cloud"},
    {1019362, "Joint"},
    {1019363, "Skin"},
    {1019365, "Weights"},
    {100004801, "Layer"},
};

} // namespace

std::string TypeName(_torvane_::Long type)
{
  const auto* row = std::lower_bound(std::begin(kNames), std::end(kNames), type,
                                     [](const Row& r, _torvane_::Long t) { return r.type < t; });
  return row != std::end(kNames) && row->type == type ? row->name : "type " + std::to_string(type);
}

} // namespace q7r
