#include "exporter/entry/hooks.h"
#include "exporter/entry/host_calls.h"
#include "exporter/entry/plugin_state.h"

namespace exporter
{

namespace
{

bool CompositionIsActive(ExportSuites& suites)
{
  const AEGP_ItemSuite13& items = suites.Get<AEGP_ItemSuite13>();
  AEGP_ItemH item = nullptr;
  AEGP_ItemType type = 0;
  AEGP_CompH composition = nullptr;
  A_Err itemError = items.AEGP_GetActiveItem(&item);
  if (!item)
    return false;
  A_Err typeError = items.AEGP_GetItemType(item, &type);
  if (type != AEGP_ItemType_COMP)
    return false;
  // An error alone doesn't count here, and neither does a missing composition: only the two together do.
  A_Err compositionError = suites.Get<AEGP_CompSuite15>().AEGP_GetCompFromItem(item, &composition);
  if (compositionError != 0 && !composition)
    return false;
  return itemError == 0 && typeError == 0;
}

} // namespace

A_Err UpdateMenuHook(AEGP_GlobalRefcon, AEGP_UpdateMenuRefcon, AEGP_WindowType)
{
  ExportSuites suites(BasicSuite);
  const AEGP_CommandSuite1& commands = suites.Get<AEGP_CommandSuite1>();
  return ExportCommand != 0 && CompositionIsActive(suites) ? commands.AEGP_EnableCommand(ExportCommand)
                                                           : commands.AEGP_DisableCommand(ExportCommand);
}

} // namespace exporter
