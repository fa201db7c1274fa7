#include "host/reader/warnings.h"

#include "host/text.h"

namespace host
{

std::string LayerLabel(const Layer& layer)
{
  return layer.name.empty() ? "layer " + std::to_string(layer.id) : "layer " + Quoted(layer.name);
}

void WarnOfLostExpressions(Project& project, const std::string& file)
{
  for (const Layer& layer : project.layers)
    for (const auto& property : layer.streams)
      if (property && property->IsExpressionLost())
        project.warnings.push_back(file + ": " + LayerLabel(layer) + ": the expression of " + property->Info().name +
                                   " is not evaluated");
}

} // namespace host
