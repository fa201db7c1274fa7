#include "ies_text.h"

#include "parameter_names.h"
#include "values.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

void TellNumbers(ValueSink& sink, const char* name, const GeTempDynArray<Real>& numbers)
{
  sink.Key(name);
  TellReals(sink, numbers.Data(), numbers.GetCount(), true);
}

} // namespace

void TellIES(ValueSink& sink, const IESLight& light)
{
  sink.Member("fileVersion", light.fileVersion);
  sink.Member("tiltMode", light.tiltMode);
  Tell(sink, "manufacturer", light.manufacturer);
  Tell(sink, "luminaireCatalogue", light.luminaireCatalogue);
  Tell(sink, "luminaire", light.luminaire);
  Tell(sink, "lampCatalogue", light.lampCatalogue);
  Tell(sink, "lamp", light.lamp);
  sink.Member("shape", light.shape);
  sink.Member("shapeWords", IESShapeWords(light.shape));
  Tell(sink, "size", light.size);
  sink.Member("verticalCount", light.GetVerticalCount());
  sink.Member("horizontalCount", light.GetHorizontalCount());
  TellNumbers(sink, "verticalAngles", light.verticalAngles);
  TellNumbers(sink, "horizontalAngles", light.horizontalAngles);
  sink.Key("candela");
  sink.BeginArray();
  for (Long i = 0; light.IsComplete() && i < light.GetHorizontalCount(); ++i)
    TellReals(sink, light.candela.Data() + i * light.GetVerticalCount(), light.GetVerticalCount(), true);
  sink.EndArray();
  sink.Member("maxCandela", light.maxCandela);
  sink.Member("totalFlux", light.GetTotalFlux());
}

} // namespace q7r
