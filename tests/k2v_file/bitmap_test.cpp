#include "source/k2v_file/pictures/bmp_run_decoder.h"
#include "support/library.h"
#include "support/pictures.h"

namespace
{

// Three by two pixels: a row of 9 bytes and 3 that fill it up.
const PlainPicture kSmall{3, 2, 3, {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16, 17, 18}};
const char* const kSmallBmp = "42 4D 4E 00 00 00 00 00 00 00 36 00 00 00 "                               // file header
                              "28 00 00 00 03 00 00 00 02 00 00 00 01 00 18 00 00 00 00 00 18 00 00 00 " // to its size
                              "11 0B 00 00 11 0B 00 00 00 00 00 00 00 00 00 00 "                         // 2833 a metre
                              "0C 0B 0A 0F 0E 0D 12 11 10 00 00 00 03 02 01 06 05 04 09 08 07 00 00 00";

// `bytes` with a little-endian number put in at a place.
Bytes With(Bytes bytes, std::size_t place, std::uint32_t value, std::size_t size = 4)
{
  for (std::size_t i = 0; i < size; ++i)
    bytes[place + i] = static_cast<std::uint8_t>(value >> (8 * i));
  return bytes;
}

std::string DecodeRuns(Long bits, Long width, Long height, const char* hex)
{
  Bytes row(static_cast<std::size_t>(GetPaddedRowSize(width, bits)), 0xEE);
  const Bytes codes = FromHex(hex);
  std::string lines;
  struct Target
  {
    std::string& lines;
    std::size_t size;
  } target{lines, row.size()};
  auto sink = [](void* to, const UChar* line) {
    auto& out = *static_cast<Target*>(to);
    out.lines += (out.lines.empty() ? "" : " | ") + ToHex(line, out.size);
  };
  BmpRunDecoder(row.data(), width, height, bits, sink, &target).Decode(codes.data(), static_cast<LLong>(codes.size()));
  return lines;
}

} // namespace

TEST(Pictures, HaveSizesUpToTheLimit)
{
  const std::tuple<Long, Long, Long, Long, Long, Long> cases[] = {
      {0, 5, kDepthColor, 1, 1, 5},      {7, -1, kDepthGrey, 1, 7, 1},      {128000, 1, kDepthGrey, 1, 128000, 1},
      {128001, 1, kDepthGrey, -2, 4, 4}, {1, 128001, kDepthGrey, -2, 4, 4}, {1, 1, 3, -2, 4, 4}};
  for (const auto& [width, height, depth, result, gotWidth, gotHeight] : cases) {
    Bitmap bitmap;
    bitmap.Init(4, 4, kDepthGrey);
    EXPECT_EQ(result, bitmap.Init(width, height, depth));
    EXPECT_TRUE(gotWidth == bitmap.GetBw() && gotHeight == bitmap.GetBh());
  }
}

TEST(Pictures, HoldPixelsOrBytesNotBoth)
{
  Bitmap bitmap;
  std::uint8_t untouched[3] = {7, 7, 7};
  bitmap.GetLine(0, 0, 1, untouched, 3);
  bitmap.SetLine(0, 0, 1, untouched, 3);
  EXPECT_EQ("07 07 07", ToHex(untouched, 3));
  EXPECT_TRUE(bitmap.GetBw() == 0 && bitmap.GetDepth() == 0);

  Fill(bitmap, kSmall);
  EXPECT_EQ(IMAGERESULT_NULL, bitmap.SetEncoded(nullptr, 5));
  EXPECT_EQ(kSmall, PixelsOf(bitmap));
  EXPECT_EQ(IMAGERESULT_OK, bitmap.SetEncoded("abc", 3));
  EXPECT_TRUE(bitmap.GetBw() == 0 && bitmap.GetEncodedSize() == 3);
  Fill(bitmap, kSmall);
  EXPECT_EQ(0, bitmap.GetEncodedSize());
}

TEST(Pictures, CopyWhatTheyHold)
{
  Bitmap pixels, encoded, empty, copy;
  Fill(pixels, kSmall);
  encoded.SetEncoded("abc", 3);
  EXPECT_TRUE(pixels.CopyTo(copy));
  EXPECT_EQ(kSmall, PixelsOf(copy));
  EXPECT_TRUE(encoded.CopyTo(copy));
  EXPECT_EQ(0, std::memcmp(copy.GetEncoded(), "abc", 3));
  EXPECT_EQ(0, copy.GetBw());
  EXPECT_TRUE(empty.CopyTo(copy) && copy.GetEncoded() == nullptr);
  EXPECT_TRUE(pixels.CopyTo(pixels));
  Bitmap* clone = pixels.GetClone();
  ASSERT_NE(nullptr, clone);
  EXPECT_EQ(kSmall, PixelsOf(*clone));
  DeleteObj(clone);
  for (int allocations = 0; allocations < 3; ++allocations)
    EXPECT_EQ(nullptr, counting_memory::WithoutMemory([&] { return pixels.GetClone(); }, allocations));
}

