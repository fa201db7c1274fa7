// The node hooks: the library's own classes.
#include "torvane/hooks.h"
#include "torvane/memory/memory.h"
#include "torvane/nodes/root_list.h"

namespace _torvane_
{

NodeData* AllocNodeData(Long type, Bool& known) { return AllocLibraryNodeData(type, known); }

RootObject* AllocRootObject() { return NewObj<RootObject>(); }

RootMaterial* AllocRootMaterial() { return NewObj<RootMaterial>(); }

RootLayer* AllocRootLayer() { return NewObj<RootLayer>(); }

RootRenderData* AllocRootRenderData() { return NewObj<RootRenderData>(); }

} // namespace _torvane_
