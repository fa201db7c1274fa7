// Plain tags in the place of those that hold arrays.
#include "q7r_file/tags/tag_makers.h"
#include "torvane/base_tag.h"

namespace _torvane_
{

BaseTag* MakePointTag() { return NewObj<BaseTag>(kTagPoint); }
BaseTag* MakePolygonTag() { return NewObj<BaseTag>(kTagPolygon); }
BaseTag* MakeTangentTag() { return NewObj<BaseTag>(kTagTangent); }
BaseTag* MakeUVWTag() { return NewObj<BaseTag>(kTagUVW); }
BaseTag* MakeSegmentTag() { return NewObj<BaseTag>(kTagSegment); }
BaseTag* MakeVertexMapTag() { return NewObj<BaseTag>(kTagVertexMap); }
BaseTag* MakeNormalTag() { return NewObj<BaseTag>(kTagNormal); }
NodeData* MakeWeightTagData() { return NewObj<NodeData>(); }

} // namespace _torvane_
