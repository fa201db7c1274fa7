// Makers of tags, and of their data, whose classes stand beside the factory. Each is defined with its class; each gives
// a new thing that the caller owns, or null when memory is short.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

class BaseTag;
class NodeData;

BaseTag* MakePointTag();
BaseTag* MakePolygonTag();
BaseTag* MakeDisplayTag();
BaseTag* MakeTextureTag();
BaseTag* MakeTangentTag();
BaseTag* MakeCompositingTag();
BaseTag* MakeCompositingTagToRead();
BaseTag* MakeUVWTag();
BaseTag* MakeSegmentTag();
BaseTag* MakeSelectionTag(Long type); // of polygons, points or edges
BaseTag* MakeVertexMapTag();
BaseTag* MakeNormalTag();
NodeData* MakeWeightTagData();

// As MakeTag, for a tag of a file.
BaseTag* MakeTagToRead(Long type);

// The library's own data for a plug-in tag's type, null where there is none. `known` tells whether there is.
NodeData* AllocTagDataOfType(Long pluginId, Bool& known);

} // namespace _torvane_