TEST(Pictures, AreSavedOnlyWithPixelsAndInAKnownFormat)
{
  const TempFolder folder;
  const std::string path = folder / "picture";
  Bitmap bitmap;
  for (Long format : {kImageFormatBmp, kImageFormatJpeg})
    EXPECT_EQ(IMAGERESULT_NULL, bitmap.Save(path.c_str(), format, nullptr, 0));
  Fill(bitmap, kSmall);
  EXPECT_EQ(IMAGERESULT_MEMORY, bitmap.Save(path.c_str(), 1103, nullptr, 0));
  EXPECT_FALSE(std::filesystem::exists(path));
  const std::string nowhere = folder / "none/picture";
  for (Long format : {kImageFormatBmp, kImageFormatJpeg})
    EXPECT_EQ(IMAGERESULT_FILE, bitmap.Save(nowhere.c_str(), format, nullptr, 0));
  EXPECT_EQ(IMAGERESULT_OPEN, bitmap.LoadBmp(nowhere.c_str()));
  EXPECT_EQ(IMAGERESULT_OPEN, JpgLoader().Load(nowhere.c_str(), bitmap, kFirstFrame));
}

TEST(BmpFiles, HaveTheseBytes)
{
  Bitmap bitmap;
  Fill(bitmap, kSmall);
  EXPECT_EQ(ToHex(FromHex(kSmallBmp)), ToHex(SaveToMemory(bitmap, kImageFormatBmp)));
  BaseContainer settings;
  settings.SetLong(kImageBmpResolution, 300);
  Fill(bitmap, {1, 1, 1, {200}}); // grey is written as colour
  EXPECT_EQ("42 4D 3A 00 00 00 00 00 00 00 36 00 00 00 28 00 00 00 01 00 00 00 01 00 00 00 01 00 18 00 00 00 00 00 "
            "04 00 00 00 20 2E 00 00 20 2E 00 00 00 00 00 00 00 00 00 00 C8 C8 C8 00",
            ToHex(SaveToMemory(bitmap, kImageFormatBmp, &settings)));
}

TEST(BmpFiles, ComeBackFromBothDirectionsOfRows)
{
  const TempFolder folder;
  const std::string path = folder / "small.bmp";
  WriteWholeFile(path, FromHex(kSmallBmp));
  Bitmap bitmap;
  EXPECT_EQ(IMAGERESULT_OK, bitmap.LoadBmp(path.c_str()));
  EXPECT_EQ(kSmall, PixelsOf(bitmap));

  const Bytes bytes = FromHex(kSmallBmp);
  const PlainPicture flipped{3, 2, 3, {10, 11, 12, 13, 14, 15, 16, 17, 18, 1, 2, 3, 4, 5, 6, 7, 8, 9}};
  EXPECT_EQ(IMAGERESULT_OK, LoadFromMemory(BmpLoader(), With(bytes, 22, static_cast<std::uint32_t>(-2)), bitmap));
  EXPECT_EQ(flipped, PixelsOf(bitmap));
  // A gap before the pixels, and an offset of zero, which means none.
  Bytes gap = With(bytes, 10, 58);
  gap.insert(gap.begin() + 54, 4, 0xEE);
  for (const Bytes& file : {gap, With(bytes, 10, 0), With(bytes, 18, static_cast<std::uint32_t>(-3))}) {
    bitmap.Free();
    EXPECT_EQ(IMAGERESULT_OK, LoadFromMemory(BmpLoader(), file, bitmap));
    EXPECT_EQ(kSmall, PixelsOf(bitmap));
  }
}

