// Identifiers that no other machine makes.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// Fills 16 bytes with a fresh random identifier, from a generator that the system seeds for each thread, or with the
// next one of a ReproducibleRun. A failure is reported and leaves the bytes as they are. Any thread may call it at any
// time.
void CreateUuid(UChar* bytes) noexcept;

} // namespace _torvane_
