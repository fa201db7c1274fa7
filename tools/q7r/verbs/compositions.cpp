// q7r compositions: what a project or composition file holds.
#include <cstdio>
#include <memory>
#include <nlohmann/json.hpp>

#include "project_input.h"
#include "verbs/verbs.h"

namespace q7r
{

namespace
{

constexpr const char* kHelp = R"(Lists the compositions of a project or composition file.

Use it to find the name for --composition of export and extract. Shows size, frame
rate, duration, the layers, and how many objects an export would make of them, those
of nested compositions counted as often as they are used. A star marks the one that
is taken when none is named.

Example: q7r compositions shot.aep)";

struct Options
{
  std::string file;
  bool json = false;
};

void PrintJson(const std::vector<host::CompositionSummary>& compositions)
{
  nlohmann::ordered_json list = nlohmann::ordered_json::array();
  for (const host::CompositionSummary& c : compositions)
    list.push_back({{"name", c.name},
                    {"id", c.id},
                    {"width", c.width},
                    {"height", c.height},
                    {"frameRate", c.frameRate},
                    {"frames", c.frames},
                    {"seconds", c.seconds},
                    {"layers", c.layers},
                    {"exported", c.exported},
                    {"active", c.isActive}});
  const auto replace = nlohmann::ordered_json::error_handler_t::replace;
  std::printf("%s\n", nlohmann::ordered_json{{"compositions", list}}.dump(2, ' ', false, replace).c_str());
}

int Compositions(const Options& options)
{
  const std::vector<host::CompositionSummary> compositions = OpenProject(options.file)->Compositions();
  if (options.json)
    PrintJson(compositions);
  else
    std::fputs(CompositionTable(compositions).c_str(), stdout);
  return kDone;
}

} // namespace

void AddCompositions(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("compositions", kHelp);
  verb->add_option("PROJECT", options->file,
                   "an After Effects project (.aep, .aepx) or a composition file; - is standard input")
      ->required();
  verb->add_flag("--json", options->json, "print JSON");
  verb->callback([options, &status] { status = Compositions(*options); });
}

} // namespace q7r
