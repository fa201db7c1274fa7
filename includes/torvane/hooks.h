// What the library asks of the program that it is linked into. The library declares these operations and never
// defines them: every program supplies exactly one set. (BaseDocument::BuildScene, declared in base_document.h, is
// the client's too.)
//
// None of these may throw: the library is compiled without exceptions.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

class NodeData;
class RootLayer;
class RootMaterial;
class RootObject;
class RootRenderData;
class String;

// A block of `size` bytes with undefined contents, or null when memory is short.
void* MemAlloc(LLong size);

// A block of `size` bytes, all zero, or null when memory is short.
void* MemAllocClear(LLong size);

// The block moved to a new size, its contents kept up to the smaller of the two; a null block is allocated anew.
// Null when memory is short: the old block then stays valid.
void* MemRealloc(void* block, LLong size);

// Frees the block that `*block` points at and sets `*block` to null. A null block does nothing.
void MemFree(void** block);

// Who writes the file: a number that identifies the program (0 for none) and its name (may be empty).
void GetWriterInfo(Long& id, String& name);

// The behaviour object for an object or tag of type `type`. `known` tells whether the client knows the type: a known
// type that gives null is a failed allocation; for an unknown one the library keeps the node's data as raw bytes.
NodeData* AllocNodeData(Long type, Bool& known);

// Not a hook, but what one can answer: the library's own class for an object or tag of type `type`, as far as it has
// one that reads what a file holds of the type. `known` as above.
NodeData* AllocLibraryNodeData(Long type, Bool& known);

// New empty root lists, with the client's member classes behind them. Null when memory is short. The caller owns them.
RootObject* AllocRootObject();
RootMaterial* AllocRootMaterial();
RootLayer* AllocRootLayer();
RootRenderData* AllocRootRenderData();

} // namespace _torvane_
