// The two hooks that EntryPointFunc registers with the host. No exception but kSuiteRefused leaves them.
#pragma once

#include "exporter/host_api/aegp_suites.h"

namespace exporter
{

// Enables the menu entry while the active item is a composition. The host's error of the enabling or disabling call.
A_Err UpdateMenuHook(AEGP_GlobalRefcon refcon, AEGP_UpdateMenuRefcon menuRefcon, AEGP_WindowType window);

// Runs the export for the plug-in's own command and leaves every other command, and one that is already handled,
// alone. A scene file that could not be begun gives 2; otherwise the host's first error, 0 for none.
A_Err CommandHook(AEGP_GlobalRefcon refcon, AEGP_CommandRefcon commandRefcon, AEGP_Command command,
                  AEGP_HookPriority priority, A_Boolean alreadyHandled, A_Boolean* handled);

} // namespace exporter
