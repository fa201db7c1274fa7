#include "footage.h"

#include <algorithm>
#include <set>

#include "host/model/layer_streams.h"
#include "host/text.h"

namespace q7r
{

namespace fs = std::filesystem;

namespace
{

// "C:\...", "C:/..." or "\\server\...".
bool IsWindowsPath(const std::string& path)
{
  const bool hasDrive = path.size() > 2 && path[1] == ':' && (path[2] == '\\' || path[2] == '/');
  return hasDrive || path.starts_with("\\\\");
}

// Data inside of a composition file have the item's id in the place of a path.
bool HasPath(const host::Item& item)
{
  return item.kind == host::ItemKind::kFootage && !item.path.empty() && item.path != item.id;
}

void Collect(const host::Composition& composition, std::set<const host::Composition*>& seen,
             std::set<const host::Item*>& used)
{
  if (!seen.insert(&composition).second)
    return;
  for (const host::Layer* layer : composition.layers) {
    if (!layer->source || !host::IsExported(*layer))
      continue;
    used.insert(layer->source);
    if (layer->source->composition)
      Collect(*layer->source->composition, seen, used);
  }
}

} // namespace

std::vector<std::string> MissingPictures(const host::Project& project)
{
  std::set<const host::Composition*> seen;
  std::set<const host::Item*> used;
  if (project.root)
    Collect(*project.root, seen, used);
  std::vector<std::string> missing;
  std::set<std::string> told;
  for (const host::Item& item : project.items) {
    std::error_code ignored;
    if (used.contains(&item) && HasPath(item) && !fs::exists(host::PathFromUtf8(item.path), ignored) &&
        told.insert(item.path).second)
      missing.push_back(item.path);
  }
  return missing;
}

void MakeRelative(host::Project& project, const fs::path& folder)
{
  // By the folders that the links on the way lead to: "..", behind a link, isn't the folder before it.
  std::error_code error;
  const fs::path root = fs::weakly_canonical(folder, error);
  if (error)
    return;
  for (host::Item& item : project.items) {
    const fs::path path = host::PathFromUtf8(item.path);
    if (!HasPath(item) || !path.is_absolute() || (fs::path::preferred_separator == '/' && IsWindowsPath(item.path)))
      continue;
    std::error_code ignored;
    const fs::path real = fs::weakly_canonical(path.parent_path(), ignored) / path.filename();
    const fs::path relative = real.lexically_relative(root);
    if (!relative.empty())
      item.path = host::PathToUtf8(relative);
  }
}

} // namespace q7r
