// q7r diff: what differs between two scenes.
#include <memory>
#include <string_view>

#include "compare/scene_diff.h"
#include "output/json_output.h"
#include "scene_file.h"
#include "verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr const char* kHelp =
    R"(Tells what differs between two scenes in what they mean: objects, tags, materials, shaders,
layers, render settings, views and the document, with their parameters, tracks, keys,
geometry, and what is kept of other programs. A line for each: what was "changed" from A
to B, by the path of the node and the key; what was "added" or "removed" with all below it;
objects that "moved" to another parent; lists whose "order" is another.

Things are the same if their markers are, else by type and name. Dates, who wrote the
file, markers and the states of an editor are left out unless --all is given. Exit status:
0 the same, 1 different, 2 a file can't be read.

Example: q7r diff --tolerance 1e-6 before.q7r after.q7r)";

struct Options
{
  std::string a;
  std::string b;
  DiffOptions diff;
  bool json = false;
  bool quiet = false;
};

std::string RowText(const RowsValue& rows, long long index)
{
  if (index >= rows.Count())
    return "none";
  double row[NumberRows::kMostInRow];
  rows.Get(index, row);
  NumberRows form;
  form.entries = row;
  form.count = rows.Form().perRow;
  form.get = [](const void* entries, long long i, double* number) { *number = static_cast<const double*>(entries)[i]; };
  return ValueText(RowsValue(form));
}

// What of two long arrays differs: "3 of 8 entries, from entry 5 on: (1, 2, 3) -> (1, 2, 4)"; null for other values.
std::string RowsText(const Difference& difference, const Comparison& comparison)
{
  constexpr long long kShort = 12;
  const auto* a = difference.a ? std::get_if<RowsValue>(difference.a) : nullptr;
  const auto* b = difference.b ? std::get_if<RowsValue>(difference.b) : nullptr;
  if (!a || !b || a->Form().perRow != b->Form().perRow)
    return {};
  if (a->Count() == b->Count() && a->Count() <= kShort && a->Form().perRow == 1)
    return {};
  const RowsDifference rows = CompareRows(*a, *b, comparison);
  return std::to_string(rows.count) + " of " + std::to_string(std::max(a->Count(), b->Count())) +
         " entries, from entry " + std::to_string(rows.first) + " on: " + RowText(*a, rows.first) + " -> " +
         RowText(*b, rows.first);
}

std::string ChangeText(const Difference& difference, const Comparison& comparison)
{
  std::string text = difference.key;
  if (difference.name)
    text += std::string(" (") + difference.name + ")";
  const std::string rows = RowsText(difference, comparison);
  const auto valueText = [](const Value* value) { return value ? ValueText(*value) : "absent"; };
  return text + ": " + (rows.empty() ? valueText(difference.a) + " -> " + valueText(difference.b) : rows);
}

void PrintDifference(const Difference& difference, const Comparison& comparison)
{
  std::string line = difference.kind;
  line.resize(9, ' ');
  line += difference.path;
  if (!difference.to.empty())
    line += " -> " + difference.to;
  if (!difference.key.empty())
    line += "  " + ChangeText(difference, comparison);
  PrintLine(line);
}

// A value, or of a long array how many entries it has.
void TellSide(ValueSink& json, const char* name, const Value* value)
{
  if (!value)
    return;
  const auto* rows = std::get_if<RowsValue>(value);
  json.Key(name);
  if (rows && rows->Form().lasts) {
    json.BeginObject();
    json.Member("entries", rows->Count());
    json.EndObject();
  } else {
    TellValue(json, *value);
  }
}

void TellDifference(ValueSink& json, const Difference& difference, const Comparison& comparison)
{
  json.BeginObject(ValueSink::Layout::kLine);
  json.Member("kind", difference.kind);
  json.Member("path", difference.path);
  if (!difference.to.empty())
    json.Member("to", difference.to);
  if (!difference.key.empty())
    json.Member("key", difference.key);
  if (difference.name)
    json.Member("name", difference.name);
  TellSide(json, "a", difference.a);
  TellSide(json, "b", difference.b);
  const std::string rows = RowsText(difference, comparison);
  if (!rows.empty())
    json.Member("summary", rows);
  json.EndObject();
}

int DiffSilently(BaseDocument& a, BaseDocument& b, const DiffOptions& options)
{
  return SceneDiff(a, b, options, [](const Difference&, const Comparison&) {}).Run() == 0 ? kDone : kProblems;
}

int DiffAsText(BaseDocument& a, BaseDocument& b, const DiffOptions& options)
{
  const long long count = SceneDiff(a, b, options, PrintDifference).Run();
  if (count == 0)
    PrintLine("the scenes are the same");
  return count == 0 ? kDone : kProblems;
}

int DiffAsJson(BaseDocument& a, BaseDocument& b, const DiffOptions& options)
{
  long long count = 0;
  PrintJson([&](ValueSink& json) {
    json.Key("differences");
    json.BeginArray();
    count = SceneDiff(a, b, options, [&json](const Difference& one, const Comparison& comparison) {
              TellDifference(json, one, comparison);
            }).Run();
    json.EndArray();
    json.Member("count", count);
    json.Member("same", count == 0);
  });
  return count == 0 ? kDone : kProblems;
}

int Diff(const Options& options)
{
  const DocumentPtr a = LoadScene(options.a);
  const DocumentPtr b = LoadScene(options.b);
  if (options.quiet)
    return DiffSilently(*a, *b, options.diff);
  return options.json ? DiffAsJson(*a, *b, options.diff) : DiffAsText(*a, *b, options.diff);
}

} // namespace

void AddDiff(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("diff", kHelp);
  verb->add_option("A", options->a, "a scene file")->required();
  verb->add_option("B", options->b, "another one")->required();
  verb->add_option("--tolerance", options->diff.tolerance, "numbers no further apart than this are the same")
      ->option_text("NUMBER [0]")
      ->check(CLI::NonNegativeNumber);
  verb->add_flag("--all", options->diff.all, "also dates, who wrote the file, markers and states");
  CLI::Option* json = verb->add_flag("--json", options->json, "as one JSON object (docs/json.md)");
  verb->add_flag("--quiet", options->quiet, "print nothing: the exit status tells")->excludes(json);
  verb->callback([options, &status] { status = Diff(*options); });
}

} // namespace q7r
