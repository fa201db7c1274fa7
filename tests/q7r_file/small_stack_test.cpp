// Nests on the stack of a small thread: what is too deep for it is an error and no crash.
#ifndef _WIN32
#include <pthread.h>

#include "support/library.h"

namespace
{

void RunOnSmallStack(std::function<void()> work)
{
  pthread_attr_t attributes;
  pthread_t thread = {};
  ASSERT_EQ(pthread_attr_init(&attributes), 0);
  ASSERT_EQ(pthread_attr_setstacksize(&attributes, 1 << 20), 0);
  const auto run = [](void* context) -> void* {
    (*static_cast<std::function<void()>*>(context))();
    return nullptr;
  };
  ASSERT_EQ(pthread_create(&thread, &attributes, run, &work), 0);
  pthread_join(thread, nullptr);
  pthread_attr_destroy(&attributes);
}

struct Nest
{
  const char* name;
  const char* before;
  const char* open;
  const char* inside;
  const char* close;
};

std::vector<std::uint8_t> FileOf(const Nest& nest, int depth)
{
  ByteWriter file;
  const auto add = [&](const char* text) { file.Append(RecordBytes(ParseRecord(text))); };
  file.Header();
  add(nest.before);
  for (int i = 0; i < depth; ++i)
    add(nest.open);
  add(nest.inside);
  for (int i = 0; i < depth; ++i)
    add(nest.close);
  for (const char* next = nest.before; *next; ++next) {
    if (*next == '[')
      file.End();
  }
  return file.bytes;
}

const Nest kNests[] = {
    {"objects", "[110059,0 [110107,0 [110100,0 [5154,0", "[110100,0 [110100,0 [5154,0", "", "] ] ]"},
    {"layers", "[110059,0 [110134,0 [110100,0 [100004801,0", "[110100,0 [110100,0 [100004801,0", "", "] ] ]"},
    {"shaders", "[110059,0 [110308,0 [110100,0 [5703,0 [110131,0 [110100,0 [5707,0", "[110100,0 [5707,0", "", "] ]"},
    {"tracks", "[110059,0 [110107,0 [110100,0 [5140,0", "[110417,0 [110100,0 [5350,0", "", "] ] ]"},
    {"containers", "[110059,0 [110107,0 [110100,0 [5140,0 [110050,1 L L [132,1 L-1", "L1 L132 [132,1 L-1", "", "]"},
    {"blend layers", "[110059,0 [110107,0 [110100,0 [5140,0 [110050,1 L L [132,1 L-1 L7 L1011131 [0,2",
     "L1 L3 L1 B S L L L R B", "L L3", "B"},
    {"channels", "[110059,0 [110308,0 [110100,0 [5703,0", "[5703,0 B [5899,0", "", "] ]"},
};

} // namespace

TEST(SmallStack, TakesShallowNestsAndRefusesDeepOnes)
{
  for (const Nest& nest : kNests) {
    const std::vector<std::uint8_t> shallow = FileOf(nest, 50);
    const std::vector<std::uint8_t> deep = FileOf(nest, 20000);
    RunOnSmallStack([&] {
      FileProblem problem;
      EXPECT_EQ(LoadFromBytes(deep, 3, &problem), nullptr) << nest.name;
      EXPECT_EQ(problem.code, FILEERROR_TOO_DEEP) << nest.name;
      LoadFromBytes(shallow, 3, &problem);
      EXPECT_NE(problem.code, FILEERROR_TOO_DEEP) << nest.name; // some end in another fault
    });
  }
}

TEST(SmallStack, SavesAndCopiesADeepDocumentOrRefusesTo)
{
  const DocumentPtr document = NewDocument();
  BaseObject* parent = AllocObject(kObjectNull);
  document->InsertObject(parent);
  for (Long depth = 2; depth < HyperFile::kMaxLoopDepth; ++depth) {
    BaseObject* child = AllocObject(kObjectNull);
    ASSERT_TRUE(child->InsertUnder(parent));
    parent = child;
  }
  RunOnSmallStack([&] {
    MemoryDescription description;
    Filename name;
    name.SetMemoryWrite(&description);
    FileProblem problem;
    SaveDocument(document.get(), name, 0, &problem);
    EXPECT_TRUE(problem.code == FILEERROR_NONE || problem.code == FILEERROR_TOO_DEEP) << problem.code;
    const DocumentPtr copy = NewDocument();
    const Bool copied = document->CopyWithTranslation(*copy, 0, nullptr);
    EXPECT_EQ(copy->GetFirstObject() != nullptr, copied);
  });
}
#endif
