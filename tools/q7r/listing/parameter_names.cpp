#include "parameter_names.h"

#include <algorithm>
#include <iterator>

#include "torvane/document/base_document.h"
#include "torvane/layers/layer_object.h"
#include "torvane/materials/material.h"
#include "torvane/objects/camera_object_data.h"
#include "torvane/objects/light_object_data.h"
#include "torvane/objects/plane_parameters.h"
#include "torvane/objects/unit_factors.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/compositing_tag.h"
#include "torvane/tags/texture_tag.h"
#include "torvane/tags/weight_tag_data.h"
#include "values.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr double kAny = std::numeric_limits<double>::infinity();
constexpr double kPositive = std::numeric_limits<double>::min();
constexpr double kPi = 3.141592653589793;

constexpr NumberWords kProjections[] = {{kProjectionPerspective, "perspective"},
                                        {kProjectionParallel, "parallel"},
                                        {3, "parallel, along an axis"},
                                        {6, "parallel, along an axis"},
                                        {0, nullptr}};
constexpr NumberWords kLightTypes[] = {{kLightPoint, "point"},
                                       {kLightSpot, "spot"},
                                       {kLightOther, "parallel or ambient"},
                                       {kLightIES, "measured"},
                                       {0, nullptr}};
constexpr NumberWords kShadows[] = {{kLightShadowNone, "none"}, {kLightShadowOn, "on"}, {0, nullptr}};
constexpr NumberWords kTextureProjections[] = {{kTextureProjectionUVW, "texture coordinates"}, {0, nullptr}};
constexpr NumberWords kShapes[] = {
    {-1, "none"}, {0, "round"},          {1, "rectangular"}, {2, "ball"}, {3, "upright cylinder"},
    {4, "box"},   {8, "lying cylinder"}, {0, nullptr}};

// Angles are radians, lengths of lenses millimetres.
constexpr ParameterRow kCamera[] = {
    {kCameraFocalLength, "focalLength", kPositive},
    {kCameraProjection, "projection", 0, kAny, kProjections},
    {kCameraApertureWidth, "apertureWidth", kPositive},
    {kCameraUseTarget, "useTarget", 0, 1},
    {kCameraFocusDistance, "focusDistance"},
    {kCameraApertureNumber, "apertureNumber", kPositive},
    {kCameraExposureTime, "exposureTime", 0},
    {kCameraFilmSpeed, "filmSpeed", kPositive},
    {kCameraTemperature, "temperature", 0},
};
constexpr ParameterRow kLight[] = {
    {kLightShadowDensity, "shadowDensity"},
    {kLightKnotCount, "knotCount", 0, kMaxLightKnots},
    {kLightColor, "color", 0, 1},
    {kLightBrightness, "brightness"},
    {kLightType, "lightType", 0, kAny, kLightTypes},
    {kLightShadow, "shadow", 0, kAny, kShadows},
    {kLightInnerAngle, "innerAngle", 0, kPi},
    {kLightOuterAngle, "outerAngle", 0, kPi},
};
constexpr ParameterRow kPlane[] = {
    {kPlaneWidth, "width", 0},
    {kPlaneHeight, "height", 0},
};
constexpr ParameterRow kTexture[] = {
    {kTextureOffsetX, "offsetX"},
    {kTextureOffsetY, "offsetY"},
    {kTextureLengthX, "lengthX"},
    {kTextureLengthY, "lengthY"},
    {kTextureProjection, "projection", 0, kAny, kTextureProjections},
    {kTextureOldName, "oldName"},
    {kTextureMaterial, "material"},
    {kTexturePosition, "position"},
    {kTextureSize, "size"},
    {kTextureRotation, "rotation"},
    {kTextureSecondLink, "secondLink"},
    {kTextureFilmAspect, "filmAspect", 0},
    {kTexturePixelAspect, "pixelAspect", 0},
};
constexpr ParameterRow kTarget[] = {
    {kTargetLink, "target"},
    {kTargetUpLink, "up"},
};
constexpr ParameterRow kCompositing[] = {{kCompositingClock, "clock"}};
constexpr ParameterRow kWeight[] = {{kWeightStrength, "strength"}};
constexpr ParameterRow kMaterial[] = {
    {kMaterialColor, "color"},
    {kMaterialColorShader, "colorShader"},
};
constexpr ParameterRow kBitmap[] = {
    {kBitmapFilename, "filename"},
    {kBitmapLastFrame, "lastFrame"},
};
constexpr ParameterRow kRender[] = {
    {kRenderWidth, "width", 1},
    {kRenderHeight, "height", 1},
    {kRenderFrameMode, "frameMode"},
    {kRenderFrameFrom, "frameFrom"},
    {kRenderFrameTo, "frameTo"},
    {kRenderFrameRate, "frameRate", kPositive},
    {kRenderFilmAspect, "filmAspect", kPositive},
    {kRenderPixelAspect, "pixelAspect", kPositive},
};
constexpr ParameterRow kDocument[] = {
    {kInfoCreatorName, "creatorName"}, {kInfoCreatorId, "creatorId"}, {kInfoWriterName, "writerName"},
    {kInfoWriterId, "writerId"},       {kInfoSaveDate, "saveDate"},   {kInfoCreationDate, "creationDate"},
    {kKeyDocumentUnit, "unit"},
};

