// Preview pictures, put into scenes and taken out of them by the program.

#include "support/byte_writer.h"
#include "support/pictures.h"
#include "support/run_q7r.h"

using namespace _torvane_;

namespace
{

// A scene whose file information holds a picture; `tail` follows inside the frame.
Bytes SceneWith(const Bytes& picture, const Bytes& tail)
{
  ByteWriter w;
  w.Header().Start(110059, 0).Start(110024, 2).Long(13000).Bool(false).Bool(true).Image(picture).End();
  return w.Append(tail).bytes;
}

class Preview : public testing::Test
{
 protected:
  std::string Write(const std::string& name, const Bytes& bytes) const
  {
    WriteWholeFile(folder_ / name, bytes);
    return folder_ / name;
  }
  // A picture file of that name, of slopes.
  std::string Picture(const std::string& name, int width, int height, int components = 3) const
  {
    Bitmap bitmap;
    Fill(bitmap, SmoothPicture(width, height, components));
    return Write(name, SaveToMemory(bitmap, name.ends_with(".bmp") ? kImageFormatBmp : kImageFormatJpeg, nullptr,
                                    components == 1 ? kImageSaveGrey : 0));
  }
  static RunResult Run(const std::string& scene, const std::string& rest, const std::string& output)
  {
    return RunQ7r("preview " + Quoted(scene) + " " + rest + " -o " + Quoted(output));
  }
  static void ExpectRefusal(const RunResult& run, const std::string& output, const std::string& says)
  {
    EXPECT_EQ(2, run.status);
    EXPECT_EQ("", run.out);
    EXPECT_NE(std::string::npos, run.err.find(says)) << run.err;
    EXPECT_EQ(1, std::count(run.err.begin(), run.err.end(), '\n')) << run.err;
    EXPECT_FALSE(std::filesystem::exists(output) || std::filesystem::exists(output + ".part"));
  }

  TempFolder folder_;
  const Bytes plain_ = ByteWriter().Header().Start(110059, 0).End().bytes; // a scene of nothing but its frame
};

} // namespace

TEST_F(Preview, GoesInAndComesOutInBothFormats)
{
  const std::string scene = Write("plain.q7r", plain_);
  const std::pair<std::string, int> cases[] = {
      {Picture("in.bmp", 31, 20), 3}, {Picture("in.jpg", 31, 20), 3}, {Picture("grey.jpg", 31, 20, 1), 1}};
  const std::string with = folder_ / "with.q7r";
  for (const auto& [picture, components] : cases) {
    SCOPED_TRACE(picture);
    ASSERT_EQ(0, Run(scene, "--force --set " + Quoted(picture), with).status);
    // A scene that is written again still has it.
    ASSERT_EQ(0, RunQ7r("resave --force " + Quoted(with) + " " + Quoted(folder_ / "again.q7r")).status);
    for (const char* name : {"out.BMP", "out.jpg", "out.jpeg"}) {
      const std::string out = folder_ / name;
      const RunResult run = Run(folder_ / "again.q7r", "--force", out);
      ASSERT_EQ(0, run.status) << run.err;
      EXPECT_NE(std::string::npos, run.out.find("31 x 20 pixels")) << run.out;
      Bitmap bitmap;
      const Long result = std::string(name) == "out.BMP" ? bitmap.LoadBmp(out.c_str())
                                                         : JpgLoader().Load(out.c_str(), bitmap, kFirstFrame);
      ASSERT_EQ(IMAGERESULT_OK, result);
      const PlainPicture slopes = SmoothPicture(31, 20, components);
      EXPECT_LE(Difference(components == 1 ? AsColor(slopes) : slopes, PixelsOf(bitmap)), 60);
    }
  }
}

TEST_F(Preview, ComesOutByteForByteFromTheStartOfTheFileAlone)
{
  const Bytes jpeg = ReadWholeFile(Picture("in.jpg", 40, 30));
  const std::string scene = Write("scene.q7r", SceneWith(jpeg, Bytes(5000, 0xFF))); // nothing behind it can be read
  const std::string out = folder_ / "out.jpg";
  ASSERT_EQ(0, Run(scene, "", out).status);
  EXPECT_EQ(jpeg, ReadWholeFile(out));
  ExpectRefusal(Run(scene, "--set " + Quoted(out), folder_ / "new.q7r"), folder_ / "new.q7r", "scene.q7r: byte ");
}

TEST_F(Preview, RefusesWithOneLine)
{
  const std::string scene = Write("plain.q7r", plain_);
  const std::string damaged = Write("damaged.q7r", SceneWith(Bytes(100, 1), ByteWriter().End().bytes));
  Bytes narrow = ReadWholeFile(Picture("in.bmp", 4, 4));
  narrow[28] = 8;
  const std::tuple<const char*, std::string, std::string, std::string, std::string> cases[] = {
      {"no picture", scene, "", "out.jpg", "plain.q7r: holds no preview"},
      {"a damaged picture", damaged, "", "out.jpg", "damaged.q7r: byte "},
      {"no scene", folder_ / "none.q7r", "", "out.jpg", "none.q7r"},
      {"another suffix", scene, "", "out.png", "out.png: the name of a picture ends with"},
      {"no picture file", scene, "--set " + Quoted(folder_ / "none.jpg"), "out.q7r", "none.jpg: No such file"},
      {"another format", scene, "--set " + Quoted(scene), "out.q7r", "plain.q7r: is neither"},
      {"8 bits", scene, "--set " + Quoted(Write("8.bmp", narrow)), "out.q7r", "8.bmp: this kind isn't read"},
      {"a cut picture", scene, "--set " + Quoted(Write("cut.jpg", {0xFF, 0xD8, 0xFF})), "out.q7r", "cut.jpg: damaged"},
  };
  for (const auto& [name, input, rest, output, says] : cases) {
    SCOPED_TRACE(name);
    ExpectRefusal(Run(input, rest, folder_ / output), folder_ / output, says);
  }
  // An existing file is left alone.
  const std::string with = folder_ / "with.q7r";
  ASSERT_EQ(0, Run(scene, "--set " + Quoted(Picture("in.jpg", 8, 8)), with).status);
  const std::string old = Write("old.jpg", {1, 2, 3});
  EXPECT_EQ(2, Run(with, "", old).status);
  EXPECT_EQ(3U, ReadWholeFile(old).size());
}
