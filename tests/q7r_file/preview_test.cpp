// The preview pictures of documents and materials.
#include "support/library.h"
#include "support/pictures.h"

namespace
{

Bytes EncodedBytes(const Bitmap& bitmap)
{
  const auto* first = static_cast<const std::uint8_t*>(bitmap.GetEncoded());
  return {first, first + bitmap.GetEncodedSize()};
}

// File information of level 2 with that picture.
ByteWriter SceneWith(const Bytes& picture, bool announced = true)
{
  ByteWriter w;
  w.Header().Start(110059, 0).Start(110024, 2).Long(13000).Bool(false).Bool(announced);
  return w.Image(picture).End();
}

} // namespace

TEST(DocumentPreview, IsWrittenAsJpegAndReadAsPixels)
{
  const DocumentPtr document = NewDocument();
  Fill(document->GetPreview(), SmoothPicture(20, 10, 3));
  const Bytes jpeg = SaveToMemory(document->GetPreview(), kImageFormatJpeg);
  const Bytes start = SceneWith(jpeg).bytes;
  const Bytes whole = SaveToBytes(*document);
  ASSERT_GT(whole.size(), start.size());
  EXPECT_EQ(ToHex(start), ToHex(whole.data(), start.size()));

  const DocumentPtr loaded = LoadFromBytes(whole);
  ASSERT_NE(loaded, nullptr);
  EXPECT_LE(Difference(SmoothPicture(20, 10, 3), PixelsOf(loaded->GetPreview())), 60);
  EXPECT_EQ(loaded->GetPreview().GetEncodedSize(), 0);
  EXPECT_EQ(EncodedBytes(loaded->GetStoredPreview()), jpeg);
  BaseDocument* clone = static_cast<BaseDocument*>(loaded->MakeClone(0, nullptr));
  ASSERT_NE(clone, nullptr);
  EXPECT_EQ(PixelsOf(clone->GetPreview()), PixelsOf(loaded->GetPreview()));
  BaseDocument::Free(clone);
}

TEST(DocumentPreview, FailsTheLoadWhenItCannotBeDecoded)
{
  Bitmap bitmap;
  Fill(bitmap, SmoothPicture(20, 10, 3));
  const Bytes jpeg = SaveToMemory(bitmap, kImageFormatJpeg);
  const std::tuple<const char*, Bytes> cases[] = {{"no bytes", {}},
                                                  {"another format", SaveToMemory(bitmap, kImageFormatBmp)},
                                                  {"cut in the header", Bytes(jpeg.begin(), jpeg.begin() + 100)}};
  for (const auto& [name, picture] : cases) {
    SCOPED_TRACE(name);
    for (Long flags : {LoadObjects | LoadMaterials, LoadPreviewOnly + 0}) {
      FileProblem problem;
      EXPECT_EQ(LoadFromBytes(SceneWith(picture).End().bytes, flags, &problem), nullptr);
      EXPECT_EQ(problem.code, FILEERROR_WRONG_VALUE);
    }
    // One that isn't announced is no concern.
    EXPECT_NE(LoadFromBytes(SceneWith(picture, false).End().bytes), nullptr);
  }
  // Only the first of a file is decoded.
  ByteWriter twice = SceneWith(jpeg);
  twice.Start(110024, 2).Long(13000).Bool(false).Bool(true).Image({1, 2, 3}).End().End();
  const DocumentPtr document = LoadFromBytes(twice.bytes);
  ASSERT_NE(document, nullptr);
  EXPECT_EQ(document->GetPreview().GetBw(), 20);
}

TEST(MaterialPreview, IsWrittenAtItsOwnQualityAndKeptAsItWasRead)
{
  Material material;
  Fill(material.GetPreview(), SmoothPicture(20, 10, 3));
  BaseContainer settings;
  settings.SetLong(kImageJpegQuality, 95);
  const Bytes jpeg = SaveToMemory(material.GetPreview(), kImageFormatJpeg, &settings);
  const Bytes value = ByteWriter().Image(jpeg).Image({}).Image({}).Bool(false).End().bytes;
  const Bytes written = BytesOf(material);
  EXPECT_NE(std::search(written.begin(), written.end(), value.begin(), value.end()), written.end());

  Material loaded;
  ASSERT_TRUE(ReadInto(loaded, written));
  EXPECT_EQ(EncodedBytes(loaded.GetPreview()), jpeg);
  // Nothing is encoded a second time.
  const Bytes again = BytesOf(loaded);
  EXPECT_NE(std::search(again.begin(), again.end(), value.begin(), value.end()), again.end());
}
