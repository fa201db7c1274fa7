// Cameras, lights and views in listings.
#include <cstdio>

#include "geometry_details.h"
#include "ies_text.h"
#include "node_details.h"
#include "parameter_names.h"
#include "scene_file.h"
#include "torvane/objects/camera_object_data.h"
#include "torvane/objects/light_object_data.h"
#include "torvane/views/base_draw.h"
#include "values.h"

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

std::string CameraWords(BaseObject& camera)
{
  const BaseContainer& settings = camera.GetDataInstance();
  std::string words = ProjectionWords(settings.GetLong(kCameraProjection));
  words += Labelled("focal length", settings.GetReal(kCameraFocalLength), " mm");
  words += Labelled("aperture", settings.GetReal(kCameraApertureWidth), " mm");
  const GeData field = Parameter(camera, kCameraFieldOfView);
  if (field.GetType() == kDataReal) // none without a focal length
    words += Labelled("field of view", RadiansToDegrees(field.GetReal()), " degrees");
  return words + Labelled("focus", settings.GetReal(kCameraFocusDistance), "");
}

std::string LightWords(BaseObject& light)
{
  const Long type = Parameter(light, kLightType).GetLong();
  std::string words = LightTypeWords(type);
  words += ", color " + ColorText(Parameter(light, kLightColor).GetVector());
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

} // namespace

void TellObjectParams(ValueSink& sink, BaseObject& object)
{
  sink.Key("params");
  sink.BeginObject();
  for (const LightParameterRange& range : kLightParameters) {
    for (Long id = range.first; id <= range.last && LightDataOf(object); ++id)
      Tell(sink, std::to_string(id), Parameter(object, id));
  }
  sink.EndObject();
}

void TellObjectIES(ValueSink& sink, BaseObject& object)
{
  const IESLight* light = GetIESLight(&object);
  if (!light)
    return;
  sink.Key("ies");
  sink.BeginObject();
  TellIES(sink, *light);
  sink.Member("lumensTimesWatts", light->GetLumens());
  sink.EndObject();
}

std::string ObjectWords(BaseObject& object)
{
  if (object.GetType() == kObjectCamera)
    return CameraWords(object);
  return LightDataOf(object) ? LightWords(object) : GeometryWords(object);
}

std::string DrawWords(BaseList2D& node)
{
  auto& draw = static_cast<BaseDraw&>(node);
  const BaseObject* editor = draw.GetEditorCamera();
  if (!editor)
    throw std::bad_alloc();
  const BaseList2D* camera = TargetOf(draw.GetSceneCamera());
  return ProjectionWords(editor->GetDataInstance().GetLong(kCameraProjection)) +
         (camera ? " through " + QuotedName(*camera) : std::string());
}

} // namespace q7r
