// XML projects. To begin with: the .aepx files beside the source tree, or one of your own.
#include "fuzz_project.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
  return fuzz::ReadProject(data, size, true);
}
