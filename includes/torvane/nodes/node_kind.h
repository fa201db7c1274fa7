// What class a node, a root list or a node's data is of: the one thing that a downcast goes by. Numbers of type are no
// classes, since one class stands for many of them, and files and plug-ins give one number to different things.
//
// Each class that is ever cast to has a record, kNodeKind, and answers GetNodeKind with it:
//
//   static constexpr NodeKindOf<BaseTag> kNodeKind{"tag", &BaseList2D::kNodeKind};
//   const NodeKind& GetNodeKind() const override { return kNodeKind; }
//
// A client's own class may do the same; without a record it passes for its base.
#pragma once

#include <type_traits>

#include "torvane/types.h"

namespace _torvane_
{

struct NodeKind
{
  const char* name;     // a word for messages; no two kinds have the same
  const NodeKind* base; // the kind of the base class; null for PrivateChunk

  // True for the kind itself and for those that it derives from.
  constexpr Bool Is(const NodeKind& other) const
  {
    const NodeKind* kind = this;
    while (kind && kind != &other)
      kind = kind->base;
    return kind != nullptr;
  }
};

// Ties a record to its class, so that NodeCast can't take the record of a base for it.
template <class Class>
struct NodeKindOf : NodeKind
{
  constexpr NodeKindOf(const char* kindName, const NodeKind* baseKind) : NodeKind{kindName, baseKind} {}
};

// `node` as a Target; null when it is null or of another class.
template <class Target, class Node>
std::conditional_t<std::is_const_v<Node>, const Target, Target>* NodeCast(Node* node)
{
  static_assert(std::is_same_v<decltype(Target::kNodeKind), const NodeKindOf<Target>>, "the class has no kind");
  using Result = std::conditional_t<std::is_const_v<Node>, const Target, Target>;
  return node && node->GetNodeKind().Is(Target::kNodeKind) ? static_cast<Result*>(node) : nullptr;
}

} // namespace _torvane_
