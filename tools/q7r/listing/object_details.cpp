// Cameras, lights and views in listings.
#include <algorithm>
#include <cstdio>
#include <iterator>
#include <new>
#include <vector>

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

namespace
{

// Position, value, colour and mode.
void AddKnot(std::vector<Real>& numbers, const LightKnot& knot)
{
  numbers.insert(numbers.end(),
                 {knot.position, knot.value, knot.color.x, knot.color.y, knot.color.z, static_cast<Real>(knot.mode)});
}

std::vector<Real> ExtraNumbers(const LightExtraBlock& block)
{
  std::vector<Real> numbers;
  AddKnot(numbers, block.head);
  for (const LightExtraBlock::Layer& layer : block.layers) {
    for (const Bool flag : layer.flags)
      numbers.push_back(flag ? 1.0 : 0.0);
    for (const Long mode : layer.modes)
      numbers.push_back(mode);
    numbers.insert(numbers.end(), std::begin(layer.numbers), std::end(layer.numbers));
    numbers.insert(numbers.end(), {layer.color.x, layer.color.y, layer.color.z, static_cast<Real>(layer.last)});
  }
  for (const LightKnot& knot : block.knots)
    AddKnot(numbers, knot);
  return numbers;
}

void TellNumbers(ValueSink& sink, const std::vector<Real>& numbers)
{
  NumberRows rows;
  rows.entries = numbers.data();
  rows.count = static_cast<long long>(numbers.size());
  rows.whole = false;
  rows.get = [](const void* all, long long index, double* row) { *row = static_cast<const Real*>(all)[index]; };
  sink.Rows(rows);
}

} // namespace

void TellLightLists(ValueSink& sink, BaseObject& object)
{
  LightObjectData* light = LightDataOf(object);
  if (!light)
    return;
  const LightExtraBlock* block = light->GetExtraBlock();
  if (!block)
    throw std::bad_alloc();
  const Long count = Parameter(object, kLightKnotCount).GetLong();
  if (count > 0) {
    sink.Key("knots");
    sink.BeginArray();
    for (Long i = 0; i < count; ++i) {
      std::vector<Real> numbers;
      AddKnot(numbers, light->GetKnots()[i]);
      TellNumbers(sink, numbers);
    }
    sink.EndArray();
  }
  const std::vector<Real> extra = ExtraNumbers(*block);
  if (std::any_of(extra.begin(), extra.end(), [](Real number) { return number != 0.0; })) {
    sink.Key("extra");
    TellNumbers(sink, extra);
  }
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

BaseObject& EditorCameraOf(BaseDraw& draw, BaseDraw& plain)
{
  BaseObject* editor = (draw.HasEditorCamera() ? draw : plain).GetEditorCamera();
  if (!editor)
    throw std::bad_alloc();
  return *editor;
}

std::string DrawWords(BaseDraw& draw)
{
  BaseDraw plain;
  const BaseObject& editor = EditorCameraOf(draw, plain);
  const BaseList2D* camera = TargetOf(draw.GetSceneCamera());
  return ProjectionWords(editor.GetDataInstance().GetLong(kCameraProjection)) +
         (camera ? " through " + QuotedName(*camera) : std::string());
}

} // namespace q7r
