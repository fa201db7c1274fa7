// The objects of a document as a list, in the order of the tree, with what each one's place in it means; and the
// settings that the whole conversion goes by.
#pragma once

#include <cstddef>
#include <unordered_map>
#include <vector>

#include "gltf/scene/frames.h"
#include "torvane/document/base_document.h"

namespace gltf
{

inline constexpr std::size_t kNone = static_cast<std::size_t>(-1);

struct SceneObject
{
  _torvane_::BaseObject* object;
  std::size_t parent;      // kNone for a root
  std::size_t nextSibling; // kNone for none
  bool hidden;             // not rendered
};

// Parents before their children, a first child next to its parent. The index of an object is that of its node.
class SceneTree
{
 public:
  explicit SceneTree(_torvane_::BaseDocument& document);

  std::size_t Count() const { return objects_.size(); }
  const SceneObject& operator[](std::size_t index) const { return objects_[index]; }
  // kNone for an object without children.
  std::size_t FirstChild(std::size_t index) const;
  // The index of an object of this document, kNone for anything else.
  std::size_t Find(const _torvane_::GeListNode* node) const;
  // What the first view looks through, else the first camera; kNone without cameras.
  std::size_t SceneCamera() const { return sceneCamera_; }

 private:
  void AddAll(_torvane_::BaseObject* first);
  std::size_t Add(_torvane_::BaseObject& object, std::size_t parent, std::vector<std::size_t>& offLayer);
  bool IsHidden(const _torvane_::BaseObject& object, std::size_t parent, std::size_t offLayer) const;
  std::size_t FindSceneCamera(_torvane_::BaseDocument& document) const;

  std::vector<SceneObject> objects_;
  mutable std::unordered_map<const _torvane_::GeListNode*, std::size_t> places_; // empty until it is first asked for
  std::size_t sceneCamera_ = kNone;
};

// What some objects have, by their index; takes nothing where none has it. It belongs to somebody else.
template <class T>
class ByObject
{
 public:
  explicit ByObject(const SceneTree& tree) : count_(tree.Count()) {}
  void Set(std::size_t index, T* value)
  {
    values_.resize(count_);
    values_[index] = value;
  }
  // Null for an object that has none.
  T* operator[](std::size_t index) const { return values_.empty() ? nullptr : values_[index]; }

 private:
  std::size_t count_;
  std::vector<T*> values_;
};

// True for an object that stands for a layer of the host that made the scene.
bool StandsForLayer(const _torvane_::BaseObject& object);

// Settings of a document, each brought to something usable.
struct SceneSettings
{
  explicit SceneSettings(_torvane_::BaseDocument& document);

  Real unit = 0.01; // metres of one scene unit
  int fps = 30;
  Real start = 0.0; // seconds
  Real end = 0.0;
  Real width = 800.0; // of the picture, pixels
  Real height = 600.0;
  Real aspect = 4.0 / 3.0; // width by height, as seen
};

} // namespace gltf
