#include "gltf/materials/picture_file.h"

#include <algorithm>
#include <cstring>
#include <fstream>
#include <iterator>

#include "gltf/text.h"

namespace gltf
{

namespace
{

using Bytes = std::vector<std::uint8_t>;

constexpr std::uint8_t kPngSignature[] = {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'};
constexpr std::uint8_t kJpegSignature[] = {0xFF, 0xD8, 0xFF};
constexpr std::size_t kPngChunkFrame = 12; // length, name and check sum of a chunk
constexpr std::uint8_t kPngGreyAlpha = 4;
constexpr std::uint8_t kPngRgba = 6;

template <std::size_t size>
bool BeginsWith(const Bytes& bytes, const std::uint8_t (&signature)[size])
{
  return bytes.size() >= size && std::equal(std::begin(signature), std::end(signature), bytes.begin());
}

std::uint32_t Word32(const Bytes& bytes, std::size_t place)
{
  return static_cast<std::uint32_t>(bytes[place]) << 24 | static_cast<std::uint32_t>(bytes[place + 1]) << 16 |
         static_cast<std::uint32_t>(bytes[place + 2]) << 8 | bytes[place + 3];
}

std::uint32_t Word16(const Bytes& bytes, std::size_t place)
{
  return static_cast<std::uint32_t>(bytes[place]) << 8 | bytes[place + 1];
}

// Walks the chunks, from IHDR to IEND.
void LookAtPng(PictureFile& picture)
{
  const Bytes& bytes = picture.bytes;
  bool hasData = false;
  for (std::size_t place = sizeof kPngSignature; bytes.size() - place >= kPngChunkFrame;) {
    const std::size_t length = Word32(bytes, place);
    if (length > bytes.size() - place - kPngChunkFrame)
      return;
    auto is = [&](const char* name) { return std::memcmp(bytes.data() + place + 4, name, 4) == 0; };
    const std::size_t body = place + 8;
    if (place == sizeof kPngSignature) {
      if (!is("IHDR") || length != 13 || Word32(bytes, body) == 0 || Word32(bytes, body + 4) == 0)
        return;
      picture.hasAlpha = bytes[body + 9] == kPngGreyAlpha || bytes[body + 9] == kPngRgba;
    }
    picture.hasAlpha = picture.hasAlpha || is("tRNS");
    hasData = hasData || (is("IDAT") && length > 0);
    if (is("IEND")) {
      picture.state = hasData ? PictureState::kGood : PictureState::kDamaged;
      return;
    }
    place += kPngChunkFrame + length;
  }
}

bool IsFrameHeader(std::uint8_t marker)
{
  return marker >= 0xC0 && marker <= 0xCF && marker != 0xC4 && marker != 0xC8 && marker != 0xCC;
}

// Walks the segments up to the first scan; a mark of the end must follow it.
void LookAtJpeg(PictureFile& picture)
{
  constexpr std::uint8_t kScan = 0xDA;
  constexpr std::uint8_t kEnd[] = {0xFF, 0xD9};
  const Bytes& bytes = picture.bytes;
  bool hasSize = false;
  for (std::size_t place = 2; place + 4 <= bytes.size();) {
    if (bytes[place] != 0xFF)
      return;
    const std::uint8_t marker = bytes[place + 1];
    if (marker == 0xFF) { // fill
      ++place;
      continue;
    }
    const std::size_t length = Word16(bytes, place + 2);
    if (length < 2 || length > bytes.size() - place - 2)
      return;
    if (IsFrameHeader(marker)) {
      if (length < 8 || Word16(bytes, place + 5) == 0 || Word16(bytes, place + 7) == 0)
        return;
      hasSize = true;
    }
    place += 2 + length;
    if (marker == kScan) {
      const auto rest = bytes.begin() + static_cast<std::ptrdiff_t>(place);
      if (hasSize && std::search(rest, bytes.end(), std::begin(kEnd), std::end(kEnd)) != bytes.end())
        picture.state = PictureState::kGood;
      return;
    }
  }
}

} // namespace

PictureFile LookAtPicture(std::vector<std::uint8_t> bytes)
{
  PictureFile picture;
  picture.bytes = std::move(bytes);
  picture.isPng = BeginsWith(picture.bytes, kPngSignature);
  picture.state = PictureState::kDamaged;
  if (picture.isPng)
    LookAtPng(picture);
  else if (BeginsWith(picture.bytes, kJpegSignature))
    LookAtJpeg(picture);
  else
    picture.state = PictureState::kOther;
  return picture;
}

std::filesystem::path LocatePicture(const std::filesystem::path& folder, const std::string& name)
{
  if (name.find('\0') != std::string::npos)
    return {};
  std::string turned = name;
  std::replace(turned.begin(), turned.end(), '\\', '/');
  for (const std::string& wanted : {name, turned, LastPart(name)}) {
    std::error_code error;
    std::filesystem::path path = folder / ToPath(wanted);
    if (std::filesystem::is_regular_file(path, error))
      return path;
  }
  return folder / ToPath(name);
}

PictureFile ReadPictureFile(const std::filesystem::path& path, bool keepBytes)
{
  std::error_code error;
  if (!std::filesystem::is_regular_file(path, error))
    return {};
  std::ifstream file(path, std::ios::binary);
  // A movie may be large, and its first bytes tell enough.
  Bytes bytes(sizeof kPngSignature);
  file.read(reinterpret_cast<char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  bytes.resize(static_cast<std::size_t>(file.gcount()));
  if (BeginsWith(bytes, kPngSignature) || BeginsWith(bytes, kJpegSignature)) {
    const std::uintmax_t size = std::filesystem::file_size(path, error);
    if (!error && size > bytes.size()) {
      const std::size_t begun = bytes.size();
      bytes.resize(static_cast<std::size_t>(size));
      file.read(reinterpret_cast<char*>(bytes.data() + begun), static_cast<std::streamsize>(bytes.size() - begun));
      bytes.resize(begun + static_cast<std::size_t>(file.gcount()));
    }
  }
  PictureFile picture = LookAtPicture(std::move(bytes));
  if (!file.is_open() || file.bad())
    picture.state = PictureState::kUnreadable;
  if (!keepBytes)
    Bytes().swap(picture.bytes);
  return picture;
}

} // namespace gltf
