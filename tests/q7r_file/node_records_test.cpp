// Nodes that are read in prepared stretches against the general way.
#include "support/full_scene.h"
#include "torvane/memory/owned.h"
#include "torvane/stream/prepared_record.h"
#include "torvane/tags/texture_tag.h"
#include "torvane/time/reproducible_run.h"

namespace
{

using namespace _torvane_;
using FileBytes = std::vector<std::uint8_t>;
using ObjectPtr = Owned<BaseObject>;

class NodeRecords : public testing::Test
{
 protected:
  ~NodeRecords() override { PreparedRecord::SetEnabled(true); }
};

// Children, of which every one has something that another one lacks. The first has a name and a plain tag, number 5
// neither.
ObjectPtr MakeTree(Long count, Long first = 0)
{
  const ReproducibleRun run(1, DateTime()); // each of them has the same link numbers and markers
  ObjectPtr root(AllocObject(kObjectNull));
  for (Long i = first; i < first + count; ++i) {
    BaseObject* object = AllocObject(i % 8 == 7 ? kObjectCamera : kObjectNull);
    object->InsertUnderLast(root.get());
    object->SetName(i % 4 == 1 ? String() : String("object"));
    object->SetRelPos(Vector(i, 0.5, -i));
    object->SetRotationOrder(i % 7);
    if (i % 6 != 5) {
      auto* tag = static_cast<TextureTag*>(object->MakeTag(kTagTexture));
      tag->GetDataInstance().SetLink(kTextureMaterial, i % 2 ? root.get() : nullptr);
      tag->GetDataInstance().SetLong(kTextureProjection, i % 3);
    }
    if (i % 5 == 2)
      object->SetFrozenPos(Vector(1, 2, 3));
    if (i % 5 == 3)
      object->SetParameterById(kObjectDisplayColor, GeData(Vector(0, 1, 0)));
    if (i % 5 == 4) {
      object->AddDynamicParameter(MakeDynamicSettings(kDataReal, "number"));
      object->AddUniqueID(7, "seven", 5);
      object->GetLinkInstance().SetLink(root.get());
      object->ChangeNBit(i, 1);
    }
  }
  return root;
}

FileBytes BytesOfTree(BaseObject& root, Bool withHeader = false)
{
  return WriteToMemory([&](HyperFile& file) { root.WriteAsChunk(file, kObjectGeneric); }, withHeader);
}

void EnterChunk(HyperFile& file)
{
  UChar tag = 0;
  Long id = 0;
  Long level = 0;
  EXPECT_TRUE(file.ReadValueHeader(tag) && file.ReadChunkStart(id, level));
}

// What is told of a reading, and what was read.
auto ReadOnto(const FileBytes& bytes, Bool generally, BaseObject& target)
{
  const ReproducibleRun run(2, DateTime());
  PreparedRecord::SetEnabled(!generally);
  MemoryReadFile memory(bytes);
  EnterChunk(memory.file);
  const Bool read = target.ReadChunkLoop(memory.file, true);
  const FileProblem problem = memory.file.GetProblem();
  const Long depth = memory.file.GetChunkDepth();
  memory.file.Close(); // links that lead nowhere become empty
  PreparedRecord::SetEnabled(true);
  return std::tuple(read, depth, problem.code, problem.position, problem.depth,
                    std::vector<Long>(std::begin(problem.chunks), std::end(problem.chunks)), BytesOfTree(target));
}

void ExpectSame(const FileBytes& bytes)
{
  const ObjectPtr targets[] = {ObjectPtr(AllocObject(kObjectNull)), ObjectPtr(AllocObject(kObjectNull))};
  ASSERT_TRUE(ReadOnto(bytes, false, *targets[0]) == ReadOnto(bytes, true, *targets[1]));
}

} // namespace

// The second write of a tree has the check sums of the first.
TEST_F(NodeRecords, AreReadAsInTheGeneralWayWholeAndDamaged)
{
  const ObjectPtr tree = MakeTree(40);
  for (int write = 0; write < 2; ++write)
    ASSERT_NO_FATAL_FAILURE(ExpectSame(BytesOfTree(*tree, true)));
  for (const auto& [child, writes] : {std::pair(0L, 1), std::pair(0L, 2), std::pair(5L, 1), std::pair(5L, 2)}) {
    const ObjectPtr one = MakeTree(1, static_cast<Long>(child));
    FileBytes bytes;
    for (int write = 0; write < writes; ++write)
      bytes = BytesOfTree(*one, true);
    for (std::size_t place = 22; place < bytes.size(); ++place) {
      SCOPED_TRACE(testing::Message() << child << ' ' << writes << ' ' << place);
      ASSERT_NO_FATAL_FAILURE(ExpectSame({bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(place)}));
      for (const int change : {0x01, 0x02, 0x80}) {
        FileBytes damaged = bytes;
        damaged[place] = static_cast<std::uint8_t>(damaged[place] ^ change);
        ASSERT_NO_FATAL_FAILURE(ExpectSame(damaged));
      }
    }
  }
}

