#include "gltf_file.h"

#include <algorithm>
#include <filesystem>

#include "gltf/page/page.h"
#include "gltf/text.h"
#include "output/output_file.h"
#include "output/temporary_file.h"
#include "report.h"
#include "standard_input.h"

namespace q7r
{

namespace fs = std::filesystem;

namespace
{

std::string BytesPath(const std::string& output) { return fs::path(output).replace_extension(".bin").string(); }

// The files that a conversion to `output` makes.
std::vector<std::string> FilesOf(const std::string& output)
{
  if (GltfFormOf(output) == GltfForm::kGltf)
    return {output, BytesPath(output)};
  return {output};
}

std::string TextOf(const fs::path& path)
{
  const std::u8string text = path.u8string();
  return {text.begin(), text.end()};
}

// The main file, as a whole.
void WriteMain(const gltf::Model& model, const std::string& title, GltfForm form, const gltf::Sink& write)
{
  if (form == GltfForm::kPage)
    return gltf::WritePage(model, title, write);
  if (form == GltfForm::kGlb)
    return gltf::WriteGlb(model, write);
  model.json.ForEachPiece(
      [&write](std::string_view piece) { write(reinterpret_cast<const std::uint8_t*>(piece.data()), piece.size()); });
}

// A file that `fill` hands its bytes to, piece by piece.
template <class Fill>
FileWriter RawFile(Fill fill)
{
  return [fill](const std::string& partial) {
    RawOutput file{fs::path(partial)};
    fill(
        [&file](const std::uint8_t* data, std::size_t size) { file.Write(reinterpret_cast<const char*>(data), size); });
    file.Close();
    return std::string();
  };
}

void WriteModel(const gltf::Model& model, const std::string& title, const std::string& output, GltfForm form)
{
  std::vector<Output> files{{output, RawFile([&](const gltf::Sink& write) { WriteMain(model, title, form, write); })}};
  if (form == GltfForm::kGltf && model.bytes.Size() > 0)
    files.push_back({BytesPath(output), RawFile([&](const auto& write) { model.bytes.ForEachBlock(write); })});
  WriteOutputs(files);
}

} // namespace

GltfForm GltfFormOf(const std::string& path, GltfForm ofDevices)
{
  std::string suffix = fs::path(path).extension().string();
  std::transform(suffix.begin(), suffix.end(), suffix.begin(),
                 [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + ('a' - 'A')) : c; });
  return suffix == ".glb"    ? GltfForm::kGlb
         : suffix == ".gltf" ? GltfForm::kGltf
         : suffix == ".html" ? GltfForm::kPage
         : IsDevice(path)    ? ofDevices
                             : GltfForm::kNone;
}

void RequireGltfOutput(const std::string& output, const std::string& scene, bool force)
{
  for (const std::string& file : FilesOf(output)) {
    std::error_code error;
    if (!scene.empty() && fs::equivalent(file, scene, error))
      throw Failure(file + ": is the scene itself");
    RequireWritable(file, force);
  }
}

int WriteGltf(_torvane_::BaseDocument& document, const std::string& scene, const std::string& output, GltfForm form,
              gltf::Options options)
{
  options.sceneFolder = fs::absolute(scene).parent_path();
  options.outputFolder = FolderOfOutput(output);
  if (form == GltfForm::kGltf)
    options.bufferName = gltf::PercentEncoded(TextOf(fs::path(BytesPath(output)).filename()));
  options.embed = options.embed || form == GltfForm::kPage;
  try {
    const gltf::Model model = gltf::Convert(document, options);
    WriteModel(model, IsStandard(scene) ? "Scene" : TextOf(fs::path(scene).stem()), output, form);
    for (const std::string& line : model.account.Lines())
      TellNote(line);
    return model.account.HasProblems() ? kProblems : kDone;
  } catch (const gltf::TooLarge& error) {
    throw Failure(output + ": " + error.what());
  }
}

} // namespace q7r
