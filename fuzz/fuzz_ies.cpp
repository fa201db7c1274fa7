// Any text as a photometric file.
#include <cstddef>
#include <cstdint>

#include "torvane/assertion.h"
#include "torvane/filename.h"
#include "torvane/ies_light.h"
#include "torvane/memory.h"

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
