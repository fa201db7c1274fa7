#include "standard_input.h"

#include <cerrno>
#include <cstdio>
#include <system_error>

#ifdef _WIN32
#include <fcntl.h>
#include <io.h>
#endif

#include "report.h"

namespace q7r
{

namespace
{

std::string ReadAll()
{
#ifdef _WIN32
  _setmode(_fileno(stdin), _O_BINARY);
#endif
  std::string bytes;
  std::string block(1 << 16, '\0');
  errno = 0;
  for (std::size_t count = block.size(); count == block.size();) {
    count = std::fread(block.data(), 1, block.size(), stdin);
    bytes.append(block, 0, count);
    if (bytes.size() > kMostInput)
      throw Failure(InputName("-"), "more than " + std::to_string(kMostInput >> 30) + " GB; give a file instead");
  }
  if (std::ferror(stdin))
    throw Failure(InputName("-"), errno ? std::generic_category().message(errno) : "can't be read");
  return bytes;
}

} // namespace

const std::string& StandardInput()
{
  static const std::string bytes = ReadAll();
  return bytes;
}

} // namespace q7r
