// The one function that the plug-in exports.
#pragma once

#include "exporter/host_api/aegp_suites.h"

#if defined(_WIN32)
#define AEGP_EXPORT __declspec(dllexport)
#else
#define AEGP_EXPORT __attribute__((visibility("default")))
#endif

// The host calls this once after loading the plug-in. `basic` stays valid as long as the process; `plugin` is the id
// that the plug-in has until it registers. 0 is success; after any other result the plug-in gets no further calls.
extern "C" AEGP_EXPORT A_Err EntryPointFunc(SPBasicSuite* basic, A_long majorVersion, A_long minorVersion,
                                            AEGP_PluginID plugin, AEGP_GlobalRefcon* globalRefcon);

// The same shape as a pointer, for a host that is handed the function.
extern "C" {
using AEGP_EntryPoint = A_Err (*)(SPBasicSuite* basic, A_long majorVersion, A_long minorVersion, AEGP_PluginID plugin,
                                  AEGP_GlobalRefcon* globalRefcon);
}
