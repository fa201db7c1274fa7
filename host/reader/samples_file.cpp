#include "host/reader/samples_file.h"

#include "host/file_bytes.h"
#include "host/model/layer_streams.h"
#include "host/model/ratio.h"
#include "host/reader/composition_keys.h"
#include "host/reader/projects/layer_properties.h"
#include "host/reader/property_reader.h"
#include "host/reader/warnings.h"
#include "host/text.h"

#include <algorithm>

namespace host
{

namespace
{

constexpr std::size_t kMostSamples = 10000000; // after a change of rate

class SamplesReader
{
 public:
  SamplesReader(const JsonDocument& document, Project& project) : document_(document), project_(project) {}

  void Read();

 private:
  void ReadEntry(const Json& entry);
  Layer* FindLayer(const Composition& composition, const Json& wanted) const;
  const StreamKey& FindKey(const Json& wanted) const;
  Ratio ReadFrameDuration(const Json& entry, const Composition& composition) const;
  std::vector<Value> ReadValues(const Json& entry, const Property& property, const Ratio& frameDuration) const;

  const JsonDocument& document_;
  Project& project_;
};

// By its place from the top, which is 1, or by its name, which may be its source's.
Layer* SamplesReader::FindLayer(const Composition& composition, const Json& wanted) const
{
  const std::vector<Layer*>& layers = composition.layers;
  if (wanted.is_number()) {
    const std::int64_t index = document_.WholeNumber(wanted);
    return index < 1 || index > static_cast<std::int64_t>(layers.size()) ? nullptr
                                                                         : layers[static_cast<std::size_t>(index - 1)];
  }
  const std::string& name = document_.Text(wanted);
  const auto found = std::find_if(layers.begin(), layers.end(), [&](const Layer* layer) {
    return (layer->name.empty() && layer->source ? layer->source->name : layer->name) == name;
  });
  return found == layers.end() ? nullptr : *found;
}

// By the key of a composition file or by After Effects' match name.
const StreamKey& SamplesReader::FindKey(const Json& wanted) const
{
  const std::string& name = document_.Text(wanted);
  for (const StreamKey& key : kStreamKeys)
    if (name == key.key || name == projects::MatchName(key.id))
      return key;
  document_.Refuse(wanted, "expected a property such as \"p\" or \"ADBE Position\"");
}

Ratio SamplesReader::ReadFrameDuration(const Json& entry, const Composition& composition) const
{
  const Json* stated = document_.Find(entry, "frameDuration");
  if (!stated)
    return {composition.frameDuration.value, composition.frameDuration.scale};
  if (!stated->is_array() || stated->size() != 2)
    document_.Refuse(*stated, "expected an array of two numbers");
  const Ratio duration{document_.WholeNumber((*stated)[0]), document_.WholeNumber((*stated)[1])};
  if (!(Ratio(0) < duration))
    document_.Refuse(*stated, "expected a duration above 0");
  return duration;
}

// One value for each frame of the root: the nearest in time.
std::vector<Value> SamplesReader::ReadValues(const Json& entry, const Property& property,
                                             const Ratio& frameDuration) const
{
  const Json& list = document_.Require(entry, "values");
  std::vector<Value> values = ReadSamples(document_, property.Info(), list);
  const Ratio rootFrames = frameDuration / Ratio{project_.frameDuration.value, project_.frameDuration.scale};
  if (rootFrames == Ratio(1))
    return values;
  const double perSample = rootFrames.ToDouble();
  const double count = static_cast<double>(values.size() - 1) * perSample + 1;
  if (!(count < static_cast<double>(kMostSamples)))
    document_.Refuse(list, "lasts longer than " + std::to_string(kMostSamples) + " frames of the composition");
  std::vector<Value> resampled;
  for (std::size_t frame = 0; static_cast<double>(frame) < count; ++frame) {
    const std::int64_t nearest = (Ratio(static_cast<std::int64_t>(frame)) / rootFrames).Round();
    resampled.push_back(values[std::min(static_cast<std::size_t>(nearest), values.size() - 1)]);
  }
  return resampled;
}

void SamplesReader::ReadEntry(const Json& entry)
{
  const Composition* composition = FindComposition(project_, document_.Text(document_.Require(entry, "composition")));
  const StreamKey& key = FindKey(document_.Require(entry, "property"));
  const Json& wanted = document_.Require(entry, "layer");
  if (!composition)
    return;
  Layer* layer = FindLayer(*composition, wanted);
  const std::string start = document_.Name() + ": composition " + Quoted(composition->item->name) + ": ";
  if (!layer) {
    project_.warnings.push_back(start + "there is no layer " +
                                (wanted.is_string() ? Quoted(document_.Text(wanted)) : wanted.dump()));
    return;
  }
  const StreamInfo& info = *FindStreamInfo(key.id);
  Property* property = layer->streams[StreamIndex(info)].get();
  if (!property) {
    project_.warnings.push_back(start + LayerLabel(*layer) + " has no " + info.name);
    return;
  }
  property->SetSamples(ReadValues(entry, *property, ReadFrameDuration(entry, *composition)));
}

void SamplesReader::Read()
{
  for (const Json& entry : document_.Array(document_.Require(document_.Root(), "samples")))
    ReadEntry(document_.Object(entry));
}

} // namespace

void AddSamples(Project& project, const std::filesystem::path& file)
{
  const FileBytes bytes(file);
  const JsonDocument document(PathToUtf8(file.filename()), bytes.View());
  SamplesReader(document, project).Read();
}

} // namespace host
