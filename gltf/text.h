// The library's texts and file names as UTF-8 and as paths.
#pragma once

#include <filesystem>
#include <string>

#include "torvane/text/ge_string.h"

namespace gltf
{

// Unpaired surrogates become U+FFFD.
std::string ToUtf8(const _torvane_::String& text);
std::filesystem::path ToPath(const std::string& utf8);

// `file` as a URI relative to `folder`, percent-encoded; absolute ("file:") where no way leads from one to the other.
// Both as the system reaches them; the folder must be there.
std::string ToUri(const std::filesystem::path& file, const std::filesystem::path& folder);
// The bytes of a path's part or of a whole path with "/", percent-encoded.
std::string PercentEncoded(const std::string& bytes);
// The last part of a path of whatever system: behind the last "/" or "\".
std::string LastPart(const std::string& path);

} // namespace gltf
