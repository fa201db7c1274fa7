// Materials and their shaders in listings.
#include <cstdio>

#include "node_details.h"
#include "scene_file.h"
#include "torvane/materials/material.h"
#include "torvane/shaders/base_shader.h"
#include "type_names.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

std::string Quoted(const String& text) { return "\"" + ToUtf8(text) + "\""; }

// The switches in the order of a file: channels 0 to 12, then -1. Empty for a material without channels.
Json ChannelsJson(BaseMaterial& material)
{
  Json states = Json::array();
  const Material* standard = NodeCast<Material>(&material);
  for (Long channel = 0; standard && channel <= kLastChannel; ++channel)
    states.push_back(standard->ChannelIsOn(channel));
  if (standard)
    states.push_back(standard->ChannelIsOn(kFirstChannel));
  return states;
}

Json ShadersJson(BaseShader* first, NodeIndex& index)
{
  Json shaders = Json::array();
  for (BaseShader* shader = first; shader; shader = shader->GetNext())
    shaders.push_back({{"type", shader->GetType()},
                       {"name", ToJson(shader->GetName())},
                       {"data", ToJson(shader->GetDataInstance())},
                       {"links", index.LinksOf(shader->GetDataInstance())},
                       {"children", ShadersJson(shader->GetDown(), index)}});
  return shaders;
}

// "  color (0.8, 0.8, 0.8)  channels 0 8"
std::string SurfaceText(const Material& material)
{
  const Vector color = material.GetDataInstance().GetVector(kMaterialColor);
  char buffer[120];
  std::snprintf(buffer, sizeof buffer, "  color (%.6g, %.6g, %.6g)", color.x + 0.0, color.y + 0.0, color.z + 0.0);
  std::string channels;
  for (Long channel = kFirstChannel; channel <= kLastChannel; ++channel) {
    if (material.ChannelIsOn(channel))
      channels += " " + std::to_string(channel);
  }
  return buffer + (channels.empty() ? std::string("  no channels") : "  channels" + channels);
}

void AddShaderLines(std::vector<std::string>& lines, BaseShader* first, std::size_t depth)
{
  for (BaseShader* shader = first; shader; shader = shader->GetNext()) {
    std::string line = std::string(2 * depth, ' ') + "shader " + TypeName(shader->GetType());
    if (shader->GetName().Content())
      line += " " + Quoted(shader->GetName());
    if (shader->HasBitmapFilename())
      line += "  " + Quoted(shader->BitmapFilename().GetString());
    lines.push_back(line);
    AddShaderLines(lines, shader->GetDown(), depth + 1);
  }
}

} // namespace

Json MaterialsJson(BaseDocument& document, NodeIndex& index)
{
  Json materials = Json::array();
  for (BaseMaterial* material = document.GetFirstMaterial(); material; material = material->GetNext())
    materials.push_back({{"type", material->GetType()},
                         {"name", ToJson(material->GetName())},
                         {"data", ToJson(material->GetDataInstance())},
                         {"links", index.LinksOf(material->GetDataInstance())},
                         {"channels", ChannelsJson(*material)},
                         {"shaders", ShadersJson(material->GetShaders(), index)}});
  return materials;
}

std::vector<std::string> MaterialLines(BaseDocument& document)
{
  std::vector<std::string> lines;
  for (BaseMaterial* material = document.GetFirstMaterial(); material; material = material->GetNext()) {
    const Material* standard = NodeCast<Material>(material);
    std::string line = TypeName(material->GetType()) + " " + Quoted(material->GetName());
    lines.push_back(standard ? line + SurfaceText(*standard) : line);
    AddShaderLines(lines, material->GetShaders(), 1);
  }
  return lines;
}

} // namespace q7r
