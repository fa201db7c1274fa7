#include "k2v_file/memory/stack_room.h"

#include <cstdint>

#ifdef _WIN32
#include <windows.h>
#else
#include <pthread.h>
#endif

namespace _torvane_
{

namespace
{

// Stacks grow down.
struct StackRange
{
  std::uintptr_t low = 0;
  std::uintptr_t high = 0;
};

#ifdef _WIN32

StackRange AskForStack()
{
  ULONG_PTR low = 0;
  ULONG_PTR high = 0;
  GetCurrentThreadStackLimits(&low, &high);
  return {low, high};
}

#else

StackRange AskForStack()
{
  pthread_attr_t attributes;
  if (pthread_getattr_np(pthread_self(), &attributes) != 0)
    return {};
  void* low = nullptr;
  std::size_t size = 0;
  const bool told = pthread_attr_getstack(&attributes, &low, &size) == 0;
  pthread_attr_destroy(&attributes);
  const auto start = reinterpret_cast<std::uintptr_t>(low);
  return told ? StackRange{start, start + size} : StackRange{};
}

#endif

constexpr std::uintptr_t kReserve = 256 * 1024;

// The address below which only the reserve is left; 0 if nobody tells.
std::uintptr_t FindLeastAddress()
{
  const StackRange stack = AskForStack();
  const std::uintptr_t quarter = (stack.high - stack.low) / 4;
  return stack.low + (quarter < kReserve ? quarter : kReserve);
}

} // namespace

Bool HasStackRoom() noexcept
{
  static thread_local const std::uintptr_t least = FindLeastAddress();
  return reinterpret_cast<std::uintptr_t>(__builtin_frame_address(0)) >= least;
}

} // namespace _torvane_
