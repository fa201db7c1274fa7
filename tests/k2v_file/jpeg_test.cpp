#include <cstdio>
#include <jpeglib.h>

#include "support/library.h"
#include "support/pictures.h"

namespace
{

struct MakeOptions
{
  J_COLOR_SPACE space = JCS_RGB; // of the pixels given
  int components = 3;
  bool progressive = false, arithmetic = false;
  int restart = 0; // rows of blocks between restart marks
};

// A file made by the JPEG library alone.
Bytes MakeJpeg(int width, int height, const MakeOptions& options)
{
  jpeg_compress_struct jpeg;
  jpeg_error_mgr errors;
  jpeg.err = jpeg_std_error(&errors);
  jpeg_create_compress(&jpeg);
  unsigned char* data = nullptr;
  unsigned long size = 0;
  jpeg_mem_dest(&jpeg, &data, &size);
  jpeg.image_width = static_cast<JDIMENSION>(width);
  jpeg.image_height = static_cast<JDIMENSION>(height);
  jpeg.input_components = options.components;
  jpeg.in_color_space = options.space;
  jpeg_set_defaults(&jpeg);
  jpeg.arith_code = options.arithmetic;
  jpeg.restart_in_rows = options.restart;
  if (options.progressive)
    jpeg_simple_progression(&jpeg);
  jpeg_start_compress(&jpeg, TRUE);
  PlainPicture picture = SmoothPicture(width, height, options.components);
  while (jpeg.next_scanline < jpeg.image_height) {
    JSAMPROW row = picture.values.data() + static_cast<int>(jpeg.next_scanline) * width * options.components;
    jpeg_write_scanlines(&jpeg, &row, 1);
  }
  jpeg_finish_compress(&jpeg);
  jpeg_destroy_compress(&jpeg);
  Bytes bytes(data, data + size);
  std::free(data);
  return bytes;
}

PlainPicture Decoded(const Bytes& bytes)
{
  Bitmap bitmap;
  EXPECT_EQ(IMAGERESULT_OK, LoadFromMemory(JpgLoader(), bytes, bitmap));
  return PixelsOf(bitmap);
}

std::size_t FindMarker(const Bytes& bytes, std::uint8_t marker)
{
  for (std::size_t i = 0; i + 1 < bytes.size(); ++i) {
    if (bytes[i] == 0xFF && bytes[i + 1] == marker)
      return i;
  }
  ADD_FAILURE() << "no such marker";
  return 0;
}

// The quantisation numbers of the first table.
Bytes FirstTable(const Bytes& bytes)
{
  const auto start = bytes.begin() + static_cast<long>(FindMarker(bytes, 0xDB)) + 5;
  return {start, start + 4};
}

} // namespace

TEST(JpegFiles, ComeBackNearlyTheSame)
{
  for (int width : {1, 7, 16, 33, 2000}) {
    Bitmap bitmap;
    const PlainPicture grey = SmoothPicture(width, 9, 1);
    Fill(bitmap, grey);
    BaseContainer settings;
    settings.SetLong(kImageJpegQuality, 100);
    EXPECT_LE(Difference(grey, Decoded(SaveToMemory(bitmap, kImageFormatJpeg, &settings, kImageSaveGrey))), 2);
    // Without the flag a grey picture becomes a colour one of the same grey.
    EXPECT_LE(Difference(AsColor(grey), Decoded(SaveToMemory(bitmap, kImageFormatJpeg, &settings))), 3);
    const PlainPicture color = SmoothPicture(width, 9, 3);
    Fill(bitmap, color);
    EXPECT_LE(Difference(color, Decoded(SaveToMemory(bitmap, kImageFormatJpeg, &settings))), 40);
    // With it, of a colour picture the red is stored.
    PlainPicture red{width, 9, 1, {}};
    for (std::size_t i = 0; i < color.values.size(); i += 3)
      red.values.push_back(color.values[i]);
    EXPECT_LE(Difference(red, Decoded(SaveToMemory(bitmap, kImageFormatJpeg, &settings, kImageSaveGrey))), 2);
  }
}

TEST(JpegFiles, TakeTheQualityOnlyFromASetting)
{
  Bitmap bitmap;
  Fill(bitmap, SmoothPicture(16, 16, 3));
  BaseContainer settings;
  // The first numbers of the standard table are 16, 11, 12, 14; the library's own quality of 75 halves them.
  EXPECT_EQ("08 06 06 07", ToHex(FirstTable(SaveToMemory(bitmap, kImageFormatJpeg, &settings))));
  settings.SetLong(kImageJpegQuality, 95);
  EXPECT_EQ("02 01 01 01", ToHex(FirstTable(SaveToMemory(bitmap, kImageFormatJpeg, &settings))));
  // Tables stay those of baseline files, of 8 bits a number.
  settings.SetLong(kImageJpegQuality, 1);
  EXPECT_EQ("FF FF FF FF", ToHex(FirstTable(SaveToMemory(bitmap, kImageFormatJpeg, &settings))));
}

