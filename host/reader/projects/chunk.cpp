#include "host/reader/projects/chunk.h"

#include <algorithm>
#include <map>

#include "host/model/composition.h"
#include "host/text.h"

namespace host::projects
{

namespace
{

constexpr std::size_t kHeaderSize = 8;    // id and size, of a chunk and of the file
constexpr std::size_t kFirstChunk = 12;   // behind the form's four characters
constexpr std::size_t kMaxPathDepth = 32; // in messages
constexpr Tag kForm = "Egg!"_tag;

std::uint32_t WordAt(std::string_view bytes, std::size_t offset) { return MakeTag(bytes.substr(offset, 4)); }

// The four characters as they can stand in a message.
std::string TagText(Tag tag)
{
  std::string text;
  for (int shift = 24; shift >= 0; shift -= 8) {
    const char character = static_cast<char>(tag >> shift);
    text += character > ' ' && character < 0x7F ? character : '?';
  }
  while (text.size() > 1 && text.back() == '?')
    text.pop_back();
  return text;
}

// Lists hold chunks, and so do these where their data begin with one.
bool HoldsChunks(const Chunk& chunk)
{
  switch (chunk.Id()) {
  case kList:
    return chunk.Kind() != "btdk"_tag;
  case "tdsn"_tag:
  case "fnam"_tag:
  case "pdnm"_tag:
  case "RCom"_tag:
    return chunk.Bytes().starts_with("Utf8");
  default:
    return false;
  }
}

} // namespace

// --- Chunks

std::string_view Chunk::Bytes() const { return document_->Bytes().substr(offset_, size_); }

ChunkRange Chunk::Children() const { return {*document_, offset_, offset_ + size_}; }

std::optional<Chunk> Chunk::Find(Tag id) const
{
  for (const Chunk& child : Children())
    if (child.Id() == id)
      return child;
  return std::nullopt;
}

std::optional<Chunk> Chunk::FindList(Tag kind) const
{
  for (const Chunk& child : Children())
    if (child.IsList(kind))
      return child;
  return std::nullopt;
}

Chunk Chunk::Require(Tag id) const
{
  const std::optional<Chunk> found = Find(id);
  if (!found)
    Refuse("expected a chunk " + TagText(id));
  return *found;
}

Chunk Chunk::RequireList(Tag kind) const
{
  const std::optional<Chunk> found = FindList(kind);
  if (!found)
    Refuse("expected a list " + TagText(kind));
  return *found;
}

std::uint64_t Chunk::Number(std::size_t offset, std::size_t bytes) const
{
  if (offset > size_ || size_ - offset < bytes)
    Refuse("expected " + std::to_string(offset + bytes) + " bytes or more, not " + std::to_string(size_));
  std::uint64_t number = 0;
  for (const char byte : Bytes().substr(offset, bytes))
    number = (number << 8) | static_cast<unsigned char>(byte);
  return number;
}

double Chunk::LittleEndianRealAt(std::size_t offset) const
{
  std::uint64_t number = Number(offset, 8), turned = 0;
  for (int i = 0; i < 8; ++i, number >>= 8)
    turned = (turned << 8) | (number & 0xFF);
  return std::bit_cast<double>(turned);
}

std::string_view Chunk::TextAt(std::size_t offset) const
{
  const std::string_view text = Bytes().substr(std::min(offset, size_));
  return text.substr(0, text.find('\0'));
}

void Chunk::Refuse(const std::string& reason) const { document_->Refuse(offset_, reason); }

void ChunkRange::Iterator::Read()
{
  chunk_.reset();
  if (at_ >= end_)
    return;
  if (end_ - at_ < kHeaderSize)
    document_->Refuse(at_, "the header of a chunk passes the end of what holds it");
  const std::string_view bytes = document_->Bytes();
  const Tag id = WordAt(bytes, at_);
  const std::size_t size = WordAt(bytes, at_ + 4);
  const std::size_t data = at_ + kHeaderSize;
  if (size > end_ - data)
    document_->Refuse(at_, "chunk " + TagText(id) + " of " + std::to_string(size) +
                               " bytes passes the end of what holds it by " + std::to_string(size - (end_ - data)));
  next_ = data + size + size % 2; // may lie behind the end by a padding byte that isn't there
  if (id != kList) {
    chunk_.emplace(*document_, id, 0, data, size);
    return;
  }
  if (size < 4)
    document_->Refuse(at_, "a list of " + std::to_string(size) + " bytes has no kind");
  chunk_.emplace(*document_, id, WordAt(bytes, data), data + 4, size - 4);
}

// --- Documents

ChunkDocument::ChunkDocument(std::string name, std::string_view bytes) : name_(std::move(name)), bytes_(bytes)
{
  CheckHeader();
}

ChunkDocument::ChunkDocument(std::string name, std::string bytes, Places places, std::string_view text)
    : name_(std::move(name)), owned_(std::move(bytes)), bytes_(owned_), places_(std::move(places)), text_(text)
{}

void ChunkDocument::CheckHeader() const
{
  if (bytes_.size() < kFirstChunk || WordAt(bytes_, 0) != "RIFX"_tag || WordAt(bytes_, 8) != kForm)
    Refuse(0, "expected an After Effects project (\"RIFX\", a size, \"Egg!\")");
  const std::size_t size = WordAt(bytes_, 4);
  if (size < 4 || size > bytes_.size() - kHeaderSize)
    Refuse(4, "the chunks are to take " + std::to_string(size) + " bytes, and the file has " +
                  std::to_string(bytes_.size() - kHeaderSize) + ": it is cut");
}

Chunk ChunkDocument::Root() const
{
  return {*this, kList, kForm, kFirstChunk, WordAt(bytes_, 4) + kHeaderSize - kFirstChunk};
}

void ChunkDocument::Refuse(std::size_t offset, const std::string& reason) const
{
  const std::string path = Path(offset);
  throw CompositionError(name_, Place(offset) + (path.empty() ? "" : " (" + path + ")") + ": " + reason,
                         static_cast<std::ptrdiff_t>(offset), path);
}

std::string ChunkDocument::Place(std::size_t offset) const
{
  if (places_.empty())
    return "byte " + std::to_string(offset);
  const auto next = std::upper_bound(places_.begin(), places_.end(), offset,
                                     [](std::size_t wanted, const auto& place) { return wanted < place.first; });
  const std::size_t there = next == places_.begin() ? 0 : std::prev(next)->second;
  const std::string_view before = text_.substr(0, there);
  return "line " + std::to_string(1 + std::count(before.begin(), before.end(), '\n'));
}

// "Fold/Item 2/Layr 3/ldta": the number tells which one among those with its name it is.
std::string ChunkDocument::Path(std::size_t offset) const
{
  std::string path;
  std::size_t begin = kFirstChunk;
  std::size_t end =
      bytes_.size() < kFirstChunk ? 0 : std::min<std::size_t>(bytes_.size(), WordAt(bytes_, 4) + kHeaderSize);
  for (std::size_t depth = 0; depth < kMaxPathDepth; ++depth) {
    std::map<Tag, std::size_t> seen;
    bool isFound = false;
    std::size_t at = begin;
    while (at < end && end - at >= kHeaderSize && at <= offset) {
      const Tag id = WordAt(bytes_, at);
      const std::size_t data = at + kHeaderSize, size = WordAt(bytes_, at + 4);
      const bool isList = id == kList && size >= 4 && end - data >= 4;
      const Tag name = isList ? WordAt(bytes_, data) : id;
      const std::size_t skip = isList ? 4 : 0, held = std::min(size, end - data);
      const std::size_t number = ++seen[name];
      if (size > held || offset < data + size || offset == data + skip) {
        path += (path.empty() ? "" : "/") + TagText(name) + (number > 1 ? " " + std::to_string(number) : "");
        const Chunk chunk(*this, id, isList ? name : 0, data + skip, held - skip);
        isFound = size == held && offset > data + skip && HoldsChunks(chunk);
        begin = data + skip;
        end = data + held;
        break;
      }
      at = data + size + size % 2;
    }
    if (!isFound)
      break;
  }
  return path;
}

} // namespace host::projects
