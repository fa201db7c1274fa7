// Ownership that ends with its scope.
#pragma once

#include <memory>

#include "torvane/memory/memory.h"

namespace _torvane_
{

// Frees what NewObj or GeAlloc made.
struct OwnedDeleter
{
  template <class T>
  void operator()(T* thing) const noexcept
  {
    if constexpr (std::is_void_v<T>)
      GeFree(thing);
    else
      DeleteObj(thing);
  }
};

// An object made by NewObj, or a block made by GeAlloc (of void or of a type that has no destructor), that goes at the
// end of the scope unless it is released.
template <class T>
using Owned = std::unique_ptr<T, OwnedDeleter>;

} // namespace _torvane_
