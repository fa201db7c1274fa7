// The parameters of a light: ids, kinds and defaults, stated once.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

enum class LightKind : UChar
{
  kNone, // no parameter
  kLong,
  kReal,
  kBool,
  kVector,
};

// Parameters with a known meaning; the others are known by number alone. Angles are radians.
inline constexpr Long kLightKnotCount = 80013;     // Long, 0 to kMaxLightKnots
inline constexpr Long kLightShadowDensity = 50001; // Real, 1.0 is 100 %
inline constexpr Long kLightColor = 90000;         // Vector, components from 0 to 1
inline constexpr Long kLightBrightness = 90001;    // Real, 1.0 is 100 %
inline constexpr Long kLightType = 90002;          // Long, a LightType or another number
inline constexpr Long kLightShadow = 90003;        // Long: kLightShadowNone or kLightShadowOn
inline constexpr Long kLightInnerAngle = 90010;    // Real
inline constexpr Long kLightOuterAngle = 90011;    // Real

enum LightType : Long
{
  kLightPoint = 0,
  kLightSpot = 1,
  kLightOther = 4, // parallel, ambient, and all else that an export meets
  kLightIES = 9,   // by a measured distribution
};

inline constexpr Long kLightShadowNone = 0;
inline constexpr Long kLightShadowOn = 1;

// The ids from `first` to `last`. The default stands for every component of a Vector.
struct LightParameterRange
{
  Long first;
  Long last;
  LightKind kind;
  Real number;
};

// In the order of the ids.
inline constexpr LightParameterRange kLightParameters[] = {
    {1002, 1002, LightKind::kLong, 0},
    {50000, 50004, LightKind::kReal, 0},
    {50005, 50007, LightKind::kLong, 0},
    {50008, 50012, LightKind::kBool, 0},
    {50013, 50013, LightKind::kVector, 0},
    {50015, 50015, LightKind::kBool, 0},
    {50016, 50016, LightKind::kReal, 0},
    {60000, 60001, LightKind::kLong, 0},
    {60002, 60006, LightKind::kReal, 0},
    {60007, 60007, LightKind::kVector, 0},
    {60008, 60008, LightKind::kBool, 0},
    {60009, 60009, LightKind::kVector, 0},
    {70000, 70003, LightKind::kBool, 0},
    {70004, 70006, LightKind::kReal, 0},
    {70009, 70009, LightKind::kReal, 0},
    {70019, 70021, LightKind::kReal, 0},
    {70022, 70023, LightKind::kBool, 0},
    {70027, 70027, LightKind::kReal, 0},
    {70028, 70028, LightKind::kVector, 0},
    {80000, 80006, LightKind::kReal, 0},
    {80007, 80012, LightKind::kBool, 0},
    {80013, 80015, LightKind::kLong, 0},
    {90000, 90000, LightKind::kVector, 1.0},
    {90001, 90001, LightKind::kReal, 1.0},
    {90002, 90005, LightKind::kLong, 0},
    {90006, 90008, LightKind::kBool, true},
    {90009, 90009, LightKind::kBool, false},
    {90010, 90010, LightKind::kReal, 0},
    {90011, 90011, LightKind::kReal, 0.5235987755982988}, // 30 degrees
    {90012, 90012, LightKind::kReal, 0},
    {90013, 90013, LightKind::kReal, 100.0},
    {90014, 90014, LightKind::kLong, 0},
    {90015, 90017, LightKind::kBool, false},
    {90018, 90018, LightKind::kBool, true},
    {90019, 90020, LightKind::kBool, false},
    {90021, 90021, LightKind::kReal, 0},
    {90022, 90022, LightKind::kReal, 1.0},
    {90024, 90024, LightKind::kReal, 0},
    {90025, 90025, LightKind::kReal, 500.0},
    {90027, 90028, LightKind::kBool, false},
    {90029, 90029, LightKind::kReal, 0},
    {90030, 90030, LightKind::kReal, 10.0},
    {90031, 90031, LightKind::kReal, 90.0},
    {90032, 90032, LightKind::kReal, 100.0},
    {90033, 90033, LightKind::kBool, false},
    {91000, 91000, LightKind::kBool, 0},
    {91001, 91001, LightKind::kReal, 0},
    {91002, 91002, LightKind::kLong, 0},
    {91003, 91003, LightKind::kBool, 0},
    {91004, 91004, LightKind::kReal, 0},
    {91005, 91006, LightKind::kLong, 0},
    {91007, 91008, LightKind::kReal, 0},
};

// Where a parameter is kept: among those of its kind, counted in the order of the table.
struct LightSlot
{
  LightKind kind;
  Long index;
};

constexpr LightSlot FindLightSlot(Long id)
{
  for (const LightParameterRange& range : kLightParameters) {
    if (id < range.first || id > range.last)
      continue;
    Long index = id - range.first;
    for (const LightParameterRange* before = kLightParameters; before != &range; ++before)
      index += before->kind == range.kind ? before->last - before->first + 1 : 0;
    return {range.kind, index};
  }
  return {LightKind::kNone, 0};
}

constexpr Long CountLightParameters(LightKind kind)
{
  Long count = 0;
  for (const LightParameterRange& range : kLightParameters)
    count += range.kind == kind ? range.last - range.first + 1 : 0;
  return count;
}

} // namespace _torvane_
