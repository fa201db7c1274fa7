#include "support/scene_corpus.h"

#include <algorithm>
#include <set>

#include "support/full_scene.h"
#include "support/record_samples.h"

using namespace _torvane_;

namespace
{

// The chunks in which a node's own stand, as text; # is the label of the node.
struct Home
{
  const NodeKind* kind;
  std::string chunks;
};

const std::string kInObject = "[110107,0 [110100,0 ";
const std::string kInTrack = kInObject + "[5140,0 [110417,0 [110100,0 [5350,0 ";
const std::string kInCurve = kInTrack + "[110418,2 [110415,0 ";
const std::string kInMaterial = "[110308,0 [110100,0 ";
const std::string kInRender = "[110106,0 [110100,0 [110304,0 ";
const std::string kInPanel = "[110123,0 [110100,0 [110306,0 ";

std::string HomeOf(GeListNode& node)
{
  static const Home homes[] = {
      {&BaseDocument::kNodeKind, ""},
      {&BaseObject::kNodeKind, kInObject + "[#,0 "},
      {&BaseTag::kNodeKind, kInObject + "[5140,0 [110108,0 [110100,0 [#,0 "},
      {&CTrack::kNodeKind, kInTrack},
      {&CCurve::kNodeKind, kInCurve},
      {&CKey::kNodeKind, kInCurve + "[110419,0 [110100,0 [5352,0 "},
      {&LayerObject::kNodeKind, "[110134,0 [110100,0 [100004801,0 "},
      {&BaseMaterial::kNodeKind, kInMaterial + "[#,0 "},
      {&BaseShader::kNodeKind, kInMaterial + "[5703,0 [110131,0 [110100,0 [5707,0 "},
      {&RenderData::kNodeKind, kInRender},
      {&MultipassObject::kNodeKind, kInRender + "[300001049,0 [110100,0 [300001048,0 "},
      {&BaseVideoPost::kNodeKind, kInRender + "[110130,0 [110100,0 [110066,0 "},
      {&ViewPanel::kNodeKind, kInPanel},
      {&BaseDraw::kNodeKind, kInPanel + "[110124,0 [110100,0 [110305,0 "},
      {&BaseList2D::kNodeKind, kInObject + "[5140,0 "},
  };
  const Home* home = std::find_if(std::begin(homes), std::end(homes),
                                  [&](const Home& row) { return node.GetNodeKind().Is(*row.kind); });
  std::string chunks = home->chunks;
  if (const std::size_t label = chunks.find('#'); label != std::string::npos)
    chunks.replace(label, 1, std::to_string(node.GetDiskType()));
  return chunks;
}

// A file of the values of a text, whose open chunks are ended.
CorpusFile MakeFile(std::string name, const std::string& text, Long version = 13000)
{
  std::replace(name.begin(), name.end(), ' ', '-');
  std::erase(name, '\'');
  const std::vector<RecordValue> values = ParseRecord("[110059,0 " + text);
  ByteWriter file;
  file.Header("Q7R6", version).Append(RecordBytes(values, version));
  auto open = std::count_if(values.begin(), values.end(), [](const RecordValue& value) { return value.kind == '['; });
  open -= std::count_if(values.begin(), values.end(), [](const RecordValue& value) { return value.kind == ']'; });
  for (; open > 0; --open)
    file.End();
  return {std::move(name), std::move(file.bytes)};
}

} // namespace

std::vector<CorpusFile> SceneCorpus()
{
  std::vector<CorpusFile> files;
  std::set<std::string> homes;
  const std::string unknown = ",3 L1 R2 [7,7 Stext ] M0102 A6:1,2 ";
  for (const RecordSample& sample : RecordSamples()) {
    const Owned<GeListNode> node(sample.make());
    const std::string home = HomeOf(*node);
    const std::string record = "[" + std::to_string(sample.chunk) + "," + std::to_string(sample.level) + " ";
    files.push_back(MakeFile(sample.name, home + record + sample.body, sample.version));
    if (!homes.insert(home).second)
      continue;
    const std::string kind = std::string(node->GetNodeKind().name) + " " + std::to_string(node->GetDiskType());
    files.push_back(MakeFile("foreign chunk in " + kind, home + "[77" + unknown));
    const std::size_t list = home.rfind("[110100,0 ");
    const bool isTag = NodeCast<BaseTag>(node.get()) != nullptr; // every number is the label of some tag
    if (list != std::string::npos && !isTag && homes.insert(home.substr(0, list)).second)
      files.push_back(MakeFile("foreign member beside " + kind, home.substr(0, list + 10) + "[4711" + unknown));
  }
  files.push_back({"everything", SaveToBytes(*full_scene::MakeFullScene())});
  return files;
}
