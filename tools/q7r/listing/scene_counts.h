// How much a scene holds.
#pragma once

#include <map>
#include <string>

#include "scene_file.h"
#include "torvane/document/base_document.h"

namespace q7r
{

struct SceneCounts
{
  std::map<_torvane_::Long, long long> objects; // by type
  std::map<_torvane_::Long, long long> tags;
  long long materials = 0;
  long long tracks = 0; // of every node, and their keys
  long long keys = 0;
};

SceneCounts CountScene(_torvane_::BaseDocument& document);

// Counts what a file holds without the scene in memory: every object and material is counted as it is read, and goes
// again. The document that is left has the rest. Throws Failure for what LoadScene can't read.
DocumentPtr CountFile(const std::string& path, SceneCounts& counts);

} // namespace q7r
