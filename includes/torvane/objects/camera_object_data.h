// The camera: object data without fields. Everything lies in the container of the camera's object; what the class adds
// are the default entries and the parameters that are computed from them.
#pragma once

#include "torvane/nodes/private_chunk.h"

namespace _torvane_
{

class BaseContainer;

// Entries of a camera's container that have a known meaning; the others stand by number among the defaults in
// camera_object_data.cpp. Lengths are millimetres, angles radians, times seconds.
inline constexpr Long kCameraFocalLength = 500;     // Real
inline constexpr Long kCameraProjection = 1001;     // Long: the two below, or one of others known by number
inline constexpr Long kCameraApertureWidth = 1006;  // Real
inline constexpr Long kCameraUseTarget = 1009;      // Bool: false without a target tag whose link is set
inline constexpr Long kCameraFocusDistance = 1010;  // Real
inline constexpr Long kCameraFilmSpeed = 1231;      // Real
inline constexpr Long kCameraApertureNumber = 1201; // Real
inline constexpr Long kCameraExposureTime = 1211;   // Real
inline constexpr Long kCameraTemperature = 1311;    // Real, kelvin

inline constexpr Long kProjectionPerspective = 0;
inline constexpr Long kProjectionParallel = 4;

// The pair of distances 4204 and 4206 is computed from the entries 4201, 4202, 4205 and 4208, whenever one of these but
// 4202 is set through SetParameter, for the perspective projection and a 4208 other than 0.

// Computed parameters.
inline constexpr Long kCameraFieldOfView = 1008;         // Real, horizontal; setting stores the focal length
inline constexpr Long kCameraVerticalFieldOfView = 4600; // Real; takes the film aspect of the render settings
inline constexpr Long kCameraEquivalentText = 1133;      // String, read only: the focal length on 36 mm film
// A position in a list, 1 for the first, or 0 for a value that the list lacks; setting stores the value.
inline constexpr Long kCameraApertureWidthPreset = 1131;
inline constexpr Long kCameraFocalLengthPreset = 1132;
inline constexpr Long kCameraApertureNumberPreset = 1200;
inline constexpr Long kCameraExposureTimePreset = 1215;
inline constexpr Long kCameraFilmSpeedPreset = 1232;
inline constexpr Long kCameraTemperaturePreset = 1310;

class CameraObjectData : public NodeData
{
 public:
  static constexpr NodeKindOf<CameraObjectData> kNodeKind{"camera data", &NodeData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }
  const NodeKind& GetOwnerKind() const override;

  Bool IsInstanceOf(Long type) const override { return type == kObjectCamera || NodeData::IsInstanceOf(type); }
  // Sets every default in the container of the node; false without a node.
  Bool Init() override;
  // Answer the computed parameters and leave all others to the object. False without a node. Setting a position
  // outside its list changes nothing and gives true, but false for kCameraTemperaturePreset.
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;

 private:
  BaseContainer& GetSettings() const;
  Real GetAspectFactor() const;
  Bool HasTarget() const;
  void SetFieldOfView(Real angle, Real factor);
};

} // namespace _torvane_
