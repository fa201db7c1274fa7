// Registers of 32 bytes, where the machine has them: functions that are to use them are compiled for them, and called
// if it does.
#pragma once

#include "torvane/types.h"

#if defined(__x86_64__) && defined(__GNUC__)
#define WITH_WIDE_REGISTERS __attribute__((target("avx2")))
#else
#define WITH_WIDE_REGISTERS
#endif

namespace _torvane_
{

inline Bool HasWideRegisters()
{
#if defined(__x86_64__) && defined(__GNUC__)
  return __builtin_cpu_supports("avx2") != 0;
#else
  return false;
#endif
}

} // namespace _torvane_
