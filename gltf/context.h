// What all parts of a conversion share.
#pragma once

#include "gltf/converter.h"
#include "gltf/file/output.h"
#include "gltf/motion/timeline.h"
#include "gltf/scene/scene_tree.h"

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
