#include "exporter/walk/plane.h"

#include "exporter/walk/layer_transform.h"
#include "torvane/materials/material.h"
#include "torvane/objects/plane_parameters.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/texture_tag.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr const char* kMovieSuffixes[] = {"avi", "mov", "mpg"};

bool IsMovie(const Filename& file)
{
  for (const char* suffix : kMovieSuffixes) {
    if (file.CheckSuffix(suffix))
      return true;
  }
  return false;
}

// A material named like the object, which a texture tag of the object lays on it. Null when memory is short.
Material* MakeMaterialOf(ExportContext& context, BaseObject& object)
{
  Material* material = AllocMaterial();
  if (!material)
    return nullptr;
  material->SetName(object.GetName());
  context.document->InsertMaterial(material);
  BaseTag* tag = object.MakeTag(kTagTexture);
  if (!tag)
    return nullptr;
  tag->SetParameterById(kTextureProjection, kTextureProjectionUVW);
  tag->GetDataInstance().SetLink(kTextureMaterial, material);
  return material;
}

void SetSolidColor(HostCalls& host, AEGP_ItemH item, Material& material)
{
  constexpr A_Boolean kNotTheProxy = 0;
  AEGP_ColorVal color = {};
  if (host(&AEGP_FootageSuite11::AEGP_GetSolidFootageColor, item, kNotTheProxy, &color))
    material.SetParameterById(kMaterialColor, Vector(color.redF, color.greenF, color.blueF));
}

// A bitmap shader on the footage's first file, which counts on through the files of a sequence or the frames of a
// movie.
void SetFootageBitmap(ExportContext& context, HostCalls& host, AEGP_FootageH footage, Material& material)
{
  HostText path(host);
  A_long files = 0;
  A_long filesPerFrame = 0;
  host(&AEGP_FootageSuite11::AEGP_GetFootagePath, footage, 0, 0, path.Out());
  host(&AEGP_FootageSuite11::AEGP_GetFootageNumFiles, footage, &files, &filesPerFrame);
  const Filename file(path.Take16());
  if (!host.Good())
    return;
  if (BaseShader* shader = SetMaterialBitmap(&material, kMaterialColorShader, file))
    shader->SetParameterById(kBitmapLastFrame, (IsMovie(file) ? context.frameCount : files) - 1);
}

void SetPlaneParameters(BaseObject& plane, Real width, Real height)
{
  plane.SetParameterById(kPlaneWidth, width);
  plane.SetParameterById(kPlaneHeight, height);
  for (const PlaneSetting& setting : kPlaneSettings)
    plane.SetParameterById(setting.id, setting.value);
}

} // namespace

BaseObject* ExportPlane(ExportContext& context, AEGP_ItemH item, AEGP_FootageH footage, bool isSolid,
                        bool isComposition)
{
  if (!item)
    return nullptr;
  HostCalls host(*context.suites);
  AEGP_LayerFlags flags = AEGP_LayerFlag_NONE;
  A_long width = 0;
  A_long height = 0;
  host(&AEGP_LayerSuite13::AEGP_GetLayerFlags, context.layer, &flags);
  const bool isNull = isSolid && (flags & AEGP_LayerFlag_NULL_LAYER) != 0;
  BaseObject* object = AllocObject(isNull ? kObjectNull : kObjectPlane);
  if (!object)
    return nullptr;
  context.document->InsertObject(object);
  context.object = object;
  host(&AEGP_ItemSuite13::AEGP_GetItemDimensions, item, &width, &height);
  if (!ExportTransform(context, width, height))
    return nullptr;
  if (isNull)
    return host.Good() ? object : nullptr;
  if (!isComposition) {
    Material* material = MakeMaterialOf(context, *object);
    if (!material)
      return nullptr;
    if (isSolid)
      SetSolidColor(host, item, *material);
    else if (footage)
      SetFootageBitmap(context, host, footage, *material);
  }
  SetPlaneParameters(*object, width, height);
  return host.Good() ? object : nullptr;
}

} // namespace exporter
