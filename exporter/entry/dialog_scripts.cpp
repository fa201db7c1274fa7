#include "exporter/entry/dialog_scripts.h"

#include <array>
#include <cstddef>

namespace exporter
{

namespace
{

// The statements with a run of tabs between each two, and a terminator.
template <std::size_t tabs, std::size_t... sizes>
consteval auto OneLine(const char (&... statements)[sizes])
{
  constexpr std::size_t kCount = sizeof...(sizes);
  std::array<char, (sizes + ...) - kCount + (kCount - 1) * tabs + 1> line{};
  std::size_t at = 0;
  auto append = [&](const char* statement) {
    for (std::size_t i = 0; at != 0 && i < tabs; ++i)
      line[at++] = '\t';
    while (*statement)
      line[at++] = *statement++;
  };
  (append(statements), ...);
  return line;
}

constexpr auto kOpenSaveDialog = OneLine<19>("function openSaveDialog() {",                           //
                                             "var f = File.saveDialog(\"Q7R Exporter\", \"*.q7r\");", //
                                             "if (f == null) return \"\";",                           //
                                             "return f.fsName;",                                      //
                                             "}",                                                     //
                                             "openSaveDialog();");

constexpr auto kAskOverwrite =
    OneLine<3>("function askOverwrite() {",
               "var foo = confirm(\"This file already exists. Would you like to replace it?\", false, "
               "\"Confirm Save As\");",
               "return foo ? \"true\" : \"false\";", //
               "}",                                  //
               "askOverwrite();");

} // namespace

const char* const kOpenSaveDialogScript = kOpenSaveDialog.data();
const char* const kAskOverwriteScript = kAskOverwrite.data();

} // namespace exporter
