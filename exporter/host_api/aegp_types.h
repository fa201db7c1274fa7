// The types that After Effects hands to a general plug-in on 64-bit systems, and the values of its enumerations that
// the exporter meets. Names, sizes and numbers are the host's own; nothing here may change without it.
#pragma once

#include <cstddef>
#include <cstdint>

static_assert(sizeof(void*) == 8, "the host's interface is stated for 64-bit systems");

// Numbers and texts.
using A_Err = std::int32_t; // 0 is success
using SPErr = std::int32_t;
using A_long = std::int32_t;
using A_u_long = std::uint32_t;
using A_short = std::int16_t;
using A_Boolean = unsigned char;
using A_char = char;
using A_UTF16Char = std::uint16_t;
using A_FpLong = double;

// A time of value / scale seconds.
struct A_Time
{
  A_long value;
  A_u_long scale;
};

struct A_Ratio
{
  A_long num;
  A_u_long den;
};

// Components from 0 to 1, not multiplied by alpha.
struct AEGP_ColorVal
{
  A_FpLong alphaF, redF, greenF, blueF;
};

// Identifiers and enumerations.
using AEGP_Command = A_long;
using AEGP_PluginID = A_long;
using AEGP_LayerIDVal = A_long;
using AEGP_HookPriority = A_u_long;
using AEGP_ItemType = A_short;
using AEGP_LTimeMode = A_short;
using AEGP_MenuID = std::int32_t;
using AEGP_WindowType = std::int32_t;
using AEGP_ObjectType = A_long;
using AEGP_LayerFlags = A_long;
using AEGP_LayerStream = A_long;
using AEGP_StreamType = A_long;
using AEGP_FilmSizeUnits = A_long;
using AEGP_FootageSignature = A_long;
using AEGP_CameraType = A_u_long;
using AEGP_LightType = A_u_long;

// Handles: the host alone knows what they point to.
struct AEGP_Item;
struct AEGP_Comp;
struct AEGP_Layer;
struct AEGP_Footage;
struct AEGP_StreamRef;
struct AEGP_Mem;
using AEGP_ItemH = AEGP_Item*;
using AEGP_CompH = AEGP_Comp*;
using AEGP_LayerH = AEGP_Layer*;
using AEGP_FootageH = AEGP_Footage*;
using AEGP_StreamRefH = AEGP_StreamRef*;
using AEGP_MemHandle = AEGP_Mem*;

// What a plug-in gives to the host and gets back in its hooks.
using AEGP_GlobalRefcon = void*;
using AEGP_CommandRefcon = void*;
using AEGP_UpdateMenuRefcon = void*;

// The value of a stream at one time.
struct AEGP_FourDVal
{
  A_FpLong x, y, z, w;
};

struct AEGP_ThreeDVal
{
  A_FpLong x, y, z;
};

struct AEGP_TwoDVal
{
  A_FpLong x, y;
};

using AEGP_OneDVal = A_FpLong;

// The stream's type tells which member holds the value.
union AEGP_StreamVal2
{
  AEGP_FourDVal four_d;
  AEGP_ThreeDVal three_d;
  AEGP_TwoDVal two_d;
  AEGP_OneDVal one_d;
  AEGP_ColorVal color;
  void* pointer; // markers, masks, texts, arbitrary data
  A_long id;     // layers, masks
};

struct AEGP_StreamValue2
{
  AEGP_StreamRefH streamH;
  AEGP_StreamVal2 val;
};

static_assert(sizeof(A_Time) == 8 && offsetof(A_Time, scale) == 4);
static_assert(sizeof(A_Ratio) == 8 && offsetof(A_Ratio, den) == 4);
static_assert(sizeof(AEGP_ColorVal) == 32 && offsetof(AEGP_ColorVal, redF) == 8 &&
              offsetof(AEGP_ColorVal, greenF) == 16 && offsetof(AEGP_ColorVal, blueF) == 24);
static_assert(sizeof(A_Err) == 4 && sizeof(SPErr) == 4 && sizeof(A_long) == 4 && sizeof(A_u_long) == 4);
static_assert(sizeof(A_short) == 2 && sizeof(A_Boolean) == 1 && sizeof(A_char) == 1 && sizeof(A_UTF16Char) == 2);
static_assert(sizeof(A_FpLong) == 8);
static_assert(sizeof(AEGP_Command) == 4 && sizeof(AEGP_PluginID) == 4 && sizeof(AEGP_LayerIDVal) == 4);
static_assert(sizeof(AEGP_HookPriority) == 4 && sizeof(AEGP_MenuID) == 4 && sizeof(AEGP_WindowType) == 4);
static_assert(sizeof(AEGP_ItemType) == 2 && sizeof(AEGP_LTimeMode) == 2);
static_assert(sizeof(AEGP_ObjectType) == 4 && sizeof(AEGP_LayerFlags) == 4 && sizeof(AEGP_LayerStream) == 4);
static_assert(sizeof(AEGP_StreamType) == 4 && sizeof(AEGP_FilmSizeUnits) == 4 && sizeof(AEGP_FootageSignature) == 4);
static_assert(sizeof(AEGP_CameraType) == 4 && sizeof(AEGP_LightType) == 4);
// The handles themselves are meant here, not what they point at. NOLINTBEGIN(bugprone-sizeof-expression)
static_assert(sizeof(AEGP_ItemH) == 8 && sizeof(AEGP_CompH) == 8 && sizeof(AEGP_LayerH) == 8);
static_assert(sizeof(AEGP_FootageH) == 8 && sizeof(AEGP_StreamRefH) == 8 && sizeof(AEGP_MemHandle) == 8);
// NOLINTEND(bugprone-sizeof-expression)
static_assert(sizeof(AEGP_StreamVal2) == 32);
static_assert(sizeof(AEGP_StreamValue2) == 40 && offsetof(AEGP_StreamValue2, val) == 8);

