#include "q7r_file/nodes/node_tools.h"

namespace _torvane_
{

Bool GetVectorParameter(const Vector& vector, const ParameterPath& path, GeData& value)
{
  Vector copy = vector;
  Long component = path[1].id;
  if (component == 0) {
    value = GeData(vector);
    return value.GetType() == kDataVector;
  }
  if (const Real* place = ComponentOf(copy, component))
    value = GeData(*place);
  return true;
}

Bool SetVectorParameter(Vector& vector, const ParameterPath& path, const GeData& value)
{
  Long component = path[1].id;
  if (component == 0)
    vector = value.GetVector();
  else if (Real* place = ComponentOf(vector, component))
    *place = value.GetReal();
  return true;
}

} // namespace _torvane_
