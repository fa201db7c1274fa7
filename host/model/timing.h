// Frame rates, frame durations and times of the host.
#pragma once

#include "exporter/host_api/aegp_types.h"

#include <cstdint>
#include <optional>

namespace host
{

// The exact duration of a frame at a rate above 0, at most 999: 1/n for a whole rate, 1001/(1000 n) for the rates of
// television (23.976, 29.97, 59.94), else 1000/round(1000 rate), with at least 1 below the line.
A_Time FrameDuration(double framesPerSecond);

// `frames` frames as a time, unreduced: (frames x value, scale) of the duration. Nothing if that doesn't fit.
std::optional<A_Time> FramesToTime(std::int64_t frames, A_Time frameDuration);

// How many frames `time` lies behind 0. A result within 1e-9 of a whole number is that number. Neither scale, nor the
// duration's value, may be 0.
double FrameAt(A_Time time, A_Time frameDuration);

} // namespace host
