// What a standalone host knows while it runs, for its suites.
#pragma once

#include "host/progress.h"
#include "host/standalone_host.h"

#include <algorithm>
#include <functional>
#include <map>
#include <new>
#include <type_traits>
#include <unordered_map>
#include <utility>

namespace host
{

// A text that the host has handed out. The handle points to this.
struct MemoryBlock
{
  std::vector<char> bytes; // with its terminating zero
  int locks = 0;
};

struct Hook
{
  AEGP_CommandHook call;
  AEGP_Command command; // 0 for all
  AEGP_HookPriority priority;
  AEGP_CommandRefcon refcon;
};

struct MenuHook
{
  AEGP_UpdateMenuHook call;
  AEGP_UpdateMenuRefcon refcon;
};

// An operation's result: null for success, else why it failed, in a few words.
using Outcome = const char*;
inline constexpr Outcome kDone = nullptr;
inline constexpr Outcome kNoPlace = "no place for the result";

// What a plug-in has registered.
struct PluginState
{
  AEGP_PluginID plugin = 0;
  std::string pluginName;
  std::vector<char> isEnabled; // by command less 1
  std::vector<MenuEntry> menu;
  std::vector<Hook> hooks;
  std::vector<MenuHook> menuHooks;
};

struct HostState : PluginState
{
  Project project;
  const Item* active = nullptr;
  std::string outputPath;
  std::function<bool()> askOverwrite;
  std::function<void(const std::string&)> report;
  Progress progress;

  bool withholdsCommand = false;
  bool outOfMemory = false; // an operation failed by it since the plug-in was called

  std::unordered_map<const void*, std::unique_ptr<MemoryBlock>> blocks;
  std::map<std::pair<std::string, std::int32_t>, std::int64_t> acquired;
  std::vector<std::pair<std::string, std::int32_t>> refused;
  HostBalance balance; // memoryHandles is the number of blocks
  std::uint64_t calls = 0;
  std::uint64_t failAt = 0;
  A_Err failWith = kErrorInjected;
  std::string lastError;
  std::vector<std::string> reports;

  // The texts go out as UTF-16 and UTF-8.
  AEGP_MemHandle NewUtf16(std::string_view utf8);
  AEGP_MemHandle NewUtf8(std::string_view utf8);
  // Null for a handle that is not alive.
  MemoryBlock* FindBlock(AEGP_MemHandle handle);

  // Every failure passes through here.
  A_Err Fail(const char* operation, const char* reason, A_Err error);

