// The library's memory: everything is allocated through the client's hooks, and running out of memory is a result,
// never an exception.
#pragma once

#include <new>
#include <type_traits>
#include <utility>

#include "torvane/types.h"

namespace _torvane_
{

// A zeroed block of `size` bytes; null for a size of 0 or less and when memory is short.
void* GeAlloc(LLong size) noexcept;

// As GeAlloc, but the block's contents are undefined.
void* GeAllocNC(LLong size) noexcept;

// Changes a block's size and keeps its contents up to the smaller one. Null when memory is short: `block` then stays
// valid and stays the caller's. A null block is allocated anew.
void* GeRealloc(void* block, LLong size) noexcept;

// Frees `block` if it is not null and sets it to null.
template <class T>
void GeFree(T*& block) noexcept;

// Copies `size` bytes; does nothing unless source, destination and size are all non-zero. The blocks must not overlap.
void GeCopyMem(void* destination, const void* source, LLong size) noexcept;

// The same for blocks of which most have no more than 16 bytes: for these a loop is quicker than a call.
inline void GeCopyFewBytes(void* destination, const void* source, LLong size) noexcept
{
  constexpr LLong kFew = 16;
  if (size > kFew) {
    GeCopyMem(destination, source, size);
    return;
  }
  for (LLong i = 0; i < size; ++i)
    static_cast<unsigned char*>(destination)[i] = static_cast<const unsigned char*>(source)[i];
}

namespace detail
{
void FreeBlock(void* block) noexcept;
extern constinit thread_local ULong failedAllocations;
} // namespace detail

template <class T>
void GeFree(T*& block) noexcept
{
  detail::FreeBlock(const_cast<std::remove_cv_t<T>*>(block));
  block = nullptr;
}

// Base of every polymorphic class of the library: `new` takes its memory from the client's hooks and gives null when
// there is none; `delete` through a base pointer frees it there.
struct GeMemory
{
  static void* operator new(std::size_t size) noexcept { return GeAllocNC(static_cast<LLong>(size)); }
  static void* operator new(std::size_t, void* place) noexcept { return place; }
  static void operator delete(void* block) noexcept { detail::FreeBlock(block); }
  static void operator delete(void*, void*) noexcept {}
};

// Destroys an object made by NewObj and sets the pointer to null; a null pointer does nothing. A derived object may
// be deleted through its base when the base has a virtual destructor.
template <class T>
void DeleteObj(T*& object) noexcept
{
  if constexpr (std::has_virtual_destructor_v<T>) {
    static_assert(std::is_base_of_v<GeMemory, T>, "polymorphic classes take their memory through GeMemory");
    delete object;
  } else if (object) {
    object->~T();
    detail::FreeBlock(const_cast<std::remove_cv_t<T>*>(object));
  }
  object = nullptr;
}

// How many allocations of the calling thread the client's hooks have refused since it began. Sizes that are turned down
// before the hooks are asked don't count.
inline ULong CountFailedAllocations() noexcept { return detail::failedAllocations; }

// Tells whether an allocation of this thread failed since the watch began. What is built of many parts (a load, a copy,
// a node with its defaults) asks it at its end: a part that came out empty somewhere below then makes the whole fail,
// whatever the function that met the null did with it.
class AllocationWatch
{
 public:
  AllocationWatch() noexcept : start_(CountFailedAllocations()) {}

  Bool Failed() const noexcept { return CountFailedAllocations() != start_; }
  // `object` if nothing failed; otherwise deletes it and gives null. Null stays null.
  template <class T>
  [[nodiscard]] T* Whole(T* object) const noexcept
  {
    if (object && Failed())
      DeleteObj(object);
    return object;
  }

 private:
  ULong start_;
};

// A new T in memory of the client's hooks, or null: also when its constructor could not get all that it asked for. The
// one way to make an object in the library.
template <class T, class... Args>
[[nodiscard]] T* NewObj(Args&&... args) noexcept
{
  AllocationWatch watch;
  void* place = GeAllocNC(static_cast<LLong>(sizeof(T)));
  return place ? watch.Whole(::new (place) T(std::forward<Args>(args)...)) : nullptr;
}

} // namespace _torvane_
