// A web page with a scene in it: cameras to choose, a time line, and nothing that is loaded from elsewhere.
#pragma once

#include <cstddef>
#include <string>

#include "gltf/converter.h"

namespace gltf
{

// Browsers hold no longer text.
inline constexpr std::size_t kMaxPage = std::size_t{512} << 20;

// Hands on the page of a model that has its pictures packed in and no file for its bytes. `title` is UTF-8. Throws
// TooLarge, before anything is handed on, above `limit` bytes.
void WritePage(const Model& model, const std::string& title, const Sink& sink, std::size_t limit = kMaxPage);

} // namespace gltf
