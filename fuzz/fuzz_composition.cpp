// Any text as a composition file: it is refused with a reason, or exported to a scene that loads.
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <string_view>

#include "exporter/walk/composition.h"
#include "host/standalone_host.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/assertion.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
  _torvane_::SetAssertionLog(nullptr);
  const std::string_view text(reinterpret_cast<const char*>(data), size);
  try {
    host::StandaloneHost player(host::LoadCompositionText(text, "fuzz.json", "/"));
    player.Start(EntryPointFunc);
    player.CallMenuHook();
  } catch (const host::CompositionError&) {
    return 0;
  }
  return 0;
}
