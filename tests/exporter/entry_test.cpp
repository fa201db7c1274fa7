#include <filesystem>
#include <fstream>

#include "export_fixture.h"
#include "exporter/entry/dialog_scripts.h"
#include "exporter/entry/message_table.h"
#include "exporter/entry/plugin_state.h"
#include "exporter/entry/scene_writer.h"
#include "support/full_scene.h"

namespace
{

namespace fs = std::filesystem;
using namespace export_test;
using exporter::ExportCommand;

constexpr const char* kProblems = "Q7RExporter: Problems encountered during file export.";

TEST(Entry, RegistersMenuEntryNameAndHooks)
{
  host::StandaloneHost host(host::LoadCompositionText(Composition(""), "test.json", "/"));
  ASSERT_EQ(host.Start(EntryPointFunc), 0);
  ASSERT_EQ(host.MenuEntries().size(), 1u);
  EXPECT_EQ(host.MenuEntries()[0].name, "KORVEX Exporter...");
  EXPECT_TRUE(host.MenuEntries()[0].menu == 13 && host.MenuEntries()[0].afterItem == -2);
  EXPECT_EQ(host.PluginName(), "KORVEX Exporter...");
  EXPECT_EQ(exporter::PluginId, host.RegisteredPlugin());
  EXPECT_EQ(host.CallMenuHook(), 0);
  EXPECT_TRUE(host.IsCommandEnabled(ExportCommand) && host.Balance() == host::HostBalance());
}

TEST(Entry, GivesTheFirstErrorOfARegistrationAndSaysSo)
{
  for (std::uint64_t n = 1; n <= 5; ++n) {
    host::StandaloneHost host(host::LoadCompositionText(Composition(""), "test.json", "/"));
    host.FailCall(n, 40);
    EXPECT_EQ(host.Start(EntryPointFunc), 40) << n;
    EXPECT_EQ(host.Reports(), std::vector<std::string>{kProblems}) << n;
    EXPECT_EQ(host.CallCount(), n + 1) << "no call but the message follows a failure";
    EXPECT_EQ(host.MenuEntries().size(), n > 2 ? 1u : 0u) << n;
  }
}

TEST(Entry, DoesNothingWithoutACommand)
{
  host::StandaloneHost host(host::LoadCompositionText(Composition(""), "test.json", "/"));
  host.WithholdCommand();
  EXPECT_EQ(host.Start(EntryPointFunc), 0);
  EXPECT_TRUE(host.MenuEntries().empty() && host.Reports().empty());
  EXPECT_EQ(host.CallCount(), 1u);
}

TEST(Entry, ShowsTheDialogsAsOneLineOfScript)
{
  const std::string t19(19, '\t');
  EXPECT_EQ(exporter::kOpenSaveDialogScript,
            "function openSaveDialog() {" + t19 + R"(var f = File.saveDialog("Q7R Exporter", "*.q7r");)" + t19 +
                R"(if (f == null) return "";)" + t19 + "return f.fsName;" + t19 + "}" + t19 + "openSaveDialog();");
  EXPECT_EQ(exporter::kAskOverwriteScript,
            std::string("function askOverwrite() {\t\t\t") +
                R"(var foo = confirm("This file already exists. Would you like to replace it?", false, )" +
                R"("Confirm Save As");)" + "\t\t\t" + R"(return foo ? "true" : "false";)" +
                "\t\t\t}\t\t\taskOverwrite();");
}

// A host with the plug-in started, and a folder to write to.
class CommandHook : public testing::Test
{
 protected:
  void SetUp() override { host_.Start(EntryPointFunc); }

  void Touch(const std::string& name) { std::ofstream(folder_.Path() / name) << "old"; }
  bool IsScene(const std::string& name) const
  {
    char magic[4] = {};
    std::ifstream(folder_.Path() / name, std::ios::binary).read(magic, 4);
    return std::string(magic, 4) == "QQ7R";
  }
  host::CommandResult Run(const std::string& name)
  {
    host_.SetOutputPath(name.empty() ? "" : folder_ / name);
    return host_.CallCommandHook(ExportCommand);
  }

