// q7r info: what a scene file is and how much it holds.
#include <cstdio>
#include <map>
#include <memory>

#include "file_list.h"
#include "listing/json_text.h"
#include "listing/scene_counts.h"
#include "listing/type_names.h"
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

Json ByType(const std::map<Long, long long>& counts)
{
  Json json = Json::object();
  for (const auto& [type, count] : counts)
    json[std::to_string(type)] = count;
  return json;
}

Json InfoJson(BaseDocument& document, const SceneCounts& counts, std::uintmax_t size)
{
  const DocumentPref& pref = document.GetPref();
  return {{"size", size},
          {"version", document.GetLoadedVersion()},
          {"name", ToJson(document.GetName())},
          {"writer", Parameter(document, kDocumentWriterText)},
          {"saved", Parameter(document, kDocumentSaveText)},
          {"creator", Parameter(document, kDocumentCreatorText)},
          {"created", Parameter(document, kDocumentCreationText)},
          {"fps", pref.GetFps()},
          {"min", ToJson(pref.GetMinTime())},
          {"max", ToJson(pref.GetMaxTime())},
          {"objects", Sum(counts.objects)},
          {"objectTypes", ByType(counts.objects)},
          {"tags", Sum(counts.tags)},
          {"tagTypes", ByType(counts.tags)},
          {"materials", document.GetMaterialRoot()->GetCount()},
          {"layers", document.GetLayerRoot()->GetCount()},
          {"renderSettings", document.GetRenderDataRoot()->GetCount()},
          {"views", document.GetViewPanelRoot()->GetCount()},
          {"tracks", counts.tracks},
          {"keys", counts.keys}};
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

void PrintInfo(const Json& info, const SceneCounts& counts)
{
  auto number = [&info](const char* key) { return info[key].dump(); };
  auto seconds = [&info](const char* key) { return info[key][0].get<double>() / info[key][1].get<double>(); };
  char range[80];
  std::snprintf(range, sizeof range, "%g to %g s", seconds("min"), seconds("max"));
  Row("size", SizeText(info["size"].get<std::uintmax_t>()));
  Row("version", number("version"));
  for (const char* key : {"name", "writer", "saved", "creator", "created"})
    Row(key, info[key].get<std::string>());
  Row("frame rate", number("fps") + " fps");
  Row("range", range);
  Row("objects", number("objects") + TypesText(counts.objects));
  Row("tags", number("tags") + TypesText(counts.tags));
  Row("materials", number("materials"));
  Row("layers", number("layers"));
  Row("render settings", number("renderSettings"));
  Row("views", number("views"));
  Row("tracks", number("tracks"));
  Row("keys", number("keys"));
}

int Info(const std::string& file, const Options& options)
{
  DocumentPtr document = LoadScene(file);
  const SceneCounts counts = CountScene(*document);
  Json info = InfoJson(*document, counts, InputSize(file));
  if (options.json)
    PrintLine(info.dump(1, ' ', false, Json::error_handler_t::replace));
  else
    PrintInfo(info, counts);
  return kDone;
}

} // namespace

void AddInfo(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("info", kHelp);
  AddFileList(*verb, *options, "a scene file", "as one JSON object");
  verb->callback([options, &status] {
    status = ShowEach(*options, [&](const std::string& file) { return Info(file, *options); });
  });
}

} // namespace q7r
