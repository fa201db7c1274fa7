// Pictures for the tests, and what other programs make of picture files.
#pragma once

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "torvane/pictures/bitmap.h"
#include "torvane/pictures/bitmap_filters.h"

// Pixels from the top row down, without padding.
struct PlainPicture
{
  int width = 0, height = 0;
  int components = 0; // 1 or 3
  std::vector<std::uint8_t> values;

  bool operator==(const PlainPicture&) const = default;
};

inline PlainPicture RandomPicture(int width, int height, int components, unsigned seed)
{
  std::mt19937 random(seed);
  PlainPicture picture{width, height, components, {}};
  picture.values.resize(static_cast<std::size_t>(width) * static_cast<std::size_t>(height * components));
  for (std::uint8_t& value : picture.values)
    value = static_cast<std::uint8_t>(random());
  return picture;
}

// Slopes without noise: JPEG changes them by little.
inline PlainPicture SmoothPicture(int width, int height, int components)
{
  PlainPicture picture{width, height, components, {}};
  for (int y = 0; y < height; ++y) {
    for (int x = 0; x < width; ++x) {
      for (int c = 0; c < components; ++c)
        picture.values.push_back(
            static_cast<std::uint8_t>((c == 1 ? 255 * y / height : 255 * x / width) / (1 + c / 2)));
    }
  }
  return picture;
}

// The same picture with all three components alike.
inline PlainPicture AsColor(const PlainPicture& grey)
{
  PlainPicture color{grey.width, grey.height, 3, {}};
  for (std::uint8_t value : grey.values)
    color.values.insert(color.values.end(), 3, value);
  return color;
}

inline void Fill(_torvane_::Bitmap& bitmap, const PlainPicture& picture)
{
  bitmap.Init(picture.width, picture.height, picture.components == 1 ? _torvane_::kDepthGrey : _torvane_::kDepthColor);
  for (int y = 0; y < picture.height; ++y)
    bitmap.SetLine(0, y, picture.width, picture.values.data() + y * picture.width * picture.components,
                   picture.components);
}

inline PlainPicture PixelsOf(const _torvane_::Bitmap& bitmap)
{
  PlainPicture picture{bitmap.GetBw(), bitmap.GetBh(), bitmap.GetDepth() == _torvane_::kDepthGrey ? 1 : 3, {}};
  picture.values.resize(static_cast<std::size_t>(picture.width) *
                        static_cast<std::size_t>(picture.height * picture.components));
  for (int y = 0; y < picture.height; ++y)
    bitmap.GetLine(0, y, picture.width, picture.values.data() + y * picture.width * picture.components,
                   picture.components);
  return picture;
}

// The largest difference of two values; 256 for pictures of different shapes.
inline int Difference(const PlainPicture& a, const PlainPicture& b)
{
  if (a.width != b.width || a.height != b.height || a.components != b.components)
    return 256;
  int largest = 0;
  for (std::size_t i = 0; i < a.values.size(); ++i)
    largest = std::max(largest, std::abs(a.values[i] - b.values[i]));
  return largest;
}

// Loads from a heap block of just the file's size, so that a sanitizer sees every read past the end.
inline _torvane_::Long LoadFromMemory(const _torvane_::BitmapLoaderData& loader, const std::vector<std::uint8_t>& bytes,
                                      _torvane_::Bitmap& bitmap)
{
  std::unique_ptr<std::uint8_t[]> block(new std::uint8_t[bytes.size()]);
  std::copy(bytes.begin(), bytes.end(), block.get());
  _torvane_::Filename name;
  name.SetMemoryRead(block.get(), static_cast<_torvane_::LLong>(bytes.size()));
  return loader.Load(name, bitmap, _torvane_::kFirstFrame);
}

// The bytes of the file that a saver makes; empty unless it gives `IMAGERESULT_OK`.
inline std::vector<std::uint8_t> SaveToMemory(const _torvane_::Bitmap& bitmap, _torvane_::Long format,
                                              const _torvane_::BaseContainer* settings = nullptr,
                                              _torvane_::Long flags = 0)
{
  _torvane_::MemoryDescription description;
  _torvane_::Filename name;
  name.SetMemoryWrite(&description);
  const void* data = nullptr;
  _torvane_::LLong size = 0;
  if (bitmap.Save(name, format, settings, flags) != _torvane_::IMAGERESULT_OK || !name.GetMemoryContinuous(data, size))
    return {};
  const auto* first = static_cast<const std::uint8_t*>(data);
  return {first, first + size};
}

inline bool HasProgram(const std::string& name)
{
  return std::system(("command -v " + name + " >/dev/null 2>&1").c_str()) == 0;
}

// What a command prints as PPM or PGM of 8 bits; an empty picture when it fails.
inline PlainPicture PictureFrom(const std::string& command)
{
  std::unique_ptr<std::FILE, int (*)(std::FILE*)> pipe(popen(command.c_str(), "r"), pclose);
  PlainPicture picture;
  char kind = 0;
  int most = 0;
  if (!pipe || std::fscanf(pipe.get(), "P%c %d %d %d", &kind, &picture.width, &picture.height, &most) != 4 ||
      std::fgetc(pipe.get()) == EOF || most != 255)
    return {};
  picture.components = kind == '5' ? 1 : 3;
  picture.values.resize(static_cast<std::size_t>(picture.width) *
                        static_cast<std::size_t>(picture.height * picture.components));
  if (std::fread(picture.values.data(), 1, picture.values.size(), pipe.get()) != picture.values.size())
    return {};
  return picture;
}

// A public test picture, or an empty path where they are not beside this tree.
inline std::string SharedImage(const std::string& name)
{
  const std::filesystem::path path = std::filesystem::path(TEST_SOURCE_DIR "/../shared/images") / name;
  return std::filesystem::exists(path) ? path.string() : std::string();
}
