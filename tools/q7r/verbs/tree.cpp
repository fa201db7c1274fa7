// q7r tree: what a scene file holds, as a tree.
#include <memory>

#include "file_list.h"
#include "listing/scene_teller.h"
#include "listing/tree_text.h"
#include "output/json_output.h"
#include "output/standard_output.h"
#include "scene_file.h"
#include "verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr const char* kHelp = R"(Shows the objects of a scene file as a tree, with type, name, position, rotation
(degrees), scale, tags and tracks; then materials, layers, render settings and views.

Use it to see at a glance what an export made. With --json everything is there, down
to the last key, for programs.

Examples: q7r tree shot.q7r
          q7r tree shot.q7r --objects 'Cam*' --json --no-keys)";

struct Options : FileList
{
  std::string objects;
  int depth = -1;
  bool noKeys = false;
};

Scope ScopeOf(const Options& options)
{
  Scope scope;
  scope.objects = options.objects;
  scope.depth = options.depth;
  scope.keys = options.json && !options.noKeys;
  scope.data = options.json;
  scope.places = options.json;
  return scope;
}

int Tree(const std::string& file, const Options& options)
{
  DocumentPtr document = LoadScene(file);
  const auto tell = [&](ValueSink& sink) { SceneTeller(sink, ScopeOf(options)).TellScene(*document); };
  if (options.json) {
    PrintJson(tell);
  } else {
    TreeText text(PrintLine);
    text.BeginObject();
    tell(text);
    text.EndObject();
  }
  return kDone;
}

} // namespace

void AddTree(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("tree", kHelp);
  AddFileList(*verb, *options, "a scene file", "everything, as one JSON object (docs/json.md)");
  verb->add_option("--objects", options->objects,
                   "only the objects with such a name and all below them; * is any text, ? one character")
      ->option_text("PATTERN");
  verb->add_option("--depth", options->depth, "so many levels of children; 0: none")
      ->option_text("N")
      ->check(CLI::NonNegativeNumber);
  verb->add_flag("--no-keys", options->noKeys, "leave the keys of tracks out of the JSON");
  verb->callback([options, &status] {
    status = ShowEach(*options, [&](const std::string& file) { return Tree(file, *options); });
  });
}

} // namespace q7r
