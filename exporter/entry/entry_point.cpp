#include "exporter/host_api/aegp_entry.h"

#include "exporter/entry/hooks.h"
#include "exporter/entry/host_calls.h"
#include "exporter/entry/message_table.h"
#include "exporter/entry/plugin_state.h"

namespace exporter
{

SPBasicSuite* BasicSuite = nullptr;
AEGP_PluginID PluginId = 0;
AEGP_Command ExportCommand = 0;

namespace
{

void Register(HostCalls& host)
{
  const char* name = GetMessage(Message::kMenuEntry);
  host(&AEGP_CommandSuite1::AEGP_InsertMenuCommand, ExportCommand, name, AEGP_Menu_EXPORT, AEGP_MENU_INSERT_SORTED);
  host(&AEGP_UtilitySuite11::AEGP_RegisterWithAEGP, nullptr, name, &PluginId);
  host(&AEGP_RegisterSuite6::AEGP_RegisterCommandHook, PluginId, AEGP_HP_AfterAE, AEGP_Command_ALL, CommandHook,
       nullptr);
  host(&AEGP_RegisterSuite6::AEGP_RegisterUpdateMenuHook, PluginId, UpdateMenuHook, nullptr);
}

} // namespace

} // namespace exporter

extern "C" A_Err EntryPointFunc(SPBasicSuite* basic, A_long, A_long, AEGP_PluginID plugin, AEGP_GlobalRefcon*)
{
  using namespace exporter;
  BasicSuite = basic;
  PluginId = plugin;
  ExportCommand = 0;
  ExportSuites suites(BasicSuite);
  HostCalls host(suites);
  host(&AEGP_CommandSuite1::AEGP_GetUniqueCommand, &ExportCommand);
  // A host without a command to spare has no place for the plug-in: it stays loaded and does nothing.
  if (host.Good() && ExportCommand == 0)
    return 0;
  Register(host);
  if (!host.Good())
    suites.Get<AEGP_UtilitySuite11>().AEGP_ReportInfo(PluginId, GetMessage(Message::kExportProblems));
  return host.GetError();
}
