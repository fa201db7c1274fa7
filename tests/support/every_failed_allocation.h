// The one check that a lack of memory is either told or without effect.
#pragma once

#include <string>

#include <gtest/gtest.h>

#include "support/counting_memory.h"

// Runs `operation` with its first allocation failing alone, then its second, and so on to the last, and again with all
// that follow failing too. What it gives is true if it succeeded, and holds what it made: a pointer, say. Each run must
// fail or make what `describe` tells to be the same as with enough memory, and nothing may stay allocated.
template <class Operation, class Describe>
void EveryFailedAllocation(Operation&& operation, Describe&& describe)
{
  auto whole = operation();
  ASSERT_TRUE(static_cast<bool>(whole)) << "with enough memory";
  const auto wanted = describe(whole);
  for (const auto fail : {counting_memory::FailOnceAfter, counting_memory::FailAfter}) {
    bool failed = true;
    for (_torvane_::LLong count = 0; failed; ++count) {
      const bool alone = fail == counting_memory::FailOnceAfter;
      SCOPED_TRACE("allocation " + std::to_string(count) + (alone ? " fails alone" : " and all behind it fail"));
      const _torvane_::LLong blocks = counting_memory::Get().blocks;
      fail(count);
      {
        auto made = operation();
        failed = counting_memory::FailNever();
        ASSERT_TRUE(failed || made);
        ASSERT_TRUE(!made || describe(made) == wanted) << "a part is missing without a word";
      }
      ASSERT_EQ(counting_memory::Get().blocks, blocks) << "library blocks were left allocated";
    }
  }
}

// For operations whose success is all that there is to see.
template <class Operation>
void EveryFailedAllocation(Operation&& operation)
{
  EveryFailedAllocation(operation, [](const auto&) { return true; });
}
