// Views: panels with their draws, the settings of new ones, and the scene camera of a document.
#include "support/library.h"

namespace
{

BaseDraw* DrawAt(ViewPanel& panel, Long index)
{
  auto* draw = static_cast<BaseDraw*>(panel.GetDraws().GetFirst());
  for (Long i = 0; i < index; ++i)
    draw = draw->GetNext();
  return draw;
}

ViewPanel* FirstPanel(BaseDocument& document)
{
  return static_cast<ViewPanel*>(document.GetViewPanelRoot()->GetFirst());
}

} // namespace

TEST(View, ADrawHasACameraOfItsOwn)
{
  BaseDraw draw;
  const BaseObject& camera = *draw.GetEditorCamera();
  EXPECT_TRUE(camera.GetDataInstance().GetBool(1123) && camera.GetRelPos() == Vector(600.0001, 300, -600));
  EXPECT_NEAR(camera.GetRelRot().x, 0.7853981633974483, 1e-15);
  EXPECT_NEAR(camera.GetRelRot().y, -0.3490658503988659, 1e-15);
  EXPECT_EQ(camera.GetRelRot().z, 0);
}

TEST(View, MakesFourDrawsWithThePerspectiveFirst)
{
  // The projection, and the entries 1003, 1042, 1004, 1043.
  constexpr Long kMade[][5] = {{0, 0, 0, 0, 0}, {6, 6, 1, 6, 1}, {3, 6, 1, 6, 1}, {4, 6, 1, 6, 1}};
  ViewPanel panel;
  for (Long index : {7, 3, 4, 2, 1, 0, -1, -100}) {
    const BaseDraw* draw = panel.GetBaseDraw(index);
    EXPECT_EQ(draw, DrawAt(panel, std::clamp(index, Long{0}, Long{3}))) << index;
  }
  ASSERT_EQ(panel.GetDraws().GetCount(), 4);
  for (Long index = 0; index < 4; ++index) {
    SCOPED_TRACE(index);
    BaseDraw* draw = panel.GetBaseDraw(index);
    const BaseContainer& camera = draw->GetEditorCamera()->GetDataInstance();
    EXPECT_TRUE(camera.GetLong(1001) == kMade[index][0] && camera.GetReal(1000) == 1.0);
    EXPECT_EQ(camera.GetReal(500), 36.0);
    EXPECT_EQ(camera.GetReal(1118) + camera.GetReal(1119), 0.0);
    const Long ids[] = {1003, 1042, 1004, 1043};
    for (int i = 0; i < 4; ++i) {
      EXPECT_EQ(draw->GetDataInstance().GetIndexId(53 + i), ids[i]);
      EXPECT_EQ(draw->GetDataInstance().GetLong(ids[i], -1), kMade[index][i + 1]);
    }
  }
  // A panel that has some gets four before them; all or none when memory is short.
  EveryFailedAllocation([] {
    ViewPanel some;
    auto* own = NewObj<BaseDraw>();
    if (!own)
      return false;
    some.GetDraws().InsertLast(own);
    const bool made = some.GetBaseDraw(0) != nullptr;
    EXPECT_EQ(some.GetDraws().GetCount(), made ? 5 : 1);
    EXPECT_EQ(DrawAt(some, made ? 4 : 0), own);
    return made;
  });
}

TEST(View, WritesAndReadsAPanel)
{
  ViewPanel panel;
  const std::string list = ToHex(Record("[110124,0"));
  EXPECT_EQ(ToHex(BytesOf(panel)).find(list), std::string::npos); // no list
  panel.GetSettings().SetLong(5, 6);
  panel.GetBaseDraw(0);
  const std::string whole = ToHex(BytesOf(panel));
  EXPECT_NE(whole.find(ToHex(Record("C0 ] [110124,0 [110100,0 [110305,0"))), std::string::npos);
  const std::string end = ToHex(Record("] ] ] [110306,0 [132,1 L-1 L5 L15 L6 ] ]")); // draw, list, chunk
  EXPECT_EQ(whole.substr(whole.size() - end.size()), end);

  ViewPanel again;
  ASSERT_TRUE(ReadInto(again, BytesOf(panel)));
  EXPECT_EQ(again.GetSettings().GetLong(5), 6);
  ASSERT_EQ(again.GetDraws().GetCount(), 4);
  EXPECT_EQ(DrawAt(again, 1)->GetEditorCamera()->GetDataInstance().GetLong(1001), 6);
  // An empty chunk, one with more behind the list, and one with another value.
  for (const auto& [body, draws, read] : {std::tuple<const char*, Long, bool>{"", 4, true},
                                          {"[110100,0 [110305,0 ] [99,0 ] ] L4 ", 1, true},
                                          {"[98,0 L1 ] ", 1, true},
                                          {"L1 ", 1, false}}) {
    EXPECT_EQ(ReadInto(again, Record("[110124,0 " + std::string(body) + "] [7,7 ]")), read);
    EXPECT_EQ(again.GetDraws().GetCount(), draws);
  }
  MemoryReadFile memory(ByteWriter().Header().Long(1).bytes);
  EXPECT_FALSE(again.ReadChunk(memory.file, 110124, 0));
  EXPECT_EQ(memory.file.GetError(), -100);
}

TEST(View, LooksThroughTheSceneCameraThatWasSetLast)
{
  const DocumentPtr document = NewDocument();
  BaseObject* first = AllocObject(kObjectCamera);
  BaseObject* second = AllocObject(kObjectCamera);
  BaseObject* light = AllocObject(kObjectLight);
  first->SetName("One");
  second->SetName("Two");
  for (BaseObject* object : {first, second, light})
    document->InsertObject(object);
  EXPECT_FALSE(document->SetSceneCamera(nullptr) || document->SetSceneCamera(light));
  EXPECT_EQ(FirstPanel(*document), nullptr);
  for (BaseObject* camera : {first, second}) {
    EXPECT_TRUE(document->SetSceneCamera(camera));
    ASSERT_NE(FirstPanel(*document), nullptr);
    EXPECT_EQ(document->GetViewPanelRoot()->GetCount(), 1);
    EXPECT_EQ(DrawAt(*FirstPanel(*document), 0)->GetSceneCamera().GetLink(), camera);
  }
  EXPECT_FALSE(document->SetSceneCamera(light));
  EXPECT_EQ(DrawAt(*FirstPanel(*document), 0)->GetSceneCamera().GetLink(), second);
  for (Long index = 1; index < 4; ++index)
    EXPECT_EQ(DrawAt(*FirstPanel(*document), index)->GetSceneCamera().GetLink(), nullptr);

  // Through a file, and as a copy.
  const DocumentPtr loaded = LoadFromBytes(SaveToBytes(*document));
  ASSERT_NE(loaded, nullptr);
  auto* camera = static_cast<BaseList2D*>(DrawAt(*FirstPanel(*loaded), 0)->GetSceneCamera().GetLink());
  ASSERT_NE(camera, nullptr);
  EXPECT_TRUE(camera->GetName() == String("Two") && camera->GetDocument() == loaded.get());
  auto* copy = static_cast<ViewPanel*>(FirstPanel(*document)->MakeClone(0, nullptr));
  ASSERT_NE(copy, nullptr);
  EXPECT_EQ(DrawAt(*copy, 0)->GetSceneCamera().GetLink(), second);
  EXPECT_NE(DrawAt(*copy, 0)->GetEditorCamera(), DrawAt(*FirstPanel(*document), 0)->GetEditorCamera());
  EXPECT_EQ(DrawAt(*copy, 2)->GetEditorCamera()->GetDataInstance().GetLong(1001), 3);
  DeleteObj(copy);
}
