// The plug-in's own texts.
#pragma once

#include <cstddef>
#include <cstdint>

namespace exporter
{

// Rows of the table, by index.
enum class Message : std::size_t
{
  kNone = 0,
  kMenuEntry = 1,      // also the name that the plug-in registers under
  kExportProblems = 2, // the one failure message that is ever shown
  kStreamProblems = 3, // kept for the table's sake; nothing shows it
  kEnd = 4,
};

struct MessageRow
{
  std::int32_t id;
  char text[256]; // zero-terminated
};

inline constexpr MessageRow kMessageTable[] = {
    {0, ""},
    {1, "KORVEX Exporter..."},
    {2, "Q7RExporter: Problems encountered during file export."},
    {3, "Q7RExporter: Problems encountered with streams."},
    {4, ""},
};

constexpr const char* GetMessage(Message message) { return kMessageTable[static_cast<std::size_t>(message)].text; }

} // namespace exporter
