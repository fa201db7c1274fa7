// The file rules of Windows, through the library's byte files.
#include <filesystem>

#include <gtest/gtest.h>

#include "deep_path.h"
#include "support/temp_folder.h"
#include "torvane/bytes/base_file.h"

using namespace _torvane_;
namespace fs = std::filesystem;

namespace
{

Filename NameOf(const fs::path& path)
{
  Filename name;
  name.SetString(String(reinterpret_cast<const UniChar*>(path.c_str()), static_cast<Long>(path.native().size())));
  return name;
}

TEST(WindowsFiles, HaveNamesOfEveryPlane)
{
  const TempFolder folder;
  for (const wchar_t* text : {L"\u00E9\u20AC", L"a\xD83D\xDE00z"}) {
    const fs::path path = folder.Path() / text;
    BaseFile file;
    EXPECT_TRUE(file.Open(NameOf(path), kFileWrite) && file.WriteChar('x') && file.Close() && GeFExist(NameOf(path)));
    EXPECT_EQ(fs::file_size(Verbatim(path)), 1u);
  }
}

TEST(WindowsFiles, LieAsDeepAsTheSystemAllows)
{
  const TempFolder folder;
  fs::path deep = folder.Path();
  // Around the limit of the plain calls, and beyond the characters that are kept without a block of their own.
  for (const std::size_t length : {244, 256, 260, 300, 1100}) {
    while (deep.native().size() + 52 < length)
      deep /= std::wstring(50, L'd');
    const fs::path path = deep / std::wstring(length - deep.native().size() - 1, L'f');
    ASSERT_EQ(path.native().size(), length);
    fs::create_directories(Verbatim(deep));
    BaseFile file;
    EXPECT_FALSE(GeFExist(NameOf(path)));
    EXPECT_TRUE(file.Open(NameOf(path), kFileWrite) && file.WriteLong(7) && file.Close()) << length;
    EXPECT_TRUE(GeFExist(NameOf(path)) && GeFExist(NameOf(deep), true)) << length;
    // Dots and slashes are tidied in long paths as they are in short ones.
    const fs::path roundabout = (deep / L"." / L"x" / L"..").native() + L"/" + path.filename().native();
    Long value = 0;
    EXPECT_TRUE(file.Open(NameOf(roundabout), kFileRead) && file.ReadLong(value) && file.Close()) << length;
    EXPECT_EQ(value, 7);
    fs::remove(Verbatim(path));
  }
  RemoveUpTo(folder.Path(), deep);
}

TEST(WindowsFiles, DrivesAreDirectories)
{
  EXPECT_TRUE(GeFExist("C:", true) && GeFExist("C:\\", true));
  EXPECT_FALSE(GeFExist("C:") || GeFExist("Q:", true));
}

// Who may open a file that is open already: the modes are numbered from 0.
TEST(WindowsFiles, AreSharedByTheirModes)
{
  const TempFolder folder;
  const Filename name = NameOf(folder.Path() / L"shared");
  const struct
  {
    Long mode;
    bool others[6]; // with mode 0 to 5
  } cases[] = {
      {kFileReadWriteAtEnd, {false, false, false, false, false, false}},
      {kFileRead, {false, true, false, false, true, true}},
      {kFileWrite, {false, false, false, false, false, false}},
      {kFileReadWrite, {false, false, false, true, false, true}},
      {kFileReadAlias, {false, true, false, false, true, true}},
      {kFileReadShared, {false, true, false, true, true, true}},
  };
  for (const auto& each : cases) {
    BaseFile file;
    WriteWholeFile(folder / "shared", {1, 2, 3, 4});
    ASSERT_TRUE(file.Open(name, each.mode)) << each.mode;
    for (Long other = 0; other < 6; ++other)
      EXPECT_EQ(BaseFile().Open(name, other), each.others[other]) << each.mode << " then " << other;
  }
}

} // namespace
