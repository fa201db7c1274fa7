// Tables of the tests that are text files, read by their lines.
#pragma once

#include <fstream>
#include <string>
#include <vector>

// The lines of a file below tests/, without empty ones and those that begin with #. An indented line continues the one
// before it.
inline std::vector<std::string> TextTable(const std::string& file)
{
  std::vector<std::string> lines;
  std::ifstream table(TEST_SOURCE_DIR "/tests/" + file);
  for (std::string line; std::getline(table, line);) {
    if (line.empty() || line[0] == '#')
      continue;
    if (line[0] == ' ')
      lines.back() += line.substr(1);
    else
      lines.push_back(line);
  }
  return lines;
}
