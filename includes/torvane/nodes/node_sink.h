// Who is handed the objects and materials of a file as they are read, for programs that look at each of them once.
#pragma once

namespace _torvane_
{

class BaseList2D;

class NodeSink
{
 public:
  // An object or a material that was read whole, with its tags, tracks and shaders. Its children came before it and are
  // gone; so is the node behind this call. Links are not followed: they are empty.
  virtual void Take(BaseList2D& node) = 0;
  // Nodes that were taken turned out to belong to no scene: a damaged or old file holds a list in the place of an
  // earlier one. What the scene holds then tells a load without a sink alone.
  virtual void TakeBack() = 0;

 protected:
  NodeSink() = default;
  NodeSink(const NodeSink&) = default;
  NodeSink& operator=(const NodeSink&) = default;
  ~NodeSink() = default;
};

} // namespace _torvane_
