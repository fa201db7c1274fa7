// Any bytes as a project: refused with a reason, or every composition of it read, written and exported.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "exporter/walk/composition.h"
#include "host/reader/projects/project_reader.h"
#include "host/standalone_host.h"
#include "host/writer/composition_writer.h"
#include "torvane/memory/assertion.h"

namespace fuzz
{

inline constexpr double kLongest = 1000;          // frames that an export samples
inline constexpr std::uint64_t kMostLayers = 200; // objects that it makes

inline void ReadComposition(host::ProjectFile& file, std::size_t index, const host::CompositionSummary& summary)
{
  try {
    host::Project project = file.Read(index);
    if (summary.frames > kLongest || summary.exported > kMostLayers)
      return;
    host::WriteComposition(project);
    host::StandaloneHost player(std::move(project));
    player.Start(EntryPointFunc);
    player.CallMenuHook();
  } catch (const host::CompositionError&) {
    return; // the others may be good
  }
}

inline int ReadProject(const std::uint8_t* data, std::size_t size, bool isXml)
{
  _torvane_::SetAssertionLog(nullptr);
  const char* const bytes = reinterpret_cast<const char*>(data);
  try {
    const auto file =
        host::projects::OpenProject("fuzz.aep", host::FileBytes(std::vector<char>(bytes, bytes + size)), isXml);
    const std::vector<host::CompositionSummary> compositions = file->Compositions();
    for (std::size_t i = 0; i < compositions.size(); ++i)
      ReadComposition(*file, i, compositions[i]);
  } catch (const host::CompositionError&) {
    return 0;
  }
  return 0;
}

} // namespace fuzz
