// A plain behaviour object in the place of the joint weights.
#include "q7r_file/tags/tag_makers.h"
#include "torvane/base_tag.h"

namespace _torvane_
{

NodeData* MakeWeightTagData() { return NewObj<NodeData>(); }

} // namespace _torvane_
