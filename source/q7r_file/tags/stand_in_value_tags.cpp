// A plain behaviour object in the place of the joint weights, and a plain tag in that of the texture tag.
#include "q7r_file/tags/tag_makers.h"
#include "torvane/base_tag.h"

namespace _torvane_
{

BaseTag* MakeTextureTag() { return NewObj<BaseTag>(kTagTexture); }
NodeData* MakeWeightTagData() { return NewObj<NodeData>(); }

} // namespace _torvane_
