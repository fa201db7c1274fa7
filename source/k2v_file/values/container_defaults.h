// Tables of the parameters that new nodes have.
#pragma once

#include <atomic>
#include <iterator>

#include "torvane/values/base_container.h"

namespace _torvane_
{

enum class DefaultForm : UChar
{
  kBool,
  kLong,
  kReal,
  kTime, // whole seconds
  kGrey, // a Vector with the number in all three components
  kVector,
  kString, // empty, as the three below
  kFilename,
  kLink,
  kContainer, // or with the entries of another table
};

// One parameter. A container holds those of a table in their order, which is that of a file.
struct ContainerDefault
{
  Long id;
  DefaultForm form;
  Real number = 0.0;
  Vector vector = {};
  const BaseContainer& (*container)() = nullptr; // a DefaultsOf
};

// What containers share.
struct BaseContainer::Defaults
{
  // The most bytes that an element has in a file, unless it holds a container.
  static constexpr LLong kLargestStored = 40;

  Element* first = nullptr;
  Long count = 0;
  // The elements as a file holds them, one behind the other: where each of them ends. One that isn't told here has no
  // bytes. Room for kLargestStored bytes, and for one end, for each element; filled when they are first needed, which
  // `isStored` tells.
  UChar* bytes = nullptr;
  Long* ends = nullptr;
  mutable std::atomic<Bool> isStored{false};
};

// The elements of a table and their payloads, in static memory for good.
template <std::size_t count>
class DefaultElements
{
 public:
  explicit DefaultElements(const ContainerDefault* rows)
  {
    defaults_.count = count;
    defaults_.bytes = bytes_;
    defaults_.ends = ends_;
    container_.BuildDefaults(rows, defaults_, places_);
  }
  ~DefaultElements() {} // NOLINT(modernize-use-equals-default): nodes may outlive static objects, so nothing is freed
  DefaultElements(const DefaultElements&) = delete;
  DefaultElements& operator=(const DefaultElements&) = delete;

  const BaseContainer& GetContainer() const { return container_; }

 private:
  alignas(BaseContainer) UChar places_[count * BaseContainer::kDefaultSize];
  UChar bytes_[count * BaseContainer::Defaults::kLargestStored];
  Long ends_[count];
  BaseContainer::Defaults defaults_;
  union
  {
    BaseContainer container_ = BaseContainer(); // NOLINT(readability-identifier-naming): private, in an unnamed union
  };
};

// Elements that take the place of shared ones are found by their ids.
template <const auto& rows>
constexpr Bool HasDifferentIds()
{
  for (auto* row = std::data(rows); row != std::data(rows) + std::size(rows); ++row) {
    for (auto* before = std::data(rows); before != row; ++before) {
      if (before->id == row->id)
        return false;
    }
  }
  return true;
}

// The container that BaseContainer::SetDefaults takes for a table: a constexpr array, or what has size() and data().
template <const auto& rows>
const BaseContainer& DefaultsOf()
{
  static_assert(HasDifferentIds<rows>());
  static const DefaultElements<std::size(rows)> elements(std::data(rows));
  return elements.GetContainer();
}

} // namespace _torvane_
