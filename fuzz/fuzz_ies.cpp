// Any text as a photometric file.
#include <cstddef>
#include <cstdint>

#include "torvane/memory/assertion.h"
#include "torvane/memory/memory.h"
#include "torvane/objects/ies_light.h"
#include "torvane/text/filename.h"

using namespace _torvane_;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
  SetAssertionLog(nullptr);
  Filename name;
  name.SetMemoryRead(data, static_cast<LLong>(size));
  IESLight* light = nullptr;
  const Long result = LoadIESFile(light, name);
  if ((result == kIESLoaded) != (light != nullptr))
    __builtin_trap();
  DeleteObj(light);
  return 0;
}
