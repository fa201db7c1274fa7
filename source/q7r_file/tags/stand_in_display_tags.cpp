// Plain tags in the place of the compositing, display and selection tags.
#include "q7r_file/tags/tag_makers.h"
#include "torvane/base_tag.h"

namespace _torvane_
{

BaseTag* MakeDisplayTag() { return NewObj<BaseTag>(kTagDisplay); }
BaseTag* MakeCompositingTag() { return NewObj<BaseTag>(kTagCompositing); }
BaseTag* MakeSelectionTag(Long type) { return NewObj<BaseTag>(type); }

} // namespace _torvane_
