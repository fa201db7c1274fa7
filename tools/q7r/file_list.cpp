#include "file_list.h"

#include <algorithm>

#include "output/standard_output.h"
#include "report.h"
#include "standard_input.h"
#include "torvane/memory/memory.h"

namespace q7r
{

namespace
{

int ShowOne(const std::string& file, const std::function<int(const std::string&)>& show)
{
  try {
    const _torvane_::AllocationWatch watch;
    const int status = show(file);
    if (watch.Failed())
      throw Failure(InputName(file), "not enough memory");
    return status;
  } catch (const std::exception&) {
    FlushStandardOutput(); // what came before the failure stands before its message
    return TellFailure();
  }
}

} // namespace

void AddFileList(CLI::App& verb, FileList& list, const std::string& what, const std::string& json)
{
  verb.add_option("FILE", list.files, what + "; - is standard input")->required();
  verb.add_flag("--json", list.json, json + "; of several files one behind the other");
}

int ShowEach(const FileList& list, const std::function<int(const std::string&)>& show)
{
  if (list.files.size() == 1)
    return show(list.files.front());
  int status = kDone;
  bool isFirst = true;
  for (const std::string& file : list.files) {
    if (!list.json && list.headed)
      PrintLine((isFirst ? "" : "\n") + InputName(file) + ":");
    isFirst = false;
    status = std::max(status, ShowOne(file, show));
    FlushStandardOutput();
  }
  return status;
}

} // namespace q7r
