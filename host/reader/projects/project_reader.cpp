#include "host/reader/projects/project_reader.h"

#include "host/reader/projects/composition_builder.h"
#include "host/reader/projects/layouts.h"
#include "host/reader/projects/xml_tree.h"
#include "host/reader/unfolded_layers.h"
#include "host/text.h"

namespace host::projects
{

namespace
{

constexpr std::uint32_t kNewestKnown = 25; // of the program's versions
constexpr std::uint32_t kOldestKnown = 9;

std::uint32_t MajorVersion(std::uint32_t bits) { return ((bits >> 26) & 15) * 8 + ((bits >> 19) & 7); }

class AfterEffectsFile : public ProjectFile
{
 public:
  AfterEffectsFile(const std::string& name, FileBytes bytes, bool isXml)
      : bytes_(std::move(bytes)),
        document_(isXml ? ReadXmlTree(OneLine(name), bytes_.View())
                        : std::make_unique<ChunkDocument>(OneLine(name), bytes_.View())),
        items_(*document_)
  {
    for (const ProjectItem& item : items_.Items())
      if (item.kind == idta::kComposition) {
        places_[item.id] = compositions_.size();
        compositions_.push_back(&item);
      }
  }

  std::vector<CompositionSummary> Compositions() override;
  Project Read(std::size_t composition) override;

 private:
  CompositionSummary Summarize(const ProjectItem& item, UnfoldedLayers& layers) const;
  void NoteVersion(Project& project) const;

  FileBytes bytes_;
  std::unique_ptr<ChunkDocument> document_;
  ItemIndex items_;
  std::vector<const ProjectItem*> compositions_;
  std::unordered_map<std::uint32_t, std::size_t> places_; // of compositions, by id
};

CompositionSummary AfterEffectsFile::Summarize(const ProjectItem& item, UnfoldedLayers& layers) const
{
  const CompositionSettings settings = ReadCompositionSettings(item.chunk);
  CompositionSummary summary;
  summary.name = OwnName(item.chunk);
  summary.id = std::to_string(item.id);
  summary.width = settings.width;
  summary.height = settings.height;
  summary.frameRate = settings.frameRate;
  summary.frames = settings.frames();
  summary.seconds = settings.duration.ToDouble();
  for (const Chunk& child : item.chunk.Children()) {
    if (!child.IsList("Layr"_tag))
      continue;
    ++summary.layers;
    const LayerRecord record = ReadLayerRecord(child);
    const bool isExported = record.kind == ldta::kLight || record.kind == ldta::kCamera ||
                            ((record.switches & ldta::k3D) != 0 && record.kind == ldta::kAudioVideo &&
                             items_.Find(record.source) != nullptr);
    if (!isExported)
      continue;
    ++layers.own;
    const auto nested = places_.find(record.source);
    if (record.source != 0 && nested != places_.end())
      layers.nested.push_back(nested->second);
  }
  return summary;
}

std::vector<CompositionSummary> AfterEffectsFile::Compositions()
{
  std::vector<CompositionSummary> summaries;
  std::vector<UnfoldedLayers> layers(compositions_.size());
  const std::optional<Chunk> active = document_->Root().Find("fcid"_tag);
  const std::string activeId = active ? std::to_string(active->Get(Field<u32>{0})) : "0";
  for (std::size_t i = 0; i < compositions_.size(); ++i) {
    summaries.push_back(Summarize(*compositions_[i], layers[i]));
    summaries.back().isActive = summaries.back().id == activeId && activeId != "0";
  }
  const std::vector<std::uint64_t> counts = CountUnfolded(layers);
  for (std::size_t i = 0; i < summaries.size(); ++i)
    summaries[i].exported = counts[i];
  return summaries;
}

Project AfterEffectsFile::Read(std::size_t composition)
{
  Project project = BuildProject(*document_, items_, *compositions_.at(composition));
  NoteVersion(project);
  return project;
}

void AfterEffectsFile::NoteVersion(Project& project) const
{
  const std::optional<Chunk> header = document_->Root().Find("head"_tag);
  if (!header || header->Size() < head::kVersion.offset + 4)
    return;
  const std::uint32_t version = MajorVersion(header->Get(head::kVersion));
  const bool isNewer = version > kNewestKnown;
  if (isNewer || version < kOldestKnown)
    project.warnings.insert(project.warnings.begin(),
                            document_->Name() + ": saved by version " + std::to_string(version) +
                                " of After Effects, " + (isNewer ? "newer" : "older") + " than any that is known here");
}

} // namespace

bool IsBinaryProject(std::string_view bytes) { return bytes.starts_with("RIFX"); }

bool IsXmlProject(std::string_view bytes)
{
  constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
  if (bytes.starts_with(kByteOrderMark))
    bytes.remove_prefix(kByteOrderMark.size());
  const std::size_t first = bytes.find_first_not_of(" \t\r\n");
  return first != std::string_view::npos && bytes[first] == '<';
}

std::unique_ptr<ProjectFile> OpenProject(const std::string& name, FileBytes bytes, bool isXml)
{
  return std::make_unique<AfterEffectsFile>(name, std::move(bytes), isXml);
}

} // namespace host::projects
