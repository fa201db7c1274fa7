// Who writes: what the program last said.
#include "torvane/client.h"
#include "torvane/hooks.h"
#include "torvane/text/ge_string.h"

namespace _torvane_
{

namespace
{

Long WriterId = 0;
const char* WriterName = "torvane";

} // namespace

void SetWriterInfo(Long id, const char* utf8Name)
{
  WriterId = id;
  WriterName = utf8Name;
}

void GetWriterInfo(Long& id, String& name)
{
  id = WriterId;
  name = String::FromUtf8(WriterName);
}

} // namespace _torvane_
