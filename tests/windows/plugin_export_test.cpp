// Loads the built plug-in as the host does and plays the host for it through the binary tables.
#include <cstdlib>
#include <filesystem>

#include <gtest/gtest.h>
#include <windows.h>

#include "deep_path.h"
#include "host/standalone_host.h"
#include "host/text.h"
#include "scene_comparison.h"
#include "support/temp_folder.h"

namespace fs = std::filesystem;

namespace
{

// The library stays loaded, as it does in the host.
AEGP_EntryPoint ThePlugin()
{
  static const HMODULE library = ::LoadLibraryW(fs::absolute(TEST_PLUGIN).make_preferred().c_str());
  if (!library)
    throw std::runtime_error("the plug-in can't be loaded");
  return reinterpret_cast<AEGP_EntryPoint>(reinterpret_cast<void*>(::GetProcAddress(library, "EntryPointFunc")));
}

// Exports the composition from the menu to the closed file.
host::CommandResult Export(host::StandaloneHost& host, const fs::path& output)
{
  EXPECT_EQ(host.Start(ThePlugin()), 0);
  EXPECT_EQ(host.CallMenuHook(), 0);
  const AEGP_Command command = host.FindCommand("KORVEX Exporter...");
  EXPECT_TRUE(host.IsCommandEnabled(command));
  host.SetOutputPath(host::PathToUtf8(output));
  return host.CallCommandHook(command);
}

std::vector<fs::path> Examples()
{
  std::vector<fs::path> files;
  for (const fs::directory_entry& entry : fs::directory_iterator(TEST_SOURCE_DIR "/examples"))
    if (entry.is_regular_file())
      files.push_back(entry.path());
  return files;
}

TEST(Plugin, WritesWhatTheOtherSystemWrites)
{
  const char* reference = std::getenv("TEST_REFERENCE");
  ASSERT_TRUE(reference) << "TEST_REFERENCE is to name the folder with the examples' scene files";
  ASSERT_GE(Examples().size(), 6u);
  const TempFolder folder;
  for (const fs::path& example : Examples()) {
    SCOPED_TRACE(example.string());
    const fs::path output = (folder.Path() / example.stem()).replace_extension("q7r");
    host::StandaloneHost host(host::LoadComposition(example));
    const host::CommandResult result = Export(host, output);
    EXPECT_EQ(result.error, 0);
    EXPECT_TRUE(result.isHandled);
    EXPECT_EQ(host.Reports(), std::vector<std::string>());
    EXPECT_EQ(host.Balance(), host::HostBalance());
    int count = 0;
    EXPECT_EQ(scene_comparison::FirstDifference(output.string(), (reference / output.filename()).string(), count), "");
    EXPECT_GT(count, 500);
  }
}

// Names beyond the code page, and paths that are longer than the system's plain calls take.
TEST(Plugin, WritesToEveryPathThatTheSystemHas)
{
  const TempFolder folder;
  fs::path deep = folder.Path();
  while (deep.native().size() < 300)
    deep /= "a-folder-with-a-long-name";
  fs::create_directories(Verbatim(deep));
  const fs::path outputs[] = {folder.Path() / u8"\u00FCber-\u6620\u753B.q7r", deep / "long.q7r"};
  for (const fs::path& output : outputs) {
    host::StandaloneHost host(host::LoadComposition(Examples().front()));
    EXPECT_EQ(Export(host, output).error, 0);
    EXPECT_GT(fs::file_size(Verbatim(output)), 1000u) << output.string();
    // The question is asked, and a no leaves the file.
    bool asked = false;
    host.OnAskOverwrite([&asked] {
      asked = true;
      return false;
    });
    EXPECT_EQ(host.CallCommandHook(host.FindCommand("KORVEX Exporter...")).error, 0);
    EXPECT_TRUE(asked) << output.string();
  }
  RemoveUpTo(folder.Path(), deep / "long.q7r");
}

// The export runs on the host's thread, which may have no more than the system's usual stack.
TEST(Plugin, ExportsALongChainOfParentsOnTheUsualStack)
{
  const TempFolder folder;
  std::string layers;
  for (int i = 1; i <= 1000; ++i) {
    layers += (i == 1 ? "" : ",") + std::string(R"({"ddd":1,"ty":3,"ks":{},"ind":)") + std::to_string(i) +
              (i == 1 ? "" : R"(,"parent":)" + std::to_string(i - 1)) + "}";
  }
  struct Job
  {
    std::string composition;
    fs::path output;
    A_Err error = -1;
  } job{R"({"fr":25,"ip":0,"op":1,"w":100,"h":100,"layers":[)" + layers + "]}", folder.Path() / "chain.q7r"};
  constexpr SIZE_T kUsualStack = 1 << 20;
  const auto run = [](void* argument) -> DWORD {
    auto* work = static_cast<Job*>(argument);
    host::StandaloneHost host(host::LoadCompositionText(work->composition, "chain.json", work->output.parent_path()));
    work->error = Export(host, work->output).error;
    return 0;
  };
  const HANDLE thread = ::CreateThread(nullptr, kUsualStack, run, &job, STACK_SIZE_PARAM_IS_A_RESERVATION, nullptr);
  ASSERT_TRUE(thread);
  ::WaitForSingleObject(thread, INFINITE);
  ::CloseHandle(thread);
  EXPECT_EQ(job.error, 0);
  // Each object's children stand in chunks of its own.
  _torvane_::StreamWalker walker;
  ASSERT_TRUE(walker.Open(q7r::ToFilename(job.output.string())));
  _torvane_::StreamValue value;
  _torvane_::Long depth = 0;
  while (walker.Next(value))
    depth = std::max(depth, walker.GetDepth());
  EXPECT_GT(depth, 1000);
}

TEST(Plugin, TellsTheHostThatTheFileCannotBeOpened)
{
  const TempFolder folder;
  host::StandaloneHost host(host::LoadComposition(Examples().front()));
  const host::CommandResult result = Export(host, folder.Path() / "missing" / "file.q7r");
  EXPECT_EQ(result.error, 2);
  EXPECT_TRUE(result.isHandled);
}

int ThrownByTheEntry(host::StandaloneHost& host)
{
  try {
    ThePlugin()(host.Basic(), 0, 0, 1, nullptr);
  } catch (int thrown) {
    return thrown;
  }
  return 0;
}

TEST(Plugin, LetsARefusedSuiteThroughToTheCallerOfItsEntry)
{
  for (const char* name : {kAEGPCommandSuite, kAEGPRegisterSuite, kAEGPUtilitySuite}) {
    host::StandaloneHost host(host::LoadComposition(Examples().front()));
    host.RefuseSuite(name);
    EXPECT_EQ(ThrownByTheEntry(host), 516) << name;
    EXPECT_EQ(host.Balance(), host::HostBalance()) << name;
  }
}

TEST(Plugin, GivesEverythingBackWhenASuiteIsRefusedDuringAnExport)
{
  const std::pair<const char*, std::int32_t> suites[] = {
      {kAEGPUtilitySuite, 11}, {kAEGPMemorySuite, 1}, {kAEGPItemSuite, 13},  {kAEGPCompSuite, 15},
      {kAEGPLayerSuite, 13},   {kAEGPStreamSuite, 9}, {kAEGPStreamSuite, 7}, {kAEGPKeyframeSuite, 4},
      {kAEGPFootageSuite, 11}, {kAEGPCameraSuite, 2}, {kAEGPLightSuite, 2},
  };
  const TempFolder folder;
  const fs::path output = folder.Path() / "refused.q7r";
  for (auto [name, version] : suites) {
    // This one has a camera, lights, solids and footage.
    host::StandaloneHost host(host::LoadComposition(TEST_SOURCE_DIR "/examples/two-node-camera.json"));
    ASSERT_EQ(host.Start(ThePlugin()), 0);
    host.SetOutputPath(host::PathToUtf8(output));
    host.RefuseSuite(name, version);
    EXPECT_EQ(host.CallCommandHook(host.FindCommand("KORVEX Exporter...")).error, 516) << name << version;
    EXPECT_EQ(host.Balance(), host::HostBalance()) << name << version;
    std::error_code error; // a file that is still open can't be removed here
    fs::remove(output, error);
    EXPECT_FALSE(error) << name << version;
  }
}

} // namespace
