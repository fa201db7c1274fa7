#include "q7r_file/views/draw_defaults.h"

#include "k2v_file/values/container_defaults.h"
#include "torvane/objects/base_object.h"
#include "torvane/objects/camera_object_data.h"
#include "torvane/views/base_draw.h"

namespace _torvane_
{

namespace
{

// In the order in which a file holds them. (1038 counts as a switch, but holds 10.)
constexpr ContainerDefault kDrawDefaults[] = {
    {1019, DefaultForm::kBool, 1},
    {1020, DefaultForm::kBool, 0},
    {1021, DefaultForm::kBool, 0},
    {1022, DefaultForm::kBool, 1},
    {1023, DefaultForm::kReal, 0.8},
    {1024, DefaultForm::kReal, 0.9},
    {1025, DefaultForm::kBool, 0},
    {1026, DefaultForm::kReal, 0.8},
    {1027, DefaultForm::kBool, 0},
    {1028, DefaultForm::kReal, 1.0},
    {1029, DefaultForm::kBool, 1},
    {1031, DefaultForm::kReal, 0.25},
    {1032, DefaultForm::kReal, 0.1},
    {1038, DefaultForm::kLong, 10},
    {1037, DefaultForm::kReal, 0.0},
    {1044, DefaultForm::kBool, 0},
    {1045, DefaultForm::kBool, 1},
    {1046, DefaultForm::kReal, 1.0},
    {1047, DefaultForm::kReal, 1.0},
    {1048, DefaultForm::kReal, 1.0},
    {1049, DefaultForm::kBool, 1},
    {1050, DefaultForm::kBool, 1},
    {1051, DefaultForm::kReal, 0.0},
    {1064, DefaultForm::kReal, 0.75},
    {1052, DefaultForm::kReal, 100.0},
    {1053, DefaultForm::kLong, 100},
    {1054, DefaultForm::kLong, 10},
    {1056, DefaultForm::kLong, 1},
    {1058, DefaultForm::kBool, 1},
    {1059, DefaultForm::kBool, 1},
    {1060, DefaultForm::kBool, 1},
    {1061, DefaultForm::kBool, 0},
    {1062, DefaultForm::kBool, 1},
    {3026, DefaultForm::kBool, 1},
    {3028, DefaultForm::kBool, 1},
    {1065, DefaultForm::kBool, 1},
    {1066, DefaultForm::kReal, 0.10000000149011612},
    {1068, DefaultForm::kBool, 0},
    {1070, DefaultForm::kBool, 0},
    {1071, DefaultForm::kBool, 0},
    {1072, DefaultForm::kBool, 0},
    {2007, DefaultForm::kVector, 0, {1.0, 0.67, 0.1}},
    {2001, DefaultForm::kVector, 0, {0.2, 0.2, 0.2}},
    {2002, DefaultForm::kVector, 0, {0.8, 0.8, 0.8}},
    {3001, DefaultForm::kBool, 1},
    {3002, DefaultForm::kBool, 1},
    {3003, DefaultForm::kBool, 1},
    {3004, DefaultForm::kBool, 1},
    {3005, DefaultForm::kBool, 1},
    {3006, DefaultForm::kBool, 1},
    {3027, DefaultForm::kBool, 1},
    {3007, DefaultForm::kBool, 1},
    {3008, DefaultForm::kBool, 1},
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

void SetDrawDefaults(BaseContainer& settings) { settings.SetDefaults(DefaultsOf<kDrawDefaults>()); }

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
