// Any bytes as a scene file: what loads can be converted, and what comes out is a good .glb.
#include <cstddef>
#include <cstdint>
#include <cstdio>

#include "gltf/converter.h"
#include "gltf/file/checker.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/assertion.h"
#include "torvane/text/filename.h"

using namespace _torvane_;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
  SetAssertionLog(nullptr);
  Filename name;
  name.SetMemoryRead(data, static_cast<LLong>(size));
  BaseDocument* document = LoadDocument(name, LoadObjects | LoadMaterials);
  if (!document)
    return 0;
  gltf::Options options;
  options.embed = true;
  options.keepHidden = size % 2 == 0;
  options.sceneFolder = "/nowhere";
  const std::string fault = gltf::CheckGlb(gltf::ToGlb(gltf::Convert(*document, options)));
  if (!fault.empty()) {
    std::fprintf(stderr, "%s\n", fault.c_str());
    __builtin_trap();
  }
  BaseDocument::Free(document);
  return 0;
}
