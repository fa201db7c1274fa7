#include <cstring>

#include "exporter/entry/dialog_scripts.h"
#include "exporter/entry/hooks.h"
#include "exporter/entry/host_calls.h"
#include "exporter/entry/plugin_state.h"
#include "exporter/entry/scene_writer.h"
#include "torvane/bytes/base_file.h"
#include "torvane/memory/owned.h"
#include "torvane/text/filename.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr A_Err kNoSceneFile = 2;

// The text that a script gives, valid as long as the handle is locked; null when the host fails.
const char* RunScript(HostCalls& host, const char* script, HostText& result)
{
  host(&AEGP_UtilitySuite11::AEGP_ExecuteScript, PluginId, script, 0, result.Out(), nullptr);
  return result.Lock8();
}

// Writes to the path, under the scene suffix whatever suffix was typed.
bool WriteUnderSceneSuffix(const char* path, Filename& name)
{
  if (name.CheckSuffix(kSceneSuffix))
    return WriteSceneFile(path);
  const AllocationWatch watch;
  name.SetSuffix(kSceneSuffix);
  const Owned<char> suffixedPath(name.GetString().GetCStringCopy(STRINGENCODING_UTF8));
  return !watch.Failed() && WriteSceneFile(suffixedPath.get());
}

A_Err RunExport()
{
  ExportSuites suites(BasicSuite);
  HostCalls host(suites);
  HostText pathText(host);
  const char* path = RunScript(host, kOpenSaveDialogScript, pathText);
  const AllocationWatch watch;
  Filename name(path);
  if (watch.Failed()) {
    pathText.Abandon();
    return kNoSceneFile;
  }
  if (!name.Content()) {
    // A cancelled dialog's text stays locked: what the host has always seen.
    if (host.Good())
      pathText.Abandon();
    return host.GetError();
  }
  // Only the name as it was typed is asked about, not the one with the suffix.
  if (GeFileExists(name)) {
    HostText answerText(host);
    const char* answer = RunScript(host, kAskOverwriteScript, answerText);
    if (!host.Good() || (answer && std::strcmp(answer, "false") == 0)) {
      pathText.Release();
      return host.GetError();
    }
  }
  if (!WriteUnderSceneSuffix(path, name)) {
    pathText.Abandon();
    return kNoSceneFile;
  }
  pathText.Release();
  return host.GetError();
}

} // namespace

A_Err CommandHook(AEGP_GlobalRefcon, AEGP_CommandRefcon, AEGP_Command command, AEGP_HookPriority,
                  A_Boolean alreadyHandled, A_Boolean* handled)
{
  if (command != ExportCommand || alreadyHandled || !BasicSuite)
    return 0;
  A_Err error = RunExport();
  if (handled)
    *handled = 1;
  return error;
}

} // namespace exporter
