// Scenes written as glTF files and as pages.
#pragma once

#include <string>

#include "gltf/converter.h"
#include "torvane/document/base_document.h"

namespace q7r
{

// What a path's suffix asks for.
enum class GltfForm
{
  kNone,
  kGlb,  // one file
  kGltf, // JSON, with the bytes in NAME.bin beside it
  kPage, // one web page (.html)
};

// A device whose name tells no form, such as standard output, has the form `ofDevices`.
GltfForm GltfFormOf(const std::string& path, GltfForm ofDevices = GltfForm::kNone);

// Refuses an output that can't be written or mustn't be replaced, NAME.bin with it: an existing file without `force`,
// the scene itself (may be empty). To be called before the work begins. Throws Failure.
void RequireGltfOutput(const std::string& output, const std::string& scene, bool force);

// Writes a document in a form, as whole files, tells what they can't hold on standard error and their sizes on standard
// output. `scene` is where the document came from: its pictures may lie beside it. Gives the exit status. A page always
// has its pictures packed in. Throws Failure.
int WriteGltf(_torvane_::BaseDocument& document, const std::string& scene, const std::string& output, GltfForm form,
              gltf::Options options);

} // namespace q7r
