// What all parts of a conversion share.
#pragma once

#include "gltf/converter.h"
#include "gltf/output.h"
#include "gltf/scene_tree.h"
#include "gltf/timeline.h"

namespace gltf
{

struct Context
{
  _torvane_::BaseDocument& document;
  const Options& options;
  const SceneTree& tree;
  const SceneSettings& settings;
  Timeline& timeline;
  Output& output;
  bool lit; // materials are
};

} // namespace gltf
