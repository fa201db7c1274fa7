// How much of its stack a thread may still use. Chunks in chunks are read and written by functions that call
// themselves: a nest that a stack of the usual size holds is too deep for the small ones that some hosts give.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// False when no more than 256 KB or a quarter of the calling thread's stack are left. True where nobody tells how large
// the stack is.
Bool HasStackRoom() noexcept;

} // namespace _torvane_
