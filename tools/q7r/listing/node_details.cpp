#include "node_details.h"

#include <cstdio>

#include "geometry_details.h"
#include "scene_file.h"
#include "torvane/animation/ctrack.h"
#include "torvane/layers/layer_object.h"
#include "torvane/materials/base_material.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/base_tag.h"
#include "torvane/tags/texture_tag.h"
#include "torvane/views/base_draw.h"
#include "values.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

std::string TagWords(BaseTag& tag)
{
  Long link = 0;
  if (tag.GetType() == kTagTarget)
    link = kTargetLink;
  else if (tag.GetType() == kTagTexture)
    link = kTextureMaterial;
  else
    return TagCountWords(tag);
  const BaseList2D* target = tag.GetDataInstance().GetLink(link);
  return target ? "-> " + QuotedName(*target) : std::string();
}

std::string TrackWords(CTrack& track)
{
  const Long count = track.GetCurve(1, 0)->GetKeyCount();
  return std::to_string(count) + (count == 1 ? " key" : " keys");
}

// The switches that aren't as on a new layer. The one that locks has a name, the others stand by number.
std::string LayerWords(LayerObject& layer)
{
  constexpr Long kLock = 4;
  const LayerObject usual;
  std::string words = layer.GetFlag(kLock) ? "locked" : "";
  for (Long i = 0; i < kLayerFlagCount; ++i) {
    if (i != kLock && layer.GetFlag(i) != usual.GetFlag(i))
      words += (words.empty() ? "switch " : ", switch ") + std::to_string(kLayerFirstFlag + i) +
               (layer.GetFlag(i) ? " on" : " off");
  }
  return words + (words.empty() ? "color " : "  color ") + ColorText(layer.GetColor());
}

std::string RenderWords(RenderData& data)
{
  const BaseContainer& settings = data.GetDataInstance();
  char text[160];
  std::snprintf(text, sizeof text, "%g x %g, %g fps, %g to %g s", settings.GetReal(kRenderWidth),
                settings.GetReal(kRenderHeight), settings.GetReal(kRenderFrameRate),
                settings.GetTime(kRenderFrameFrom).Get(), settings.GetTime(kRenderFrameTo).Get());
  return text;
}

std::string DocumentWords(BaseDocument& document)
{
  const DocumentPref& pref = document.GetPref();
  char text[100];
  std::snprintf(text, sizeof text, "%d fps, %g to %g s", pref.GetFps(), pref.GetMinTime().Get(),
                pref.GetMaxTime().Get());
  return text;
}

std::string ShaderWords(BaseShader& shader)
{
  return shader.HasBitmapFilename() ? "\"" + ToUtf8(shader.BitmapFilename().GetString()) + "\"" : std::string();
}

} // namespace

std::string QuotedName(const BaseList2D& node) { return "\"" + ToUtf8(node.GetName()) + "\""; }

std::string NumbersText(const double* numbers, double factor)
{
  char buffer[120];
  std::snprintf(buffer, sizeof buffer, "(%.6g, %.6g, %.6g)", numbers[0] * factor + 0.0, numbers[1] * factor + 0.0,
                numbers[2] * factor + 0.0); // no "-0"
  return buffer;
}

std::string ColorText(const Vector& color)
{
  const double numbers[] = {color.x, color.y, color.z};
  return NumbersText(numbers);
}

std::string SummaryOf(BaseList2D& node)
{
  if (auto* object = NodeCast<BaseObject>(&node))
    return ObjectWords(*object);
  if (auto* tag = NodeCast<BaseTag>(&node))
    return TagWords(*tag);
  if (auto* track = NodeCast<CTrack>(&node))
    return TrackWords(*track);
  if (NodeCast<BaseMaterial>(&node))
    return MaterialWords(node);
  if (auto* shader = NodeCast<BaseShader>(&node))
    return ShaderWords(*shader);
  if (auto* layer = NodeCast<LayerObject>(&node))
    return LayerWords(*layer);
  if (auto* data = NodeCast<RenderData>(&node))
    return RenderWords(*data);
  if (auto* document = NodeCast<BaseDocument>(&node))
    return DocumentWords(*document);
  auto* draw = NodeCast<BaseDraw>(&node);
  return draw ? DrawWords(*draw) : std::string();
}

void TellRaw(ValueSink& sink, Long level, const void* data, LLong size)
{
  if (size == 0)
    return;
  sink.Key("raw");
  sink.BeginObject(ValueSink::Layout::kLine);
  TellBytes(sink, level, data, size);
  sink.EndObject();
}

} // namespace q7r
