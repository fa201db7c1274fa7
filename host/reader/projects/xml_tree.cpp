#include "host/reader/projects/xml_tree.h"

#include <nlohmann/json.hpp>
#include <pugixml.hpp>

#include "host/model/composition.h"

#include <algorithm>
#include <limits>

namespace host::projects
{

namespace
{

constexpr std::size_t kMaxDepth = 1000; // real projects stay below 20
constexpr const char* kRoot = "AfterEffectsProject";

int HexDigit(char digit)
{
  if (digit >= '0' && digit <= '9')
    return digit - '0';
  const char lower = static_cast<char>(digit | 0x20);
  return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

class TreeBuilder
{
 public:
  TreeBuilder(const std::string& name, std::string_view text) : name_(name), text_(text) {}

  std::unique_ptr<ChunkDocument> Build();

 private:
  // A chunk that is still growing, and the element that comes next in it.
  struct Open
  {
    std::size_t sizeAt;
    pugi::xml_node next;
  };

  void Add(pugi::xml_node element);
  void AddLeaf(Tag id, std::string_view data);
  void AddHexadecimal(pugi::xml_node element, Tag id, Tag kind);
  void AddFileReference(pugi::xml_node element);
  void AddText(pugi::xml_node element);
  void Begin(pugi::xml_node element, Tag id, Tag kind);
  std::size_t BeginChunk(Tag id, Tag kind);
  void EndChunk(std::size_t sizeAt);
  void PutWord(std::uint32_t word);
  [[noreturn]] void Refuse(std::ptrdiff_t at, const std::string& reason) const;

  const std::string& name_;
  std::string_view text_;
  std::string bytes_;
  ChunkDocument::Places places_;
  std::vector<Open> open_;
};

void TreeBuilder::Refuse(std::ptrdiff_t at, const std::string& reason) const
{
  const std::string_view before = text_.substr(0, static_cast<std::size_t>(std::max<std::ptrdiff_t>(at, 0)));
  const auto line = 1 + std::count(before.begin(), before.end(), '\n');
  throw CompositionError(name_, "line " + std::to_string(line) + ": " + reason, std::max<std::ptrdiff_t>(at, 0));
}

void TreeBuilder::PutWord(std::uint32_t word)
{
  for (int shift = 24; shift >= 0; shift -= 8)
    bytes_ += static_cast<char>(word >> shift);
}

// Gives the place of the chunk's size, which is known when the chunk ends.
std::size_t TreeBuilder::BeginChunk(Tag id, Tag kind)
{
  PutWord(id);
  const std::size_t sizeAt = bytes_.size();
  PutWord(0);
  if (id == kList)
    PutWord(kind);
  return sizeAt;
}

void TreeBuilder::EndChunk(std::size_t sizeAt)
{
  const std::size_t size = bytes_.size() - sizeAt - 4;
  if (size > std::numeric_limits<std::uint32_t>::max())
    Refuse(0, "holds more than 4 GB");
  for (std::size_t i = 0; i < 4; ++i)
    bytes_[sizeAt + i] = static_cast<char>(size >> (24 - 8 * i));
  if (size % 2)
    bytes_ += '\0';
}

void TreeBuilder::AddLeaf(Tag id, std::string_view data)
{
  const std::size_t sizeAt = BeginChunk(id, 0);
  bytes_ += data;
  EndChunk(sizeAt);
}

void TreeBuilder::AddHexadecimal(pugi::xml_node element, Tag id, Tag kind)
{
  const std::size_t sizeAt = BeginChunk(id, kind);
  int high = -1;
  for (const char* digit = element.attribute("bdata").value(); *digit; ++digit) {
    if (*digit == ' ' || *digit == '\n' || *digit == '\r' || *digit == '\t')
      continue;
    const int value = HexDigit(*digit);
    if (value < 0)
      Refuse(element.offset_debug(), std::string("bdata of ") + element.name() + ": expected hexadecimal digits");
    if (high < 0) {
      high = value;
    } else {
      bytes_ += static_cast<char>(high * 16 + value);
      high = -1;
    }
  }
  if (high >= 0)
    Refuse(element.offset_debug(), std::string("bdata of ") + element.name() + ": an odd number of digits");
  EndChunk(sizeAt);
}

// The binary form has the attributes as JSON.
void TreeBuilder::AddFileReference(pugi::xml_node element)
{
  nlohmann::json json = nlohmann::json::object();
  for (const pugi::xml_attribute& attribute : element.attributes())
    json[attribute.name()] = attribute.value();
  if (const pugi::xml_attribute isFolder = element.attribute("target_is_folder"))
    json["target_is_folder"] = isFolder.as_bool();
  AddLeaf("alas"_tag, json.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace));
}

void TreeBuilder::AddText(pugi::xml_node element)
{
  const std::size_t sizeAt = BeginChunk("Utf8"_tag, 0);
  for (const pugi::xml_node& part : element.children())
    bytes_ += part.value(); // empty for elements
  EndChunk(sizeAt);
}

void TreeBuilder::Begin(pugi::xml_node element, Tag id, Tag kind)
{
  if (open_.size() >= kMaxDepth)
    Refuse(element.offset_debug(), "nested deeper than " + std::to_string(kMaxDepth));
  const std::size_t sizeAt = BeginChunk(id, kind);
  open_.push_back({sizeAt, element.first_child()});
}

void TreeBuilder::Add(pugi::xml_node element)
{
  const std::string_view name = element.name();
  const bool isData = !element.attribute("bdata").empty();
  const Tag tag = MakeTag(name);
  places_.emplace_back(bytes_.size(), static_cast<std::size_t>(element.offset_debug()));
  if (name == "string")
    AddText(element);
  else if (name == "fileReference")
    AddFileReference(element);
  else if (name.size() > 4) // metadata and what newer versions may bring
    places_.pop_back();
  else if (isData)
    AddHexadecimal(element, name == "btdk" ? kList : tag, tag);
  else if (name == "tdsn" || name == "fnam" || name == "pdnm" || name == "RCom")
    Begin(element, tag, 0);
  else
    Begin(element, kList, tag);
}

std::unique_ptr<ChunkDocument> TreeBuilder::Build()
{
  pugi::xml_document document;
  const pugi::xml_parse_result result =
      document.load_buffer(text_.data(), text_.size(), pugi::parse_default | pugi::parse_ws_pcdata_single);
  if (!result)
    Refuse(result.offset, std::string("not XML: ") + result.description());
  const pugi::xml_node root = document.document_element();
  if (std::string_view(root.name()) != kRoot)
    Refuse(root.offset_debug(), std::string("expected the element ") + kRoot);
  bytes_.reserve(text_.size() / 2);
  PutWord("RIFX"_tag);
  PutWord(0);
  PutWord("Egg!"_tag);
  places_.emplace_back(0, static_cast<std::size_t>(root.offset_debug()));
  open_.push_back({4, root.first_child()});
  while (!open_.empty()) {
    const pugi::xml_node element = open_.back().next;
    if (!element) {
      EndChunk(open_.back().sizeAt);
      open_.pop_back();
      continue;
    }
    open_.back().next = element.next_sibling();
    if (element.type() == pugi::node_element)
      Add(element);
  }
  return std::make_unique<ChunkDocument>(name_, std::move(bytes_), std::move(places_), text_);
}

} // namespace

std::unique_ptr<ChunkDocument> ReadXmlTree(const std::string& name, std::string_view text)
{
  return TreeBuilder(name, text).Build();
}

} // namespace host::projects
