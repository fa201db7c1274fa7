#include <cstring>
#include <gtest/gtest.h>

#include "exporter/entry/hooks.h"
#include "exporter/entry/plugin_state.h"

namespace
{

// A host that answers with errors and handles in every combination, which a well-behaved one would not.
struct ItemAnswers
{
  const char* what;
  AEGP_Command command;
  A_Err itemError;
  bool hasItem;
  A_Err typeError;
  AEGP_ItemType type;
  A_Err compositionError;
  bool hasComposition, enables;
};

const ItemAnswers* answers;
int enableCalls;
int disableCalls;
char handleTarget;

A_Err GetActiveItem(AEGP_ItemH* item)
{
  *item = answers->hasItem ? reinterpret_cast<AEGP_ItemH>(&handleTarget) : nullptr;
  return answers->itemError;
}

A_Err GetItemType(AEGP_ItemH, AEGP_ItemType* type)
{
  *type = answers->type;
  return answers->typeError;
}

A_Err GetCompFromItem(AEGP_ItemH, AEGP_CompH* composition)
{
  *composition = answers->hasComposition ? reinterpret_cast<AEGP_CompH>(&handleTarget) : nullptr;
  return answers->compositionError;
}

A_Err Enable(AEGP_Command)
{
  ++enableCalls;
  return 71;
}

A_Err Disable(AEGP_Command)
{
  ++disableCalls;
  return 72;
}

SPErr AcquireSuite(const char* name, std::int32_t, const void** suite)
{
  static AEGP_ItemSuite13 items = {};
  static AEGP_CompSuite15 compositions = {};
  static AEGP_CommandSuite1 commands = {};
  items.AEGP_GetActiveItem = GetActiveItem;
  items.AEGP_GetItemType = GetItemType;
  compositions.AEGP_GetCompFromItem = GetCompFromItem;
  commands.AEGP_EnableCommand = Enable;
  commands.AEGP_DisableCommand = Disable;
  if (std::strcmp(name, kAEGPItemSuite) == 0)
    *suite = &items;
  else if (std::strcmp(name, kAEGPCompSuite) == 0)
    *suite = &compositions;
  else
    *suite = &commands;
  return 0;
}

SPErr ReleaseSuite(const char*, std::int32_t) { return 0; }

TEST(MenuHook, EnablesTheEntryForAnActiveCompositionAlone)
{
  const AEGP_ItemType composition = AEGP_ItemType_COMP;
  const ItemAnswers cases[] = {
      {"composition", 5, 0, true, 0, composition, 0, true, true},
      {"no command", 0, 0, true, 0, composition, 0, true, false},
      {"no item", 5, 0, false, 0, composition, 0, true, false},
      {"footage", 5, 0, true, 0, AEGP_ItemType_FOOTAGE, 0, true, false},
      {"error and no composition", 5, 0, true, 0, composition, 9, false, false},
      {"error with a composition", 5, 0, true, 0, composition, 9, true, true},
      {"no error and no composition", 5, 0, true, 0, composition, 0, false, true},
      {"error with an item", 5, 9, true, 0, composition, 0, true, false},
      {"error with the type", 5, 0, true, 9, composition, 0, true, false},
  };
  SPBasicSuite basic = {};
  basic.AcquireSuite = AcquireSuite;
  basic.ReleaseSuite = ReleaseSuite;
  exporter::BasicSuite = &basic;
  for (const ItemAnswers& c : cases) {
    answers = &c;
    exporter::ExportCommand = c.command;
    enableCalls = disableCalls = 0;
    EXPECT_EQ(exporter::UpdateMenuHook(nullptr, nullptr, 0), c.enables ? 71 : 72) << c.what;
    EXPECT_EQ(enableCalls, c.enables ? 1 : 0) << c.what;
    EXPECT_EQ(disableCalls, c.enables ? 0 : 1) << c.what;
  }
  exporter::BasicSuite = nullptr;
  exporter::ExportCommand = 0;
}

} // namespace
