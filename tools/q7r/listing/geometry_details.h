// Points, polygons and selections in a listing.
#pragma once

#include <string>

#include "output/value_sink.h"
#include "torvane/objects/base_object.h"
#include "torvane/tags/base_tag.h"

namespace q7r
{

// "8 points, 6 polygons, 2 points selected" of an object; empty for one without geometry.
std::string GeometryWords(_torvane_::BaseObject& object);
// "8 points" of a tag with an array, "5 selected" of a selection tag; empty for others.
std::string TagCountWords(_torvane_::BaseTag& tag);
// The object's own selections ("selections", by name) and the edges of its n-gons ("ngons") where it has them.
void TellGeometry(ValueSink& sink, _torvane_::BaseObject& object);
// The array of a tag ("values"); nothing for a tag without one.
void TellTagValues(ValueSink& sink, _torvane_::BaseTag& tag);

} // namespace q7r
