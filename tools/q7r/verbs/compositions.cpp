// q7r compositions: what a project or composition file holds.
#include <memory>

#include "output/json_output.h"
#include "output/standard_output.h"
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

void TellCompositions(ValueSink& json, const std::vector<host::CompositionSummary>& compositions)
{
  json.Key("compositions");
  json.BeginArray();
  for (const host::CompositionSummary& c : compositions) {
    json.BeginObject();
    json.Member("name", c.name);
    json.Member("id", c.id);
    json.Member("width", c.width);
    json.Member("height", c.height);
    json.Member("frameRate", c.frameRate);
    json.Member("frames", c.frames);
    json.Member("seconds", c.seconds);
    json.Member("layers", c.layers);
    json.Member("exported", c.exported);
    json.Member("active", c.isActive);
    json.EndObject();
  }
  json.EndArray();
}

int Compositions(const Options& options)
{
  const std::vector<host::CompositionSummary> compositions = OpenProject(options.file)->Compositions();
  if (options.json)
    PrintJson([&](ValueSink& json) { TellCompositions(json, compositions); });
  else
    Print(CompositionTable(compositions));
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
