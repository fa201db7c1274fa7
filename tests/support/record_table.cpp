#include <algorithm>
#include <map>
#include <sstream>

#include "support/record_samples.h"
#include "support/text_table.h"
#include "torvane/animation/ctrack.h"
#include "torvane/document/base_document.h"
#include "torvane/layers/layer_object.h"
#include "torvane/materials/material.h"
#include "torvane/objects/base_object.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/base_tag.h"
#include "torvane/tags/weight_tag_data.h"
#include "torvane/views/base_draw.h"

using namespace _torvane_;

namespace
{

using Maker = GeListNode* (*)();

template <class Node, Long... type>
GeListNode* New()
{
  return NewObj<Node>(type...);
}
template <Long type>
GeListNode* Tag()
{
  return MakeTag(type);
}
template <Long type>
GeListNode* Object()
{
  return AllocObject(type);
}
// The exporter's client leaves weights the bytes that they are: here their data read them.
class WeightTag : public BaseTag
{
 public:
  WeightTag() : BaseTag(kTagPlugin, kTagWeight) { SetNodeData(NewObj<WeightTagData>()); }
  Bool ReadChunk(HyperFile& file, Long id, Long level) override
  {
    Long number = 0;
    return id != kChunkNodeData ? BaseTag::ReadChunk(file, id, level)
                                : file.ReadLong(number) && file.ReadLong(number) && file.ReadString(name_) &&
                                      GetNodeData()->ReadData(file, id, level) && file.SkipToEndChunk();
  }
};

GeListNode* NewWeightTag()
{
  auto* tag = NewObj<WeightTag>();
  if (tag && !tag->GetNodeData())
    DeleteObj(tag);
  return tag;
}

GeListNode* Document() { return BaseDocument::Alloc(); }

const std::map<std::string, Maker> kMakers = {
    {"BaseDraw", New<BaseDraw>},
    {"BaseList2D", New<BaseList2D>},
    {"BaseShader", New<BaseShader>},
    {"BaseVideoPost", New<BaseVideoPost>},
    {"CCurve", New<CCurve>},
    {"CKey", New<CKey>},
    {"CTrack", New<CTrack>},
    {"Document", Document},
    {"LayerObject", New<LayerObject>},
    {"Material", New<Material>},
    {"MultipassObject", New<MultipassObject>},
    {"PluginMaterial", New<BaseMaterial, kMaterialPlugin>},
    {"RenderData", New<RenderData>},
    {"ViewPanel", New<ViewPanel>},
    {"BareObject", New<BaseObject, kObjectGeneric>}, // what every object is while it is read
    {"NullObject", Object<kObjectNull>},
    {"PolygonObject", Object<kObjectPolygon>},
    {"SplineObject", Object<kObjectSpline>},
    {"CompositingTag", Tag<kTagCompositing>},
    {"DisplayTag", Tag<kTagDisplay>},
    {"NormalTag", Tag<kTagNormal>},
    {"OldVertexMap", New<BaseTag, kTagOldVertexMap>},
    {"PluginTag", Tag<kTagPlugin>},
    {"PointSelectionTag", Tag<kTagPointSelection>},
    {"PointTag", Tag<kTagPoint>},
    {"PolygonTag", Tag<kTagPolygon>},
    {"TangentTag", Tag<kTagTangent>},
    {"TextureTag", Tag<kTagTexture>},
    {"UVWTag", Tag<kTagUVW>},
    {"VertexMapTag", Tag<kTagVertexMap>},
    {"WeightTag", NewWeightTag},
};

struct Table
{
  Table();
  std::string Expanded(const std::string& words) const
  {
    std::string text;
    std::istringstream stream(words);
    for (std::string word; stream >> word;)
      text += (text.empty() ? "" : " ") + (word[0] == '$' ? texts.at(word) : word);
    return text;
  }

  std::vector<RecordSample> samples;
  std::map<std::string, std::string> texts; // of words that begin with $
};

Table::Table()
{
  for (const std::string& line : TextTable("support/records.txt")) {
    std::istringstream cells(line);
    std::string name, head, body, now;
    if (line[0] == '$') {
      cells >> name >> head;
      std::getline(cells, body);
      texts[name] = Expanded(body);
      continue;
    }
    std::getline(cells, name, '|');
    std::getline(cells, head, '|');
    std::getline(cells, body, '|');
    std::getline(cells, now);
    RecordSample sample{name.substr(0, name.size() - 1), nullptr, 0, 0, Expanded(body)};
    std::istringstream words(head);
    std::string maker;
    char comma = 0;
    words >> maker >> sample.chunk >> comma >> sample.level;
    if (maker.starts_with("tag:"))
      sample.make = [type = std::stoi(maker.substr(4))] { return MakeTag(type); };
    else
      sample.make = kMakers.at(maker);
    for (std::string option; words >> option;) {
      if (option == "of")
        words >> sample.version;
      sample.copied = sample.copied && option != "uncopied";
    }
    const std::size_t colon = now.find(':');
    if (colon != std::string::npos)
      sample.nowLevel = std::stoi(now);
    if (!now.empty())
      sample.now = Expanded(colon == std::string::npos ? now : now.substr(colon + 1));
    samples.push_back(sample);
  }
}

const Table& TheTable()
{
  static const Table table;
  return table;
}

} // namespace

const std::vector<RecordSample>& RecordSamples() { return TheTable().samples; }

std::string ExpandRecord(const std::string& body) { return TheTable().Expanded(body); }

const RecordSample& FindRecordSample(const std::string& name)
{
  const auto& samples = RecordSamples();
  return *std::find_if(samples.begin(), samples.end(), [&](const RecordSample& sample) { return sample.name == name; });
}
