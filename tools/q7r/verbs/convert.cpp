// q7r convert: scenes as glTF.
#include <memory>

#include "gltf_file.h"
#include "scene_file.h"
#include "standard_input.h"
#include "usage.h"
#include "verbs.h"
#include "work_list.h"

namespace q7r
{

namespace
{

constexpr const char* kHelp = R"(Writes what a scene shows as glTF 2.0, which viewers, engines and 3D applications open:
nodes, cameras, lights, planes with their pictures, meshes and everything that moves.

The output ends with .glb (one file) or with .gltf (JSON, with NAME.bin beside it). What
glTF can't hold is told once a kind; docs/gltf.md tells what goes over and how.

Examples: q7r convert shot.q7r shot.glb --embed
          q7r convert scenes/*.q7r -o models)";

struct Options : WorkOptions
{
  bool lit = false;
  bool unlit = false;
  bool noPointers = false;
  gltf::Options conversion;
};

GltfForm FormOf(const Work& work) { return GltfFormOf(work.output, GltfForm::kGlb); }

int Convert(Options& options)
{
  options.conversion.pointers = !options.noPointers;
  if (options.lit || options.unlit)
    options.conversion.shading = options.lit ? gltf::Shading::kLit : gltf::Shading::kUnlit;
  return DoWork(
      PlanWork(options, ".glb"), options.jobs,
      [&](const Work& work) {
        const GltfForm form = FormOf(work);
        if (form != GltfForm::kGlb && form != GltfForm::kGltf)
          throw Failure(InputName(work.output), "the name must end with .glb or .gltf");
        RequireGltfOutput(work.output, work.input, options.force);
      },
      [&](const Work& work) {
        const DocumentPtr document = LoadScene(work.input);
        return WriteGltf(*document, work.input, work.output, FormOf(work), options.conversion);
      });
}

} // namespace

void AddConvert(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("convert", kHelp);
  AddWorkOptions(
      *verb, *options, "SCENE",
      "the scene file, then the file to write, .glb or .gltf. With -o, as many scene files as you like, each "
      "into a .glb");
  verb->add_flag("--embed", options->conversion.embed, "pack the pictures into the file");
  verb->add_flag("--hidden", options->conversion.keepHidden,
                 "keep what isn't rendered, switched off by KHR_node_visibility, which few viewers know");
  CLI::Option* lit = verb->add_flag("--lit", options->lit, "light the materials also in a scene without lights");
  verb->add_flag("--unlit", options->unlit, "show the materials in full colour also in a scene with lights")
      ->excludes(lit);
  verb->add_option("--unit", options->conversion.unit, "metres of one scene unit, in place of what the scene says")
      ->check(CLI::Range(1e-9, 1e9));
  verb->add_flag("--no-pointers", options->noPointers,
                 "leave out what moves in cameras and lights, for old readers (KHR_animation_pointer)");
  AddTalkOptions(*verb);
  verb->callback([options, &status] { status = Convert(*options); });
}

} // namespace q7r
