// The items of a project: which there are, and what footage is made of.
#pragma once

#include "host/model/composition.h"
#include "host/reader/projects/chunk.h"

#include <unordered_map>

namespace host::projects
{

struct ProjectItem
{
  Chunk chunk;
  std::uint16_t kind; // idta::kComposition or idta::kFootage
  std::uint32_t id;
};

// All compositions and footage, those in folders too, in the order of the file.
class ItemIndex
{
 public:
  explicit ItemIndex(const ChunkDocument& document);

  const std::vector<ProjectItem>& Items() const { return items_; }
  // Null for an id that no item has. Of two equal ones the first counts.
  const ProjectItem* Find(std::uint32_t id) const;

 private:
  void Add(const Chunk& item, std::vector<Chunk>& folders);

  std::vector<ProjectItem> items_;
  std::unordered_map<std::uint32_t, std::size_t> byId_;
};

// The name that the user gave; empty where the item shows its source's.
std::string OwnName(const Chunk& item);

// Fills kind, name, size, duration, files and path, or a solid's colour.
void ReadFootage(const ProjectItem& footage, Item& item);

// Text as UTF-8: bytes that are none are taken as Windows-1252. Ends at the first NUL.
std::string ToText(std::string_view bytes);

} // namespace host::projects