  // The host that suites speak for on this thread; null if there is none.
  static HostState*& Current();
  // The one that was current when this one was made, and takes over after it.
  HostState* previous = nullptr;
};

enum class CallKind
{
  kUse,
  kRelease, // gives something back, even when it is told to fail
};

// Runs the body of a suite operation: counts it, fails it when it is its turn, and keeps exceptions from the caller.
// The body takes the state and gives an Outcome.
template <CallKind Kind = CallKind::kUse, class Body>
A_Err Operation(const char* name, Body&& body)
{
  HostState* state = HostState::Current();
  if (!state)
    return kErrorParameter;
  const bool isToFail = ++state->calls == state->failAt;
  if (isToFail && Kind == CallKind::kUse)
    return state->Fail(name, "told to fail", state->failWith);
  try {
    const Outcome outcome = body(*state);
    if (outcome)
      return state->Fail(name, outcome, kErrorParameter);
  } catch (const std::bad_alloc&) {
    state->outOfMemory = true;
    return state->Fail(name, "out of memory", kErrorMemory);
  } catch (const std::exception& error) {
    return state->Fail(name, error.what(), kErrorParameter);
  }
  return isToFail ? state->Fail(name, "told to fail", state->failWith) : 0;
}

// Handles are the addresses of what they stand for.
inline AEGP_ItemH ToHandle(const Item* item) { return reinterpret_cast<AEGP_ItemH>(const_cast<Item*>(item)); }
inline AEGP_CompH ToHandle(Composition* composition) { return reinterpret_cast<AEGP_CompH>(composition); }
inline AEGP_LayerH ToHandle(Layer* layer) { return reinterpret_cast<AEGP_LayerH>(layer); }
inline AEGP_StreamRefH ToHandle(Property* property) { return reinterpret_cast<AEGP_StreamRefH>(property); }
inline const Item* FromHandle(AEGP_ItemH item) { return reinterpret_cast<const Item*>(item); }
inline const Item* FromHandle(AEGP_FootageH footage) { return reinterpret_cast<const Item*>(footage); }
inline const Composition* FromHandle(AEGP_CompH comp) { return reinterpret_cast<const Composition*>(comp); }
inline const Layer* FromHandle(AEGP_LayerH layer) { return reinterpret_cast<const Layer*>(layer); }
// Null for a stream that isn't open.
inline Property* FromHandle(AEGP_StreamRefH stream)
{
  auto* property = reinterpret_cast<Property*>(stream);
  return property && property->openHandles > 0 ? property : nullptr;
}

// What an operation says of a handle that stands for nothing.
constexpr Outcome NotGiven(AEGP_ItemH) { return "no item"; }
constexpr Outcome NotGiven(AEGP_FootageH) { return "no footage"; }
constexpr Outcome NotGiven(AEGP_CompH) { return "no composition"; }
constexpr Outcome NotGiven(AEGP_LayerH) { return "no layer"; }
constexpr Outcome NotGiven(AEGP_StreamRefH) { return "not a stream that is open"; }

// Runs `body` with what a handle stands for and the place of the result, neither null.
template <class Handle, class Result, class Body>
A_Err Query(const char* operation, Handle handle, Result* result, Body&& body)
{
  return Operation(operation, [&](HostState& state) -> Outcome {
    const auto* object = FromHandle(handle);
    if (!object)
      return NotGiven(handle);
    if (!result)
      return kNoPlace;
    return body(state, *object);
  });
}

// An operation's name as an argument of a template.
template <std::size_t size>
struct OperationName
{
  char text[size];

  consteval OperationName(const char (&name)[size]) // NOLINT(google-explicit-constructor): a literal is meant
  {
    std::copy_n(name, size, text);
  }
};

// What a plug-in gets of a value: a handle of an object, and else the value itself.
template <class Result, class Value>
Result ToResult(const Value& value)
{
  if constexpr (std::is_pointer_v<Value>)
    return ToHandle(value);
  else
    return static_cast<Result>(value);
}

// The operation that tells one member of what a handle stands for: a suite's slot gives handle and result their types.
template <OperationName name, auto member, class Handle, class Result>
A_Err Tell(Handle handle, Result* result)
{
  return Query(name.text, handle, result, [&](HostState&, const auto& found) {
    *result = ToResult<Result>(std::invoke(member, found));
    return kDone;
  });
}

// The suites, one file each family.
AEGP_CommandSuite1 MakeCommandSuite();
AEGP_RegisterSuite6 MakeRegisterSuite();
AEGP_UtilitySuite11 MakeUtilitySuite();
AEGP_MemorySuite1 MakeMemorySuite();
AEGP_ItemSuite13 MakeItemSuite();
AEGP_CompSuite15 MakeCompSuite();
AEGP_FootageSuite11 MakeFootageSuite();
AEGP_LayerSuite13 MakeLayerSuite();
AEGP_CameraSuite2 MakeCameraSuite();
AEGP_LightSuite2 MakeLightSuite();
AEGP_StreamSuite9 MakeStreamSuite();
AEGP_StreamSuite7 MakeOlderStreamSuite();
AEGP_KeyframeSuite4 MakeKeyframeSuite();

// The suite table; null for a name and version that this host doesn't have.
const void* FindSuite(std::string_view name, std::int32_t version);
SPBasicSuite* TheBasicSuite();

} // namespace host
