#include "usage.h"

#include <algorithm>
#include <sstream>

#include "report.h"

namespace q7r
{

namespace
{

// Of restricted edits: a pair of letters that are swapped counts as one.
std::size_t Distance(const std::string& a, const std::string& b)
{
  const std::size_t width = b.size() + 1;
  std::vector<std::size_t> cells((a.size() + 1) * width);
  const auto cell = [&](std::size_t i, std::size_t j) -> std::size_t& { return cells[i * width + j]; };
  for (std::size_t i = 0; i <= a.size(); ++i) {
    for (std::size_t j = 0; j <= b.size(); ++j) {
      if (i == 0 || j == 0) {
        cell(i, j) = i + j;
        continue;
      }
      const bool isSame = a[i - 1] == b[j - 1];
      cell(i, j) = std::min({cell(i - 1, j) + 1, cell(i, j - 1) + 1, cell(i - 1, j - 1) + (isSame ? 0 : 1)});
      if (i > 1 && j > 1 && a[i - 1] == b[j - 2] && a[i - 2] == b[j - 1])
        cell(i, j) = std::min(cell(i, j), cell(i - 2, j - 2) + 1);
    }
  }
  return cells.back();
}

std::string Guess(const std::string& word, const std::vector<std::string>& candidates)
{
  const std::string nearest = Nearest(word, candidates);
  return nearest.empty() ? "" : "; did you mean " + nearest + "?";
}

std::vector<std::string> VerbsOf(const CLI::App& program)
{
  std::vector<std::string> names = {"help", "--version"}; // what people try as verbs
  for (const CLI::App* verb : program.get_subcommands([](const CLI::App*) { return true; }))
    names.push_back(verb->get_name());
  return names;
}

std::vector<std::string> OptionsOf(const CLI::App& verb)
{
  std::vector<std::string> names;
  for (const CLI::Option* option : verb.get_options()) {
    for (const std::string& name : option->get_lnames())
      names.push_back("--" + name);
  }
  return names;
}

bool IsError(const CLI::ParseError& error, CLI::ExitCodes code)
{
  return error.get_exit_code() == static_cast<int>(code);
}

bool IsOption(const std::string& argument) { return argument.size() > 1 && argument[0] == '-'; }

std::string UnknownOption(const CLI::App& verb, const std::string& argument)
{
  const std::string name = argument.substr(0, argument.find('='));
  return "there is no option " + name + Guess(name, OptionsOf(verb));
}

// An argument that the verb has no place for.
std::string ExtraText(const CLI::App& verb)
{
  const std::vector<std::string> extra = verb.remaining();
  const auto option = std::find_if(extra.begin(), extra.end(), IsOption);
  if (option != extra.end())
    return UnknownOption(verb, *option);
  return extra.empty() ? "too many arguments" : "\"" + extra.front() + "\" is one argument too many";
}

constexpr const char* kVerbsAreIn = " (q7r --help lists the verbs)";

std::string NoVerbText(const CLI::App& program, const std::vector<std::string>& arguments)
{
  if (arguments.empty())
    return "which verb?";
  if (IsOption(arguments.front()))
    return UnknownOption(program, arguments.front());
  return "there is no verb \"" + arguments.front() + "\"" + Guess(arguments.front(), VerbsOf(program));
}

class Format final : public CLI::Formatter
{
 public:
  std::string make_subcommand(const CLI::App* verb) const override
  {
    std::string clause = verb->get_description();
    for (const char* end : {".\n", ". ", "\n\n", ": ", ":\n", "; ", ";\n"})
      clause.resize(std::min(clause.find(end), clause.size()));
    std::replace(clause.begin(), clause.end(), '\n', ' ');
    std::ostringstream line;
    CLI::detail::format_help(line, verb->get_name(), clause, 16);
    return line.str();
  }
};

} // namespace

std::shared_ptr<CLI::Formatter> HelpFormat() { return std::make_shared<Format>(); }

std::string UsageText(const CLI::App& program, const CLI::ParseError& error, const std::vector<std::string>& arguments)
{
  const std::vector<CLI::App*> verbs = program.get_subcommands();
  if (verbs.empty())
    return NoVerbText(program, arguments) + kVerbsAreIn;
  const CLI::App& verb = *verbs.front();
  const std::string words = error.what();
  const std::string option = words.substr(0, words.find(':'));
  const std::string text = IsError(error, CLI::ExitCodes::ExtrasError)        ? ExtraText(verb)
                           : IsError(error, CLI::ExitCodes::ArgumentMismatch) ? option + " needs a value"
                                                                              : words;
  return verb.get_name() + ": " + text + " (q7r " + verb.get_name() + " --help tells more)";
}

void RequireVerb(const CLI::App& program, const std::vector<std::string>& arguments)
{
  if (arguments.empty() || IsOption(arguments.front()))
    return;
  const auto isMeant = [&](const CLI::App* verb) { return verb->check_name(arguments.front()); };
  if (program.get_subcommands(isMeant).empty())
    throw Failure(NoVerbText(program, arguments) + kVerbsAreIn);
}

std::string Nearest(const std::string& word, const std::vector<std::string>& candidates)
{
  std::string nearest;
  std::size_t least = std::max<std::size_t>(2, word.size() / 3) + 1;
  for (const std::string& candidate : candidates) {
    const bool isStart = word.size() > 3 && candidate.starts_with(word);
    const std::size_t distance = isStart ? 0 : word.size() > 200 ? least : Distance(word, candidate);
    if (distance < least) {
      least = distance;
      nearest = candidate;
    }
  }
  return nearest;
}

void AddTalkOptions(CLI::App& verb, const char* verbose)
{
  CLI::Option* quiet = verb.add_flag("--quiet", TheTalk().quiet, "tell failures alone");
  if (verbose)
    verb.add_flag("--verbose", TheTalk().verbose, verbose)->excludes(quiet);
}

} // namespace q7r