TEST(JpegFiles, MayBeWiderThanBmpFiles)
{
  const TempFolder folder;
  const std::string path = folder / "wide";
  const std::tuple<Long, Long, Long, Long> cases[] = {{32000, 1, 1, 1},  {32001, 1, -7, 1},  {1, 32001, -7, 1},
                                                      {65000, 1, -7, 1}, {65001, 1, -7, -7}, {1, 65001, -7, -7}};
  for (const auto& [width, height, bmp, jpeg] : cases) {
    Bitmap bitmap;
    bitmap.Init(width, height, kDepthGrey);
    EXPECT_EQ(bmp, bitmap.Save(path.c_str(), kImageFormatBmp, nullptr, 0));
    EXPECT_EQ(jpeg, bitmap.Save(path.c_str(), kImageFormatJpeg, nullptr, kImageSaveGrey));
    if (jpeg == 1) {
      EXPECT_EQ(IMAGERESULT_OK, JpgLoader().Load(path.c_str(), bitmap, kFirstFrame));
      EXPECT_EQ(width, bitmap.GetBw());
    }
  }
}

TEST(JpegFiles, OfEveryKindOpenAsInOtherPrograms)
{
  const std::tuple<const char*, int, int, MakeOptions> cases[] = {
      {"baseline", 33, 17, {}},
      {"grey", 15, 9, {.space = JCS_GRAYSCALE, .components = 1}},
      {"progressive", 40, 30, {.progressive = true}},
      {"progressive grey", 9, 40, {.space = JCS_GRAYSCALE, .components = 1, .progressive = true}},
      {"restarts", 64, 64, {.restart = 1}},
#ifdef D_ARITH_CODING_SUPPORTED
      {"arithmetic", 33, 17, {.arithmetic = true}},
      {"arithmetic progressive", 33, 17, {.progressive = true, .arithmetic = true}},
#endif
  };
  const TempFolder folder;
  const std::string path = folder / "picture.jpg";
  for (const auto& [name, width, height, options] : cases) {
    SCOPED_TRACE(name);
    WriteWholeFile(path, MakeJpeg(width, height, options));
    Bitmap bitmap;
    ASSERT_EQ(IMAGERESULT_OK, JpgLoader().Load(path.c_str(), bitmap, kFirstFrame));
    EXPECT_LE(Difference(SmoothPicture(width, height, options.components), PixelsOf(bitmap)), 40);
    if (HasProgram("djpeg")) {
      EXPECT_EQ(PictureFrom("djpeg -pnm " + path), PixelsOf(bitmap));
    }
  }
}

TEST(JpegFiles, WrittenHereOpenInOtherPrograms)
{
  if (!HasProgram("djpeg") || !HasProgram("convert"))
    GTEST_SKIP() << "djpeg or ImageMagick are not here";
  const TempFolder folder;
  const std::string path = folder / "picture.jpg";
  for (int components : {1, 3}) {
    Bitmap bitmap;
    Fill(bitmap, SmoothPicture(119, 96, components));
    ASSERT_EQ(IMAGERESULT_OK,
              bitmap.Save(path.c_str(), kImageFormatJpeg, nullptr, components == 1 ? kImageSaveGrey : 0));
    ASSERT_EQ(IMAGERESULT_OK, JpgLoader().Load(path.c_str(), bitmap, kFirstFrame));
    EXPECT_EQ(PictureFrom("djpeg -pnm " + path), PixelsOf(bitmap));
    // The other program's JPEG library may be another.
    EXPECT_LE(Difference(PictureFrom("convert " + path + " -depth 8 pnm:-"), PixelsOf(bitmap)), 3);
  }
  const std::string shared = SharedImage("photo-227x149.jpg");
  if (shared.empty())
    return;
  Bitmap bitmap;
  ASSERT_EQ(IMAGERESULT_OK, JpgLoader().Load(shared.c_str(), bitmap, kFirstFrame));
  EXPECT_TRUE(bitmap.GetBw() == 227 && bitmap.GetBh() == 149);
  EXPECT_EQ(PictureFrom("djpeg -ppm " + shared), PixelsOf(bitmap));
}

