#include "host/reader/samples_file.h"

#include <algorithm>

#include "host/file_bytes.h"
#include "host/model/ratio.h"
#include "host/reader/composition_reader.h"
#include "host/reader/warnings.h"
#include "host/text.h"

namespace host
{

namespace
{

constexpr double kMostSamples = 1e7; // after a change of rate

const std::string& NameOf(const Layer& layer)
{
  return layer.name.empty() && layer.source ? layer.source->name : layer.name;
}

class SamplesReader
{
 public:
  SamplesReader(const Project& baked, const std::string& name, Project& project)
      : baked_(baked),
        name_(name),
        project_(project),
        framesPerSample_(Ratio{baked.frameDuration.value, baked.frameDuration.scale} /
                         Ratio{project.frameDuration.value, project.frameDuration.scale})
  {}

  void Run();

 private:
  void TakeLayer(const Composition& composition, std::size_t index, const Composition& target);
  bool TakeProperty(const Property& baked, Property* own) const;
  std::vector<Value> Resample(const std::vector<Value>& samples) const;
  void Warn(const std::string& text) { project_.warnings.push_back(name_ + ": " + text); }

  const Project& baked_;
  const std::string& name_;
  Project& project_;
  Ratio framesPerSample_;
};

Layer* FindLayer(const Composition& composition, std::size_t index, const Layer& wanted)
{
  const std::vector<Layer*>& layers = composition.layers;
  const auto isNamed = [&](const Layer* layer) { return NameOf(*layer) == NameOf(wanted); };
  if (index < layers.size() && isNamed(layers[index]))
    return layers[index];
  const auto found = std::find_if(layers.begin(), layers.end(), isNamed);
  return found == layers.end() ? nullptr : *found;
}

// One value for each frame of the project's root: the nearest in time.
std::vector<Value> SamplesReader::Resample(const std::vector<Value>& samples) const
{
  if (framesPerSample_ == Ratio(1))
    return samples;
  const double count = static_cast<double>(samples.size() - 1) * framesPerSample_.ToDouble() + 1;
  if (!(count < kMostSamples))
    throw CompositionError(name_, "its samples last too many frames of the composition");
  std::vector<Value> resampled;
  for (std::int64_t frame = 0; static_cast<double>(frame) < count; ++frame) {
    const auto nearest = static_cast<std::size_t>((Ratio(frame) / framesPerSample_).Round());
    resampled.push_back(samples[std::min(nearest, samples.size() - 1)]);
  }
  return resampled;
}

// False when there are samples and nothing to take them. Of a separated position each dimension takes its own.
bool SamplesReader::TakeProperty(const Property& baked, Property* own) const
{
  bool isTaken = true;
  if (!baked.Samples().empty()) {
    if (own)
      own->SetSamples(Resample(baked.Samples()));
    isTaken = own != nullptr;
  }
  for (std::size_t c = 0; c < baked.Split().size(); ++c) {
    if (baked.Split()[c].Samples().empty())
      continue;
    if (own && !own->Split().empty())
      own->SetSplitSamples(c, Resample(baked.Split()[c].Samples()));
    else
      isTaken = false;
  }
  return isTaken;
}

void SamplesReader::TakeLayer(const Composition& composition, std::size_t index, const Composition& target)
{
  const Layer& layer = *composition.layers[index];
  Layer* const taker = FindLayer(target, index, layer);
  for (const auto& property : layer.streams) {
    if (!property)
      continue;
    const StreamInfo& info = property->Info();
    if (!TakeProperty(*property, taker ? taker->streams[StreamIndex(info)].get() : nullptr))
      Warn(LayerLabel(layer) + ": its samples of " + info.name + " find no such property in composition " +
           Quoted(target.item->name));
  }
}

void SamplesReader::Run()
{
  bool isUsed = false;
  for (const Composition& composition : baked_.compositions) {
    const Composition* target = FindComposition(project_, composition.item->name);
    isUsed = isUsed || target;
    for (std::size_t i = 0; target && i < composition.layers.size(); ++i)
      TakeLayer(composition, i, *target);
  }
  if (!isUsed)
    Warn("its compositions have other names than those that are read: no samples are taken");
}

} // namespace

void AddSamples(Project& project, const std::filesystem::path& file)
{
  const FileBytes bytes(file);
  const std::string name = OneLine(PathToUtf8(file));
  SamplesReader(ReadComposition(JsonDocument(name, bytes.View()), std::filesystem::absolute(file).parent_path()), name,
                project)
      .Run();
}

} // namespace host
