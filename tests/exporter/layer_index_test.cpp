#include "exporter/walk/layer_index.h"
#include "support/library.h"

namespace
{

using exporter::FindLayerObject;
using exporter::LayerIndex;

struct Layer
{
  Long id;
  int parent; // a layer of the same composition, or -1
  int nested; // a composition, or -1
};

// How often, in a thousand, the walk leaves its regular course.
struct Faults
{
  int repeatedRound; // a layer is exported once more in place of the next, as after a failing host call
  int missingObject; // a layer fails before its object has an id
  int sharedId;      // a host that gives one id twice
};

// Goes through compositions as the exporter does, with bare objects, and compares every search with the plain one.
class Walk
{
 public:
  Walk(unsigned seed, const Faults& faults) : random_(seed), faults_(faults), document_(BaseDocument::Alloc())
  {
    compositions_.resize(3 + static_cast<std::size_t>(Roll(4)));
    Long id = 1;
    for (std::size_t c = 0; c < compositions_.size(); ++c) {
      const int count = 1 + Roll(5);
      for (int i = 0; i < count; ++i) {
        const int deeper = static_cast<int>(compositions_.size() - c) - 1;
        const int nested = deeper > 0 && Roll(2) ? static_cast<int>(c) + 1 + Roll(deeper) : -1;
        const int parent = count > 1 && Roll(2) ? i - 1 : -1;
        compositions_[c].push_back({Happens(faults.sharedId) ? 1 + Roll(9) : id++, parent, nested});
      }
    }
  }

  void Run()
  {
    LayerIndex::Use use(index_, Handle(0));
    Create(0);
    Link(0, Make(-1));
  }

  int Searches() const { return searches_; }
  bool IsIndexed() const { return index_.IsTrusted(); }

 private:
  int Roll(int sides) { return static_cast<int>(random_() % static_cast<unsigned>(sides)); }
  bool Happens(int inThousand) { return Roll(1000) < inThousand; }
  AEGP_CompH Handle(std::size_t composition) { return reinterpret_cast<AEGP_CompH>(&compositions_[composition]); }

  BaseObject* Make(Long id)
  {
    BaseObject* object = AllocObject(kObjectNull);
    document_->InsertObject(object);
    if (id >= 0) {
      object->GetDataInstance().SetLong(kKeyLayerId, id);
      index_.Add(id, object);
    }
    return object;
  }

  void Create(std::size_t composition)
  {
    const std::vector<Layer>& layers = compositions_[composition];
    std::size_t at = 0;
    for (std::size_t round = 0; round < layers.size(); ++round) {
      if (!Happens(faults_.repeatedRound))
        at = round;
      BaseObject* plane = Make(Happens(faults_.missingObject) ? -1 : layers[at].id);
      if (layers[at].nested < 0)
        continue;
      const auto nested = static_cast<std::size_t>(layers[at].nested);
      LayerIndex::Use use(index_, Handle(nested));
      Create(nested);
      Link(nested, plane);
    }
  }

  void Link(std::size_t composition, BaseObject* fallback)
  {
    const std::vector<Layer>& layers = compositions_[composition];
    for (const Layer& layer : layers) {
      BaseObject* object = Search(layer.id);
      BaseObject* parent = layer.parent < 0 ? nullptr : Search(layers[static_cast<std::size_t>(layer.parent)].id);
      parent = parent ? parent : fallback;
      if (!object || IsBelow(parent, object))
        continue;
      object->RemoveFromList();
      object->InsertUnderLast(parent);
    }
  }

  BaseObject* Search(Long id)
  {
    ++searches_;
    BaseObject* first = document_->GetFirstObject();
    BaseObject* expected = FindLayerObject(first, id);
    EXPECT_EQ(index_.Find(first, id), expected);
    return expected;
  }

  static bool IsBelow(BaseObject* object, const BaseObject* top)
  {
    while (object && object != top)
      object = object->GetUp();
    return object != nullptr;
  }

  std::mt19937 random_;
  Faults faults_;
  Owned<BaseDocument> document_;
  std::vector<std::vector<Layer>> compositions_;
  LayerIndex index_;
  int searches_ = 0;
};

TEST(LayerIndex, FindsWhatTheSearchOverTheDocumentFinds)
{
  const Faults courses[] = {{0, 0, 0}, {100, 0, 0}, {0, 100, 0}, {0, 0, 100}, {60, 60, 60}};
  int searches = 0;
  for (const Faults& faults : courses) {
    for (unsigned seed = 0; seed < 300; ++seed) {
      Walk walk(seed, faults);
      walk.Run();
      searches += walk.Searches();
      EXPECT_TRUE(walk.IsIndexed() || &faults != courses) << "seed " << seed;
      ASSERT_FALSE(HasFailure()) << "seed " << seed << " with " << faults.repeatedRound << ", " << faults.missingObject
                                 << ", " << faults.sharedId;
    }
  }
  EXPECT_GT(searches, 10000);
}

TEST(LayerIndex, SearchesADocumentThatItDoesNotKnow)
{
  BaseDocument* document = BaseDocument::Alloc();
  BaseObject* object = AllocObject(kObjectNull);
  document->InsertObject(object);
  object->GetDataInstance().SetLong(kKeyLayerId, 7);
  LayerIndex index;
  EXPECT_EQ(index.Find(object, 7), nullptr);
  index.Distrust();
  EXPECT_TRUE(index.Find(object, 7) == object && index.Find(object, exporter::kNoLayerId) == nullptr);
  BaseDocument::Free(document);
}

} // namespace
