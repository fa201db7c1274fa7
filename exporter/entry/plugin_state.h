// What the plug-in keeps between the host's calls: three values that EntryPointFunc sets once, before any hook can run.
#pragma once

#include "exporter/host_api/aegp_suites.h"

namespace exporter
{

// Lives as long as the process; null until the host has called EntryPointFunc.
extern SPBasicSuite* BasicSuite;

// First the number that the host passes in, then the one of the registration.
extern AEGP_PluginID PluginId;

// The command behind the menu entry; 0 when the host gave none.
extern AEGP_Command ExportCommand;

} // namespace exporter
