#include "host/reader/projects/project_items.h"

#include <nlohmann/json.hpp>
#include <utf8.h>

#include "host/reader/projects/layouts.h"
#include "host/text.h"

#include <algorithm>

namespace host::projects
{

namespace
{

constexpr double kFraction = 65536; // a rate's last 16 bits count these
constexpr A_long kLargestSize = 30000;

// Windows-1252 from 0x80 to 0x9F; the rest of it is Latin-1. 0 where it has no character.
constexpr char32_t kWindows1252[32] = {0x20AC, 0,      0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021,
                                       0x02C6, 0x2030, 0x0160, 0x2039, 0x0152, 0,      0x017D, 0,
                                       0,      0x2018, 0x2019, 0x201C, 0x201D, 0x2022, 0x2013, 0x2014,
                                       0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0,      0x017E, 0x0178};

// The file part of a path of Windows or another system.
std::string FilePart(const std::string& path) { return path.substr(path.find_last_of("/\\") + 1); }

// A folder's path joined to a file's name by the separator that the path uses.
std::string Join(const std::string& folder, const std::string& file)
{
  if (folder.empty() || folder.back() == '/' || folder.back() == '\\')
    return folder + file;
  const bool isWindows = folder.find('/') == std::string::npos && folder.find('\\') != std::string::npos;
  return folder + (isWindows ? '\\' : '/') + file;
}

struct FileReference
{
  std::string path;
  bool isFolder = false;
};

FileReference ReadReference(const Chunk& source)
{
  const Chunk alias = source.RequireList("Als2"_tag).Require("alas"_tag);
  const nlohmann::json json = nlohmann::json::parse(ToText(alias.Bytes()), nullptr, false);
  const auto path = json.is_object() ? json.find("fullpath") : json.end();
  if (!json.is_object() || path == json.end() || !path->is_string())
    alias.Refuse("expected JSON with the text \"fullpath\"");
  const auto isFolder = json.find("target_is_folder");
  const bool isTrue = isFolder != json.end() && isFolder->is_boolean() && isFolder->get<bool>();
  return {path->get<std::string>(), isTrue};
}

std::string Padded(std::uint32_t number, std::uint32_t digits)
{
  const std::string text = std::to_string(number);
  const std::size_t wanted = std::min<std::size_t>(digits, 20); // more than any number has
  return text.size() < wanted ? std::string(wanted - text.size(), '0') + text : text;
}

struct Sequence
{
  std::string firstFile;
  std::uint64_t files = 1;
};

// The names in `StVc`, else what `sspc` says of the numbers, between the texts that stand before `opti`.
Sequence ReadSequence(const Chunk& source, const Chunk& settings)
{
  if (const std::optional<Chunk> names = source.FindList("StVc"_tag)) {
    Sequence sequence{"", 0};
    for (const Chunk& name : names->Children())
      if (name.Id() == "Utf8"_tag && sequence.files++ == 0)
        sequence.firstFile = ToText(name.Bytes());
    if (sequence.files > 0)
      return sequence;
  }
  std::vector<std::string> texts;
  for (const Chunk& child : source.Children()) {
    if (child.Id() == "opti"_tag)
      break;
    if (child.Id() == "Utf8"_tag)
      texts.push_back(ToText(child.Bytes()));
    else
      texts.clear();
  }
  const std::string suffix = texts.empty() ? "" : texts.back();
  const std::string prefix = texts.size() < 2 ? "" : texts[texts.size() - 2];
  const u32 first = settings.Get(sspc::kFirstNumber), last = settings.Get(sspc::kLastNumber);
  if (first == sspc::kUnknown || last == sspc::kUnknown || last < first)
    return {prefix + suffix, 1};
  return {prefix + Padded(first, settings.Get(sspc::kDigits)) + suffix, std::uint64_t{last} - first + 1};
}

void ReadFile(const Chunk& source, const Chunk& settings, Item& item)
{
  const FileReference reference = ReadReference(source);
  item.path = reference.path;
  if (reference.isFolder) {
    const Sequence sequence = ReadSequence(source, settings);
    item.path = Join(reference.path, sequence.firstFile);
    item.files = static_cast<A_long>(std::min<std::uint64_t>(sequence.files, 0x7FFFFFFF));
  }
}

// What the file lasts, at the rate that it is made to have, as often as it is played.
double ReadDuration(const Chunk& settings)
{
  const double own = settings.Get(sspc::kRate) + settings.Get(sspc::kRateFraction) / kFraction;
  const double forced = settings.Get(sspc::kForcedRate) + settings.Get(sspc::kForcedRateFraction) / kFraction;
  const double loops = std::max<double>(1, settings.Get(sspc::kLoops));
  return settings.Get(sspc::kDuration).ToDouble() * (forced > 0 && own > 0 ? own / forced : 1) * loops;
}

A_long ReadSize(const Chunk& settings, Field<u16> field)
{
  const A_long size = settings.Get(field);
  if (size > kLargestSize)
    settings.Refuse("expected a size from 0 to 30000, not " + std::to_string(size));
  return size;
}

void ReadSolidColor(const Chunk& options, Item& item)
{
  double* const parts[] = {&item.color.redF, &item.color.greenF, &item.color.blueF};
  const Field<f32> fields[] = {opti::kRed, opti::kGreen, opti::kBlue};
  for (std::size_t i = 0; i < std::size(parts); ++i) {
    *parts[i] = options.Get(fields[i]);
    if (!(*parts[i] >= 0 && *parts[i] <= 1e6)) // beyond 1 in projects of high range
      options.Refuse("expected a colour");
  }
}

} // namespace

std::string ToText(std::string_view bytes)
{
  bytes = bytes.substr(0, bytes.find('\0'));
  std::string text(bytes);
  if (utf8::is_valid(text.begin(), text.end()))
    return text;
  text.clear();
  for (const char byte : bytes) {
    const auto code = static_cast<unsigned char>(byte);
    const char32_t character = code >= 0x80 && code < 0xA0 ? kWindows1252[code - 0x80] : char32_t{code};
    utf8::append(character ? character : U'\uFFFD', std::back_inserter(text));
  }
  return text;
}

std::string OwnName(const Chunk& item)
{
  const std::optional<Chunk> name = item.Find("Utf8"_tag);
  return name ? ToText(name->Bytes()) : "";
}

ItemIndex::ItemIndex(const ChunkDocument& document)
{
  // Folders may be nested as deep as they like. The newest comes next, so each is read in its place but for its own
  // items, which follow those of the folder that it is in.
  std::vector<Chunk> folders{document.Root().RequireList("Fold"_tag)};
  for (std::size_t next = 0; next < folders.size(); ++next) {
    const Chunk folder = folders[next];
    for (const Chunk& child : folder.Children())
      if (child.IsList("Item"_tag))
        Add(child, folders);
  }
}

void ItemIndex::Add(const Chunk& item, std::vector<Chunk>& folders)
{
  const std::optional<Chunk> data = item.Find("idta"_tag);
  if (!data)
    return;
  const u16 kind = data->Get(idta::kKind);
  if (kind == idta::kFolder) {
    if (const std::optional<Chunk> content = item.FindList("Sfdr"_tag))
      folders.push_back(*content);
  } else if (kind == idta::kComposition || kind == idta::kFootage) {
    const u32 id = data->Get(idta::kId);
    if (byId_.try_emplace(id, items_.size()).second)
      items_.push_back({item, kind, id});
  }
}

const ProjectItem* ItemIndex::Find(std::uint32_t id) const
{
  const auto found = byId_.find(id);
  return found == byId_.end() ? nullptr : &items_[found->second];
}

void ReadFootage(const ProjectItem& footage, Item& item)
{
  item.id = std::to_string(footage.id);
  item.name = OwnName(footage.chunk);
  const Chunk source = footage.chunk.RequireList("Pin"_tag);
  const Chunk settings = source.Require("sspc"_tag);
  const Chunk options = source.Require("opti"_tag);
  item.width = ReadSize(settings, sspc::kWidth);
  item.height = ReadSize(settings, sspc::kHeight);
  const Tag kind = options.Get(opti::kSource);
  item.kind = kind == opti::kSolid ? ItemKind::kSolid : ItemKind::kFootage;
  if (kind == opti::kSolid) {
    ReadSolidColor(options, item);
    if (item.name.empty())
      item.name = ToText(options.TextAt(opti::kSolidName));
    return;
  }
  item.duration = ReadDuration(settings);
  if (kind == opti::kPlaceholder) {
    if (item.name.empty())
      item.name = ToText(options.TextAt(opti::kPlaceholderName));
    return;
  }
  ReadFile(source, settings, item);
  if (item.name.empty())
    item.name = FilePart(item.path);
}

} // namespace host::projects
