// Tables of the parameters that new nodes have.
#pragma once

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

// The elements of a table and their payloads, in static memory for good.
template <std::size_t count>
class DefaultElements
{
 public:
  explicit DefaultElements(const ContainerDefault* rows) { container_.BuildDefaults(rows, count, places_); }
  ~DefaultElements() {} // NOLINT(modernize-use-equals-default): nodes may outlive static objects, so nothing is freed
  DefaultElements(const DefaultElements&) = delete;
  DefaultElements& operator=(const DefaultElements&) = delete;

  const BaseContainer& GetContainer() const { return container_; }

 private:
  alignas(BaseContainer) UChar places_[count * BaseContainer::kDefaultSize];
  union
  {
    BaseContainer container_ = BaseContainer(); // NOLINT(readability-identifier-naming): private, in an unnamed union
  };
};

// The container that BaseContainer::SetDefaults takes for a table: a constexpr array, or what has size() and data().
template <const auto& rows>
const BaseContainer& DefaultsOf()
{
  static const DefaultElements<std::size(rows)> elements(std::data(rows));
  return elements.GetContainer();
}

} // namespace _torvane_
