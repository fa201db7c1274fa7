// What a project says of a composition and of a layer, apart from properties.
#pragma once

#include "exporter/host_api/aegp_types.h"
#include "host/reader/projects/chunk.h"

namespace host::projects
{

struct CompositionSettings
{
  A_long width = 0;
  A_long height = 0;
  A_Ratio pixelAspect{1, 1};
  double frameRate = 0;       // as the host states it
  Ratio framesPerSecond;      // the exact rate
  A_Time frameDuration{1, 1}; // its inverse
  Ratio duration;             // seconds
  Ratio workAreaStart;        // frames; whole numbers but for a rounding in the file are whole here
  Ratio workAreaEnd;          // frames
  double frames() const { return (duration * framesPerSecond).ToDouble(); }
};

// `item` is the composition's. Throws CompositionError, as ReadLayerRecord does.
CompositionSettings ReadCompositionSettings(const Chunk& item);

struct LayerRecord
{
  std::uint32_t id = 0;
  std::uint32_t source = 0; // id of an item, 0 for none
  std::uint32_t parent = 0; // id of a layer, 0 for none
  std::uint8_t kind = 0;    // ldta::kAudioVideo and so on
  std::uint8_t switches = 0;
  std::uint8_t moreSwitches = 0;
  std::uint32_t lightKind = 0;
  std::uint32_t cameraKind = 0;
  std::uint32_t filmSizeUnits = 0;
  double filmSize = 0; // pixels
  Ratio start;         // seconds of the composition
  Ratio in;            // seconds of layer time
  Ratio out;
  Ratio stretch{1}; // never 0
};

LayerRecord ReadLayerRecord(const Chunk& layer); // a list `Layr`

} // namespace host::projects
