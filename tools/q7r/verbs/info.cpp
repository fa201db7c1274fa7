// q7r info: what a scene file is and how much it holds.
#include <cstdio>
#include <map>
#include <memory>

#include "file_list.h"
#include "listing/scene_counts.h"
#include "listing/type_names.h"
#include "listing/values.h"
#include "output/json_output.h"
#include "output/standard_output.h"
#include "scene_file.h"
#include "verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr const char* kHelp = R"(Tells a scene file's version, writer and dates, its frame rate and range, and how many
objects, tags, materials, tracks and keys it holds.

Example: q7r info shot.q7r)";

struct Options : FileList
{};

long long Sum(const std::map<Long, long long>& counts)
{
  long long sum = 0;
  for (const auto& [type, count] : counts)
    sum += count;
  return sum;
}

std::string Parameter(BaseDocument& document, Long id)
{
  GeData value;
  document.GetParameterById(id, value);
  return value.GetType() == kDataString ? ToUtf8(value.GetString()) : std::string();
}

void TellTypes(ValueSink& sink, const char* name, const std::map<Long, long long>& counts)
{
  sink.Key(name);
  sink.BeginObject();
  for (const auto& [type, count] : counts)
    sink.Member(std::to_string(type), count);
  sink.EndObject();
}

// The texts that a document has about itself.
constexpr struct
{
  const char* name;
  Long id;
} kTexts[] = {{"writer", kDocumentWriterText},
              {"saved", kDocumentSaveText},
              {"creator", kDocumentCreatorText},
              {"created", kDocumentCreationText}};

void TellInfo(ValueSink& sink, BaseDocument& document, const SceneCounts& counts, std::uintmax_t size)
{
  const DocumentPref& pref = document.GetPref();
  sink.Member("size", size);
  sink.Member("version", document.GetLoadedVersion());
  Tell(sink, "name", document.GetName());
  for (const auto& text : kTexts)
    sink.Member(text.name, Parameter(document, text.id));
  sink.Member("fps", pref.GetFps());
  Tell(sink, "min", pref.GetMinTime());
  Tell(sink, "max", pref.GetMaxTime());
  sink.Member("objects", Sum(counts.objects));
  TellTypes(sink, "objectTypes", counts.objects);
  sink.Member("tags", Sum(counts.tags));
  TellTypes(sink, "tagTypes", counts.tags);
  sink.Member("materials", counts.materials);
  sink.Member("layers", document.GetLayerRoot()->GetCount());
  sink.Member("renderSettings", document.GetRenderDataRoot()->GetCount());
  sink.Member("views", document.GetViewPanelRoot()->GetCount());
  sink.Member("tracks", counts.tracks);
  sink.Member("keys", counts.keys);
}

std::string TypesText(const std::map<Long, long long>& counts)
{
  std::string text;
  for (const auto& [type, count] : counts)
    text += (text.empty() ? "  (" : ", ") + std::to_string(count) + " " + TypeName(type);
  return text.empty() ? text : text + ")";
}

void Row(const char* label, const std::string& text)
{
  if (!text.empty())
    PrintFormatted("%-16s %s\n", label, text.c_str());
}

void PrintInfo(BaseDocument& document, const SceneCounts& counts, std::uintmax_t size)
{
  const DocumentPref& pref = document.GetPref();
  char range[80];
  std::snprintf(range, sizeof range, "%g to %g s", pref.GetMinTime().Get(), pref.GetMaxTime().Get());
  Row("size", SizeText(size));
  Row("version", std::to_string(document.GetLoadedVersion()));
  Row("name", ToUtf8(document.GetName()));
  for (const auto& text : kTexts)
    Row(text.name, Parameter(document, text.id));
  Row("frame rate", std::to_string(pref.GetFps()) + " fps");
  Row("range", range);
  Row("objects", std::to_string(Sum(counts.objects)) + TypesText(counts.objects));
  Row("tags", std::to_string(Sum(counts.tags)) + TypesText(counts.tags));
  Row("materials", std::to_string(counts.materials));
  Row("layers", std::to_string(document.GetLayerRoot()->GetCount()));
  Row("render settings", std::to_string(document.GetRenderDataRoot()->GetCount()));
  Row("views", std::to_string(document.GetViewPanelRoot()->GetCount()));
  Row("tracks", std::to_string(counts.tracks));
  Row("keys", std::to_string(counts.keys));
}

int Info(const std::string& file, const Options& options)
{
  SceneCounts counts;
  const DocumentPtr document = CountFile(file, counts);
  const std::uintmax_t size = InputSize(file);
  if (options.json)
    PrintJson([&](ValueSink& json) { TellInfo(json, *document, counts, size); });
  else
    PrintInfo(*document, counts, size);
  return kDone;
}

} // namespace

void AddInfo(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("info", kHelp);
  AddFileList(*verb, *options, "a scene file", "as one JSON object (docs/json.md)");
  verb->callback([options, &status] {
    status = ShowEach(*options, [&](const std::string& file) { return Info(file, *options); });
  });
}

} // namespace q7r
