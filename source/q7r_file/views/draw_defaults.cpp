#include "q7r_file/views/draw_defaults.h"

#include "torvane/objects/base_object.h"
#include "torvane/objects/camera_object_data.h"
#include "torvane/views/base_draw.h"

namespace _torvane_
{

namespace
{

enum class Kind : UChar
{
  kBool,
  kLong,
  kReal,
  kVector,
};

struct DrawDefault
{
  Long id;
  Kind kind;
  Real number;
  Vector vector = {};
};

// In the order in which a file holds them. (1038 counts as a switch, but holds 10.)
constexpr DrawDefault kDrawDefaults[] = {
    {1019, Kind::kBool, 1},
    {1020, Kind::kBool, 0},
    {1021, Kind::kBool, 0},
    {1022, Kind::kBool, 1},
    {1023, Kind::kReal, 0.8},
    {1024, Kind::kReal, 0.9},
    {1025, Kind::kBool, 0},
    {1026, Kind::kReal, 0.8},
    {1027, Kind::kBool, 0},
    {1028, Kind::kReal, 1.0},
    {1029, Kind::kBool, 1},
    {1031, Kind::kReal, 0.25},
    {1032, Kind::kReal, 0.1},
    {1038, Kind::kLong, 10},
    {1037, Kind::kReal, 0.0},
    {1044, Kind::kBool, 0},
    {1045, Kind::kBool, 1},
    {1046, Kind::kReal, 1.0},
    {1047, Kind::kReal, 1.0},
    {1048, Kind::kReal, 1.0},
    {1049, Kind::kBool, 1},
    {1050, Kind::kBool, 1},
    {1051, Kind::kReal, 0.0},
    {1064, Kind::kReal, 0.75},
    {1052, Kind::kReal, 100.0},
    {1053, Kind::kLong, 100},
    {1054, Kind::kLong, 10},
    {1056, Kind::kLong, 1},
    {1058, Kind::kBool, 1},
    {1059, Kind::kBool, 1},
    {1060, Kind::kBool, 1},
    {1061, Kind::kBool, 0},
    {1062, Kind::kBool, 1},
    {3026, Kind::kBool, 1},
    {3028, Kind::kBool, 1},
    {1065, Kind::kBool, 1},
    {1066, Kind::kReal, 0.10000000149011612},
    {1068, Kind::kBool, 0},
    {1070, Kind::kBool, 0},
    {1071, Kind::kBool, 0},
    {1072, Kind::kBool, 0},
    {2007, Kind::kVector, 0, {1.0, 0.67, 0.1}},
    {2001, Kind::kVector, 0, {0.2, 0.2, 0.2}},
    {2002, Kind::kVector, 0, {0.8, 0.8, 0.8}},
    {3001, Kind::kBool, 1},
    {3002, Kind::kBool, 1},
    {3003, Kind::kBool, 1},
    {3004, Kind::kBool, 1},
    {3005, Kind::kBool, 1},
    {3006, Kind::kBool, 1},
    {3027, Kind::kBool, 1},
    {3007, Kind::kBool, 1},
    {3008, Kind::kBool, 1},
};

// Settings of a draw that tell its view.
constexpr Long kDrawViewIds[] = {1003, 1042, 1004, 1043};

struct View
{
  Long projection;
  Long values[4]; // of kDrawViewIds
};

// In the order of a panel.
constexpr View kViews[kDrawCount] = {
    {0, {0, 0, 0, 0}},
    {6, {6, 1, 6, 1}},
    {3, {6, 1, 6, 1}},
    {4, {6, 1, 6, 1}},
};

constexpr Real kPerspectiveFocalLength = 36.0;

} // namespace

void SetDrawDefaults(BaseContainer& settings)
{
  for (const DrawDefault& entry : kDrawDefaults) {
    switch (entry.kind) {
    case Kind::kBool:
      settings.SetBool(entry.id, entry.number != 0.0);
      break;
    case Kind::kLong:
      settings.SetLong(entry.id, static_cast<Long>(entry.number));
      break;
    case Kind::kReal:
      settings.SetReal(entry.id, entry.number);
      break;
    case Kind::kVector:
      settings.SetVector(entry.id, entry.vector);
      break;
    }
  }
}

void SetViewOfIndex(BaseDraw& draw, Long index)
{
  const View& view = kViews[index];
  BaseContainer& camera = draw.GetEditorCamera()->GetDataInstance();
  camera.SetLong(kCameraProjection, view.projection);
  if (index == 0) {
    camera.SetReal(kCameraFocalLength, kPerspectiveFocalLength);
  } else {
    camera.SetReal(1000, 1.0);
    camera.SetReal(1118, 0.0);
    camera.SetReal(1119, 0.0);
  }
  for (Long i = 0; i < 4; ++i)
    draw.GetDataInstance().SetLong(kDrawViewIds[i], view.values[i]);
}

} // namespace _torvane_