TEST(JpegFiles, GiveACodeForEachFault)
{
  const Bytes good = MakeJpeg(40, 30, {});
  const std::size_t frame = FindMarker(good, 0xC0);
  Bytes twelveBits = good, huge = good, twoComponents = MakeJpeg(8, 8, {.space = JCS_UNKNOWN, .components = 2});
  twelveBits[frame + 4] = 12;
  std::fill_n(huge.begin() + static_cast<long>(frame) + 5, 4, std::uint8_t{0xF0});
  // The tables of a scan, and then nothing but starts of scans, each a pass over the picture.
  Bytes scans = MakeJpeg(800, 800, {.space = JCS_GRAYSCALE, .components = 1, .progressive = true});
  const std::size_t scan = FindMarker(scans, 0xDA);
  const Bytes oneScan(scans.begin() + static_cast<long>(scan), scans.begin() + static_cast<long>(scan) + 10);
  scans.resize(scan);
  for (int i = 0; i < 5000; ++i)
    scans.insert(scans.end(), oneScan.begin(), oneScan.end());
  const std::tuple<const char*, Bytes, Long> cases[] = {
      {"four components", MakeJpeg(8, 8, {.space = JCS_CMYK, .components = 4}), IMAGERESULT_FORMAT},
      {"two components", twoComponents, IMAGERESULT_FORMAT},
      {"12 bits", twelveBits, IMAGERESULT_MEMORY},
      {"more pixels than the file explains", huge, IMAGERESULT_MEMORY},
      {"more scans than any picture has", scans, IMAGERESULT_MEMORY},
      {"another format", Bytes{'B', 'M', 0, 0, 0, 0}, IMAGERESULT_MEMORY},
      {"no frame", Bytes{0xFF, 0xD8, 0xFF, 0xD9}, IMAGERESULT_MEMORY},
  };
  counting_memory::ResetPeak();
  const LLong before = counting_memory::Get().peakBytes;
  for (const auto& [name, bytes, result] : cases) {
    SCOPED_TRACE(name);
    Bitmap bitmap;
    EXPECT_EQ(result, LoadFromMemory(JpgLoader(), bytes, bitmap));
  }
  EXPECT_LT(counting_memory::Get().peakBytes - before, 1 << 20);
  const TempFolder folder;
  WriteWholeFile(folder / "empty", {});
  Bitmap bitmap;
  EXPECT_EQ(IMAGERESULT_MEMORY, JpgLoader().Load((folder / "empty").c_str(), bitmap, kFirstFrame));
}

TEST(JpegFiles, SurviveCutsAndDamageEverywhere)
{
  std::mt19937 random(7);
  for (const MakeOptions& options : {MakeOptions{}, MakeOptions{.progressive = true}}) {
    const Bytes whole = MakeJpeg(24, 24, options);
    for (std::size_t size = 1; size < whole.size(); ++size) {
      Bitmap bitmap;
      const Long result =
          LoadFromMemory(JpgLoader(), Bytes(whole.begin(), whole.begin() + static_cast<long>(size)), bitmap);
      EXPECT_TRUE(result == IMAGERESULT_OK || result == IMAGERESULT_MEMORY) << result;
      // Behind the header of the only scan a cut costs pixels, no more.
      if (!options.progressive && size > FindMarker(whole, 0xDA) + 20) {
        EXPECT_EQ(IMAGERESULT_OK, result);
      }
    }
    for (int round = 0; round < 2000; ++round) {
      Bytes damaged = whole;
      for (int i = 0; i < 1 + round % 4; ++i)
        damaged[random() % damaged.size()] = static_cast<std::uint8_t>(random());
      Bitmap bitmap;
      LoadFromMemory(JpgLoader(), damaged, bitmap);
    }
  }
}

TEST(PictureFiles, FailCleanlyWhenMemoryOrDiskIsShort)
{
  Bitmap source;
  Fill(source, SmoothPicture(200, 100, 3));
  for (Long format : {kImageFormatBmp, kImageFormatJpeg}) {
    const Bytes whole = SaveToMemory(source, format);
    EveryFailedAllocation([&] {
      const Long result = [&] {
        MemoryDescription description;
        Filename name;
        name.SetMemoryWrite(&description);
        return source.Save(name, format, nullptr, 0);
      }();
      EXPECT_TRUE(result == IMAGERESULT_OK || result == IMAGERESULT_MEMORY || result == IMAGERESULT_FILE) << result;
      return result == IMAGERESULT_OK;
    });
    const BmpLoader bmp;
    const JpgLoader jpeg;
    const BitmapLoaderData& loader = format == kImageFormatBmp ? static_cast<const BitmapLoaderData&>(bmp) : jpeg;
    EveryFailedAllocation(
        [&] {
          auto bitmap = std::make_unique<Bitmap>();
          const Long result = LoadFromMemory(loader, whole, *bitmap);
          EXPECT_TRUE(result == IMAGERESULT_OK || result == IMAGERESULT_MEMORY || result == IMAGERESULT_OPEN) << result;
          return result == IMAGERESULT_OK ? std::move(bitmap) : nullptr;
        },
        [](const auto& bitmap) { return PixelsOf(*bitmap); });
    if (std::filesystem::exists("/dev/full")) {
      EXPECT_NE(IMAGERESULT_OK, source.Save("/dev/full", format, nullptr, 0));
    }
  }
}
