// Objects as nodes, with what hangs on them.
#pragma once

#include <bit>
#include <cstddef>
#include <string>
#include <unordered_map>
#include <vector>

#include "gltf/context.h"
#include "gltf/scene/targets.h"
#include "gltf/shapes/meshes.h"

namespace gltf
{

// Names that are unique in a file: of equal ones the second is called "name.2", the third "name.3", ...
class UniqueNames
{
 public:
  // For so many names.
  explicit UniqueNames(std::size_t count) : taken_(std::bit_ceil(count + count / 2 + 1)) {}
  std::string Take(const std::string& name); // an empty one stays so

 private:
  bool Enter(const std::string& name);

  // By their hashes, each at the first free place from its own on, 0 where none is: a scene has many names. Who meets
  // the hash of another name gives way too.
  std::vector<std::size_t> taken_;
  std::unordered_map<std::string, int> next_; // the number to try for a name that is taken
};

class Nodes
{
 public:
  Nodes(Context& context, Targets& targets, const ByObject<const Motion>& motions, const ByObject<TrackSet>& tracks);

  // Adds all nodes, in the order of the tree, and their channels.
  void Write();

 private:
  struct Parts // what a node draws
  {
    std::size_t camera = kNone;
    std::size_t mesh = kNone;
    std::size_t light = kNone;

    bool IsSeen() const { return mesh != kNone || light != kNone; }
  };

  void WriteNode(std::size_t index);
  Parts PartsOf(std::size_t index, TrackSet& tracks);
  void AddPlace(std::size_t index, Json& node);
  void AddParts(const Parts& parts, Json& node);
  std::size_t HiddenPart(const Parts& parts);
  Json ExtrasOf(std::size_t index) const;
  void AddChildren(std::size_t index, std::size_t hiddenPart, Json& node) const;
  void AddChannels(std::size_t index);

  Context& context_;
  Targets& targets_;
  const ByObject<const Motion>& motions_;
  const ByObject<TrackSet>& tracks_;
  Meshes meshes_;
  UniqueNames names_;
  std::vector<Json> addedNodes_; // behind those of the objects
};

} // namespace gltf
