// Cameras, lights and views in listings.
#include <cstdio>

#include "geometry_details.h"
#include "ies_text.h"
#include "node_details.h"
#include "scene_file.h"
#include "torvane/objects/camera_object_data.h"
#include "torvane/objects/light_object_data.h"
#include "torvane/views/base_draw.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

LightObjectData* LightDataOf(BaseObject& object) { return NodeCast<LightObjectData>(object.GetObjectData()); }

GeData Parameter(BaseObject& object, Long id)
{
  GeData value;
  object.GetParameterById(id, value);
  return value;
}

// ", label 12.5 unit".
std::string Labelled(const char* label, Real number, const char* unit)
{
  char text[80];
  std::snprintf(text, sizeof text, ", %s %.6g%s", label, number + 0.0, unit); // no "-0"
  return text;
}

std::string ColorText(const Vector& color)
{
  char text[100];
  std::snprintf(text, sizeof text, ", color (%.6g, %.6g, %.6g)", color.x, color.y, color.z);
  return text;
}

std::string ProjectionText(Long projection)
{
  if (projection == 0)
    return "perspective";
  return projection == 4 ? "parallel" : "projection " + std::to_string(projection);
}

std::string CameraWords(BaseObject& camera)
{
  const BaseContainer& settings = camera.GetDataInstance();
  std::string words = " " + ProjectionText(settings.GetLong(kCameraProjection));
  words += Labelled("focal length", settings.GetReal(kCameraFocalLength), " mm");
  words += Labelled("aperture", settings.GetReal(kCameraApertureWidth), " mm");
  const GeData field = Parameter(camera, kCameraFieldOfView);
  if (field.GetType() == kDataReal) // none without a focal length
    words += Labelled("field of view", RadiansToDegrees(field.GetReal()), " degrees");
  return words + Labelled("focus", settings.GetReal(kCameraFocusDistance), "");
}

std::string LightTypeText(Long type)
{
  switch (type) {
  case kLightPoint:
    return "point";
  case kLightSpot:
    return "spot";
  case kLightOther:
    return "parallel";
  case kLightIES:
    return "measured";
  default:
    return "light type " + std::to_string(type);
  }
}

std::string LightWords(BaseObject& light)
{
  const Long type = Parameter(light, kLightType).GetLong();
  std::string words = " " + LightTypeText(type) + ColorText(Parameter(light, kLightColor).GetVector());
  words += Labelled("intensity", 100.0 * Parameter(light, kLightBrightness).GetReal(), " %");
  if (Parameter(light, kLightShadow).GetLong() != 0)
    words += Labelled("shadow", 100.0 * Parameter(light, kLightShadowDensity).GetReal(), " %");
  if (type == kLightSpot) {
    words += Labelled("inner", RadiansToDegrees(Parameter(light, kLightInnerAngle).GetReal()), " degrees");
    words += Labelled("outer", RadiansToDegrees(Parameter(light, kLightOuterAngle).GetReal()), " degrees");
  }
  if (const IESLight* ies = GetIESLight(&light)) {
    const std::string name = ToUtf8(ies->luminaire.Content() ? ies->luminaire : ies->luminaireCatalogue);
    words += ", distribution \"" + name + "\"" + Labelled("output", ies->GetLumens(), " lm times the power in watts");
  }
  return words;
}

Json DrawJson(BaseDraw& draw, NodeIndex& index)
{
  const BaseObject& editor = *draw.GetEditorCamera();
  Json camera = ToJson(editor.GetDataInstance());
  camera["pos"] = ToJson(editor.GetRelPos());
  camera["scale"] = ToJson(editor.GetRelScale());
  camera["rot"] = ToJson(editor.GetRelRot());
  return {{"sceneCamera", LinkJson(draw.GetSceneCamera())},
          {"sceneCameraIndex", index.PathOf(draw.GetSceneCamera().GetLink())},
          {"data", ToJson(draw.GetDataInstance())},
          {"camera", std::move(camera)}};
}

BaseDraw* FirstDraw(ViewPanel& panel) { return NodeCast<BaseDraw>(panel.GetDraws().GetFirst()); }

ViewPanel* FirstPanel(BaseDocument& document) { return NodeCast<ViewPanel>(document.GetViewPanelRoot()->GetFirst()); }

} // namespace

Json ObjectParams(BaseObject& object)
{
  Json params = Json::object();
  if (!LightDataOf(object))
    return params;
  for (const LightParameterRange& range : kLightParameters) {
    for (Long id = range.first; id <= range.last; ++id)
      params[std::to_string(id)] = ToJson(Parameter(object, id));
  }
  return params;
}

Json ObjectIES(BaseObject& object)
{
  const IESLight* light = GetIESLight(&object);
  if (!light)
    return {};
  Json json = IESJson(*light);
  json["lumensTimesWatts"] = light->GetLumens();
  return json;
}

std::string ObjectWords(BaseObject& object)
{
  if (object.GetType() == kObjectCamera)
    return CameraWords(object);
  return LightDataOf(object) ? LightWords(object) : GeometryWords(object);
}

Json ViewsJson(BaseDocument& document, NodeIndex& index)
{
  Json views = Json::array();
  for (ViewPanel* panel = FirstPanel(document); panel; panel = panel->GetNext()) {
    Json draws = Json::array();
    for (BaseDraw* draw = FirstDraw(*panel); draw; draw = draw->GetNext())
      draws.push_back(DrawJson(*draw, index));
    views.push_back({{"draws", std::move(draws)}});
  }
  return views;
}

std::vector<std::string> ViewLines(BaseDocument& document)
{
  std::vector<std::string> lines;
  for (ViewPanel* panel = FirstPanel(document); panel; panel = panel->GetNext()) {
    lines.push_back("panel");
    for (BaseDraw* draw = FirstDraw(*panel); draw; draw = draw->GetNext()) {
      const Long projection = draw->GetEditorCamera()->GetDataInstance().GetLong(kCameraProjection);
      const auto* camera = NodeCast<BaseList2D>(draw->GetSceneCamera().GetLink());
      lines.push_back("  " + ProjectionText(projection) +
                      (camera ? " through \"" + ToUtf8(camera->GetName()) + "\"" : std::string()));
    }
  }
  return lines;
}

} // namespace q7r