TEST(BmpFiles, GiveACodeForEachFault)
{
  const Bytes good = FromHex(kSmallBmp);
  const std::tuple<const char*, Bytes, Long> cases[] = {
      {"signature", With(good, 0, 0x4D43, 2), IMAGERESULT_FORMAT},
      {"header size", With(good, 14, 108), IMAGERESULT_FORMAT},
      {"8 bits", With(good, 28, 8, 2), IMAGERESULT_FORMAT},
      {"32 bits", With(good, 28, 32, 2), IMAGERESULT_FORMAT},
      {"compression", With(good, 30, 3), IMAGERESULT_FORMAT},
      {"too wide", With(good, 18, 128001), IMAGERESULT_MEMORY},
      {"the lowest height", With(good, 22, 0x80000000), IMAGERESULT_MEMORY},
      {"more pixels than the file explains", With(With(good, 18, 128000), 22, 128000), IMAGERESULT_MEMORY},
      {"more rows than the file has", With(good, 22, 3), IMAGERESULT_FILE},
      {"pixels behind the end", With(good, 10, 0xFFFFFFF0), IMAGERESULT_FILE},
      {"runs", With(good, 30, 1), IMAGERESULT_OK},
      {"runs of four bits", With(good, 30, 2), IMAGERESULT_OK},
      {"runs behind the end", With(With(With(good, 30, 2), 2, 0x7FFFFFFF), 34, 0x7FFFFFFF), IMAGERESULT_FILE},
      {"runs behind a wrong offset", With(With(good, 30, 1), 10, 0x7FFFFFFF), IMAGERESULT_FILE},
  };
  for (const auto& [name, bytes, result] : cases) {
    SCOPED_TRACE(name);
    Bitmap bitmap;
    EXPECT_EQ(result, LoadFromMemory(BmpLoader(), bytes, bitmap));
  }
  // The runs of 24-bit files stand for nothing.
  Bitmap bitmap;
  LoadFromMemory(BmpLoader(), With(good, 30, 1), bitmap);
  EXPECT_EQ(Bytes(18, 0), PixelsOf(bitmap).values);
}

TEST(BmpFiles, KeepTheRowsBeforeACut)
{
  const Bytes whole = FromHex(kSmallBmp);
  for (std::size_t size = 1; size < whole.size(); ++size) {
    SCOPED_TRACE(size);
    Bitmap bitmap;
    const Long result =
        LoadFromMemory(BmpLoader(), Bytes(whole.begin(), whole.begin() + static_cast<long>(size)), bitmap);
    // Up to the bit count the header is unknown; behind it a read comes short.
    EXPECT_EQ(size < 30 ? IMAGERESULT_FORMAT : IMAGERESULT_FILE, result);
    if (size >= 66) {
      const Bytes values = PixelsOf(bitmap).values;
      EXPECT_EQ("00 00 00 00 00 00 00 00 00 0A 0B 0C 0D 0E 0F 10 11 12", ToHex(values));
    }
  }
}

TEST(BmpFiles, CutInTheHeaderAreRefusedWhateverTheirWidth)
{
  const Bytes whole = With(FromHex(kSmallBmp), 18, 0);
  for (std::size_t size = 30; size < 54; ++size) {
    Bitmap bitmap;
    EXPECT_EQ(IMAGERESULT_FILE,
              LoadFromMemory(BmpLoader(), Bytes(whole.begin(), whole.begin() + static_cast<long>(size)), bitmap));
  }
}

TEST(ImageValues, HoldAPictureSavedInTheWantedFormat)
{
  Bitmap bitmap;
  Fill(bitmap, kSmall);
  EXPECT_EQ("81 00 00 00 4E " + ToHex(FromHex(kSmallBmp)), ToHex(WriteToMemory([&](HyperFile& file) {
              EXPECT_TRUE(file.WriteImage(&bitmap, kImageFormatBmp, nullptr, 0));
            })));
  // Of a picture that its format can't hold the tag alone is written, and that counts as success.
  bitmap.Init(32001, 1, kDepthGrey);
  EXPECT_EQ("81", ToHex(WriteToMemory(
                      [&](HyperFile& file) { EXPECT_TRUE(file.WriteImage(&bitmap, kImageFormatBmp, nullptr, 0)); })));
}

TEST(BmpRuns, DecodeByHand)
{
  const std::tuple<const char*, Long, Long, Long, const char*, const char*> cases[] = {
      {"run and end of line", 8, 4, 2, "03 AA 00 00 04 BB 00 01", "AA AA AA 00 | BB BB BB BB"},
      {"literals of odd count", 8, 5, 1, "00 03 01 02 03 FF 02 09", "01 02 03 09 09 00 00 00"},
      {"a run stops at the row's end", 8, 4, 1, "FF 07 00 00", "07 07 07 07"},
      {"delta", 8, 4, 3, "01 05 00 02 02 01 01 06 00 01", "05 00 00 00 | 00 00 00 06"},
      {"delta past the picture", 8, 4, 2, "01 05 00 02 FF FF 01 06 00 00", "05 00 00 00 | 00 00 00 00"},
      {"lines past the picture", 8, 4, 1, "00 00 00 00 01 01", "00 00 00 00"},
      {"nibbles of a run", 4, 5, 1, "05 12 00 00", "12 12 10 00"},
      {"nibbles at an odd place", 4, 8, 1, "01 90 04 12 00 00", "91 21 20 00"},
      {"nibbles of literals", 4, 7, 1, "00 05 12 34 50 FF 02 67 00 01", "12 34 56 70"},
      {"cut literals", 8, 4, 1, "00 04 01 02", "01 02 00 00"},
      {"cut delta", 8, 4, 1, "01 07 00 02 01", "07 00 00 00"},
      {"24 bits have no runs", 24, 2, 2, "02 FF 00 00 00 02 01 02 00 00",
       "00 00 00 00 00 00 00 00 | 00 00 00 00 00 00 00 00"},
  };
  for (const auto& [name, bits, width, height, codes, lines] : cases) {
    SCOPED_TRACE(name);
    EXPECT_EQ(lines, DecodeRuns(bits, width, height, codes));
  }
}

