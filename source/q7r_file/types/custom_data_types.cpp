// The custom value types that the library knows. A class that interprets a type puts its maker into the type's row.
#include "torvane/shaders/blend_layers.h"
#include "torvane/shaders/gradient.h"
#include "torvane/tags/joint_tree.h"
#include "torvane/values/custom_data.h"

namespace _torvane_
{

namespace
{

// In the order of their ids.
constexpr CustomDataType kTypes[] = {
    {kCustomGradient, 1, MakeCustomData<GradientData>},
    {1000997, 0, MakeCustomData<OpaqueCustomData>},
    {1009060, 3, MakeCustomData<OpaqueCustomData>},
    {1009290, 2, MakeCustomData<OpaqueCustomData>},
    {kCustomThreeNumbers, 0, MakeCustomData<ThreeNumbersData>},
    {1009398, 0, MakeCustomData<OpaqueCustomData>},
    {kCustomBlendLayers, 2, MakeCustomData<iBlendDataType>},
    {1011153, 7, MakeCustomData<OpaqueCustomData>},
    {1018397, 0, MakeCustomData<OpaqueCustomData>},
    {1019655, 1, MakeCustomData<OpaqueCustomData>},
    {1019660, 3, MakeCustomData<OpaqueCustomData>},
    {kCustomJointTree, 0, MakeCustomData<JointTreeData>},
    {100004811, 0, MakeCustomData<OpaqueCustomData>},
    {180000104, 0, MakeCustomData<OpaqueCustomData>},
    {kCustomUnitScale, 0, MakeCustomData<UnitScaleData>},
    {450000019, 0, MakeCustomData<OpaqueCustomData>},
};

} // namespace

const CustomDataType* FindCustomDataType(Long id)
{
  for (const CustomDataType& type : kTypes) {
    if (type.id == id)
      return &type;
  }
  return nullptr;
}

} // namespace _torvane_
