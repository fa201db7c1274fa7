// q7r view: scenes as web pages.
#include <filesystem>
#include <memory>

#include "gltf_file.h"
#include "output/browser.h"
#include "output/standard_output.h"
#include "output/temporary_file.h"
#include "scene_file.h"
#include "standard_input.h"
#include "usage.h"
#include "verbs.h"

namespace q7r
{

namespace
{

namespace fs = std::filesystem;

constexpr const char* kHelp = R"(Makes a web page that shows the scene: its cameras, a free view, and a time line.

PAGE ends with .html, or is - for standard output. It holds all that it needs, pictures
included, so that it can be sent on and opened anywhere. Without PAGE it goes to a
temporary file, which the desktop's browser opens. docs/gltf.md tells what a page shows.

Examples: q7r view shot.q7r
          q7r view shot.q7r -o shot.html
          q7r view - -o - <shot.q7r >shot.html)";

struct Options
{
  std::string scene;
  std::string output;
  bool force = false;
};

int WritePage(const Options& options)
{
  if (GltfFormOf(options.output, GltfForm::kPage) != GltfForm::kPage)
    throw Failure(InputName(options.output), "the name must end with .html");
  RequireGltfOutput(options.output, options.scene, options.force);
  const DocumentPtr document = LoadScene(options.scene);
  return WriteGltf(*document, options.scene, options.output, GltfForm::kPage, {});
}

// The page stays: a browser reads it again whenever its user likes.
int ShowPage(const Options& options)
{
  const DocumentPtr document = LoadScene(options.scene);
  const fs::path folder = MakePrivateFolder();
  const fs::path name = IsStandard(options.scene) ? fs::path("scene") : fs::path(options.scene).stem();
  const fs::path page = folder / fs::path(name).concat(".html");
  int status = kNotDone;
  try {
    status = WriteGltf(*document, options.scene, page.string(), GltfForm::kPage, {});
  } catch (...) {
    std::error_code ignored;
    fs::remove_all(folder, ignored);
    throw;
  }
  if (!OpenInBrowser(page)) {
    if (TheTalk().quiet)
      PrintLine(page.string()); // where it is was not told yet
    TellNote("No browser could be started here: open the page in one.");
  }
  return status;
}

} // namespace

void AddView(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("view", kHelp);
  verb->add_option("SCENE", options->scene, "the scene file")->required();
  CLI::Option* output = verb->add_option("-o,--output", options->output, "the page to write")->option_text("PAGE");
  verb->add_flag("--force", options->force, "replace an existing page without asking");
  AddTalkOptions(*verb);
  verb->callback(
      [options, output, &status] { status = output->count() > 0 ? WritePage(*options) : ShowPage(*options); });
}

} // namespace q7r
