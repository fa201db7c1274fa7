// Every type of node that the library tells apart, in one table: the factories of objects, tags and list members make
// nodes by it, and listings name them by it. A new type is a row.
#pragma once

#include "torvane/nodes/node_kind.h"

namespace _torvane_
{

class BaseList2D;
class BaseObject;
class BaseTag;
class NodeData;

// What the numbers of a row are for.
enum class NodeNumber
{
  kType,  // of nodes
  kLabel, // under which members of a list stand in a file; no type of any node that is made for an asked type
};

// One type, or a range of types that are alike.
struct NodeType
{
  Long first;
  Long last;
  Long label;           // under which nodes of the type stand in a file
  const char* name;     // in listings; null: the number stands for it
  const NodeKind* kind; // of the nodes' class
  // Both give a new thing that the caller owns, or null when memory is short.
  BaseList2D* (*make)(const NodeType& row, Long type);
  NodeData* (*makeData)(const NodeType& row, Long type) = nullptr; // null: the nodes have none
  NodeNumber number = NodeNumber::kType;
};

// The row of a number that stands for nodes of a class, or of one derived from it; null where there is none. One number
// may mean different things among objects and among the tags of plug-ins.
const NodeType* FindNodeType(Long number, const NodeKind& kind);

// The node behind a label of an object list: an object of that type, or of the one that the label stands for; null for
// a label that can't be made and when memory is short. The caller owns it.
BaseObject* MakeObjectOfLabel(Long label);

// The library's own data for a plug-in tag's type, null where there is none. `known` tells whether there is.
NodeData* AllocTagDataOfType(Long pluginId, Bool& known);

} // namespace _torvane_
