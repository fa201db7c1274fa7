// Memory hooks for the tests: they count what is allocated and can be told to fail.
#pragma once

#include "torvane/types.h"

namespace counting_memory
{

struct Counts
{
  _torvane_::LLong blocks;      // blocks allocated and not yet freed
  _torvane_::LLong bytes;       // their bytes
  _torvane_::LLong peakBytes;   // the most bytes since ResetPeak
  _torvane_::LLong allocations; // allocations ever made, failed ones included
};

Counts Get();

void ResetPeak();

// The allocation that comes after `count` further ones fails, and so do all that follow, until FailNever.
void FailAfter(_torvane_::LLong count);
// As FailAfter, but the one allocation fails alone.
void FailOnceAfter(_torvane_::LLong count);
// True if an allocation failed before this call.
bool FailNever();

// The most bytes that were taken at once while `act` ran, beyond those that were there before.
template <class Act>
_torvane_::LLong PeakOf(Act&& act)
{
  ResetPeak();
  const _torvane_::LLong before = Get().bytes;
  act();
  return Get().peakBytes - before;
}

// What `act` gives when the allocation behind `count` further ones fails, and all that follow.
template <class Act>
auto WithoutMemory(Act&& act, _torvane_::LLong count = 0)
{
  FailAfter(count);
  auto result = act();
  FailNever();
  return result;
}

} // namespace counting_memory
