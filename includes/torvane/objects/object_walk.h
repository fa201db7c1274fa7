// A way through objects and all that hangs under them.
#pragma once

#include "torvane/objects/base_object.h"

namespace _torvane_
{

// The object behind this one, depth first: its first child, else what comes next beside it or beside the nearest of its
// parents; null at the end. From the first root of a scene on it passes every object once.
inline BaseObject* GetNextDepthFirst(const BaseObject* object)
{
  if (BaseObject* child = object->GetDown())
    return child;
  while (object && !object->GetNext())
    object = object->GetUp();
  return object ? object->GetNext() : nullptr;
}

} // namespace _torvane_
