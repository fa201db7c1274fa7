// Containers that share their elements against containers of their own ones: edited, written and read alike.
#include "support/library.h"
#include "torvane/stream/prepared_record.h"

namespace
{

constexpr int kSteps = 40;

class SharedDefaults : public testing::Test
{
 protected:
  ~SharedDefaults() override { PreparedRecord::SetEnabled(true); }
};

// Elements of its own, equal to those of the other.
void Fill(BaseContainer& own, const BaseContainer& other)
{
  BaseContainer::Iterator iterator;
  Long id = 0;
  const GeData* value = nullptr;
  for (Bool more = other.BrowseFirst(iterator, id, value); more; more = other.BrowseNext(iterator, id, value))
    own.InsertData(id, *value);
}

Bytes BytesOf(const BaseContainer& container)
{
  return WriteToMemory([&](HyperFile& file) { file.WriteContainer(container); });
}

// In the general way.
Bytes PlainBytesOf(const BaseContainer& container)
{
  PreparedRecord::SetEnabled(false);
  Bytes bytes = BytesOf(container);
  PreparedRecord::SetEnabled(true);
  return bytes;
}

// One of the things that can be done to a container; what it gives is to be the same for both.
Long Edit(BaseContainer& container, unsigned choice, Long id, Long number, GeListNode& target)
{
  switch (choice % 9) {
  case 0:
    return container.SetData(id, GeData(number)) != nullptr;
  case 1:
    return container.SetData(id, GeData(Vector(number, 1, 2))) != nullptr;
  case 2:
    container.SetLink(id, static_cast<BaseList2D*>(&target));
    return container.GetLink(id) != nullptr;
  case 3: {
    GeData* found = container.FindData(id);
    return found ? (*found = GeData(Real{0.5} * number), 1) : 0;
  }
  case 4:
    return number % 8 == 0 && container.RemoveData(id);
  case 5:
    return number % 8 == 0 && container.InsertData(id, GeData(number));
  case 6:
    return number % 8 == 0 && container.InsertDataAfter(77, GeData(number), container.FindData(id));
  case 7: {
    BaseContainer copy(container);
    container = copy;
    return copy.GetCount() + copy.FindIndex(id);
  }
  default:
    return container.GetData(id).GetLink() != nullptr;
  }
}

} // namespace

TEST_F(SharedDefaults, AreEditedAndWrittenAsOwnElements)
{
  TextureTag target;
  for (unsigned seed = 0; seed < 60; ++seed) {
    std::mt19937 random(seed);
    TextureTag tag;
    BaseContainer& shared = tag.GetDataInstance();
    BaseContainer own;
    Fill(own, shared);
    ASSERT_EQ(BytesOf(shared), PlainBytesOf(own));
    for (int step = 0; step < kSteps; ++step) {
      SCOPED_TRACE("seed " + std::to_string(seed) + ", step " + std::to_string(step));
      const auto choice = static_cast<unsigned>(random());
      const Long id = 1000 + static_cast<Long>(random() % 21);
      const Long number = static_cast<Long>(random() % 32);
      const UWord dirtyShared = shared.GetDirty();
      const UWord dirtyOwn = own.GetDirty();
      ASSERT_EQ(Edit(shared, choice, id, number, target), Edit(own, choice, id, number, target));
      ASSERT_EQ(static_cast<UWord>(shared.GetDirty() - dirtyShared), static_cast<UWord>(own.GetDirty() - dirtyOwn));
      ASSERT_EQ(BytesOf(shared), PlainBytesOf(own));
      ASSERT_EQ(shared.GetCount(), own.GetCount());
      ASSERT_TRUE(shared.IsEqual(own) && own.IsEqual(shared));
      for (Long index = -1; index <= own.GetCount(); ++index)
        ASSERT_EQ(shared.GetIndexId(index), own.GetIndexId(index));
    }
  }
}

TEST_F(SharedDefaults, StayWhereTheyLieWhenMoreOfThemChange)
{
  TextureTag tag;
  BaseContainer& container = tag.GetDataInstance();
  const GeData* first = container.FindData(1002);
  for (Long id = 1000; id < 1010; ++id)
    container.SetData(id, GeData(id));
  container.InsertData(5, GeData(5));
  EXPECT_TRUE(container.FindData(1002) == first && container.GetLong(1002) == 1002);
  EXPECT_EQ(TextureTag().GetDataInstance().GetReal(1002), 1.0);
}

// Whole, cut at every byte, and with a byte changed.
TEST_F(SharedDefaults, AreReadAsOwnElements)
{
  TextureTag target, source;
  source.GetDataInstance().SetId(kTagTexture);
  source.GetDataInstance().SetLink(kTextureMaterial, &target);
  source.GetDataInstance().SetReal(kTextureOffsetX, 0.25);
  const Bytes whole = WriteToMemory([&](HyperFile& file) { file.WriteContainer(source.GetDataInstance()); }, true);
  std::mt19937 random(1);
  const auto isReadAlike = [](const Bytes& bytes) {
    TextureTag tags[2];
    Bool read[2] = {};
    Long errors[2] = {};
    for (int way = 0; way < 2; ++way) {
      PreparedRecord::SetEnabled(way == 0);
      MemoryReadFile file(bytes);
      read[way] = file.file.ReadContainer(tags[way].GetDataInstance(), true);
      errors[way] = file.file.GetError();
      PreparedRecord::SetEnabled(true);
    }
    EXPECT_EQ(read[0], read[1]);
    EXPECT_EQ(errors[0], errors[1]);
    EXPECT_EQ(tags[0].GetDataInstance().GetDirty(), tags[1].GetDataInstance().GetDirty());
    return PlainBytesOf(tags[0].GetDataInstance()) == PlainBytesOf(tags[1].GetDataInstance());
  };
  for (std::size_t size = 13; size <= whole.size(); ++size)
    ASSERT_TRUE(isReadAlike({whole.begin(), whole.begin() + static_cast<std::ptrdiff_t>(size)})) << size << " bytes";
  for (std::size_t place = 13; place < whole.size(); ++place) {
    Bytes changed = whole;
    for (const int change : {1, 2, 128}) {
      changed[place] = static_cast<std::uint8_t>(whole[place] ^ change);
      ASSERT_TRUE(isReadAlike(changed)) << "byte " << place << " with " << change;
    }
  }
}

TEST_F(SharedDefaults, TellAndSurviveALackOfMemory)
{
  EveryFailedAllocation([] {
    TextureTag tag;
    BaseContainer& container = tag.GetDataInstance();
    Bool done = true;
    for (Long id = 1000; id < 1006 && done; ++id)
      done = container.SetData(id, GeData(Vector(id, 0, 0))) != nullptr;
    return done && container.InsertData(1, GeData(1)) && container.GetCount() == 18;
  });
}
