// Files whose nodes go to a sink, against the same files loaded whole.
#include "support/library.h"
#include "support/scene_corpus.h"
#include "torvane/nodes/node_sink.h"

namespace
{

// What there is of objects and materials: type, tags, tracks, keys of the first curves.
using Nodes = std::multiset<std::tuple<Long, Long, Long, Long>>;

void Note(BaseList2D& node, Nodes& nodes)
{
  Long tags = 0, tracks = 0, keys = 0;
  if (auto* object = NodeCast<BaseObject>(&node)) {
    for (BaseTag* tag = object->GetFirstTag(); tag; tag = tag->GetNext())
      ++tags;
  }
  for (CTrack* track = node.GetFirstTrack(); track; track = track->GetNext()) {
    ++tracks;
    keys += track->GetCurve(1, 1)->GetKeyCount();
  }
  nodes.emplace(node.GetType(), tags, tracks, keys);
}

void NoteAll(BaseList2D* first, Nodes& nodes)
{
  for (BaseList2D* node = first; node; node = node->GetNext()) {
    Note(*node, nodes);
    if (auto* object = NodeCast<BaseObject>(node))
      NoteAll(object->GetDown(), nodes);
  }
}

class Noting : public NodeSink
{
 public:
  void Take(BaseList2D& node) override
  {
    auto* object = NodeCast<BaseObject>(&node);
    EXPECT_TRUE(object ? !object->GetDown() : NodeCast<BaseMaterial>(&node) != nullptr);
    Note(node, nodes);
  }
  void TakeBack() override { isExact = false; }

  Nodes nodes;
  bool isExact = true;
};

// True if the sink got all that there is.
bool GetsTheSame(const Bytes& bytes)
{
  FileProblem problems[2];
  Noting sink;
  Nodes nodes;
  Filename name;
  name.SetMemoryRead(bytes.data(), static_cast<LLong>(bytes.size()));
  const DocumentPtr whole(LoadDocument(name, LoadObjects | LoadMaterials, &problems[0]));
  const DocumentPtr rest(LoadDocument(name, LoadObjects | LoadMaterials, &problems[1], &sink));
  EXPECT_EQ(whole == nullptr, rest == nullptr);
  EXPECT_EQ(problems[0].code, problems[1].code);
  EXPECT_EQ(problems[0].position, problems[1].position);
  if (!whole || !rest)
    return false;
  EXPECT_TRUE(rest->GetObjectRoot()->IsEmpty() && rest->GetMaterialRoot()->IsEmpty());
  EXPECT_EQ(rest->GetLayerRoot()->GetCount(), whole->GetLayerRoot()->GetCount());
  NoteAll(whole->GetObjectRoot()->GetFirst(), nodes);
  NoteAll(whole->GetMaterialRoot()->GetFirst(), nodes);
  EXPECT_TRUE(!sink.isExact || sink.nodes == nodes);
  return sink.isExact;
}

TEST(NodeSink, GetsWhatAWholeLoadGives)
{
  std::mt19937 random(5);
  int exact = 0, files = 0;
  for (const CorpusFile& file : SceneCorpus()) {
    SCOPED_TRACE(file.name);
    ++files;
    exact += GetsTheSame(file.bytes) ? 1 : 0;
    for (int i = 0; i < 12; ++i) {
      Bytes damaged = file.bytes;
      damaged[random() % damaged.size()] = static_cast<std::uint8_t>(random());
      GetsTheSame(damaged);
      damaged.resize(random() % damaged.size());
      GetsTheSame(damaged);
    }
  }
  EXPECT_GT(exact, files - 10); // all but those with old lists
}

// What stood in a list that another one replaces is no part of the scene.
TEST(NodeSink, HearsOfAListThatIsReplaced)
{
  const std::string once = "[110100,0 [5140,0 [110100,0 [110100,0 [5140,0 ] ] ] ] ]";
  const std::string empty = "[110100,0 ]";
  const std::tuple<std::string, bool> rows[] = {
      {once, true}, {once + " " + once, false}, {once + " " + empty, false}, {empty + " " + once, true}};
  for (const auto& [lists, isExact] : rows) {
    const auto values = ParseRecord("[110059,0 [110107,0 " + lists + " ] ]");
    ByteWriter file;
    file.Header("Q7R6", 13000).Append(RecordBytes(values, 13000));
    EXPECT_EQ(GetsTheSame(file.bytes), isExact) << lists;
  }
}

} // namespace