TEST(BmpFiles, AreTheSameToOtherPrograms)
{
  if (!HasProgram("convert"))
    GTEST_SKIP() << "ImageMagick is not here";
  const TempFolder folder;
  for (int width : {1, 3, 4}) {
    for (int components : {1, 3}) {
      SCOPED_TRACE(std::to_string(width) + " x 5, " + std::to_string(components));
      const PlainPicture picture = RandomPicture(width, 5, components, static_cast<unsigned>(width));
      Bitmap bitmap;
      Fill(bitmap, picture);
      const std::string ours = folder / "ours.bmp";
      ASSERT_EQ(IMAGERESULT_OK, bitmap.Save(ours.c_str(), kImageFormatBmp, nullptr, 0));
      EXPECT_EQ(components == 1 ? AsColor(picture) : picture, PictureFrom("convert " + ours + " -depth 8 ppm:-"));
      const std::string theirs = folder / "theirs.bmp";
      ASSERT_EQ(0, std::system(("convert " + ours + " -type truecolor bmp3:" + theirs).c_str()));
      ASSERT_EQ(IMAGERESULT_OK, bitmap.LoadBmp(theirs.c_str()));
      EXPECT_EQ(components == 1 ? AsColor(picture) : picture, PixelsOf(bitmap));
    }
  }
}

TEST(BmpFiles, OfOtherProgramsOpen)
{
  if (SharedImage("photo-119x96.bmp").empty() || !HasProgram("convert"))
    GTEST_SKIP() << "the public pictures or ImageMagick are not here";
  const std::tuple<const char*, int, int> cases[] = {{"photo-119x96.bmp", 119, 96}, {"photo-192x144.bmp", 192, 144}};
  for (const auto& [name, width, height] : cases) {
    Bitmap bitmap;
    ASSERT_EQ(IMAGERESULT_OK, bitmap.LoadBmp(SharedImage(name).c_str()));
    EXPECT_TRUE(width == bitmap.GetBw() && height == bitmap.GetBh());
    EXPECT_EQ(PictureFrom("convert " + SharedImage(name) + " -depth 8 ppm:-"), PixelsOf(bitmap));
  }
}

TEST(PictureFiles, AreToldByTheirFirstBytes)
{
  const std::tuple<const char*, Bytes, bool, bool> cases[] = {
      {"bmp", FromHex(kSmallBmp), true, false},
      {"bmp, too short", FromHex("42 4D 4E 00 00 00 00 00 00 00 36 00 00 00 28 00 00"), false, false},
      {"bmp of another header", With(FromHex(kSmallBmp), 14, 12), false, false},
      {"nothing", {}, false, false},
      {"start alone", FromHex("FF D8"), false, true},
      {"half a start", FromHex("FF"), false, false},
      {"no start", FromHex("FF D9 FF E0"), false, false},
      {"fewer than four left", FromHex("FF D8 00 00 00"), false, true},
      {"no marker", FromHex("FF D8 00 E0 00 10"), false, false},
      {"end of image", FromHex("FF D8 FF D9 00 00"), false, true},
      {"two segments, then none", FromHex("FF D8 FF E0 00 02 FF E1 00 03 07 00 00 00 00"), false, false},
      {"three segments, then anything", FromHex("FF D8 FF E0 00 02 FF E1 00 02 FF E2 00 02 00 00 00 00"), false, true},
      {"a segment past the end", FromHex("FF D8 FF E0 FF FF 00 00"), false, true},
  };
  for (const auto& [name, bytes, bmp, jpeg] : cases) {
    SCOPED_TRACE(name);
    EXPECT_EQ(bmp, BmpLoader().Identify({}, bytes.data(), static_cast<LLong>(bytes.size())));
    EXPECT_EQ(jpeg, JpgLoader().Identify({}, bytes.data(), static_cast<LLong>(bytes.size())));
  }
  EXPECT_EQ(kImageFormatBmp, BmpLoader().GetFormatId());
  EXPECT_EQ(kImageFormatJpeg, JpgLoader().GetFormatId());
}
