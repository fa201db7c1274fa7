// What particular classes of nodes add to a listing. One place for each family; arrays and selections have a file of
// their own.
#pragma once

#include <string>
#include <vector>

#include "json_text.h"
#include "node_index.h"

namespace q7r
{

// The parameters of an object's own data, by id; an empty object where there are none.
Json ObjectParams(_torvane_::BaseObject& object);
// The measured distribution of a light; null without one.
Json ObjectIES(_torvane_::BaseObject& object);
// The array of a tag; null for a tag without one.
Json TagValues(_torvane_::BaseTag& tag);
Json MaterialsJson(_torvane_::BaseDocument& document, NodeIndex& index);
Json ViewsJson(_torvane_::BaseDocument& document, NodeIndex& index);

// A few words about a node for the listing of people, such as "8 points"; empty where there is nothing to tell.
std::string ObjectWords(_torvane_::BaseObject& object);
std::string TagWords(_torvane_::BaseTag& tag);
// The lines of materials with their shaders, and of views with their draws.
std::vector<std::string> MaterialLines(_torvane_::BaseDocument& document);
std::vector<std::string> ViewLines(_torvane_::BaseDocument& document);

} // namespace q7r
