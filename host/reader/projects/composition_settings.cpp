#include "host/reader/projects/composition_settings.h"

#include <cmath>

#include "host/reader/projects/layouts.h"

namespace host::projects
{

namespace
{

constexpr double kFraction = 65536; // a rate's last 16 bits count these
constexpr std::int64_t kLargestSize = 30000;
constexpr double kLargestRate = 999;
constexpr double kFrameSlack = 0.05; // what a time in 600ths of a second may be off at a common rate

A_long ReadSize(const Chunk& settings, Field<u16> field)
{
  const A_long size = settings.Get(field);
  if (size < 1 || size > kLargestSize)
    settings.Refuse("expected a size from 1 to 30000, not " + std::to_string(size));
  return size;
}

// A whole number where there is one in reach.
Ratio SnapToFrame(const Ratio& frames)
{
  const std::int64_t nearest = frames.Round();
  return std::abs(frames.ToDouble() - static_cast<double>(nearest)) < kFrameSlack ? Ratio(nearest) : frames;
}

void ReadRate(const Chunk& data, CompositionSettings& settings)
{
  settings.frameRate = data.Get(cdta::kRate) + data.Get(cdta::kRateFraction) / kFraction;
  if (!(settings.frameRate > 0 && settings.frameRate <= kLargestRate))
    data.Refuse("expected a frame rate above 0 and not above 999");
  settings.framesPerSecond = {data.Get(cdta::kTicksPerSecond), data.Get(cdta::kTicksPerFrame)};
  const Ratio frame = Ratio(1) / settings.framesPerSecond;
  if (!(Ratio(0) < frame) || frame.Numerator() > 0x7FFFFFFF)
    data.Refuse("expected ticks for a frame and for a second above 0");
  settings.frameDuration = {static_cast<A_long>(frame.Numerator()), static_cast<A_u_long>(frame.Divisor())};
}

void ReadTimes(const Chunk& data, CompositionSettings& settings)
{
  settings.duration = data.Get(cdta::kDuration);
  if (!(Ratio(0) < settings.duration))
    data.Refuse("expected a duration above 0");
  const Ratio frames = SnapToFrame(settings.duration * settings.framesPerSecond);
  settings.duration = frames / settings.framesPerSecond;
  settings.workAreaStart = SnapToFrame(data.Get(cdta::kWorkAreaStart) * settings.framesPerSecond);
  const bool isToTheEnd = data.Get(Field<u32>{cdta::kWorkAreaEnd.offset}) == cdta::kToTheEnd;
  settings.workAreaEnd = isToTheEnd ? frames : SnapToFrame(data.Get(cdta::kWorkAreaEnd) * settings.framesPerSecond);
  if (frames < settings.workAreaEnd)
    settings.workAreaEnd = frames;
  if (settings.workAreaEnd < settings.workAreaStart)
    data.Refuse("the work area ends before it starts");
}

} // namespace

CompositionSettings ReadCompositionSettings(const Chunk& item)
{
  const Chunk data = item.Require("cdta"_tag);
  CompositionSettings settings;
  settings.width = ReadSize(data, cdta::kWidth);
  settings.height = ReadSize(data, cdta::kHeight);
  const Ratio aspect = data.Get(cdta::kPixelAspect);
  if (!(Ratio(0) < aspect) || aspect.Numerator() > 0x7FFFFFFF)
    data.Refuse("expected a pixel aspect ratio above 0");
  settings.pixelAspect = {static_cast<A_long>(aspect.Numerator()), static_cast<A_u_long>(aspect.Divisor())};
  ReadRate(data, settings);
  ReadTimes(data, settings);
  return settings;
}

LayerRecord ReadLayerRecord(const Chunk& layer)
{
  const Chunk data = layer.Require("ldta"_tag);
  LayerRecord record;
  record.id = data.Get(ldta::kId);
  record.kind = data.Get(ldta::kKind);
  record.switches = data.Get(ldta::kSwitches);
  record.moreSwitches = data.Get(ldta::kMoreSwitches);
  record.source = record.kind == ldta::kAudioVideo ? data.Get(ldta::kSource) : 0;
  record.parent = data.Get(ldta::kParent);
  record.lightKind = data.Get(ldta::kLightKind);
  record.cameraKind = data.Get(ldta::kCameraKind);
  record.filmSizeUnits = data.Get(ldta::kFilmSizeUnits);
  record.filmSize = data.Get(ldta::kFilmSize);
  if (record.kind == ldta::kCamera && !std::isfinite(record.filmSize))
    data.Refuse("expected a finite film size");
  record.start = data.Get(ldta::kStart);
  record.in = data.Get(ldta::kIn);
  record.out = data.Get(ldta::kOut);
  const Ratio stretch{data.Get(ldta::kStretch), data.Get(ldta::kStretchDivisor)};
  if (!(stretch == Ratio(0)))
    record.stretch = stretch;
  return record;
}

} // namespace host::projects
