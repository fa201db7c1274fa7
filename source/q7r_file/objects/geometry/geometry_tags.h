// The value tags of an object by their class.
#pragma once

#include "torvane/objects/base_object.h"
#include "torvane/tags/value_tags.h"

namespace _torvane_
{

// The first tag of this node type among `tag` and those behind it; null if there is none. It is of the class Tag, which
// must be the one that stands for the type: a tag of a plug-in may bear the same number, but not this node type.
template <class Tag>
Tag* FindTagFrom(BaseTag* tag, Long type)
{
  while (tag && tag->GetDiskType() != type)
    tag = tag->GetNext();
  return NodeCast<Tag>(tag);
}

template <class Tag>
Tag* FindTag(const BaseObject& object, Long type)
{
  return FindTagFrom<Tag>(object.GetFirstTag(), type);
}

// Makes the tag when there is none; null when memory is short.
template <class Tag>
Tag* NeedTag(BaseObject& object, Long type)
{
  Tag* tag = FindTag<Tag>(object, type);
  return tag ? tag : NodeCast<Tag>(object.MakeTag(type));
}

// Gives every tag of this type `count` entries. False when one can't be resized; those behind it stay as they are.
inline Bool ResizeTags(BaseObject& object, Long type, Long count)
{
  auto* tag = FindTag<BaseArrayTag>(object, type);
  for (; tag; tag = FindTagFrom<BaseArrayTag>(tag->GetNext(), type)) {
    if (!tag->ResizeTagArray(count))
      return false;
  }
  return true;
}

} // namespace _torvane_
