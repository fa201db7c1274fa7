// Points, polygons and selections in a listing.
#pragma once

#include <string>

#include "json_text.h"

namespace q7r
{

// "8 points, 6 polygons, 2 points selected" of an object; empty for one without geometry.
std::string GeometryWords(_torvane_::BaseObject& object);
// "8 points" of a tag with an array, "5 selected" of a selection tag; empty for others.
std::string TagCountWords(_torvane_::BaseTag& tag);
// Adds the object's own selections ("selections", by name) and the edges of its n-gons ("ngons") where it has them.
void AddGeometry(_torvane_::BaseObject& object, Json& json);

} // namespace q7r
