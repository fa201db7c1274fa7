// Where the values stand in the chunks of a project, in bytes from the start of a chunk's data.
#pragma once

#include "host/reader/projects/chunk.h"

namespace host::projects
{

using u8 = std::uint8_t;
using u16 = std::uint16_t;
using u32 = std::uint32_t;
using i32 = std::int32_t;
using f32 = float;
using f64 = double;

namespace head
{
inline constexpr Field<u32> kVersion{4}; // in bits, as ProgramVersion takes them apart
}

// An item of the project.
namespace idta
{
inline constexpr Field<u16> kKind{0}; // kFolder, kComposition, kFootage
inline constexpr Field<u32> kId{16};  // what layers name

inline constexpr u16 kFolder = 1;
inline constexpr u16 kComposition = 4;
inline constexpr u16 kFootage = 7;
} // namespace idta

// The settings of a composition.
namespace cdta
{
inline constexpr Field<u32> kTicksPerFrame{4};
inline constexpr Field<u32> kTicksPerSecond{8};
inline constexpr RatioField<u32> kWorkAreaStart{28}; // seconds
inline constexpr RatioField<u32> kWorkAreaEnd{36};   // seconds; numerator kToTheEnd: the end of the composition
inline constexpr RatioField<u32> kDuration{44};      // seconds
inline constexpr Field<u16> kWidth{140};
inline constexpr Field<u16> kHeight{142};
inline constexpr RatioField<u32> kPixelAspect{144};
inline constexpr Field<u16> kRate{156};         // frames a second, the whole part
inline constexpr Field<u16> kRateFraction{158}; // and 65536ths

inline constexpr u32 kToTheEnd = 0xFFFFFFFF;
} // namespace cdta

// What a layer is, and when.
namespace ldta
{
inline constexpr Field<u32> kId{0};
inline constexpr Field<i32> kStretch{8};      // over kStretchDivisor; 1 when one of them is 0
inline constexpr RatioField<i32> kStart{12};  // composition time of layer time 0, in seconds
inline constexpr RatioField<i32> kIn{20};     // layer time, in seconds
inline constexpr RatioField<i32> kOut{28};    // layer time, in seconds
inline constexpr Field<u8> kSwitches{38};     // k3D, kLooksAtPoint, kNull
inline constexpr Field<u8> kMoreSwitches{39}; // kVideo, kLocked
inline constexpr Field<u32> kSource{40};      // id of an item
inline constexpr Field<u32> kStretchDivisor{108};
inline constexpr Field<u8> kKind{131};        // kAudioVideo and so on
inline constexpr Field<u32> kParent{132};     // id of a layer, 0 for none
inline constexpr Field<u32> kLightKind{136};  // kParallel to kEnvironment
inline constexpr Field<u32> kCameraKind{140}; // 0 perspective, 1 orthographic
inline constexpr Field<u32> kFilmSizeUnits{148};
inline constexpr Field<f64> kFilmSize{152}; // pixels at 72 an inch

inline constexpr u8 k3D = 0x04;
inline constexpr u8 kLooksAtPoint = 0x40;
inline constexpr u8 kNull = 0x80;
inline constexpr u8 kVideo = 0x01;
inline constexpr u8 kLocked = 0x20;

inline constexpr u8 kAudioVideo = 0;
inline constexpr u8 kLight = 1;
inline constexpr u8 kCamera = 2;
inline constexpr u8 kText = 3;
inline constexpr u8 kShape = 4;
inline constexpr u8 kModel = 5;

inline constexpr u32 kParallel = 0;
inline constexpr u32 kAmbient = 3;
inline constexpr u32 kEnvironment = 4;
} // namespace ldta

// Switches of a property.
namespace tdsb
{
inline constexpr Field<u32> kSwitches{0};

inline constexpr u32 kSeparated = 0x02; // on a position: its dimensions are separated
} // namespace tdsb

// The form of a property's values.
namespace tdb4
{
inline constexpr Field<u16> kComponents{2};
inline constexpr Field<u8> kForm{5}; // kSpatial, kWide
inline constexpr Field<u32> kTicksPerSecond{12};
inline constexpr Field<u8> kExpressionOff{119}; // 1: there is one, and it is switched off

inline constexpr u8 kSpatial = 0x08; // moves along a path
inline constexpr u8 kWide = 0x06;    // one of the bits: keyframes with tangents
} // namespace tdb4

// The header of a table, whose items stand in `ldat`.
namespace lhd3
{
inline constexpr Field<u32> kItems{8};
inline constexpr Field<u32> kItemSize{16};
} // namespace lhd3

// A keyframe. The values behind are at places that depend on the number of components and on the form.
namespace keyframe
{
inline constexpr std::size_t kTime = 0; // i32, ticks of layer time
inline constexpr std::size_t kWayIn = 4;
inline constexpr std::size_t kWayOut = 5;
inline constexpr std::size_t kSwitches = 7; // kRoving
inline constexpr std::size_t kPlainValues = 8;
inline constexpr std::size_t kWideEase = 24;   // f64 speed in, influence in, speed out, influence out
inline constexpr std::size_t kWideValues = 56; // value, tangent in, tangent out

inline constexpr u8 kBezier = 2; // a way in or out
inline constexpr u8 kHold = 3;
inline constexpr u8 kRoving = 0x20;
} // namespace keyframe

// Footage.
namespace sspc
{
inline constexpr Field<u16> kWidth{32};
inline constexpr Field<u16> kHeight{36};
inline constexpr RatioField<u32> kDuration{38}; // seconds
inline constexpr Field<u32> kRate{56};          // native frames a second, the whole part
inline constexpr Field<u16> kRateFraction{60};  // and 65536ths
inline constexpr Field<u8> kLoops{129};
inline constexpr Field<u16> kForcedRate{148}; // frames a second that it is made to have; 0: its own
inline constexpr Field<u16> kForcedRateFraction{150};
inline constexpr Field<u32> kFirstNumber{172}; // of a sequence's files; kUnknown
inline constexpr Field<u32> kLastNumber{176};
inline constexpr Field<u32> kDigits{180};

inline constexpr u32 kUnknown = 0xFFFFFFFF;
} // namespace sspc

// What footage is made of.
namespace opti
{
inline constexpr Field<u32> kSource{0}; // kSolid, kPlaceholder, else the format of a file
inline constexpr Field<f32> kRed{14};   // 0 to 1
inline constexpr Field<f32> kGreen{18};
inline constexpr Field<f32> kBlue{22};
inline constexpr std::size_t kSolidName = 26;
inline constexpr std::size_t kPlaceholderName = 10;

inline constexpr Tag kSolid = "Soli"_tag;
inline constexpr Tag kPlaceholder = 0;
} // namespace opti

} // namespace host::projects