struct Group
{
  const NodeKind& kind;
  Long type;
  ParameterRows rows;
};

template <std::size_t Count>
constexpr ParameterRows All(const ParameterRow (&rows)[Count])
{
  return {rows, Count};
}

constexpr Group kGroups[] = {
    {BaseObject::kNodeKind, kObjectCamera, All(kCamera)},
    {BaseObject::kNodeKind, kObjectLight, All(kLight)},
    {BaseObject::kNodeKind, kObjectPlane, All(kPlane)},
    {BaseTag::kNodeKind, kTagTexture, All(kTexture)},
    {BaseTag::kNodeKind, kTagTarget, All(kTarget)},
    {BaseTag::kNodeKind, kTagCompositing, All(kCompositing)},
    {BaseTag::kNodeKind, kTagWeight, All(kWeight)},
    {BaseMaterial::kNodeKind, kMaterialStandard, All(kMaterial)},
    {BaseShader::kNodeKind, kShaderBitmap, All(kBitmap)},
    {RenderData::kNodeKind, kTypeRenderData, All(kRender)},
    {BaseDocument::kNodeKind, kTypeDocument, All(kDocument)},
};

const char* FindWords(const NumberWords* words, Long number)
{
  for (; words && words->words; ++words) {
    if (words->number == number)
      return words->words;
  }
  return nullptr;
}

} // namespace

ParameterRows NamedParametersOf(const BaseList2D& node)
{
  for (const Group& group : kGroups) {
    if (node.GetType() == group.type && node.GetNodeKind().Is(group.kind))
      return group.rows;
  }
  return {};
}

const ParameterRow* FindParameter(const BaseList2D& node, Long id)
{
  const ParameterRows rows = NamedParametersOf(node);
  const auto* row = std::find_if(rows.begin(), rows.end(), [id](const ParameterRow& r) { return r.id == id; });
  return row != rows.end() ? row : nullptr;
}

const char* WordsOf(const ParameterRow& row, Long number) { return FindWords(row.words, number); }

const char* ProjectionWords(Long projection)
{
  const char* words = FindWords(kProjections, projection);
  return words ? words : "parallel"; // whatever isn't perspective is
}

const char* LightTypeWords(Long type)
{
  const char* words = FindWords(kLightTypes, type);
  return words ? words : "of another type";
}

const char* IESShapeWords(Long shape)
{
  const char* words = FindWords(kShapes, shape);
  return words ? words : "of another shape";
}

bool GetHeldParameter(BaseList2D& node, Long id, GeData& value)
{
  const BaseContainer& data = node.GetDataInstance();
  if (const GeData* held = data.FindData(id)) {
    value = *held;
    return true;
  }
  const auto* object = NodeCast<BaseObject>(&node);
  return object && NodeCast<LightObjectData>(object->GetObjectData()) && node.GetParameterById(id, value);
}

void TellNamed(ValueSink& sink, BaseList2D& node)
{
  const ParameterRows rows = NamedParametersOf(node);
  if (rows.count == 0)
    return;
  sink.Key("named");
  sink.BeginObject();
  GeData value;
  for (const ParameterRow& row : rows) {
    if (!GetHeldParameter(node, row.id, value))
      continue;
    Tell(sink, row.name, value);
    const char* words = value.GetType() == kDataLong ? WordsOf(row, value.GetLong()) : nullptr;
    if (words)
      sink.Member(std::string(row.name) + "Words", words);
  }
  sink.EndObject();
}

} // namespace q7r
