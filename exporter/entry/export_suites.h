// The holder of the host's suites for the length of one host call.
#pragma once

#include <array>
#include <cstddef>

#include "exporter/host_api/aegp_suites.h"

namespace exporter
{

// What is thrown when the host refuses a suite. Nothing in the plug-in catches it: it leaves the hook and reaches the
// host, after every frame between has given back what it holds.
inline constexpr int kSuiteRefused = 516;

// How the host knows a suite, and its place in the holder.
struct SuiteEntry
{
  std::size_t slot;
  const char* name;
  std::int32_t version;
};

template <class Suite>
inline constexpr SuiteEntry kSuiteEntry = {};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_CommandSuite1>{0, kAEGPCommandSuite, kAEGPCommandSuiteVersion1};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_RegisterSuite6>{1, kAEGPRegisterSuite, kAEGPRegisterSuiteVersion6};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_UtilitySuite11>{2, kAEGPUtilitySuite, kAEGPUtilitySuiteVersion11};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_MemorySuite1>{3, kAEGPMemorySuite, kAEGPMemorySuiteVersion1};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_ItemSuite13>{4, kAEGPItemSuite, kAEGPItemSuiteVersion13};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_CompSuite15>{5, kAEGPCompSuite, kAEGPCompSuiteVersion15};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_LayerSuite13>{6, kAEGPLayerSuite, kAEGPLayerSuiteVersion13};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_StreamSuite9>{7, kAEGPStreamSuite, kAEGPStreamSuiteVersion9};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_StreamSuite7>{8, kAEGPStreamSuite, kAEGPStreamSuiteVersion7};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_KeyframeSuite4>{9, kAEGPKeyframeSuite, kAEGPKeyframeSuiteVersion4};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_FootageSuite11>{10, kAEGPFootageSuite, kAEGPFootageSuiteVersion11};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_CameraSuite2>{11, kAEGPCameraSuite, kAEGPCameraSuiteVersion2};
template <>
inline constexpr SuiteEntry kSuiteEntry<AEGP_LightSuite2>{12, kAEGPLightSuite, kAEGPLightSuiteVersion2};

inline constexpr std::size_t kSuiteCount = 13;

// Acquires each suite on its first use and releases all that it acquired when it goes.
class ExportSuites
{
 public:
  // `basic` may be null: the host then refuses every suite.
  explicit ExportSuites(SPBasicSuite* basic) : basic_(basic) {}
  ~ExportSuites();
  ExportSuites(const ExportSuites&) = delete;
  ExportSuites& operator=(const ExportSuites&) = delete;

  // Throws kSuiteRefused when the host fails to give the suite or gives a null one. A suite that was given once is
  // given again without asking the host, so a second Get never throws.
  template <class Suite>
  const Suite& Get()
  {
    static_assert(kSuiteEntry<Suite>.name != nullptr, "not a suite of the host");
    constexpr const SuiteEntry& kEntry = kSuiteEntry<Suite>;
    if (!cache_[kEntry.slot].suite)
      Acquire(kEntry);
    return *static_cast<const Suite*>(cache_[kEntry.slot].suite);
  }

 private:
  struct CachedSuite
  {
    const void* suite = nullptr;
    const SuiteEntry* entry = nullptr;
  };

  void Acquire(const SuiteEntry& entry);

  SPBasicSuite* basic_;
  std::array<CachedSuite, kSuiteCount> cache_;
};

} // namespace exporter