namespace
{

// Whether the node, written `writes` times, is then read in one piece; if not, nothing may be read.
template <class Node>
void ExpectInOnePiece(Node& node, Node&& copy, Long label, bool whole, int writes = 1)
{
  FileBytes bytes;
  for (int write = 0; write < writes; ++write)
    bytes = WriteToMemory([&](HyperFile& file) { node.WriteAsChunk(file, label); }, true);
  MemoryReadFile memory(bytes);
  EnterChunk(memory.file);
  const LLong start = memory.file.GetPosition();
  EXPECT_EQ(copy.ReadInOnePiece(memory.file), whole);
  EXPECT_EQ(memory.file.GetPosition(), whole ? memory.file.GetLength() : start);
  EXPECT_EQ(memory.file.GetError(), FILEERROR_NONE);
}

} // namespace

TEST_F(NodeRecords, ATextureTagThatOnlyTellsItsMaterialIsReadInOnePiece)
{
  const Owned<BaseMaterial> material(AllocMaterial());
  for (const bool plain : {true, false}) {
    TextureTag tag;
    tag.SetMaterial(material.get());
    tag.SetName(String()); // as files hold them
    if (!plain)
      tag.GetDataInstance().SetLong(kTextureProjection, 2);
    ExpectInOnePiece(tag, TextureTag(), kTagTexture, plain);
  }
}

TEST_F(NodeRecords, AnObjectWithoutAnythingUnusualIsReadInOnePiece)
{
  using Change = void (*)(BaseObject&);
  const std::tuple<const char*, bool, Change> rows[] = {
      {"bare", true, [](BaseObject&) {}},
      {"tag", true, [](BaseObject& object) { object.MakeTag(kTagTexture)->SetName(String()); }},
      {"named tag", false, [](BaseObject& object) { object.MakeTag(kTagTexture)->SetName(String("name")); }},
      {"two tags", false,
       [](BaseObject& object) {
         object.MakeTag(kTagTexture)->SetName(String());
         object.MakeTag(kTagTexture)->SetName(String());
       }},
      {"child", false, [](BaseObject& object) { AllocObject(kObjectNull)->InsertUnderLast(&object); }},
      {"parameter", false, [](BaseObject& object) { object.GetDataInstance().SetLong(7, 1); }},
      {"frozen", false, [](BaseObject& object) { object.SetFrozenPos(Vector(1, 2, 3)); }},
  };
  for (const auto& [name, whole, change] : rows) {
    for (const int writes : {1, 2}) {
      SCOPED_TRACE(testing::Message() << name << ' ' << writes);
      BaseObject object(kObjectNull);
      object.SetName(String("a name that is not short"));
      change(object);
      ExpectInOnePiece(object, BaseObject(kObjectNull), kObjectGeneric, whole, writes);
    }
  }
  const ObjectPtr camera(AllocObject(kObjectCamera));
  ExpectInOnePiece(*camera, BaseObject(kObjectNull), kObjectGeneric, false);
}

// What an object had before is gone, or stays, alike.
TEST_F(NodeRecords, AreReadOntoNodesThatHaveContent)
{
  const FileBytes plain = BytesOfTree(*MakeTree(1), true);
  for (Long other = 0; other < 8; ++other) {
    const ObjectPtr trees[] = {MakeTree(8), MakeTree(8)};
    BaseObject* targets[] = {trees[0]->GetDown(), trees[1]->GetDown()};
    for (Long i = 0; i < other; ++i) {
      targets[0] = targets[0]->GetNext();
      targets[1] = targets[1]->GetNext();
    }
    ASSERT_TRUE(ReadOnto(plain, false, *targets[0]) == ReadOnto(plain, true, *targets[1])) << other;
  }
}

TEST_F(NodeRecords, TellProgressAtTheSamePlaces)
{
  const FileBytes bytes = BytesOfTree(*MakeTree(2000), true);
  std::vector<Long> told[2];
  for (const bool generally : {false, true}) {
    PreparedRecord::SetEnabled(!generally);
    MemoryReadFile memory(bytes);
    memory.file.SetReadProgress(
        [](Long number, void* list) { static_cast<std::vector<Long>*>(list)->push_back(number); }, &told[generally]);
    const ObjectPtr root(AllocObject(kObjectNull));
    EnterChunk(memory.file);
    EXPECT_TRUE(root->ReadChunkLoop(memory.file, true));
  }
  EXPECT_GE(told[0].size(), 50U);
  EXPECT_EQ(told[0], told[1]);
}
