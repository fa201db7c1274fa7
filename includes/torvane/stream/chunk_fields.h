// The one place where the order of a class's values in a file is told.
#pragma once

namespace _torvane_
{

// What the chunks of `Class` hold, which names this its friend. It is specialised beside the code of the class: a
// function template, Visit..., for a chunk, which writes or reads an object as the visitor does.
template <class Class>
struct ChunkFields;

} // namespace _torvane_
