// The host as a plug-in sees it: tables, handles, commands, scripts, and what goes wrong on purpose.
#include "stage.h"

#include <cstring>

namespace
{

using stage::Answer;
using stage::Stage;

constexpr const char* kTwoLayers = R"({"ty": 13, "nm": "Eye", "pe": {"k": 400}}, {"ty": 1, "ddd": 1, "nm": "Wall"})";

TEST(SuiteTables, HoldTheirOperationsInTheHostsSlots)
{
  const std::tuple<const char*, std::int32_t, std::size_t, std::vector<std::size_t>> cases[] = {
      {"AEGP Command Suite", 1, 8, {0, 1, 4, 5}},
      {"AEGP Register Suite", 6, 12, {0, 1}},
      {"AEGP Utility Suite", 11, 31, {0, 8, 27}},
      {"AEGP Memory Suite", 1, 8, {1, 2, 3}},
      {"AEGP Item Suite", 13, 27, {2, 5, 7, 16, 17}},
      {"AEGP Comp Suite", 15, 34, {0, 7, 13, 14, 30}},
      {"AEGP Layer Suite", 13, 48, {0, 1, 4, 7, 10, 28, 29, 37, 41}},
      {"AEGP Stream Suite", 9, 22, {0, 3, 7, 11, 12, 13, 14, 17}},
      {"AEGP Stream Suite", 7, 22, {0}},
      {"AEGP Keyframe Suite", 4, 20, {0}},
      {"AEGP Footage Suite", 11, 21, {0, 2, 3, 4, 16}},
      {"AEGP Camera Suite", 2, 5, {1, 3}},
      {"AEGP Light Suite", 2, 2, {0}},
  };
  Stage stage(kTwoLayers);
  for (const auto& [name, version, slots, wanted] : cases) {
    SCOPED_TRACE(name);
    const auto* table = stage::Acquire<const void*>(stage.host, name, version);
    ASSERT_NE(nullptr, table);
    std::vector<std::size_t> used;
    for (std::size_t slot = 0; slot < slots; ++slot)
      if (table[slot])
        used.push_back(slot);
    EXPECT_EQ(wanted, used);
    const void* other = table;
    EXPECT_NE(0, stage.host.Basic()->AcquireSuite(name, version + 100, &other));
    EXPECT_EQ(nullptr, other);
  }
}

// Calls a slot by its number alone, as a plug-in compiled elsewhere would.
template <class... Arguments>
A_Err CallSlot(const void* suite, std::size_t slot, Arguments... arguments)
{
  const auto* table = static_cast<A_Err (*const*)(Arguments...)>(suite);
  return table[slot](arguments...);
}

TEST(SuiteTables, WorkBySlotNumbersAlone)
{
  const Stage stage(kTwoLayers);
  AEGP_ItemH item = nullptr;
  AEGP_CompH comp = nullptr;
  AEGP_LayerH layer = nullptr;
  AEGP_StreamRefH stream = nullptr;
  std::int32_t number = 0;
  unsigned char truth = 9;
  AEGP_StreamValue2 value{};
  const A_Time time{0, 25};
  EXPECT_EQ(0, CallSlot(stage.items, 2, &item));
  EXPECT_EQ(0, CallSlot(stage.comps, 0, item, &comp));
  EXPECT_EQ(0, CallSlot(stage.layers, 0, comp, &number));
  EXPECT_EQ(2, number);
  EXPECT_EQ(0, CallSlot(stage.layers, 1, comp, std::int32_t{0}, &layer));
  EXPECT_EQ(0, CallSlot(stage.layers, 29, layer, &truth));
  EXPECT_EQ(1, truth);
  EXPECT_EQ(0, CallSlot(stage.layers, 28, layer, &number));
  EXPECT_EQ(2, number); // a camera
  EXPECT_EQ(0, CallSlot(stage.streams, 3, std::int32_t{0}, layer, std::int32_t{11}, &stream));
  EXPECT_EQ(0, CallSlot(stage.streams, 13, std::int32_t{0}, stream, std::int16_t{1}, &time, truth, &value));
  double words[5]; // the stream, then the value's four
  static_assert(sizeof(words) == sizeof(value));
  std::memcpy(words, &value, sizeof(words));
  EXPECT_EQ(400, words[1]);
  EXPECT_EQ(0, CallSlot(stage.streams, 14, &value));
  EXPECT_EQ(0, CallSlot(stage.streams, 7, stream));
}

TEST(HostBalance, CountsWhatIsGivenOut)
{
  Stage stage(kTwoLayers);
  const host::HostBalance start = stage.host.Balance();
  EXPECT_EQ((host::HostBalance{0, 0, 0, 0, 12}), start);

  AEGP_MemHandle name = nullptr;
  EXPECT_EQ(0, stage.layers->AEGP_GetLayerName(0, stage.Layer(0), &name, nullptr));
  void* data = Answer(stage.memory->AEGP_LockMemHandle, name);
  const AEGP_StreamRefH stream = stage.Stream(0, AEGP_LayerStream_ZOOM), again = stage.Stream(0, AEGP_LayerStream_ZOOM);
  AEGP_StreamValue2 value{};
  const A_Time time{0, 1};
  EXPECT_EQ(0, stage.streams->AEGP_GetNewStreamValue(0, stream, 1, &time, 0, &value));
  EXPECT_EQ((host::HostBalance{1, 1, 2, 1, 12}), stage.host.Balance());

  EXPECT_EQ(0, stage.streams->AEGP_DisposeStreamValue(&value));
  EXPECT_NE(0, stage.streams->AEGP_DisposeStreamValue(&value)); // given back already
  EXPECT_EQ(0, stage.streams->AEGP_DisposeStream(stream));
  EXPECT_EQ(0, stage.streams->AEGP_GetNewStreamValue(0, again, 1, &time, 0, &value)); // the other one is still open
  EXPECT_EQ(0, stage.streams->AEGP_DisposeStreamValue(&value));
  EXPECT_EQ(0, stage.streams->AEGP_DisposeStream(again));
  EXPECT_NE(0, stage.streams->AEGP_DisposeStream(again));
  EXPECT_NE(0, stage.streams->AEGP_GetNewStreamValue(0, again, 1, &time, 0, &value));
  EXPECT_EQ("AEGP_GetNewStreamValue: not a stream that is open", stage.host.LastError());
  EXPECT_EQ(0, stage.memory->AEGP_UnlockMemHandle(name));
  EXPECT_NE(0, stage.memory->AEGP_UnlockMemHandle(name));
  EXPECT_EQ(0, stage.memory->AEGP_FreeMemHandle(name));
  EXPECT_NE(0, stage.memory->AEGP_FreeMemHandle(name));
  EXPECT_NE(0, stage.memory->AEGP_LockMemHandle(name, &data));
  EXPECT_EQ(start, stage.host.Balance());

  EXPECT_EQ(0, stage.host.Basic()->ReleaseSuite("AEGP Light Suite", 2));
  EXPECT_NE(0, stage.host.Basic()->ReleaseSuite("AEGP Light Suite", 2));
  EXPECT_NE(0, stage.host.Basic()->ReleaseSuite("AEGP Stream Suite", 7)); // only 9 is acquired
  EXPECT_EQ(11, stage.host.Balance().suites);
}

TEST(HostErrors, MeetArgumentsThatMakeNoSense)
{
  const Stage stage(kTwoLayers);
  AEGP_ItemType type = 0;
  AEGP_StreamRefH stream = nullptr;
  AEGP_StreamValue2 value{};
  const A_Time noTime{0, 0};
  A_long number = 0;
  EXPECT_NE(0, stage.items->AEGP_GetItemType(nullptr, &type));
  EXPECT_NE(0, stage.items->AEGP_GetItemType(stage.ActiveItem(), nullptr));
  EXPECT_NE(0, stage.layers->AEGP_GetCompNumLayers(nullptr, &number));
  EXPECT_NE(0, stage.layers->AEGP_GetLayerFlags(nullptr, &number));
  EXPECT_NE(0, stage.streams->AEGP_GetNewLayerStream(0, stage.Layer(1), AEGP_LayerStream_ZOOM, &stream));
  EXPECT_EQ("AEGP_GetNewLayerStream: the stream is not legal on this layer", stage.host.LastError());
  stream = stage.Stream(0, AEGP_LayerStream_ZOOM);
  EXPECT_NE(0, stage.streams->AEGP_GetNewStreamValue(0, stream, 1, &noTime, 0, &value));
  EXPECT_NE(0, stage.streams->AEGP_GetNewStreamValue(0, stream, 1, nullptr, 0, &value));
  EXPECT_NE(0, stage.commands->AEGP_EnableCommand(1)); // never given out
  EXPECT_NE(0, stage.commands->AEGP_InsertMenuCommand(0, "Nothing", 13, -2));
}

TEST(HostErrors, ComeWhenTheyAreAskedFor)
{
  Stage stage(kTwoLayers);
  const std::uint64_t before = stage.host.CallCount();
  stage.host.FailCall(before + 2, 77);
  const AEGP_ItemH item = stage.ActiveItem();
  AEGP_ItemType type = 0;
  EXPECT_EQ(77, stage.items->AEGP_GetItemType(item, &type));
  EXPECT_EQ(0, type);
  EXPECT_EQ(0, stage.items->AEGP_GetItemType(item, &type));
  EXPECT_EQ(before + 3, stage.host.CallCount());

  // Giving back fails, but takes the thing back.
  const AEGP_StreamRefH stream = stage.Stream(0, AEGP_LayerStream_ZOOM);
  stage.host.FailCall(stage.host.CallCount() + 1);
  EXPECT_EQ(host::kErrorInjected, stage.streams->AEGP_DisposeStream(stream));
  EXPECT_EQ(0, stage.host.Balance().streams);

  stage.host.RefuseSuite("AEGP Stream Suite", 7);
  stage.host.RefuseSuite("AEGP Item Suite");
  EXPECT_EQ(nullptr, stage::Acquire<void>(stage.host, "AEGP Stream Suite", 7));
  EXPECT_NE(nullptr, stage::Acquire<void>(stage.host, "AEGP Stream Suite", 9));
  EXPECT_EQ(nullptr, stage::Acquire<void>(stage.host, "AEGP Item Suite", 13));
}

// --- A plug-in in small

struct Plugin
{
  A_long menuCalls = 0;
  AEGP_Command seen = -1;
  A_Boolean seenHandled = 9;
};

A_Err OnMenu(AEGP_GlobalRefcon, AEGP_UpdateMenuRefcon refcon, AEGP_WindowType)
{
  return static_cast<Plugin*>(refcon)->menuCalls++ == 0 ? 0 : 5;
}

A_Err OnCommand(AEGP_GlobalRefcon, AEGP_CommandRefcon refcon, AEGP_Command command, AEGP_HookPriority,
                A_Boolean alreadyHandled, A_Boolean* handled)
{
  auto* plugin = static_cast<Plugin*>(refcon);
  plugin->seen = command;
  plugin->seenHandled = alreadyHandled;
  *handled = !alreadyHandled;
  if (command == 516)
    throw 516;
  return 0;
}

A_Err Enter(SPBasicSuite*, A_long, A_long, AEGP_PluginID plugin, AEGP_GlobalRefcon*) { return plugin == 0 ? 9 : 0; }
A_Err EnterThrowing(SPBasicSuite*, A_long, A_long, AEGP_PluginID, AEGP_GlobalRefcon*) { throw 516; }

TEST(HostCommands, AreRegisteredEnabledAndCalled)
{
  Stage stage(kTwoLayers);
  Plugin all, one;
  EXPECT_TRUE(stage.host.Start(Enter) == 0 && stage.host.Start(EnterThrowing) == 516);
  const AEGP_Command command = Answer(stage.commands->AEGP_GetUniqueCommand);
  const AEGP_Command other = Answer(stage.commands->AEGP_GetUniqueCommand);
  EXPECT_TRUE(command != 0 && command != other);
  EXPECT_EQ(0, stage.commands->AEGP_InsertMenuCommand(command, "Do it...", 13, -2));
  const AEGP_PluginID id = Answer(stage.utility->AEGP_RegisterWithAEGP, nullptr, "Small");
  EXPECT_TRUE(stage.host.RegisteredPlugin() == id && stage.host.PluginName() == "Small");
  EXPECT_EQ(0, stage.hooks->AEGP_RegisterCommandHook(id, 2, 0, OnCommand, &all));
  EXPECT_EQ(0, stage.hooks->AEGP_RegisterCommandHook(id, 2, command, OnCommand, &one));
  EXPECT_EQ(0, stage.hooks->AEGP_RegisterUpdateMenuHook(id, OnMenu, &all));

  ASSERT_EQ(1u, stage.host.MenuEntries().size());
  EXPECT_TRUE(stage.host.MenuEntries()[0].menu == 13 && stage.host.MenuEntries()[0].afterItem == -2);
  EXPECT_TRUE(stage.host.FindCommand("Do it...") == command && stage.host.FindCommand("Undo it...") == 0);
  EXPECT_FALSE(stage.host.IsCommandEnabled(command));
  EXPECT_EQ(0, stage.commands->AEGP_EnableCommand(command));
  EXPECT_TRUE(stage.host.IsCommandEnabled(command) && !stage.host.IsCommandEnabled(other));
  EXPECT_EQ(0, stage.commands->AEGP_DisableCommand(command));
  EXPECT_FALSE(stage.host.IsCommandEnabled(command));

  EXPECT_EQ(0, stage.host.CallMenuHook());
  EXPECT_EQ(5, stage.host.CallMenuHook());
  EXPECT_TRUE(stage.host.CallCommandHook(command).isHandled);
  EXPECT_TRUE(all.seen == command && all.seenHandled == 0);
  EXPECT_EQ(command, one.seen);
  EXPECT_EQ(1, one.seenHandled); // by the first
  const host::CommandResult thrown = stage.host.CallCommandHook(516, true);
  EXPECT_EQ(516, thrown.error);
  EXPECT_FALSE(thrown.isHandled);
  EXPECT_EQ(1, all.seenHandled);
  EXPECT_EQ(command, one.seen);

  stage.host.WithholdCommand();
  EXPECT_EQ(0, Answer(stage.commands->AEGP_GetUniqueCommand));
}

TEST(HostScripts, AnswerTheTwoDialogs)
{
  Stage stage(kTwoLayers);
  const auto run = [&](const char* script) -> std::string {
    AEGP_MemHandle result = nullptr;
    const A_Err error = stage.utility->AEGP_ExecuteScript(2, script, 0, &result, nullptr);
    return error ? "error" : stage.TakeText<char>(result);
  };
  const char* const save = "function openSaveDialog() {\t\t\treturn askOverwrite();\t\t}\t\topenSaveDialog();";
  const char* const ask = "function askOverwrite() {\t\treturn openSaveDialog();\t}\taskOverwrite() ; ";
  EXPECT_EQ("", run(save)); // cancelled
  EXPECT_EQ("false", run(ask));
  stage.host.SetOutputPath("/tmp/\xC3\xBC.q7r");
  EXPECT_EQ("/tmp/\xC3\xBC.q7r", run(save));
  bool answer = true;
  int asked = 0;
  stage.host.OnAskOverwrite([&] { return ++asked, answer; });
  EXPECT_EQ("true", run(ask));
  answer = false;
  EXPECT_EQ("false", run(ask));
  EXPECT_EQ(2, asked);
  for (const char* script : {"", "alert('x');", "reopenSaveDialog();", "openSaveDialog", "openSaveDialog(1);"})
    EXPECT_EQ("error", run(script)) << script;
  EXPECT_EQ(0, stage.utility->AEGP_ExecuteScript(2, save, 0, nullptr, nullptr)); // an answer that nobody wants
  EXPECT_EQ(0, stage.host.Balance().memoryHandles);
}

TEST(HostReports, ReachTheCallback)
{
  Stage stage(kTwoLayers);
  std::string text;
  stage.host.OnReport([&](const std::string& report) { text = report; });
  EXPECT_EQ(0, stage.utility->AEGP_ReportInfo(2, "Trouble"));
  EXPECT_EQ("Trouble", text);
  EXPECT_EQ(std::vector<std::string>{"Trouble"}, stage.host.Reports());
}

TEST(StandaloneHost, IsTheOneThatWasMadeLast)
{
  auto first = std::make_unique<Stage>(R"({"ty": 13})", R"("nm": "One")");
  auto second = std::make_unique<Stage>(R"({"ty": 13})", R"("nm": "Two")");
  EXPECT_TRUE(first->host.Basic() == second->host.Basic() && first->items == second->items);
  EXPECT_EQ(u"Two", first->ItemName(first->ActiveItem()));
  first.reset(); // in any order
  EXPECT_EQ(u"Two", second->ItemName(second->ActiveItem()));
  first = std::make_unique<Stage>(R"({"ty": 13})", R"("nm": "Three")");
  EXPECT_EQ(u"Three", second->ItemName(second->ActiveItem()));
  first.reset();
  EXPECT_EQ(u"Two", second->ItemName(second->ActiveItem()));
  second->host.Activate(nullptr);
  EXPECT_EQ(nullptr, second->ActiveItem());
  const AEGP_ItemSuite13* items = second->items;
  second.reset();
  AEGP_ItemH item = nullptr;
  EXPECT_NE(0, items->AEGP_GetActiveItem(&item)); // no host at all
}

} // namespace
