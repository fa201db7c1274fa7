// Runs the built program as its users do.
#pragma once

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <functional>
#include <random>
#include <set>
#include <sstream>
#include <string>
#include <tuple>

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "support/temp_folder.h"

#ifndef _WIN32
#include <sys/wait.h>
#endif

using Bytes = std::vector<std::uint8_t>;
using Json = nlohmann::json;

struct RunResult
{
  int status;      // the exit status; negative when the program was killed
  std::string out; // standard output
  std::string err; // standard error
};

inline std::string Quoted(const std::string& argument) { return "\"" + argument + "\""; }

// What a program has printed; line ends are read as the system writes them.
inline std::string ReadOutput(const std::string& path)
{
  std::ifstream file(path);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

// `arguments` as they stand on a command line, with the paths Quoted. Standard input is empty. `environment` are
// settings of the shell for this program alone.
inline RunResult RunQ7r(const std::string& arguments, [[maybe_unused]] const std::string& environment = {})
{
  const TempFolder folder;
  const std::string out = folder / "out";
  const std::string err = folder / "err";
#ifdef _WIN32
  const std::string command =
      "\"" + Quoted(TEST_Q7R) + " " + arguments + " <NUL >" + Quoted(out) + " 2>" + Quoted(err) + "\"";
  const int status = std::system(command.c_str());
#else
  const std::string command =
      environment + " " + Quoted(TEST_Q7R) + " </dev/null >" + Quoted(out) + " 2>" + Quoted(err) + " " + arguments;
  const int raw = std::system(command.c_str());
  const int status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
#endif
  return {status, ReadOutput(out), ReadOutput(err)};
}
