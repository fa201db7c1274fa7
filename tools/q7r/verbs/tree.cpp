// q7r tree: what a scene file holds, as a tree.
#include <cstdio>
#include <memory>

#include "file_list.h"
#include "listing/node_details.h"
#include "listing/scene_json.h"
#include "listing/type_names.h"
#include "output/standard_output.h"
#include "scene_file.h"
#include "torvane/animation/ctrack.h"
#include "torvane/materials/base_material.h"
#include "torvane/tags/base_tag.h"
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

Example: q7r tree shot.q7r)";

struct Options : FileList
{};

std::string Quoted(const String& text) { return "\"" + ToUtf8(text) + "\""; }

std::string Numbers(const Vector& v, Real factor = 1.0)
{
  char buffer[120];
  std::snprintf(buffer, sizeof buffer, "(%.6g, %.6g, %.6g)", v.x * factor + 0.0, v.y * factor + 0.0,
                v.z * factor + 0.0); // no "-0"
  return buffer;
}

void PrintIndented(int depth, const std::string& text)
{
  PrintLine(std::string(2 * static_cast<std::size_t>(depth), ' ') + text);
}

// Words with a space in front, or nothing.
std::string Behind(const std::string& words) { return words.empty() ? words : " " + words; }

void PrintTracks(const BaseList2D& node, int depth)
{
  for (CTrack* track = node.GetFirstTrack(); track; track = track->GetNext())
    PrintIndented(depth, "track " + Quoted(track->GetName()) + " " +
                             std::to_string(track->GetCurve(1, 0)->GetKeyCount()) + " keys");
}

std::string ObjectLine(BaseObject& object)
{
  std::string line =
      TypeName(object.GetType()) + " " + Quoted(object.GetName()) + "  pos " + Numbers(object.GetRelPos());
  if (!(object.GetRelRot() == Vector()))
    line += "  rot " + Numbers(object.GetRelRot(), RadiansToDegrees(1.0));
  if (!(object.GetRelScale() == Vector(1.0, 1.0, 1.0)))
    line += "  scale " + Numbers(object.GetRelScale());
  if (object.GetRenderMode() == kObjectModeOff)
    line += "  not rendered";
  if (const BaseList2D* layer = object.GetLayer())
    line += "  layer " + Quoted(layer->GetName());
  return line + Behind(ObjectWords(object));
}

void PrintObject(BaseObject& object, int depth)
{
  PrintIndented(depth, ObjectLine(object));
  for (BaseTag* tag = object.GetFirstTag(); tag; tag = tag->GetNext())
    PrintIndented(depth + 1, "tag " + TypeName(tag->GetType()) +
                                 (tag->GetName().Content() ? " " + Quoted(tag->GetName()) : std::string()) +
                                 Behind(TagWords(*tag)));
  PrintTracks(object, depth + 1);
  for (BaseObject* child = object.GetDown(); child; child = child->GetNext())
    PrintObject(*child, depth + 1);
}

void PrintLayer(LayerObject& layer, int depth)
{
  std::string flags;
  for (Long i = 0; i < kLayerFlagCount; ++i)
    flags += layer.GetFlag(i) ? '1' : '0';
  PrintIndented(depth, Quoted(layer.GetName()) + "  flags " + flags + "  color " + Numbers(layer.GetColor()));
  for (LayerObject* child = layer.GetDown(); child; child = child->GetNext())
    PrintLayer(*child, depth + 1);
}

void PrintRenderData(RenderData& data, int depth)
{
  const BaseContainer& settings = data.GetDataInstance();
  char size[160];
  std::snprintf(size, sizeof size, "%g x %g, %g fps, %g to %g s", settings.GetReal(kRenderWidth),
                settings.GetReal(kRenderHeight), settings.GetReal(kRenderFrameRate),
                settings.GetTime(kRenderFrameFrom).Get(), settings.GetTime(kRenderFrameTo).Get());
  PrintIndented(depth, Quoted(data.GetName()) + "  " + size);
  for (RenderData* child = data.GetDown(); child; child = child->GetNext())
    PrintRenderData(*child, depth + 1);
}

void PrintScene(BaseDocument& document)
{
  const DocumentPref& pref = document.GetPref();
  PrintFormatted("document %s  %d fps, %g to %g s\n", Quoted(document.GetName()).c_str(), pref.GetFps(),
                 pref.GetMinTime().Get(), pref.GetMaxTime().Get());
  PrintLine("objects");
  for (BaseObject* object = document.GetFirstObject(); object; object = object->GetNext())
    PrintObject(*object, 1);
  PrintLine("materials");
  for (const std::string& line : MaterialLines(document))
    PrintIndented(1, line);
  PrintLine("layers");
  for (LayerObject* layer = document.GetFirstLayer(); layer; layer = layer->GetNext())
    PrintLayer(*layer, 1);
  PrintLine("render settings");
  for (RenderData* data = document.GetFirstRenderData(); data; data = data->GetNext())
    PrintRenderData(*data, 1);
  PrintLine("views");
  for (const std::string& line : ViewLines(document))
    PrintIndented(1, line);
}

int Tree(const std::string& file, const Options& options)
{
  DocumentPtr document = LoadScene(file);
  if (options.json)
    PrintLine(SceneJson(*document).dump(1, ' ', false, Json::error_handler_t::replace));
  else
    PrintScene(*document);
  return kDone;
}

} // namespace

void AddTree(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("tree", kHelp);
  AddFileList(*verb, *options, "a scene file", "everything, as one JSON object");
  verb->callback([options, &status] {
    status = ShowEach(*options, [&](const std::string& file) { return Tree(file, *options); });
  });
}

} // namespace q7r
