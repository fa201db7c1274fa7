// Any bytes as a picture file of each format.
#include <cstddef>
#include <cstdint>

#include "torvane/memory/assertion.h"
#include "torvane/pictures/bitmap_filters.h"
#include "torvane/text/filename.h"

using namespace _torvane_;

namespace
{

void Load(const BitmapLoaderData& loader, const Filename& name, const std::uint8_t* data, std::size_t size)
{
  Bitmap bitmap;
  loader.Identify(name, data, static_cast<LLong>(size));
  // A picture that was read whole has pixels.
  if (loader.Load(name, bitmap, kFirstFrame) == IMAGERESULT_OK && bitmap.GetBw() < 1)
    __builtin_trap();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
  SetAssertionLog(nullptr);
  Filename name;
  name.SetMemoryRead(data, static_cast<LLong>(size));
  Load(BmpLoader(), name, data, size);
  Load(JpgLoader(), name, data, size);
  return 0;
}
