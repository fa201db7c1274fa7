// The walk along a parameter path through a node's container. It differs on purpose from that of BaseContainer.
#include "q7r_file/nodes/node_tools.h"
#include "torvane/nodes/base_list.h"

namespace _torvane_
{

namespace
{

// The nested container of an id, made when it is missing.
BaseContainer* EnterContainer(BaseContainer& container, Long id)
{
  if (BaseContainer* nested = container.GetContainerInstance(id))
    return nested;
  container.RemoveData(id);
  GeData* value = container.InsertData(id, GeData(BaseContainer()));
  return value ? value->GetContainer() : nullptr;
}

constexpr Long kStepOver = 1; // a level of this data type is passed over when reading

} // namespace

Bool BaseList2D::GetParameter(const ParameterPath& path, GeData& value)
{
  const BaseContainer* container = &data_;
  Long last = path.GetLevelCount() - 1;
  if (last < 0)
    return false;
  for (Long i = 0; i < last; ++i) {
    const ParameterLevel& level = path[i];
    switch (level.dtype) {
    case kStepOver:
      continue;
    case kDataGroup:
      container = container->GetContainerInstance(level.id);
      if (!container) {
        value.Free();
        return true;
      }
      continue;
    case kDataVector: {
      // Always the top container's Vector, whatever containers were entered before.
      Vector vector = data_.GetVector(level.id);
      const Real* component = ComponentOf(vector, path[i + 1].id);
      if (component)
        value = GeData(*component);
      return true;
    }
    default:
      return true;
    }
  }
  const GeData* found = container->FindData(path[last].id);
  if (!found)
    return false;
  value = *found;
  return true;
}

Bool BaseList2D::SetParameter(const ParameterPath& path, const GeData& value)
{
  BaseContainer* container = &data_;
  Long last = path.GetLevelCount() - 1;
  if (last < 0)
    return false;
  for (Long i = 0; i < last; ++i) {
    const ParameterLevel& level = path[i];
    switch (level.dtype) {
    case kDataGroup:
      container->MarkDirty();
      container = EnterContainer(*container, level.id);
      if (!container)
        return false;
      continue;
    case kDataVector: {
      Vector vector = data_.GetVector(level.id);
      if (Real* component = ComponentOf(vector, path[i + 1].id)) {
        *component = value.GetReal();
        data_.SetVector(level.id, vector);
      }
      // The walk goes on to the component's level, which leaves an entry of its own.
      continue;
    }
    default:
      return true;
    }
  }
  return container->SetData(path[last].id, value) != nullptr;
}

} // namespace _torvane_
