#include "host/reader/moved_footage.h"

#include <algorithm>
#include <unordered_map>

#include "host/text.h"

namespace host
{

namespace
{

namespace fs = std::filesystem;

// Folders and file of a path of any system.
std::vector<std::string> Parts(const std::string& path)
{
  std::vector<std::string> parts{""};
  for (const char c : path) {
    if (c == '/' || c == '\\')
      parts.emplace_back();
    else
      parts.back() += c;
  }
  std::erase_if(parts, [](const std::string& part) { return part.empty() || part == "." || part == ".."; });
  return parts;
}

std::string Lowered(std::string text)
{
  std::transform(text.begin(), text.end(), text.begin(),
                 [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; });
  return text;
}

bool IsFile(const fs::path& path)
{
  std::error_code ignored;
  return fs::is_regular_file(path, ignored);
}

class FolderSearch
{
 public:
  explicit FolderSearch(const fs::path& folder) : folder_(fs::absolute(folder)) {}

  // An empty path when it is nowhere.
  fs::path Find(const std::string& path)
  {
    const std::vector<std::string> parts = Parts(path);
    for (std::size_t first = 0; first < parts.size(); ++first) {
      fs::path candidate = folder_;
      for (std::size_t i = first; i < parts.size(); ++i)
        candidate /= PathFromUtf8(parts[i]);
      if (IsFile(candidate))
        return candidate;
    }
    if (parts.empty())
      return {};
    Index();
    const auto found = byName_.find(Lowered(parts.back()));
    return found == byName_.end() ? fs::path() : found->second;
  }

 private:
  // Once; of files with one name the first in the order of paths.
  void Index()
  {
    if (isIndexed_)
      return;
    isIndexed_ = true;
    std::error_code error;
    fs::recursive_directory_iterator entry(folder_, fs::directory_options::skip_permission_denied, error);
    for (; !error && entry != fs::recursive_directory_iterator(); entry.increment(error)) {
      if (!IsFile(entry->path()))
        continue;
      const auto [place, isNew] = byName_.try_emplace(Lowered(PathToUtf8(entry->path().filename())), entry->path());
      if (!isNew && entry->path() < place->second)
        place->second = entry->path();
    }
  }

  fs::path folder_;
  bool isIndexed_ = false;
  std::unordered_map<std::string, fs::path> byName_;
};

} // namespace

void FindMovedFootage(Project& project, const fs::path& folder, const std::string& name)
{
  std::error_code ignored;
  if (!fs::is_directory(folder, ignored))
    throw CompositionError(OneLine(PathToUtf8(folder)), "is no folder");
  FolderSearch search(folder);
  for (Item& item : project.items) {
    if (item.kind != ItemKind::kFootage || item.path.empty() || IsFile(PathFromUtf8(item.path)))
      continue;
    const fs::path found = search.Find(item.path);
    if (found.empty())
      project.warnings.push_back(name + ": " + Quoted(item.path) + " is not below " + OneLine(PathToUtf8(folder)));
    else
      item.path = PathToUtf8(fs::path(found).make_preferred());
  }
}

} // namespace host
