#include "host/reader/project_file.h"

#include <algorithm>
#include <unordered_map>

#include "host/file_bytes.h"
#include "host/model/layer_streams.h"
#include "host/model/timing.h"
#include "host/reader/composition_reader.h"
#include "host/reader/moved_footage.h"
#include "host/reader/projects/project_reader.h"
#include "host/reader/samples_file.h"
#include "host/reader/unfolded_layers.h"
#include "host/reader/warnings.h"
#include "host/text.h"

namespace host
{

namespace
{

// A composition file: all of it is read at once.
class CompositionFile : public ProjectFile
{
 public:
  CompositionFile(const std::string& name, const FileBytes& bytes, const std::filesystem::path& folder)
      : project_(ReadComposition(JsonDocument(name, bytes.View()), folder))
  {}

  std::vector<CompositionSummary> Compositions() override;
  Project Read(std::size_t composition) override
  {
    project_.root = &project_.compositions.at(composition);
    return std::move(project_);
  }

 private:
  UnfoldedLayers LayersOf(const Composition& composition) const;

  Project project_;
  std::unordered_map<const Composition*, std::size_t> places_;
};

UnfoldedLayers CompositionFile::LayersOf(const Composition& composition) const
{
  UnfoldedLayers layers;
  for (const Layer* layer : composition.layers) {
    if (!IsExported(*layer))
      continue;
    ++layers.own;
    if (layer->source && layer->source->composition)
      layers.nested.push_back(places_.at(layer->source->composition));
  }
  return layers;
}

std::vector<CompositionSummary> CompositionFile::Compositions()
{
  std::vector<CompositionSummary> summaries;
  std::vector<UnfoldedLayers> layers;
  for (const Composition& composition : project_.compositions)
    places_[&composition] = places_.size();
  for (const Composition& composition : project_.compositions) {
    const Item& item = *composition.item;
    layers.push_back(LayersOf(composition));
    CompositionSummary& summary = summaries.emplace_back();
    summary = {.name = item.name, .id = item.id, .width = item.width, .height = item.height};
    summary.frameRate = composition.frameRate;
    summary.frames = composition.frames;
    summary.seconds = composition.frames * composition.frameDuration.value / composition.frameDuration.scale;
    summary.layers = composition.layers.size();
    summary.isActive = &composition == project_.root;
  }
  const std::vector<std::uint64_t> counts = CountUnfolded(layers);
  for (std::size_t i = 0; i < summaries.size(); ++i)
    summaries[i].exported = counts[i];
  return summaries;
}

constexpr std::string_view kByteOrderMarkAndSpace = "\xEF\xBB\xBF \t\r\n";

bool BeginsAsJson(std::string_view bytes)
{
  const std::size_t first = bytes.find_first_not_of(kByteOrderMarkAndSpace);
  return first != std::string_view::npos && bytes[first] == '{';
}

bool HasSuffix(const std::filesystem::path& file, std::string_view suffix)
{
  std::string own = PathToUtf8(file.extension());
  std::transform(own.begin(), own.end(), own.begin(),
                 [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c; });
  return own == suffix;
}

// What is neither a project nor JSON is told at once, in words of the one who gave it.
void RefuseOthers(std::string_view bytes, const std::string& name)
{
  const std::size_t first = bytes.find_first_not_of(kByteOrderMarkAndSpace);
  const std::string file = OneLine(name);
  if (first == std::string_view::npos)
    throw CompositionError(file, "is empty");
  if (bytes.starts_with("QQ7R"))
    throw CompositionError(file, "is a scene file, no project or composition");
  constexpr std::string_view kFirstOfJson = "{[\"-0123456789tfn";
  if (kFirstOfJson.find(bytes[first]) == std::string_view::npos)
    throw CompositionError(file, "neither an After Effects project nor a composition (JSON)");
}

} // namespace

std::unique_ptr<ProjectFile> OpenProjectFile(const std::filesystem::path& file)
{
  return OpenProjectFile(FileBytes(file), PathToUtf8(file), std::filesystem::absolute(file).parent_path());
}

std::unique_ptr<ProjectFile> OpenProjectFile(FileBytes bytes, const std::string& name,
                                             const std::filesystem::path& folder)
{
  const bool isBinary = projects::IsBinaryProject(bytes.View()), isXml = projects::IsXmlProject(bytes.View());
  // The suffix only tells what is missed in a file that is none of them.
  const std::filesystem::path path = PathFromUtf8(name);
  const bool isToBeXml = HasSuffix(path, ".aepx"), isToBeProject = isToBeXml || HasSuffix(path, ".aep");
  if (isBinary || isXml || (isToBeProject && !BeginsAsJson(bytes.View())))
    return projects::OpenProject(name, std::move(bytes), isXml || (isToBeXml && !isBinary));
  RefuseOthers(bytes.View(), name);
  return std::make_unique<CompositionFile>(name, bytes, folder);
}

Project LoadComposition(const std::filesystem::path& file)
{
  const FileBytes bytes(file);
  return LoadCompositionText(bytes.View(), PathToUtf8(file), std::filesystem::absolute(file).parent_path());
}

Project ReadProject(ProjectFile& file, std::size_t composition, const std::string& name, const ReadOptions& options)
{
  Project project = file.Read(composition);
  if (!options.samples.empty())
    AddSamples(project, options.samples);
  if (!options.images.empty())
    FindMovedFootage(project, options.images, name);
  WarnOfLostExpressions(project, name);
  return project;
}

} // namespace host
