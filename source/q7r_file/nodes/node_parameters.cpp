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

// Whether the walk along a path goes on behind a level.
enum class Step
{
  kOn,
  kDone,   // the answer is true
  kFailed, // the answer is false
};

// Takes the levels above the last one, each with the id below it, until a step ends the walk.
template <class Take>
Step WalkToLastLevel(const ParameterPath& path, const Take& take)
{
  const Long last = path.GetLevelCount() - 1;
  Step step = last < 0 ? Step::kFailed : Step::kOn;
  for (Long i = 0; i < last && step == Step::kOn; ++i)
    step = take(path[i], path[i + 1].id);
  return step;
}

// One component of a Vector of a container, if there is such a component.
void GetComponent(const BaseContainer& container, Long id, Long component, GeData& value)
{
  Vector vector = container.GetVector(id);
  if (const Real* place = ComponentOf(vector, component))
    value = GeData(*place);
}

void SetComponent(BaseContainer& container, Long id, Long component, Real value)
{
  Vector vector = container.GetVector(id);
  if (Real* place = ComponentOf(vector, component)) {
    *place = value;
    container.SetVector(id, vector);
  }
}

} // namespace

Bool BaseList2D::GetParameter(const ParameterPath& path, GeData& value)
{
  const BaseContainer* container = &data_;
  const Step step = WalkToLastLevel(path, [&](const ParameterLevel& level, Long below) {
    switch (level.dtype) {
    case kStepOver:
      return Step::kOn;
    case kDataGroup:
      container = container->GetContainerInstance(level.id);
      if (!container)
        value.Free();
      return container ? Step::kOn : Step::kDone;
    case kDataVector: // always the top container's, whatever containers were entered before
      GetComponent(data_, level.id, below, value);
      return Step::kDone;
    default:
      return Step::kDone;
    }
  });
  if (step != Step::kOn)
    return step == Step::kDone;
  const GeData* found = container->FindData(path[-1].id);
  if (!found)
    return false;
  value = *found;
  return value.GetType() == found->GetType();
}

Bool BaseList2D::SetParameter(const ParameterPath& path, const GeData& value)
{
  const AllocationWatch watch;
  BaseContainer* container = &data_;
  const Step step = WalkToLastLevel(path, [&](const ParameterLevel& level, Long below) {
    switch (level.dtype) {
    case kDataGroup:
      container->MarkDirty();
      container = EnterContainer(*container, level.id);
      return container ? Step::kOn : Step::kFailed;
    case kDataVector:
      // The walk goes on to the component's level, which leaves an entry of its own.
      SetComponent(data_, level.id, below, value.GetReal());
      return Step::kOn;
    default:
      return Step::kDone;
    }
  });
  if (step != Step::kOn)
    return step == Step::kDone;
  return container->SetData(path[-1].id, value) && !watch.Failed();
}

} // namespace _torvane_
