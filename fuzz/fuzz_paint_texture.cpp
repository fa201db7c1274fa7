// Any bytes as a paint texture.
#include <cstddef>
#include <cstdint>

#include "torvane/memory/assertion.h"
#include "torvane/pictures/paint_texture.h"
#include "torvane/text/filename.h"

using namespace _torvane_;

namespace
{

// Looks at every byte that it is given and keeps none.
class Listener : public K2VClient
{
 public:
  Bool CreateImage(Long, Long, Long) override { return true; }
  Bool CreateAlpha(Long, Long, Long) override { return true; }
  void SetAlphaLine(Long, Long, Long, Long count, const UChar* buffer) override
  {
    for (Long i = 0; i < count; ++i)
      sum_ = sum_ + buffer[i];
  }
  Long GetImageWidth() override { return 0; }
  Long GetImageHeight() override { return 0; }
  Long GetImageDepth(HyperFile&, Long, Long) override { return 4; }
  void GetImageLine(Long, Long, Long, UChar*) override {}
  Long GetAlphaCount() override { return 0; }
  void GetAlphaLine(Long, Long, Long, Long, UChar*) override {}

 private:
  volatile ULong sum_ = 0;
};

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
  SetAssertionLog(nullptr);
  Filename name;
  name.SetMemoryRead(data, static_cast<LLong>(size));
  Listener listener;
  K2VImageFilter filter;
  filter.Load(name, listener);
  return 0;
}
