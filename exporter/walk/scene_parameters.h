// Parameters of the objects that the exporter makes.
#pragma once

#include "torvane/types.h"

namespace exporter
{

using _torvane_::Long;

// Cameras. The field of view is derived from focal length and aperture.
inline constexpr Long kCameraProjection = 1001;
inline constexpr Long kProjectionPerspective = 0;
inline constexpr Long kProjectionParallel = 4;
inline constexpr Long kCameraAperture = 1006;      // Real, millimetres
inline constexpr Long kCameraFieldOfView = 1008;   // Real, radians
inline constexpr Long kCameraFocusDistance = 1010; // Real

// Lights.
inline constexpr Long kLightColor = 90000;     // Vector, 0 to 1
inline constexpr Long kLightIntensity = 90001; // Real, 1.0 is full
inline constexpr Long kLightType = 90002;
inline constexpr Long kLightTypePoint = 0;
inline constexpr Long kLightTypeSpot = 1;
inline constexpr Long kLightTypeOther = 4;
inline constexpr Long kLightShadow = 90003;
inline constexpr Long kLightShadowNone = 0;
inline constexpr Long kLightShadowOn = 1;
inline constexpr Long kLightInnerAngle = 90010;    // Real, radians
inline constexpr Long kLightOuterAngle = 90011;    // Real, radians
inline constexpr Long kLightShadowDensity = 50001; // Real, 1.0 is full

// Planes.
inline constexpr Long kPlaneWidth = 1230;  // Real
inline constexpr Long kPlaneHeight = 1231; // Real
inline constexpr Long kPlaneHeightSegments = 1232;
inline constexpr Long kPlaneWidthSegments = 1233;
inline constexpr Long kPlaneAxis = 1300;
inline constexpr Long kPlaneAxisTowardsViewer = 5;

// Texture tags.
inline constexpr Long kTextureProjection = 1004;
inline constexpr Long kTextureProjectionUVW = 6;

} // namespace exporter
