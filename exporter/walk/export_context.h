// What one export passes down from the composition to its layers.
#pragma once

#include "exporter/entry/host_calls.h"
#include "exporter/walk/layer_index.h"
#include "torvane/document/base_document.h"
#include "torvane/time/base_time.h"

namespace exporter
{

struct ExportContext
{
  _torvane_::BaseDocument* document = nullptr;
  ExportSuites* suites = nullptr;
  AEGP_LayerH layer = nullptr;                 // the layer being exported
  AEGP_LayerH enclosingLayer = nullptr;        // the layer that holds the nested composition being walked; null at top
  _torvane_::BaseObject* object = nullptr;     // made for `layer`
  _torvane_::LayerObject* lockLayer = nullptr; // shared by the locked layers of the top composition; made on first need
  // Streams of `layer`, held while its transform is exported.
  HostStream positionStream;
  HostStream rotateXStream;
  HostStream rotateYStream;
  HostStream rotateZStream;
  HostStream orientationStream;
  // Of the outermost composition: a nested one's own rate and work area play no part.
  A_Time workAreaStart = {0, 1}; // also the time at which single values are read
  A_Time workAreaDuration = {0, 1};
  A_Time frameDuration = {0, 1};
  _torvane_::Long framesPerSecond = 30; // rounded
  _torvane_::Long frameCount = 10;      // in the work area
  _torvane_::Real pixelAspect = 1.0;
  LayerIndex layers;
};

// The time of a frame's key, counted from the start of the composition.
inline _torvane_::BaseTime KeyTime(const ExportContext& context, _torvane_::Long frame)
{
  return _torvane_::BaseTime(frame, context.framesPerSecond > 0 ? context.framesPerSecond : 1);
}

} // namespace exporter
