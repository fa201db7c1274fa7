// The suites that deal with the items of the project: compositions and footage.
#include "host/suites/host_state.h"

namespace host
{

namespace
{

// --- Items

A_Err GetActiveItem(AEGP_ItemH* item)
{
  return Operation("AEGP_GetActiveItem", [&](HostState& state) -> Outcome {
    if (!item)
      return kNoPlace;
    *item = ToHandle(state.active);
    return kDone;
  });
}

A_Err GetItemType(AEGP_ItemH item, AEGP_ItemType* type)
{
  return Query("AEGP_GetItemType", item, type, [&](HostState&, const Item& found) {
    *type = found.composition ? AEGP_ItemType_COMP : AEGP_ItemType_FOOTAGE;
    return kDone;
  });
}

A_Err GetItemName(AEGP_PluginID, AEGP_ItemH item, AEGP_MemHandle* name)
{
  return Query("AEGP_GetItemName", item, name, [&](HostState& state, const Item& found) {
    *name = state.NewUtf16(found.name);
    return kDone;
  });
}

A_Err GetItemDimensions(AEGP_ItemH item, A_long* width, A_long* height)
{
  return Query("AEGP_GetItemDimensions", item, height ? width : nullptr, [&](HostState&, const Item& found) {
    *width = found.width;
    *height = found.height;
    return kDone;
  });
}

A_Err GetItemPixelAspectRatio(AEGP_ItemH item, A_Ratio* ratio)
{
  return Query("AEGP_GetItemPixelAspectRatio", item, ratio, [&](HostState&, const Item& found) {
    *ratio = found.composition ? found.composition->pixelAspect : A_Ratio{1, 1};
    return kDone;
  });
}

// --- Footage

A_Err GetMainFootageFromItem(AEGP_ItemH item, AEGP_FootageH* footage)
{
  return Query("AEGP_GetMainFootageFromItem", item, footage, [&](HostState&, const Item& found) {
    // Footage is known by its item; a composition has none.
    *footage = found.composition ? nullptr : reinterpret_cast<AEGP_FootageH>(item);
    return kDone;
  });
}

A_Err GetFootageNumFiles(AEGP_FootageH footage, A_long* mainFiles, A_long* filesPerFrame)
{
  return Operation("AEGP_GetFootageNumFiles", [&](HostState&) -> Outcome {
    if (!footage)
      return NotGiven(footage);
    if (mainFiles)
      *mainFiles = FromHandle(footage)->files;
    if (filesPerFrame)
      *filesPerFrame = 1;
    return kDone;
  });
}

A_Err GetFootagePath(AEGP_FootageH footage, A_long frame, A_long file, AEGP_MemHandle* path)
{
  return Query("AEGP_GetFootagePath", footage, path, [&](HostState& state, const Item& found) -> Outcome {
    if (frame < 0 || frame >= found.files || file != 0)
      return "no such file of the footage";
    *path = state.NewUtf16(found.path);
    return kDone;
  });
}

A_Err GetFootageSignature(AEGP_FootageH footage, AEGP_FootageSignature* signature)
{
  return Query("AEGP_GetFootageSignature", footage, signature, [&](HostState&, const Item& found) {
    *signature = found.kind == ItemKind::kSolid ? AEGP_FootageSignature_SOLID : AEGP_FootageSignature_NONE;
    return kDone;
  });
}

A_Err GetSolidFootageColor(AEGP_ItemH item, A_Boolean, AEGP_ColorVal* color)
{
  return Query("AEGP_GetSolidFootageColor", item, color, [&](HostState&, const Item& found) -> Outcome {
    if (found.kind != ItemKind::kSolid)
      return "the item is no solid";
    *color = found.color;
    return kDone;
  });
}

} // namespace

AEGP_ItemSuite13 MakeItemSuite()
{
  AEGP_ItemSuite13 suite{};
  suite.AEGP_GetActiveItem = GetActiveItem;
  suite.AEGP_GetItemType = GetItemType;
  suite.AEGP_GetItemName = GetItemName;
  suite.AEGP_GetItemDimensions = GetItemDimensions;
  suite.AEGP_GetItemPixelAspectRatio = GetItemPixelAspectRatio;
  return suite;
}

AEGP_CompSuite15 MakeCompSuite()
{
  AEGP_CompSuite15 suite{};
  suite.AEGP_GetCompFromItem = Tell<"AEGP_GetCompFromItem", &Item::composition>;
  suite.AEGP_GetCompFramerate = Tell<"AEGP_GetCompFramerate", &Composition::frameRate>;
  suite.AEGP_GetCompWorkAreaStart = Tell<"AEGP_GetCompWorkAreaStart", &Composition::workAreaStart>;
  suite.AEGP_GetCompWorkAreaDuration = Tell<"AEGP_GetCompWorkAreaDuration", &Composition::workAreaDuration>;
  suite.AEGP_GetCompFrameDuration = Tell<"AEGP_GetCompFrameDuration", &Composition::frameDuration>;
  return suite;
}

AEGP_FootageSuite11 MakeFootageSuite()
{
  AEGP_FootageSuite11 suite{};
  suite.AEGP_GetMainFootageFromItem = GetMainFootageFromItem;
  suite.AEGP_GetFootageNumFiles = GetFootageNumFiles;
  suite.AEGP_GetFootagePath = GetFootagePath;
  suite.AEGP_GetFootageSignature = GetFootageSignature;
  suite.AEGP_GetSolidFootageColor = GetSolidFootageColor;
  return suite;
}

} // namespace host
