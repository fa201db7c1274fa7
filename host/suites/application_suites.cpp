// The suites that deal with the application: commands, hooks, messages, scripts and memory.
#include "host/suites/host_state.h"

#include <algorithm>
#include <cctype>

namespace host
{

namespace
{

constexpr AEGP_PluginID kRegisteredPluginId = 2;

// --- Commands

A_Err GetUniqueCommand(AEGP_Command* command)
{
  return Operation("AEGP_GetUniqueCommand", [&](HostState& state) -> Outcome {
    if (!command)
      return "no place for the command";
    *command = 0;
    if (state.withholdsCommand)
      return kDone;
    state.isEnabled.push_back(false); // until the update-menu hook says otherwise
    *command = static_cast<AEGP_Command>(state.isEnabled.size());
    return kDone;
  });
}

// Where a command keeps whether it is enabled; null for a command that was never given out.
char* EnabledState(HostState& state, AEGP_Command command)
{
  const auto index = static_cast<std::size_t>(command) - 1; // a huge one for 0 and below
  return index < state.isEnabled.size() ? &state.isEnabled[index] : nullptr;
}

A_Err InsertMenuCommand(AEGP_Command command, const A_char* name, AEGP_MenuID menu, A_long afterItem)
{
  return Operation("AEGP_InsertMenuCommand", [&](HostState& state) -> Outcome {
    if (!EnabledState(state, command))
      return "unknown command";
    if (!name)
      return "no name";
    state.menu.push_back({command, name, menu, afterItem});
    return kDone;
  });
}

A_Err SetEnabled(const char* operation, AEGP_Command command, bool isEnabled)
{
  return Operation(operation, [&](HostState& state) -> Outcome {
    char* enabled = EnabledState(state, command);
    if (!enabled)
      return "unknown command";
    *enabled = isEnabled;
    return kDone;
  });
}

A_Err EnableCommand(AEGP_Command command) { return SetEnabled("AEGP_EnableCommand", command, true); }
A_Err DisableCommand(AEGP_Command command) { return SetEnabled("AEGP_DisableCommand", command, false); }

// --- Hooks

A_Err RegisterCommandHook(AEGP_PluginID, AEGP_HookPriority priority, AEGP_Command command, AEGP_CommandHook hook,
                          AEGP_CommandRefcon refcon)
{
  return Operation("AEGP_RegisterCommandHook", [&](HostState& state) -> Outcome {
    if (!hook)
      return "no hook";
    state.hooks.push_back({hook, command, priority, refcon});
    return kDone;
  });
}

A_Err RegisterUpdateMenuHook(AEGP_PluginID, AEGP_UpdateMenuHook hook, AEGP_UpdateMenuRefcon refcon)
{
  return Operation("AEGP_RegisterUpdateMenuHook", [&](HostState& state) -> Outcome {
    if (!hook)
      return "no hook";
    state.menuHooks.push_back({hook, refcon});
    return kDone;
  });
}

// --- Messages and scripts

A_Err ReportInfo(AEGP_PluginID, const A_char* text)
{
  return Operation("AEGP_ReportInfo", [&](HostState& state) -> Outcome {
    if (!text)
      return "no text";
    state.reports.emplace_back(text);
    if (state.report)
      state.report(state.reports.back());
    return kDone;
  });
}

A_Err RegisterWithAEGP(AEGP_GlobalRefcon, const A_char* name, AEGP_PluginID* plugin)
{
  return Operation("AEGP_RegisterWithAEGP", [&](HostState& state) -> Outcome {
    if (!name || !plugin)
      return "no name or no place for the id";
    state.pluginName = name;
    *plugin = state.plugin = kRegisteredPluginId;
    return kDone;
  });
}

// The function that the last statement of a script calls without arguments; empty if it does something else.
std::string_view CalledFunction(std::string_view script)
{
  const auto trimEnd = [&](auto&& isTrimmed) {
    while (!script.empty() && isTrimmed(static_cast<unsigned char>(script.back())))
      script.remove_suffix(1);
  };
  trimEnd([](unsigned char c) { return std::isspace(c) || c == ';'; });
  if (!script.ends_with("()"))
    return {};
  script.remove_suffix(2);
  const auto isNamed = [](char c) { return std::isalnum(static_cast<unsigned char>(c)) || c == '_'; };
  const auto start = std::find_if_not(script.rbegin(), script.rend(), isNamed);
  return script.substr(static_cast<std::size_t>(script.rend() - start));
}

A_Err ExecuteScript(AEGP_PluginID, const A_char* script, A_Boolean, AEGP_MemHandle* result, AEGP_MemHandle* error)
{
  return Operation("AEGP_ExecuteScript", [&](HostState& state) -> Outcome {
    for (AEGP_MemHandle* handle : {result, error})
      if (handle)
        *handle = nullptr;
    const std::string_view function = script ? CalledFunction(script) : std::string_view();
    std::string answer;
    if (function == "openSaveDialog")
      answer = state.outputPath;
    else if (function == "askOverwrite")
      answer = state.askOverwrite && state.askOverwrite() ? "true" : "false";
    else
      return "a script that this host cannot run";
    if (result)
      *result = state.NewUtf8(answer);
    return kDone;
  });
}

// --- Memory

constexpr Outcome kDeadHandle = "not a memory handle that is alive";

A_Err FreeMemHandle(AEGP_MemHandle handle)
{
  return Operation<CallKind::kRelease>("AEGP_FreeMemHandle", [&](HostState& state) -> Outcome {
    const MemoryBlock* block = state.FindBlock(handle);
    if (!block)
      return kDeadHandle;
    state.balance.memoryLocks -= block->locks;
    --state.balance.memoryHandles;
    state.blocks.erase(handle);
    return kDone;
  });
}

A_Err LockMemHandle(AEGP_MemHandle handle, void** data)
{
  return Operation("AEGP_LockMemHandle", [&](HostState& state) -> Outcome {
    MemoryBlock* block = state.FindBlock(handle);
    if (!block || !data)
      return kDeadHandle;
    ++block->locks;
    ++state.balance.memoryLocks;
    *data = block->bytes.data();
    return kDone;
  });
}

A_Err UnlockMemHandle(AEGP_MemHandle handle)
{
  return Operation<CallKind::kRelease>("AEGP_UnlockMemHandle", [&](HostState& state) -> Outcome {
    MemoryBlock* block = state.FindBlock(handle);
    if (!block)
      return kDeadHandle;
    if (block->locks == 0)
      return "the handle is not locked";
    --block->locks;
    --state.balance.memoryLocks;
    return kDone;
  });
}

} // namespace

AEGP_CommandSuite1 MakeCommandSuite()
{
  AEGP_CommandSuite1 suite{};
  suite.AEGP_GetUniqueCommand = GetUniqueCommand;
  suite.AEGP_InsertMenuCommand = InsertMenuCommand;
  suite.AEGP_EnableCommand = EnableCommand;
  suite.AEGP_DisableCommand = DisableCommand;
  return suite;
}

AEGP_RegisterSuite6 MakeRegisterSuite()
{
  AEGP_RegisterSuite6 suite{};
  suite.AEGP_RegisterCommandHook = RegisterCommandHook;
  suite.AEGP_RegisterUpdateMenuHook = RegisterUpdateMenuHook;
  return suite;
}

AEGP_UtilitySuite11 MakeUtilitySuite()
{
  AEGP_UtilitySuite11 suite{};
  suite.AEGP_ReportInfo = ReportInfo;
  suite.AEGP_RegisterWithAEGP = RegisterWithAEGP;
  suite.AEGP_ExecuteScript = ExecuteScript;
  return suite;
}

AEGP_MemorySuite1 MakeMemorySuite()
{
  AEGP_MemorySuite1 suite{};
  suite.AEGP_FreeMemHandle = FreeMemHandle;
  suite.AEGP_LockMemHandle = LockMemHandle;
  suite.AEGP_UnlockMemHandle = UnlockMemHandle;
  return suite;
}

} // namespace host