  TempFolder folder_;
  host::StandaloneHost host_{host::LoadCompositionText(Composition(Solid("A")), "test.json", "/")};
};

TEST_F(CommandHook, LeavesOtherCommandsAndHandledOnesAlone)
{
  const std::uint64_t calls = host_.CallCount();
  for (auto [command, alreadyHandled] : {std::pair(ExportCommand + 1, false), {ExportCommand, true}}) {
    host::CommandResult result = host_.CallCommandHook(command, alreadyHandled);
    EXPECT_EQ(result.error, 0);
    EXPECT_FALSE(result.isHandled && !alreadyHandled);
  }
  EXPECT_EQ(host_.CallCount(), calls);
}

TEST_F(CommandHook, WritesTheSceneFile)
{
  host::CommandResult result = Run("scene.q7r");
  EXPECT_EQ(result.error, 0);
  EXPECT_TRUE(result.isHandled && IsScene("scene.q7r") && host_.Reports().empty());
  EXPECT_EQ(host_.Balance(), host::HostBalance());
}

TEST_F(CommandHook, LetsTheHostTellHowFarItIs)
{
  // Five objects: a composition of one layer, twice, and a layer that moves; a title and a flat layer don't count.
  const std::string nested = Layer(0, "N", "", R"("refId":"in")");
  host::StandaloneHost host(
      host::LoadCompositionText(Composition(nested + "," + Layer(5, "Title", "") + "," + nested +
                                                R"(,{"ty":1,"sw":9,"sh":9,"sc":"#fff","ks":{}},)" +
                                                Solid("A", R"("p":)" + Ramp("[0,0,0]", "[9,9,9]")),
                                            R"("assets":[{"id":"in","layers":[)" + Solid("B") + "]}]"),
                                "test.json", "/"));
  std::vector<double> shares;
  host.OnProgress([&](double share) { shares.push_back(share); });
  host.Start(EntryPointFunc);
  host.SetOutputPath(folder_ / "progress.q7r");
  host.OnAskOverwrite([] { return true; });
  for (int round = 0; round < 2; ++round) { // each export counts from 0
    shares.clear();
    EXPECT_EQ(host.CallCommandHook(ExportCommand).error, 0);
    EXPECT_TRUE(std::is_sorted(shares.begin(), shares.end()));
    const std::set<double> seen(shares.begin(), shares.end());
    for (double share : {0.0, 0.2, 0.4, 0.6, 0.8, 0.9, 1.0})
      EXPECT_TRUE(seen.count(share)) << share;
  }
}

TEST_F(CommandHook, KeepsTheTextOfACancelledDialogLocked)
{
  host::CommandResult result = Run("");
  EXPECT_EQ(result.error, 0);
  EXPECT_TRUE(result.isHandled && host_.Reports().empty());
  EXPECT_EQ(host_.Balance(), (host::HostBalance{.memoryHandles = 1, .memoryLocks = 1}));
}

TEST_F(CommandHook, AsksBeforeItReplacesTheFileThatWasNamed)
{
  int questions = 0;
  bool answer = false;
  host_.OnAskOverwrite([&] { return ++questions, answer; });
  Touch("scene.q7r");
  EXPECT_EQ(Run("scene.q7r").error, 0);
  EXPECT_FALSE(IsScene("scene.q7r"));
  answer = true;
  EXPECT_EQ(Run("scene.q7r").error, 0);
  EXPECT_TRUE(IsScene("scene.q7r"));
  EXPECT_EQ(questions, 2);
  EXPECT_EQ(host_.Balance(), host::HostBalance());
}

TEST_F(CommandHook, ForcesTheSuffixWithoutAskingForTheNewName)
{
  const std::tuple<const char*, const char*, int, const char*> cases[] = {
      {"plain", "plain.q7r", 0, "plain.q7r"},
      {"a.txt", "a.txt", 1, "a.q7r"},
      {"b.Q7R", "none", 0, "b.Q7R"},
      {"c.tar.gz", "none", 0, "c.tar.q7r"},
      {"d.suffix7", "none", 0, "d.suffix7.q7r"},
      {"\xC3\xA9t\xC3\xA9", "none", 0, "\xC3\xA9t\xC3\xA9.q7r"},
  };
  for (const auto& [typed, existing, asked, written] : cases) {
    int questions = 0;
    host_.OnAskOverwrite([&] { return ++questions, true; });
    Touch(existing);
    host::CommandResult result = Run(typed);
    EXPECT_EQ(result.error, 0) << typed;
    EXPECT_EQ(questions, asked) << typed;
    EXPECT_TRUE(IsScene(written)) << typed;
  }
}

TEST_F(CommandHook, GivesTwoForAFileThatCannotBeOpened)
{
  host::CommandResult result = Run("missing/scene.q7r");
  EXPECT_EQ(result.error, 2);
  EXPECT_TRUE(result.isHandled && host_.Reports().empty());
  EXPECT_EQ(host_.Balance(), (host::HostBalance{.memoryHandles = 1, .memoryLocks = 1}));
}

TEST_F(CommandHook, GivesTheErrorOfADialogAndWritesNothing)
{
  Touch("scene.q7r");
  for (std::uint64_t n : {1U, 3U}) { // the save dialog; the question behind the locking of its answer
    host_.FailCall(host_.CallCount() + n, 40);
    host::CommandResult result = Run("scene.q7r");
    EXPECT_EQ(result.error, 40);
    EXPECT_TRUE(result.isHandled);
    EXPECT_NE(host_.LastError().find("AEGP_ExecuteScript"), std::string::npos);
    EXPECT_FALSE(IsScene("scene.q7r"));
    EXPECT_EQ(host_.Balance(), host::HostBalance());
  }
}

TEST(SceneWriter, TellsAMissingPathFromAnEmptyOne)
{
  EXPECT_FALSE(exporter::WriteSceneFile(nullptr));
  EXPECT_TRUE(exporter::WriteSceneFile(""));
}

// Every kind of layer, animated and not, nested, locked, parented.
const std::string kEverything = Composition(
    Layer(13, "Camera", R"("p":)" + Ramp("[500,250,-1000]", "[500,250,-900]") + R"(,"a":)" + Property("[500,250,0]"),
          R"("pe":)" + Ramp("[1000]", "[900]")) +
        "," +
        Layer(14, "Spot", R"("a":)" + Ramp("[0,0,9]", "[9,0,9]"),
              R"("light":{"type":"spot","coneAngle":)" + Ramp("[90]", "[0]") + R"(,"color":)" +
                  Ramp("[1,1,1]", "[0,0,0]") + "}") +
        "," + Layer(14, "Ambient", "", R"("light":{"type":"ambient"})") + "," +
        Solid("Locked", R"("rx":)" + Ramp("[0]", "[90]"), R"("ae":{"locked":true},"parent":9)") + "," +
        Layer(3, "Null", "", R"("ind":9)") + "," + Layer(2, "", "", R"("refId":"still")") + "," +
        Layer(0, "Nested", "", R"("refId":"inner")"),
    R"("ae":{"workArea":[0,2]},"assets":[{"id":"still","p":"a.png","w":8,"h":8},{"id":"inner","nm":"Inner","w":300,"h":200,"layers":[)" +
        Solid("Inside", R"("s":)" + Ramp("[100,100,100]", "[50,50,50]")) + "," + Layer(5, "Title", "") + "]}]");

// Nothing is said when there is no active composition to be found (three calls), and where a setting keeps its default
// (six calls).
constexpr std::uint64_t kSilentCalls = 9;

TEST(Failures, AnyHostCallMayFailAndTheFileIsWrittenAllTheSame)
{
  const TempFolder folder;
  const fs::path file = folder / "failures.q7r";
  std::uint64_t started = 0;
  for (std::uint64_t n = 0;; ++n) { // 0: nothing fails
    host::StandaloneHost host(host::LoadCompositionText(kEverything, "test.json", "/footage"));
    ASSERT_EQ(host.Start(EntryPointFunc), 0);
    started = host.CallCount() + 2; // behind the dialog and the locking of its answer
    fs::remove(file);
    host.SetOutputPath(file.string());
    host.FailCall(n == 0 ? 0 : started + n);
    const host::CommandResult result = host.CallCommandHook(ExportCommand);
    ASSERT_EQ(host.Balance(), host::HostBalance()) << n;
    ASSERT_TRUE(fs::exists(file)) << n;
    BaseDocument* document = LoadDocument(Filename(file.string().c_str()), LoadObjects | LoadMaterials);
    ASSERT_NE(document, nullptr) << n;
    BaseDocument::Free(document);
    if (n != 0 && started + n > host.CallCount())
      break; // every call has had its turn
    const bool isHandle = host.LastError().find("MemHandle") != std::string::npos;
    if (n <= kSilentCalls) {
      ASSERT_TRUE(host.Reports().empty()) << n << host.LastError();
    } else if (!isHandle) {
      ASSERT_EQ(host.Reports(), std::vector<std::string>{kProblems}) << n << host.LastError();
    }
    ASSERT_TRUE(result.isHandled);
  }
}

TEST(Failures, EveryFailedAllocationLeavesNoFileOrTheWholeScene)
{
  const TempFolder folder;
  const fs::path file = folder / "memory.q7r";
  EveryFailedAllocation(
      [&] {
        fs::remove(file);
        host::StandaloneHost host(host::LoadCompositionText(kEverything, "test.json", "/footage"));
        host.Start(EntryPointFunc);
        host.SetOutputPath(file.string());
        const host::CommandResult result = host.CallCommandHook(ExportCommand);
        EXPECT_TRUE(result.isHandled);
        EXPECT_TRUE(result.error == 0 || result.error == 2) << result.error;
        EXPECT_EQ(fs::exists(file), result.error == 0);
        EXPECT_TRUE(host.Reports().empty() ||
                    (result.error != 0 && host.Reports() == std::vector<std::string>{kProblems}));
        EXPECT_EQ(host.Balance().streams, 0);
        return result.error == 0;
      },
      [&](bool) {
        std::ifstream written(file, std::ios::binary);
        return full_scene::Comparable({std::istreambuf_iterator<char>(written), {}});
      });
}

TEST(Failures, ARefusedSuiteLeavesAsAnExceptionAndEverythingIsGivenBack)
{
  const std::pair<const char*, std::int32_t> suites[] = {
      {kAEGPUtilitySuite, 11}, {kAEGPMemorySuite, 1}, {kAEGPItemSuite, 13},  {kAEGPCompSuite, 15},
      {kAEGPLayerSuite, 13},   {kAEGPStreamSuite, 9}, {kAEGPStreamSuite, 7}, {kAEGPKeyframeSuite, 4},
      {kAEGPFootageSuite, 11}, {kAEGPCameraSuite, 2}, {kAEGPLightSuite, 2},
  };
  const TempFolder folder;
  const fs::path file = folder / "refused.q7r";
  for (auto [name, version] : suites) {
    host::StandaloneHost host(host::LoadCompositionText(kEverything, "test.json", "/footage"));
    ASSERT_EQ(host.Start(EntryPointFunc), 0);
    host.SetOutputPath(file.string());
    host.RefuseSuite(name, version);
    fs::remove(file);
    EXPECT_EQ(host.CallCommandHook(ExportCommand).error, 516) << name << version;
    EXPECT_EQ(host.Balance(), host::HostBalance()) << name << version;
  }
}

} // namespace
