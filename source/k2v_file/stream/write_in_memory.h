// Values written into a file that nobody opens again, for those who need their bytes.
#pragma once

#include "torvane/stream/hyper_file.h"
#include "torvane/text/filename.h"

namespace _torvane_
{

// Opens a scene file in memory for `write(HyperFile&)`, and hands all its bytes, of which the first `header` stand
// before the first value, to `take(const UChar* bytes, LLong size, LLong header)`. They are gone afterwards. What
// `take` gives; false when the file failed or memory was short.
template <class Write, class Take>
Bool WriteInMemory(Write&& write, Take&& take)
{
  MemoryDescription description;
  Filename target;
  target.SetMemoryWrite(&description);
  HyperFile file;
  if (!file.Open(kSceneIdent, target, kHyperFileWrite))
    return false;
  const LLong header = file.GetPosition();
  write(file);
  const void* bytes = nullptr;
  LLong size = 0;
  return file.Close() && target.GetMemoryContinuous(bytes, size) &&
         take(static_cast<const UChar*>(bytes), size, header);
}

} // namespace _torvane_
