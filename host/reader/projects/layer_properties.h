// The streams of a layer from the properties of a project: units, defaults, keyframes, expressions.
#pragma once

#include "host/model/composition.h"
#include "host/reader/projects/composition_settings.h"
#include "host/reader/projects/keyframe_builder.h"

#include <set>
#include <string>

namespace host::projects
{

// What of a file nobody has seen After Effects do; each is told once.
using Doubts = std::set<std::string>;

struct LayerContext
{
  const CompositionSettings& composition;
  const LayerRecord& record;
  LayerClock clock;
  Doubts& doubts;
};

// Fills the streams of a layer whose kind, flags and source are known. `properties` is the layer's own group.
void ReadStreams(const PropertyGroup& properties, const LayerContext& context, Layer& layer);

} // namespace host::projects
