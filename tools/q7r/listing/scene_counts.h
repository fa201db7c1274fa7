// How much a scene holds.
#pragma once

#include <map>

#include "torvane/document/base_document.h"

namespace q7r
{

struct SceneCounts
{
  std::map<_torvane_::Long, long long> objects; // by type
  std::map<_torvane_::Long, long long> tags;
  long long tracks = 0; // of every node, and their keys
  long long keys = 0;
};

SceneCounts CountScene(_torvane_::BaseDocument& document);

} // namespace q7r
