// Materials in listings.
#include "node_details.h"
#include "torvane/materials/material.h"

namespace q7r
{

using namespace _torvane_;

// "color (0.8, 0.8, 0.8)  channels color, 8"
std::string MaterialWords(BaseList2D& node)
{
  const Material* material = NodeCast<Material>(&node);
  if (!material)
    return {};
  std::string channels;
  for (Long channel = kFirstChannel; channel <= kLastChannel; ++channel) {
    if (material->ChannelIsOn(channel))
      channels +=
          (channels.empty() ? "" : ", ") + (channel == kColorChannel ? std::string("color") : std::to_string(channel));
  }
  return "color " + ColorText(material->GetDataInstance().GetVector(kMaterialColor)) +
         (channels.empty() ? "  no channels" : "  channels " + channels);
}

} // namespace q7r
