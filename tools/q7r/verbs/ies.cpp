// q7r ies: what a photometric file holds.
#include <memory>

#include "file_list.h"
#include "listing/ies_text.h"
#include "listing/parameter_names.h"
#include "output/json_output.h"
#include "output/number_text.h"
#include "output/standard_output.h"
#include "scene_file.h"
#include "standard_input.h"
#include "verbs.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr const char* kHelp =
    R"(Reads a photometric file (a measured light distribution, as makers of luminaires publish
them) and tells its version, texts, luminous opening, angles, largest intensity and light
output.

Use it to see whether a light can carry the file, and whether the output is the one that
the maker tells. A light in a scene has all intensities multiplied by the power in watts
as well; here they are without it. With --json the table of intensities is there too.

Example: q7r ies downlight.ies)";

struct Options : FileList
{};

using IESPtr = Owned<IESLight>;

IESPtr LoadIES(const std::string& path)
{
  const std::string bytes = ReadInput(path);
  Filename name;
  name.SetMemoryRead(bytes.data(), static_cast<LLong>(bytes.size()));
  IESLight* loaded = nullptr;
  const Long result = LoadIESFile(loaded, name, IESFactors::kLightOnly);
  if (result != kIESLoaded)
    throw Failure(InputName(path), GetIESResultText(result));
  return IESPtr(loaded);
}

const char* VersionText(Long version)
{
  return version == kIESVersion1991 ? "IESNA91" : version == kIESVersion1995 ? "IESNA:LM-63-1995" : "another";
}

constexpr int kDigits = 7;

const char* TiltText(Long mode)
{
  return mode == kIESTiltNone ? "none" : mode == kIESTiltInclude ? "included" : "not told";
}

std::string SizeOf(const Vector& size)
{
  return NumberText(size.x, kDigits) + " x " + NumberText(size.y, kDigits) + " x " + NumberText(size.z, kDigits) + " m";
}

// "74, 0 to 180 degrees".
std::string AnglesText(const GeTempDynArray<Real>& angles)
{
  const Long count = angles.GetCount();
  if (count == 0)
    return "none";
  return std::to_string(count) + ", " + NumberText(angles[0], kDigits) + " to " +
         NumberText(angles[count - 1], kDigits) + " degrees";
}

void Row(const char* label, const std::string& text)
{
  if (!text.empty())
    PrintFormatted("%-20s %s\n", label, text.c_str());
}

void PrintIES(const IESLight& light)
{
  Row("version", VersionText(light.fileVersion));
  Row("tilt", TiltText(light.tiltMode));
  Row("manufacturer", ToUtf8(light.manufacturer));
  Row("luminaire catalogue", ToUtf8(light.luminaireCatalogue));
  Row("luminaire", ToUtf8(light.luminaire));
  Row("lamp catalogue", ToUtf8(light.lampCatalogue));
  Row("lamp", ToUtf8(light.lamp));
  Row("shape", IESShapeWords(light.shape));
  Row("size", SizeOf(light.size));
  Row("vertical angles", AnglesText(light.verticalAngles));
  Row("horizontal angles", AnglesText(light.horizontalAngles));
  Row("maxCandela", NumberText(light.maxCandela, kDigits));
  Row("totalFlux", NumberText(light.GetTotalFlux(), kDigits));
  Row("lumens", NumberText(light.GetLumens(), kDigits));
}

void PrintIESJson(const IESLight& light)
{
  PrintJson([&light](ValueSink& json) {
    TellIES(json, light);
    json.Member("lumens", light.GetLumens());
  });
}

int ShowIES(const std::string& file, const Options& options)
{
  const IESPtr light = LoadIES(file);
  if (options.json)
    PrintIESJson(*light);
  else
    PrintIES(*light);
  return kDone;
}

} // namespace

void AddIES(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("ies", kHelp);
  AddFileList(*verb, *options, "a photometric file", "as one JSON object, with the table");
  verb->callback([options, &status] {
    status = ShowEach(*options, [&](const std::string& file) { return ShowIES(file, *options); });
  });
}

} // namespace q7r
