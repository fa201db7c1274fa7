// The container of a .glb: a header of twelve bytes, and two chunks.
#include <limits>

#include "gltf/converter.h"

namespace gltf
{

namespace
{

constexpr std::uint32_t kMagic = 0x46546C67; // "glTF"
constexpr std::uint32_t kVersion = 2;
constexpr std::uint32_t kJsonChunk = 0x4E4F534A;  // "JSON"
constexpr std::uint32_t kBytesChunk = 0x004E4942; // "BIN"
constexpr std::uint64_t kHeader = 12;
constexpr std::uint64_t kChunkHeader = 8;

std::uint64_t Padded(std::uint64_t size) { return (size + 3) / 4 * 4; }

} // namespace

std::size_t GlbSize(const Model& model)
{
  const std::uint64_t bytes = Padded(model.bytes.Size());
  return kHeader + kChunkHeader + Padded(model.json.Size()) + (bytes > 0 ? kChunkHeader + bytes : 0);
}

void WriteGlb(const Model& model, const Sink& take)
{
  const std::uint64_t json = Padded(model.json.Size());
  const std::uint64_t bytes = Padded(model.bytes.Size());
  const std::uint64_t whole = GlbSize(model);
  if (whole > std::numeric_limits<std::uint32_t>::max())
    throw TooLarge("the scene takes more than the 4 GB that a .glb can hold");
  auto word = [&take](std::uint64_t value) {
    const std::uint8_t four[] = {static_cast<std::uint8_t>(value), static_cast<std::uint8_t>(value >> 8),
                                 static_cast<std::uint8_t>(value >> 16), static_cast<std::uint8_t>(value >> 24)};
    take(four, sizeof four);
  };
  auto header = [&word](std::uint64_t first, std::uint64_t second) {
    word(first);
    word(second);
  };
  auto text = [&take](std::string_view part) { take(reinterpret_cast<const std::uint8_t*>(part.data()), part.size()); };
  word(kMagic);
  header(kVersion, whole);
  header(json, kJsonChunk);
  model.json.ForEachPiece(text);
  text(std::string(json - model.json.Size(), ' '));
  if (bytes == 0)
    return;
  header(bytes, kBytesChunk);
  model.bytes.ForEachBlock(take);
  text(std::string(bytes - model.bytes.Size(), '\0'));
}

std::vector<std::uint8_t> ToGlb(const Model& model)
{
  std::vector<std::uint8_t> bytes;
  bytes.reserve(GlbSize(model));
  WriteGlb(model,
           [&bytes](const std::uint8_t* data, std::size_t size) { bytes.insert(bytes.end(), data, data + size); });
  return bytes;
}

} // namespace gltf
