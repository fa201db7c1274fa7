// A Windows library taken apart from its bytes: what it exports, what it needs, and its resources.
#pragma once

#include <array>
#include <cstdint>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

class PluginImage
{
 public:
  explicit PluginImage(std::vector<std::uint8_t> file) : file_(std::move(file))
  {
    header_ = Get(0x3C, 4) + 4; // behind the signature
    if (file_.at(0) != 'M' || file_.at(1) != 'Z' || Text(header_ - 4) != "PE")
      throw std::runtime_error("no Windows library");
  }

  std::uint32_t Machine() const { return Get(header_, 2); }
  std::uint32_t Characteristics() const { return Get(header_ + 18, 2); }
  std::uint32_t OptionalMagic() const { return Get(Optional(), 2); }
  std::uint32_t DllCharacteristics() const { return Get(Optional() + 70, 2); }

  // By name; and how many entries there are, with a name or without.
  std::vector<std::string> Exports() const
  {
    std::vector<std::string> names;
    const std::size_t table = Place(Directory(0));
    const std::size_t list = Place(Get(table + 32, 4));
    for (std::uint32_t i = 0; i < Get(table + 24, 4); ++i)
      names.push_back(Text(Place(Get(list + 4 * i, 4))));
    return names;
  }
  std::uint32_t ExportCount() const { return Get(Place(Directory(0)) + 20, 4); }

  // The libraries that are loaded with it, in lower case; delayed ones would stand in a directory of their own.
  std::vector<std::string> Imports() const
  {
    std::vector<std::string> names;
    for (std::size_t entry = Place(Directory(1)); Get(entry + 12, 4) != 0; entry += 20) {
      names.push_back(Text(Place(Get(entry + 12, 4))));
      for (char& c : names.back())
        c = c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c;
    }
    return names;
  }
  bool HasDelayedImports() const { return Directory(13) != 0; }

  // Every resource by "type/id/language".
  std::map<std::string, std::vector<std::uint8_t>> Resources() const
  {
    std::map<std::string, std::vector<std::uint8_t>> found;
    CollectResources(0, "", found);
    return found;
  }

 private:
  std::size_t Optional() const { return header_ + 20; }
  std::uint32_t Directory(std::size_t index) const { return Get(Optional() + 112 + 8 * index, 4); }

  std::uint32_t Get(std::size_t at, std::size_t size) const
  {
    std::uint32_t value = 0;
    for (std::size_t i = size; i-- > 0;)
      value = value << 8 | file_.at(at + i);
    return value;
  }

  std::string Text(std::size_t at) const
  {
    std::string text;
    while (file_.at(at) != 0)
      text += static_cast<char>(file_[at++]);
    return text;
  }

  // Where in the file an address lies that counts from the loaded library's beginning.
  std::size_t Place(std::uint32_t address) const
  {
    const std::size_t sections = Optional() + Get(header_ + 16, 2);
    for (std::size_t section = sections; section < sections + 40 * Get(header_ + 2, 2); section += 40) {
      const std::uint32_t start = Get(section + 12, 4);
      if (address >= start && address < start + Get(section + 16, 4))
        return Get(section + 20, 4) + (address - start);
    }
    throw std::runtime_error("an address outside all sections");
  }

  std::string ResourceName(std::uint32_t name) const
  {
    if ((name & kDeeper) == 0)
      return std::to_string(name);
    const std::size_t at = Place(Directory(2)) + (name & ~kDeeper);
    std::string text;
    for (std::uint32_t i = 0; i < Get(at, 2); ++i)
      text += static_cast<char>(Get(at + 2 + 2 * std::size_t{i}, 2));
    return text;
  }

  void CollectResources(std::size_t table, const std::string& path,
                        std::map<std::string, std::vector<std::uint8_t>>& found) const
  {
    const std::size_t root = Place(Directory(2));
    const std::uint32_t count = Get(root + table + 12, 2) + Get(root + table + 14, 2);
    for (std::size_t entry = root + table + 16, i = 0; i < count; ++i, entry += 8) {
      const std::string name = path + (path.empty() ? "" : "/") + ResourceName(Get(entry, 4));
      const std::uint32_t next = Get(entry + 4, 4);
      if ((next & kDeeper) != 0) {
        CollectResources(next & ~kDeeper, name, found);
        continue;
      }
      const auto start = file_.begin() + static_cast<std::ptrdiff_t>(Place(Get(root + next, 4)));
      found[name].assign(start, start + static_cast<std::ptrdiff_t>(Get(root + next + 4, 4)));
    }
  }

  static constexpr std::uint32_t kDeeper = 0x80000000; // the entry leads to a table, or the name is a text

  std::vector<std::uint8_t> file_;
  std::size_t header_ = 0;
};