// Menus and hooks.
inline constexpr AEGP_MenuID AEGP_Menu_EXPORT = 13; // File > Export
inline constexpr A_long AEGP_MENU_INSERT_SORTED = -2;
inline constexpr AEGP_HookPriority AEGP_HP_AfterAE = 2;
inline constexpr AEGP_Command AEGP_Command_ALL = 0; // a command hook for every command

// Items and footage.
inline constexpr AEGP_ItemType AEGP_ItemType_COMP = 2;
inline constexpr AEGP_ItemType AEGP_ItemType_FOOTAGE = 4;
inline constexpr AEGP_FootageSignature AEGP_FootageSignature_NONE = 0;
inline constexpr AEGP_FootageSignature AEGP_FootageSignature_SOLID = 0x536F6C69; // "Soli"

// Layers.
inline constexpr AEGP_ObjectType AEGP_ObjectType_NONE = -1;
inline constexpr AEGP_ObjectType AEGP_ObjectType_AV = 0;
inline constexpr AEGP_ObjectType AEGP_ObjectType_LIGHT = 1;
inline constexpr AEGP_ObjectType AEGP_ObjectType_CAMERA = 2;
inline constexpr AEGP_ObjectType AEGP_ObjectType_TEXT = 3;
inline constexpr AEGP_ObjectType AEGP_ObjectType_VECTOR = 4;

inline constexpr AEGP_LayerFlags AEGP_LayerFlag_NONE = 0;
inline constexpr AEGP_LayerFlags AEGP_LayerFlag_VIDEO_ACTIVE = 0x0001;
inline constexpr AEGP_LayerFlags AEGP_LayerFlag_LOCKED = 0x0020;
inline constexpr AEGP_LayerFlags AEGP_LayerFlag_LAYER_IS_3D = 0x0800;
inline constexpr AEGP_LayerFlags AEGP_LayerFlag_LOOK_AT_POI = 0x2000;
inline constexpr AEGP_LayerFlags AEGP_LayerFlag_NULL_LAYER = 0x10000;

inline constexpr AEGP_CameraType AEGP_CameraType_PERSPECTIVE = 0;
inline constexpr AEGP_CameraType AEGP_CameraType_ORTHOGRAPHIC = 1;
// What a caller holds before it has asked: no camera has it.
inline constexpr AEGP_CameraType AEGP_CameraType_NONE = 0xFFFFFFFFu;

inline constexpr AEGP_FilmSizeUnits AEGP_FilmSizeUnits_NONE = 0;
inline constexpr AEGP_FilmSizeUnits AEGP_FilmSizeUnits_HORIZONTAL = 1;
inline constexpr AEGP_FilmSizeUnits AEGP_FilmSizeUnits_VERTICAL = 2;
inline constexpr AEGP_FilmSizeUnits AEGP_FilmSizeUnits_DIAGONAL = 3;

inline constexpr AEGP_LightType AEGP_LightType_PARALLEL = 0;
inline constexpr AEGP_LightType AEGP_LightType_SPOT = 1;
inline constexpr AEGP_LightType AEGP_LightType_POINT = 2;
inline constexpr AEGP_LightType AEGP_LightType_AMBIENT = 3;

// Streams.
inline constexpr AEGP_LayerStream AEGP_LayerStream_NONE = -1;
inline constexpr AEGP_LayerStream AEGP_LayerStream_ANCHORPOINT = 0; // the point of interest of cameras and lights
inline constexpr AEGP_LayerStream AEGP_LayerStream_POSITION = 1;
inline constexpr AEGP_LayerStream AEGP_LayerStream_SCALE = 2;
inline constexpr AEGP_LayerStream AEGP_LayerStream_ROTATE_Z = 3;
inline constexpr AEGP_LayerStream AEGP_LayerStream_ROTATE_X = 8;
inline constexpr AEGP_LayerStream AEGP_LayerStream_ROTATE_Y = 9;
inline constexpr AEGP_LayerStream AEGP_LayerStream_ORIENTATION = 10;
inline constexpr AEGP_LayerStream AEGP_LayerStream_ZOOM = 11;
inline constexpr AEGP_LayerStream AEGP_LayerStream_FOCUS_DISTANCE = 13;
inline constexpr AEGP_LayerStream AEGP_LayerStream_INTENSITY = 16;
inline constexpr AEGP_LayerStream AEGP_LayerStream_COLOR = 17;
inline constexpr AEGP_LayerStream AEGP_LayerStream_CONE_ANGLE = 18;
inline constexpr AEGP_LayerStream AEGP_LayerStream_CONE_FEATHER = 19;
inline constexpr AEGP_LayerStream AEGP_LayerStream_SHADOW_DARKNESS = 20;
inline constexpr AEGP_LayerStream AEGP_LayerStream_CASTS_SHADOWS = 28;

inline constexpr AEGP_StreamType AEGP_StreamType_ThreeD_SPATIAL = 1;
inline constexpr AEGP_StreamType AEGP_StreamType_ThreeD = 2;
inline constexpr AEGP_StreamType AEGP_StreamType_OneD = 5;
inline constexpr AEGP_StreamType AEGP_StreamType_COLOR = 6;

inline constexpr AEGP_LTimeMode AEGP_LTimeMode_LayerTime = 0;
inline constexpr AEGP_LTimeMode AEGP_LTimeMode_CompTime = 1;
