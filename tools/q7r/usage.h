// What is told of a command line that can't be taken.
#pragma once

#include <CLI/CLI.hpp>
#include <memory>
#include <string>
#include <vector>

namespace q7r
{

// One line: what is wrong, the verb or option that was probably meant, and where help is. `arguments` are those behind
// the program's name.
std::string UsageText(const CLI::App& program, const CLI::ParseError& error, const std::vector<std::string>& arguments);

// Throws Failure for a first argument that is neither an option nor a verb.
void RequireVerb(const CLI::App& program, const std::vector<std::string>& arguments);

// The candidate that differs least from a word: by letters that are missing, too many, other or swapped. Empty when all
// differ too much to have been meant.
std::string Nearest(const std::string& word, const std::vector<std::string>& candidates);

// How help is set out: the program's has for each verb the first clause of what the verb's own help says.
std::shared_ptr<CLI::Formatter> HelpFormat();

// Adds --quiet, and --verbose unless `verbose`, which tells what it does, is null.
void AddTalkOptions(CLI::App& verb, const char* verbose = nullptr);

} // namespace q7r
