// A host without After Effects: answers every operation that the exporter calls, from a composition in memory, and
// plays the part of the user.
#pragma once

#include "exporter/host_api/aegp_entry.h"
#include "host/model/composition.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace host
{

struct HostState;

// What the host returns from an operation that it cannot do.
inline constexpr A_Err kErrorInjected = 1;  // told to fail by FailCall or RefuseSuite
inline constexpr A_Err kErrorParameter = 3; // an argument that makes no sense, a stream that isn't legal
inline constexpr A_Err kErrorMemory = 4;

// An entry that a plug-in has put into a menu.
struct MenuEntry
{
  AEGP_Command command = 0;
  std::string name;
  AEGP_MenuID menu = 0;
  A_long afterItem = 0;
};

// What the host has given out and not got back.
struct HostBalance
{
  std::int64_t memoryHandles = 0;
  std::int64_t memoryLocks = 0;
  std::int64_t streams = 0;
  std::int64_t streamValues = 0;
  std::int64_t suites = 0;

  friend bool operator==(const HostBalance&, const HostBalance&) = default;
};

struct CommandResult
{
  A_Err error = 0;
  bool isHandled = false;
};

// Suite tables are tables of plain functions, so they find their host through a pointer: the host that was made last on
// this thread and still lives. Basic() is the same table for every host; a plug-in that has kept it can be played by
// one host after another. A host belongs to the thread that made it.
class StandaloneHost
{
 public:
  explicit StandaloneHost(Project project);
  ~StandaloneHost();
  StandaloneHost(const StandaloneHost&) = delete;
  StandaloneHost& operator=(const StandaloneHost&) = delete;

  const Project& GetProject() const;
  SPBasicSuite* Basic() const;

  // --- What the user does

  // Makes a composition the active item, by its name or its asset's id. False if there is none.
  bool ActivateComposition(std::string_view nameOrId);
  // Makes any item of the project active; null for none. At first it is the root composition.
  void Activate(const Item* item);
  // What the save dialog answers, as UTF-8; empty (as at first) when the user cancels it.
  void SetOutputPath(std::string path);
  // Whether the file that exists may be replaced; without a function the answer is no.
  void OnAskOverwrite(std::function<bool()> ask);
  // Takes the messages that the plug-in shows.
  void OnReport(std::function<void(const std::string&)> report);
  // Hears, while a command runs, which share of the active composition was read: from 0 to 1, never falling. It is
  // called for every value that is read, so it has to be quick.
  void OnProgress(std::function<void(double share)> progress);

  // --- What the application does

  // Calls the plug-in's entry point. An int that a plug-in throws out of this or out of a hook is taken as its error.
  // All three throw std::bad_alloc when the host itself ran out of memory meanwhile, whatever the plug-in made of it.
  A_Err Start(AEGP_EntryPoint entry);
  // In place of Start, for a plug-in that was started by another host, of any thread: an application starts a plug-in
  // once. The plug-in finds here what it registered there.
  void TakePlugin(const StandaloneHost& started);
  // Calls the update-menu hooks, as before the menus are shown; the first error ends the round.
  A_Err CallMenuHook();
  // Calls the command hooks that are registered for the command or for all, whether it is enabled or not.
  CommandResult CallCommandHook(AEGP_Command command, bool alreadyHandled = false);

  const std::vector<MenuEntry>& MenuEntries() const;
  // The command of the menu entry with the name; 0 if there is none.
  AEGP_Command FindCommand(std::string_view menuEntry) const;
  bool IsCommandEnabled(AEGP_Command command) const;
  // The name that the plug-in has registered itself with, and the id it got; empty and 0 before.
  const std::string& PluginName() const;
  AEGP_PluginID RegisteredPlugin() const;

  // --- What tests look at and turn

  HostBalance Balance() const;
  // Calls of suite operations so far; those of the basic suite don't count.
  std::uint64_t CallCount() const;
  // The n-th call of a suite operation, counted from 1 since the host was made, returns `error` and does nothing; 0 for
  // none. An operation that gives something back (unlock, free, dispose) does so all the same, so that the balance
  // shows only what the caller has forgotten.
  void FailCall(std::uint64_t n, A_Err error = kErrorInjected);
  // AcquireSuite refuses this suite; version 0 stands for every version.
  void RefuseSuite(std::string name, std::int32_t version = 0);
  // GetUniqueCommand succeeds but gives the command 0.
  void WithholdCommand();
  // Operation and reason of the last call that failed; empty if none has.
  const std::string& LastError() const;
  const std::vector<std::string>& Reports() const;

 private:
  std::unique_ptr<HostState> state_;
};

} // namespace host
