// The built plug-in, taken apart.
#include <algorithm>
#include <set>

#include <gtest/gtest.h>

#include "plugin_image.h"
#include "support/temp_folder.h"

namespace
{

using Bytes = std::vector<std::uint8_t>;

PluginImage ThePlugin() { return PluginImage(ReadWholeFile(TEST_PLUGIN)); }

TEST(PluginFile, IsALibraryFor64Bits)
{
  const PluginImage plugin = ThePlugin();
  EXPECT_EQ(plugin.Machine(), 0x8664u);
  EXPECT_EQ(plugin.OptionalMagic(), 0x20Bu);
  EXPECT_EQ(plugin.Characteristics() & 0x2000u, 0x2000u);
  // It may lie anywhere in the 64-bit space, and no data is run.
  EXPECT_EQ(plugin.DllCharacteristics() & 0x160u, 0x160u);
}

TEST(PluginFile, ExportsTheEntryPointAlone)
{
  EXPECT_EQ(ThePlugin().Exports(), std::vector<std::string>{"EntryPointFunc"});
  EXPECT_EQ(ThePlugin().ExportCount(), 1u);
}

TEST(PluginFile, NeedsOnlyWhatWindowsHas)
{
  const std::set<std::string> partsOfWindows = {"advapi32.dll", "bcrypt.dll", "kernel32.dll",
                                                "msvcrt.dll",   "user32.dll", "ws2_32.dll"};
  EXPECT_FALSE(ThePlugin().HasDelayedImports());
  for (const std::string& name : ThePlugin().Imports())
    EXPECT_TRUE(partsOfWindows.contains(name)) << name;
}

TEST(PluginFile, DescribesItselfToTheHost)
{
  const Bytes list = {
      0x01, 0x00,                                 // version 1
      0x00, 0x00, 0x00, 0x00,                     //
      0x05, 0x00, 0x00, 0x00,                     // properties
      'M',  'I',  'B',  '8',  'd', 'n', 'i', 'k', // kind
      0x00, 0x00, 0x00, 0x00, 4,   0,   0,   0,   //
      'x',  'g',  'E',  'A',                      //
      'M',  'I',  'B',  '8',  'e', 'm', 'a', 'n', // name
      0x00, 0x00, 0x00, 0x00, 8,   0,   0,   0,   //
      6,    'K',  'O',  'R',  'V', 'E', 'X', 0,   //
      'M',  'I',  'B',  '8',  'g', 't', 'a', 'c', // category
      0x00, 0x00, 0x00, 0x00, 16,  0,   0,   0,   //
      14,   'G',  'e',  'n',  'e', 'r', 'a', 'l', //
      ' ',  'P',  'l',  'u',  'g', 'i', 'n', 0,   //
      'M',  'I',  'B',  '8',  's', 'r', 'e', 'v', // version of the plug-in
      0x00, 0x00, 0x00, 0x00, 4,   0,   0,   0,   //
      0x00, 0x00, 0x01, 0x00,                     //
      'M',  'I',  'B',  '8',  '4', '6', '6', '8', // entry point
      0x00, 0x00, 0x00, 0x00, 16,  0,   0,   0,   //
      'E',  'n',  't',  'r',  'y', 'P', 'o', 'i', //
      'n',  't',  'F',  'u',  'n', 'c', 0,   0,   //
  };
  const std::map<std::string, Bytes> resources = ThePlugin().Resources();
  ASSERT_TRUE(resources.contains("PIPL/16000/1033"));
  EXPECT_EQ(resources.at("PIPL/16000/1033"), list);
  ASSERT_TRUE(resources.contains("16/1/1033")); // its version
  EXPECT_EQ(resources.size(), 2u);
}

TEST(PluginFile, TellsItsVersionAsTheProgramDoes)
{
  for (const char* file : {TEST_PLUGIN, TEST_Q7R}) {
    const std::map<std::string, Bytes> resources = PluginImage(ReadWholeFile(file)).Resources();
    ASSERT_TRUE(resources.contains("16/1/1033")) << file;
    const Bytes& version = resources.at("16/1/1033");
    const Bytes head = {0xBD, 0x04, 0xEF, 0xFE, 0, 0, 1, 0, 0, 0, 1, 0}; // signature, form 1.0, version 1.0
    EXPECT_NE(std::search(version.begin(), version.end(), head.begin(), head.end()), version.end()) << file;
  }
}

} // namespace
