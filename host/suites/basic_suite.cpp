// Which suites there are, and how they are acquired.
#include "host/suites/host_state.h"

#include <algorithm>

namespace host
{

namespace
{

struct SuiteEntry
{
  std::string_view name;
  std::int32_t version;
  const void* table;
};

// A table made once, for the life of the process.
template <auto Make>
const void* Table()
{
  static const auto table = Make();
  return &table;
}

const std::vector<SuiteEntry>& Suites()
{
  static const std::vector<SuiteEntry> suites = {
      {kAEGPCommandSuite, kAEGPCommandSuiteVersion1, Table<MakeCommandSuite>()},
      {kAEGPRegisterSuite, kAEGPRegisterSuiteVersion6, Table<MakeRegisterSuite>()},
      {kAEGPUtilitySuite, kAEGPUtilitySuiteVersion11, Table<MakeUtilitySuite>()},
      {kAEGPMemorySuite, kAEGPMemorySuiteVersion1, Table<MakeMemorySuite>()},
      {kAEGPItemSuite, kAEGPItemSuiteVersion13, Table<MakeItemSuite>()},
      {kAEGPCompSuite, kAEGPCompSuiteVersion15, Table<MakeCompSuite>()},
      {kAEGPLayerSuite, kAEGPLayerSuiteVersion13, Table<MakeLayerSuite>()},
      {kAEGPStreamSuite, kAEGPStreamSuiteVersion9, Table<MakeStreamSuite>()},
      {kAEGPStreamSuite, kAEGPStreamSuiteVersion7, Table<MakeOlderStreamSuite>()},
      {kAEGPKeyframeSuite, kAEGPKeyframeSuiteVersion4, Table<MakeKeyframeSuite>()},
      {kAEGPFootageSuite, kAEGPFootageSuiteVersion11, Table<MakeFootageSuite>()},
      {kAEGPCameraSuite, kAEGPCameraSuiteVersion2, Table<MakeCameraSuite>()},
      {kAEGPLightSuite, kAEGPLightSuiteVersion2, Table<MakeLightSuite>()},
  };
  return suites;
}

bool IsRefused(const HostState& state, std::string_view name, std::int32_t version)
{
  return std::any_of(state.refused.begin(), state.refused.end(), [&](const auto& refused) {
    return refused.first == name && (refused.second == 0 || refused.second == version);
  });
}

SPErr AcquireSuite(const char* name, std::int32_t version, const void** suite)
{
  HostState* state = HostState::Current();
  if (!state || !name || !suite)
    return kErrorParameter;
  *suite = nullptr;
  if (IsRefused(*state, name, version))
    return state->Fail("AcquireSuite", "told to refuse this suite", kErrorInjected);
  const void* table = FindSuite(name, version);
  if (!table)
    return state->Fail("AcquireSuite", "there is no suite of this name and version", kErrorParameter);
  ++state->acquired[{name, version}];
  ++state->balance.suites;
  *suite = table;
  return 0;
}

SPErr ReleaseSuite(const char* name, std::int32_t version)
{
  HostState* state = HostState::Current();
  if (!state || !name)
    return kErrorParameter;
  const auto found = state->acquired.find({name, version});
  if (found == state->acquired.end() || found->second == 0)
    return state->Fail("ReleaseSuite", "the suite is not acquired", kErrorParameter);
  --found->second;
  --state->balance.suites;
  return 0;
}

} // namespace

const void* FindSuite(std::string_view name, std::int32_t version)
{
  const std::vector<SuiteEntry>& suites = Suites();
  const auto found = std::find_if(suites.begin(), suites.end(), [&](const SuiteEntry& suite) {
    return suite.name == name && suite.version == version;
  });
  return found == suites.end() ? nullptr : found->table;
}

SPBasicSuite* TheBasicSuite()
{
  static SPBasicSuite suite = [] {
    SPBasicSuite table{};
    table.AcquireSuite = AcquireSuite;
    table.ReleaseSuite = ReleaseSuite;
    return table;
  }();
  return &suite;
}

} // namespace host
