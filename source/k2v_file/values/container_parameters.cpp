// Parameters of a container by their path.
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

// The member that a level below a Vector selects; null for an id that selects none.
Real Vector::*GetComponent(Long id)
{
  switch (id) {
  case kVectorX:
    return &Vector::x;
  case kVectorY:
    return &Vector::y;
  case kVectorZ:
    return &Vector::z;
  default:
    return nullptr;
  }
}

} // namespace

Bool BaseContainer::GetParameter(const ParameterPath& path, GeData& value) const
{
  if (path.GetStoredCount() == 0)
    return false;
  const BaseContainer* container = this;
  const Long last = path.GetLevelCount() - 1;
  for (Long i = 0; i < last; ++i) {
    const ParameterLevel& level = path[i];
    if (level.dtype == kDataVector) {
      Real Vector::*component = GetComponent(path[i + 1].id);
      value = component ? GeData(container->GetVector(level.id).*component) : GeData();
      return true;
    }
    if (level.dtype != kDataGroup) {
      value = GetData(path[0].id);
      return true;
    }
    container = container->GetContainerInstance(level.id);
    if (!container) {
      value.Free();
      return true;
    }
  }
  value = container->GetData(path[last < 0 ? 0 : last].id);
  return true;
}

// The nested container of an id. One that is missing is made, in the place of whatever has its id.
BaseContainer* BaseContainer::EnterGroup(Long id)
{
  GeData* value = FindData(id);
  if (value && value->GetRawType() == kDataContainer)
    return value->GetContainer();
  GeData group;
  if (!group.SetType(kDataContainer))
    return nullptr;
  RemoveData(id);
  value = InsertData(id, std::move(group));
  return value ? value->GetContainer() : nullptr;
}

// Another component's number leaves the Vector as it is.
Bool BaseContainer::SetComponent(Long id, Long componentId, Real value)
{
  Real Vector::*component = GetComponent(componentId);
  if (!component)
    return true;
  Vector vector = GetVector(id);
  vector.*component = value;
  return SetData(id, GeData(vector)) != nullptr;
}

Bool BaseContainer::SetParameter(const ParameterPath& path, const GeData& value)
{
  if (path.GetStoredCount() == 0)
    return false;
  const Long last = path.GetLevelCount() - 1;
  if (last <= 0)
    return SetData(path[0].id, value) != nullptr;

  // Making a group may remove the element that `value` lies in.
  // NOLINTNEXTLINE(performance-unnecessary-copy-initialization)
  const GeData copy(value);
  BaseContainer* container = this;
  MarkDirty();
  for (Long i = 0; i < last; ++i) {
    const ParameterLevel& level = path[i];
    if (level.dtype == kDataVector)
      return container->SetComponent(level.id, path[i + 1].id, copy.GetReal());
    if (level.dtype != kDataGroup)
      return SetData(path[0].id, copy) != nullptr;
    container = container->EnterGroup(level.id);
    if (!container)
      return false;
    container->MarkDirty();
  }
  return container->SetData(path[last].id, copy) != nullptr;
}

} // namespace _torvane_
