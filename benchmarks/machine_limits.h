// What this machine can do at best: the plainest code for the same kind of work. Each is measured once, when first
// asked for, as the best of three: runs of one process after a first one that touches the memory, or, where memory is
// to be fresh, runs of a process each, as the compared work has.
#pragma once

namespace benchmarks
{

// Doubles a second out of memory into a file, byte-swapped through a 64 KiB buffer (L2).
double DoubleWriteLimit();
// Doubles a second out of a file, read in 64 KiB pieces and byte-swapped into fresh memory (L3).
double DoubleReadLimit();
// Values a second to a file: a tag byte and eight big-endian bytes each, inlined, through a 16 KiB buffer (L4).
double ValueWriteLimit();
// The same, read (L4).
double ValueReadLimit();
// Nodes of 64 bytes a second, allocated in memory fresh from the system and filled (L5).
double NodeLimit();

} // namespace benchmarks
