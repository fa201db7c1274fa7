// Paths that are longer than the plain calls of the system take.
#pragma once

#include <filesystem>

// The form of an absolute path in which nothing but the names count, up to 32767 characters.
inline std::filesystem::path Verbatim(const std::filesystem::path& path) { return L"\\\\?\\" + path.native(); }

// Removes a path and the folders above it, below `folder`.
inline void RemoveUpTo(const std::filesystem::path& folder, std::filesystem::path path)
{
  for (; path != folder; path = path.parent_path())
    std::filesystem::remove(Verbatim(path));
}
