// Whole documents: the layout of the file, every old form of the document's own chunks, partial loads, damage, merging
// and copying.
#include <functional>
#include <random>

#include <gtest/gtest.h>

#include "q7r_file/node_bytes.h"
#include "support/assertion_counter.h"
#include "support/counting_memory.h"
#include "support/scene_bytes.h"
#include "support/temp_folder.h"
#include "support/text.h"
#include "torvane/animation/ctrack.h"
#include "torvane/materials/base_material.h"
#include "torvane/tags/base_tag.h"
#include "torvane/time/date_time.h"

namespace
{

using namespace _torvane_;

BaseObject* AddObject(BaseDocument& document, const char* name, Long type = kObjectNull)
{
  BaseObject* object = AllocObject(type);
  object->SetName(name);
  document.InsertObject(object);
  return object;
}

// Two objects that point at each other through target tags, one below the other, on a layer, with a track.
DocumentPtr MakeScene()
{
  DocumentPtr document = NewDocument();
  BaseObject* parent = AddObject(*document, "Parent");
  BaseObject* child = AllocObject(kObjectPlane);
  child->SetName("Child");
  child->InsertUnder(parent);
  child->MakeTag(kTagTarget)->GetDataInstance().SetLink(kTargetLink, parent);
  parent->MakeTag(kTagTarget)->GetDataInstance().SetLink(kTargetLink, child);
  LayerObject* layer = AllocLayer();
  layer->SetName("Layer");
  document->InsertLayer(layer);
  child->SetLayer(layer);
  CTrack* track = CTrack::Alloc(child, {{903, 23, 0}, {1000, 19, 0}}, "Position X");
  for (Long frame = 0; frame < 3; ++frame)
    track->GetCurve(1, 1)->AddKey(BaseTime(frame, 25))->SetValue(nullptr, frame * 0.5);
  child->InsertTrackLast(track);
  document->GetPref().SetFps(25);
  return document;
}

BaseList2D* TargetOf(BaseObject* object)
{
  return object->GetTag(kTagTarget)->GetDataInstance().GetLink(kTargetLink, object->GetDocument());
}

// What MakeScene makes, found again.
void ExpectScene(BaseDocument& document)
{
  BaseObject* parent = document.GetFirstObject();
  ASSERT_NE(parent, nullptr);
  BaseObject* child = parent->GetDown();
  ASSERT_NE(child, nullptr);
  EXPECT_TRUE(child->GetName() == String("Child"));
  EXPECT_EQ(child->GetUp(), parent);
  EXPECT_EQ(child->GetDocument(), &document);
  EXPECT_EQ(TargetOf(child), parent);
  EXPECT_EQ(TargetOf(parent), child);
  EXPECT_EQ(child->GetLayer(), document.GetFirstLayer());
  CTrack* track = child->FindTrack({{903, 0, 0}, {1000, 0, 0}});
  ASSERT_NE(track, nullptr);
  ASSERT_EQ(track->GetCurve(1, 0)->GetKeyCount(), 3);
  EXPECT_EQ(track->GetCurve(1, 0)->GetKey(2)->GetValue(), 1.0);
  EXPECT_EQ(document.GetPref().GetFps(), 25);
}

TEST(DocumentFile, BeginsAndEndsAsEveryReaderExpects)
{
  DocumentPtr document = NewDocument();
  Bytes bytes = SaveToBytes(*document);
  EXPECT_EQ(ToHex(bytes.data(), 49), ToHex(FromHex("51513752 51375236 000032C8 00"
                                                   "01 0001ADEB 00000000  01 0001ADC8 00000002"
                                                   "0F 000032C8  15 00  15 00  02"
                                                   "01 0001ADE2 000000"))
                                         .substr(0, 49 * 3 - 1));
  // Preferences: 0, 30 fps, 0 s, 3 s, 0 s, 3 s, four switches, 1.0, three switches.
  const std::string zero = "16 0000000000000000 3FF0000000000000";
  const std::string three = "16 4008000000000000 3FF0000000000000";
  const Bytes pref = FromHex("01 0001ADBF 00000004 0F 00000000 0F 0000001E" + zero + three + zero + three +
                             "15 01 15 01 15 01 15 01 13 3FF0000000000000 15 00 15 00 15 00 02");
  auto place = std::search(bytes.begin(), bytes.end(), pref.begin(), pref.end());
  ASSERT_NE(place, bytes.end());
  // The state follows at once, and nothing stands behind the frame's end.
  ByteWriter state;
  state.Start(110059, 12).Time(0, 1).Long(11).Long(12574);
  for (int i = 0; i < 16; ++i)
    state.Bool(i % 4 != 3);
  for (int i = 0; i < 16; ++i)
    state.Bool(false);
  state.Filename(u"").Bool(false).Long(0).Filename(u"").Long(0);
  for (Long id : {0, 0, 0, 0, 0, -1, 0})
    state.Start(132, 1).Long(id).End();
  for (int i = 0; i < 3; ++i)
    state.Vector(0, 0, 0);
  state.Start(0, 0).Start(110050, 7);
  auto behindPref = place + static_cast<long>(pref.size());
  EXPECT_EQ(ToHex(Bytes(behindPref, behindPref + static_cast<long>(state.bytes.size()))), ToHex(state.bytes));
  ByteWriter tail;
  tail.Bool(false).Long(0).Long(0).Real(0.5).Real(0.5).Bool(false).Bool(false).Long(0).Bool(false);
  tail.Start(132, 1).Long(-1).End().Long(200000088).Long(1);
  for (int i = 0; i < 12; ++i)
    tail.Bool(i == 2 || i == 4);
  tail.End().End();
  EXPECT_EQ(ToHex(Bytes(bytes.end() - static_cast<long>(tail.bytes.size()), bytes.end())), ToHex(tail.bytes));
}

TEST(DocumentFile, ASceneComesBackWhole)
{
  counting_memory::BalanceCheck balance;
  DocumentPtr document = MakeScene();
  DocumentPtr back = LoadFromBytes(SaveToBytes(*document));
  ASSERT_NE(back, nullptr);
  ExpectScene(*back);
  EXPECT_EQ(back->GetLoadedVersion(), 13000);
  EXPECT_EQ(back->GetRenderDataRoot()->GetCount(), 1);
  GeData writer;
  back->GetParameterById(kDocumentWriterText, writer);
  EXPECT_EQ(Utf8(writer.GetString()), "TORVANE Saver V5 - Krokior (#1027408)");
  EXPECT_EQ(back->GetNBit(-1), 0x3C0000u);
}

TEST(DocumentFile, EveryCutGivesNullAndLeaksNothing)
{
  DocumentPtr document = MakeScene();
  Bytes whole = SaveToBytes(*document);
  AssertionCounter quiet;
  counting_memory::BalanceCheck balance;
  for (std::size_t size = 0; size < whole.size(); ++size) {
    FileProblem problem;
    ASSERT_EQ(LoadFromBytes(Bytes(whole.begin(), whole.begin() + static_cast<long>(size)), 3, &problem), nullptr)
        << size;
    ASSERT_NE(problem.code, FILEERROR_NONE) << size;
  }
  // Bytes behind the frame do no harm.
  whole.push_back(77);
  EXPECT_NE(LoadFromBytes(whole), nullptr);
}

TEST(DocumentFile, NoChangedByteCrashesTheReader)
{
  DocumentPtr document = MakeScene();
  const Bytes whole = SaveToBytes(*document);
  AssertionCounter quiet;
  counting_memory::BalanceCheck balance;
  std::mt19937 random(7);
  for (int round = 0; round < 3000; ++round) {
    Bytes damaged = whole;
    for (int i = 0; i < 3; ++i)
      damaged[13 + random() % (whole.size() - 13)] =
          static_cast<std::uint8_t>(random() % 4 ? random() : 1 + random() % 2);
    LoadFromBytes(damaged);
  }
}

TEST(DocumentFile, RefusesWhatIsNoSceneFile)
{
  struct Case
  {
    const char* name;
    Bytes bytes;
    Long flags;
    Long code;
  };
  const Bytes header = ByteWriter().Header().bytes;
  const Case cases[] = {
      {"nothing", {}, 3, FILEERROR_WRONG_VALUE},
      {"another ident", ByteWriter().Header("Q7R5").Start(110059, 0).End().bytes, 3, FILEERROR_WRONG_VALUE},
      {"the header alone", header, 3, FILEERROR_READ},
      {"a value before the frame", ByteWriter().Header().Long(1).bytes, 3, FILEERROR_WRONG_VALUE},
      {"a value inside the frame", ByteWriter().Header().Start(110059, 0).Long(1).bytes, 3, FILEERROR_CHUNK_STRUCTURE},
      {"an old version where a current one is asked for",
       ByteWriter().Header("Q7R6", 12599).Start(110059, 0).End().bytes, LoadObjects | LoadRequireCurrent,
       FILEERROR_OLD_VERSION},
  };
  AssertionCounter quiet;
  for (const Case& c : cases) {
    SCOPED_TRACE(c.name);
    FileProblem problem;
    EXPECT_EQ(LoadFromBytes(c.bytes, c.flags, &problem), nullptr);
    EXPECT_EQ(problem.code, c.code);
  }
  EXPECT_NE(LoadFromBytes(ByteWriter().Header("Q7R6", 99000).Start(110059, 0).End().bytes), nullptr);
}

TEST(DocumentFile, PartialLoadsReadNoMoreThanTheyNeed)
{
  DocumentPtr document = MakeScene();
  Bytes whole = SaveToBytes(*document);
  DocumentPtr materialsOnly = LoadFromBytes(whole, LoadMaterials);
  ASSERT_NE(materialsOnly, nullptr);
  EXPECT_EQ(materialsOnly->GetFirstObject(), nullptr);
  EXPECT_NE(materialsOnly->GetFirstLayer(), nullptr);
  // The file information ends at byte 40; nothing behind it is read.
  Bytes start(whole.begin(), whole.begin() + 40);
  start.insert(start.end(), 10, 0xFF);
  EXPECT_NE(LoadFromBytes(start, LoadObjects | LoadPreviewOnly), nullptr);
  const Bytes pref = ByteWriter().Start(110015, 4).bytes;
  auto place = std::search(whole.begin(), whole.end(), pref.begin(), pref.end());
  ASSERT_NE(place, whole.end());
  Bytes untilState(whole.begin(), place + 111);
  DocumentPtr prefs = LoadFromBytes(untilState, LoadPrefsOnly);
  ASSERT_NE(prefs, nullptr);
  EXPECT_EQ(prefs->GetPref().GetFps(), 25);
}

// The body of the state chunk up to level 0's end, and what each level adds.
ByteWriter StateStart(Long level, Long mode, Long tool)
{
  ByteWriter w;
  w.Start(110059, level).Time(1, 2).Long(mode).Long(tool);
  for (int i = 0; i < 32; ++i)
    w.Bool(i == 3);
  w.Filename(u"x").Bool(true).Long(5).Filename(u"y").Long(6);
  for (Long i = 0; i < 6; ++i)
    w.Start(132, 1).Long(i).Long(70 + i).Long(15).Long(100 + i).End();
  return w;
}

void AddStateLevels(ByteWriter& w, Long level)
{
  if (level >= 1)
    w.Start(132, 1).Long(0).End();
  if (level >= 2)
    w.Vector(1, 2, 3).Vector(1, 2, 3).Vector(1, 2, 3);
  if (level >= 3)
    w.Start(5, 5).Start(110069, 0).Long(0).End().End();
  if (level >= 4)
    w.Bool(true).Long(1).Long(1).Real(1).Real(1).Bool(true).Bool(true);
  if (level >= 5)
    w.Long(1);
  if (level >= 6)
    w.Bool(true);
  if (level >= 7)
    w.Start(132, 1).Long(9).Long(75).Long(15).Long(105).End();
  if (level >= 8)
    w.Long(200000089);
  if (level >= 9) {
    w.Long(4);
    for (int i = 0; i < 11; ++i)
      w.Bool(true);
  }
  if (level == 10)
    w.Long(1);
  if (level >= 12)
    w.Bool(true);
}

TEST(DocumentState, EveryLevelKeepsTheStreamInStep)
{
  for (Long level = 0; level <= 13; ++level) {
    SCOPED_TRACE(level);
    ByteWriter w;
    w.Header().Start(110059, 0).Append(StateStart(level, 4, 12111).bytes);
    AddStateLevels(w, level);
    if (level == 13)
      w.Long(1).Start(1, 1).Real(2).End(); // a newer program's values
    w.End().Start(110015, 0).Long(0).Long(12).Time(-1000, 1).Time(9, 1).Time(0, 1).Time(9, 1);
    w.Bool(false).Bool(true).Bool(false).Bool(true).End().End();
    DocumentPtr document = LoadFromBytes(w.bytes);
    ASSERT_NE(document, nullptr);
    EXPECT_EQ(document->GetMode(), 4);
    EXPECT_EQ(document->GetActiveTool(), level >= 8 ? 200000089 : 200000090); // level 8 tells the tool anew
    for (Long i : {0, 1, 2, 3})
      EXPECT_EQ(document->GetSettings(i).GetLong(70 + i), 100 + i);
    EXPECT_EQ(document->GetSettings(4).GetLong(75), 105); // the one before it is dropped
    EXPECT_EQ(document->GetSettings(5).GetLong(75, -1), level >= 7 ? 105 : -1);
    EXPECT_EQ(document->GetPref().GetFps(), 12);
    EXPECT_TRUE(document->GetPref().GetMinTime() == BaseTime(-600.0, 1.0));
    EXPECT_FALSE(document->GetPref().GetBool(0));
  }
}

TEST(DocumentState, TranslatesOldModesAndTools)
{
  auto load = [](Long mode, Long tool, Long level) {
    ByteWriter w;
    w.Header().Start(110059, 0).Append(StateStart(level, mode, tool).bytes);
    AddStateLevels(w, level);
    return LoadFromBytes(w.End().End().bytes);
  };
  for (auto [mode, expected] :
       {std::pair<Long, Long>{2, 11}, {8, 11}, {10, 11}, {15, 11}, {-1, 11}, {0, 0}, {14, 14}}) {
    DocumentPtr document = load(mode, 1, 0);
    EXPECT_EQ(document->GetMode(), expected);
    EXPECT_EQ(document->GetDataInstance().GetBool(50016), mode == 2);
  }
  for (auto [tool, expected] : {std::pair<Long, Long>{12111, 200000090},
                                {12152, 200000088},
                                {12256, 200000086},
                                {12572, 200000084},
                                {12573, 200000085},
                                {12574, 200000083},
                                {77, 77}})
    EXPECT_EQ(load(0, tool, 0)->GetActiveTool(), expected);
}

TEST(Document, AnswersItsParameters)
{
  DocumentPtr document = NewDocument();
  GeData value;
  for (auto [fps, expected] : {std::pair<Long, Long>{0, 1}, {5000, 1000}, {25, 25}}) {
    document->SetParameterById(kDocumentFps, GeData(fps));
    EXPECT_EQ(document->GetPref().GetFps(), expected);
  }
  // The first loop mark follows the minimum, the last one the maximum.
  document->SetParameterById(kDocumentMinTime, GeData(BaseTime(5.0, 1.0)));
  EXPECT_TRUE(document->GetPref().GetMaxTime() == BaseTime(5.0, 1.0));
  EXPECT_TRUE(document->GetPref().GetLoopMin() == BaseTime(5.0, 1.0));
  document->SetParameterById(kDocumentMaxTime, GeData(BaseTime(4.0, 1.0)));
  EXPECT_TRUE(document->GetPref().GetMaxTime() == BaseTime(5.0, 1.0));
  document->SetParameterById(kDocumentMaxTime, GeData(BaseTime(8.0, 1.0)));
  document->SetParameterById(kDocumentLoopMax, GeData(BaseTime(20.0, 1.0)));
  EXPECT_TRUE(document->GetPref().GetLoopMax() == BaseTime(8.0, 1.0));
  document->SetParameterById(kDocumentMinTime, GeData(BaseTime(-5000.0, 1.0)));
  EXPECT_TRUE(document->GetPref().GetMinTime() == BaseTime(-600.0, 1.0));

  document->SetParameterById(kDocumentTool, GeData(200000089));
  document->SetParameterById(kDocumentFirstAxisLock + 2, GeData(false));
  document->GetParameterById(kDocumentFirstAxisLock + 2, value);
  EXPECT_EQ(value.GetLong(), 0);
  document->SetParameterById(kDocumentTool, GeData(1)); // the row of all other tools
  document->GetParameterById(kDocumentFirstAxisLock + 2, value);
  EXPECT_EQ(value.GetLong(), 1);

  document->SetParameterById(kDocumentInverseSwitch, GeData(false));
  EXPECT_TRUE(document->GetDataInstance().GetBool(100004828));
  document->GetParameter({{kDocumentColor, kDataVector, 0}, {kVectorY, 0, 0}}, value);
  EXPECT_EQ(value.GetReal(), 0.38);
  document->GetDataInstance().SetLong(2113, 0);
  document->GetParameterById(kDocumentColor, value);
  EXPECT_TRUE(value.GetVector() == Vector(0.8, 0.8, 0.8));
}

TEST(Document, TellsWhoMadeItAndWhen)
{
  DocumentPtr document = NewDocument();
  BaseContainer& data = document->GetDataInstance();
  auto text = [&](Long id) {
    GeData value;
    document->GetParameterById(id, value);
    return value.GetType() == kDataString ? Utf8(value.GetString()) : "none";
  };
  data.SetString(kInfoCreatorName, "");
  data.SetLong(kInfoCreatorId, 7);
  EXPECT_EQ(text(kDocumentCreatorText), "#7");
  data.SetString(kInfoCreatorName, "Me");
  EXPECT_EQ(text(kDocumentCreatorText), "Me (#7)");
  data.SetLong(kInfoCreatorId, 0);
  EXPECT_EQ(text(kDocumentCreatorText), "Me");
  EXPECT_EQ(text(kDocumentSaveText), "none");
  const Real day = GetJulianDay({2001, 2, 3, 4, 5, 6});
  LLong bits = 0;
  std::memcpy(&bits, &day, sizeof bits);
  data.SetLLong(kInfoSaveDate, bits);
  EXPECT_EQ(text(kDocumentSaveText), "2001/02/03 04:05:06");
  EXPECT_FALSE(document->SetParameterById(kDocumentSaveText, GeData(String("no"))));
}

TEST(Document, CopiesWithLinksInsideTheCopy)
{
  counting_memory::BalanceCheck balance;
  DocumentPtr document = MakeScene();
  DocumentPtr copy(static_cast<BaseDocument*>(document->MakeClone(0, nullptr)));
  ASSERT_NE(copy, nullptr);
  document.reset();
  ExpectScene(*copy);
}

TEST(Document, MergesBehindNothingButAboveWhatIsThere)
{
  counting_memory::BalanceCheck balance;
  TempFolder folder;
  DocumentPtr source = MakeScene();
  AddObject(*source, "Second");
  Filename name;
  name.SetString(String((folder / "source.q7r").c_str(), STRINGENCODING_UTF8));
  ASSERT_TRUE(SaveDocument(source.get(), name, 0));
  source.reset();
  DocumentPtr target = NewDocument();
  AddObject(*target, "Old");
  FileProblem problem;
  ASSERT_TRUE(MergeDocument(target.get(), name, LoadObjects, &problem));
  std::string names;
  for (BaseObject* object = target->GetFirstObject(); object; object = object->GetNext())
    names += Utf8(object->GetName()) + " ";
  EXPECT_EQ(names, "Second Parent Old ");
  BaseObject* child = target->GetFirstObject()->GetNext()->GetDown();
  EXPECT_EQ(child->GetDocument(), target.get());
  EXPECT_EQ(TargetOf(child), child->GetUp());
  EXPECT_EQ(child->GetLayer(), target->GetFirstLayer());
  EXPECT_EQ(target->GetRenderDataRoot()->GetCount(), 2);
  name.SetString("no such file");
  EXPECT_FALSE(MergeDocument(target.get(), name, LoadObjects, &problem));
  EXPECT_EQ(problem.code, FILEERROR_OPEN);
  EXPECT_FALSE(SaveDocument(target.get(), Filename(), 0, &problem));
  for (auto refuse : {+[](const Filename&n, FileProblem&p) { return SaveDocument(nullptr, n, 0, &p); },
                      +[](const Filename&n, FileProblem&p) { return MergeDocument(nullptr, n, 3, &p); }}) {
    problem = {};
    EXPECT_FALSE(refuse(name, problem));
    EXPECT_EQ(problem.code, FILEERROR_INVALID);
  }
}

TEST(Document, AThousandLevelsOfParentsWork)
{
  DocumentPtr document = NewDocument();
  BaseObject* parent = AddObject(*document, "Top");
  for (int i = 0; i < 1000; ++i) {
    BaseObject* child = AllocObject(kObjectNull);
    child->InsertUnder(parent);
    parent = child;
  }
  DocumentPtr back = LoadFromBytes(SaveToBytes(*document));
  ASSERT_NE(back, nullptr);
  DocumentPtr copy(static_cast<BaseDocument*>(back->MakeClone(0, nullptr)));
  ASSERT_NE(copy, nullptr);
  int depth = 0;
  for (BaseObject* object = copy->GetFirstObject(); object; object = object->GetDown())
    ++depth;
  EXPECT_EQ(depth, 1001);
}

TEST(Document, WhatIsSavedCanBeLoadedAndWhatNestsTooDeepIsRefused)
{
  const auto depthOf = [](BaseDocument& document) {
    int depth = 0;
    for (BaseObject* object = document.GetFirstObject(); object; object = object->GetDown())
      ++depth;
    return depth;
  };
  DocumentPtr document = NewDocument();
  BaseObject* last = nullptr;
  int saved = 0;
  for (int depth = 1; depth <= HyperFile::kMaxLoopDepth + 1; ++depth) {
    BaseObject* object = AllocObject(kObjectNull);
    if (last)
      object->InsertUnder(last);
    else
      document->InsertObject(object);
    last = object;
    if (depth < HyperFile::kMaxLoopDepth - 5 && depth != 2000)
      continue;
    Long error = FILEERROR_NONE;
    const Bytes bytes = WriteToMemory(
        [&](HyperFile& file) {
          document->WriteChunks(file);
          error = file.GetError();
        },
        true);
    if (error == FILEERROR_NONE) {
      DocumentPtr back = LoadFromBytes(bytes);
      ASSERT_NE(back, nullptr) << depth;
      EXPECT_EQ(depthOf(*back), saved = depth);
    } else {
      EXPECT_EQ(error, FILEERROR_TOO_DEEP) << depth;
    }
  }
  EXPECT_GE(saved, HyperFile::kMaxLoopDepth - 3);
  EXPECT_LT(saved, HyperFile::kMaxLoopDepth);
}

TEST(Document, ACopyThatFailsLeavesNoNodesBehind)
{
  DocumentPtr source = NewDocument();
  AddObject(*source, "A")->MakeTag(kTagProtection);
  source->InsertMaterial(MakeMaterial(kMaterialStandard));
  source->InsertLayer(AllocLayer());
  DocumentPtr target = NewDocument();
  bool copied = false;
  for (LLong count = 0; !copied; count += 3) {
    counting_memory::FailAfter(count);
    copied = source->CopyWithTranslation(*target, 0, nullptr);
    counting_memory::FailNever();
    for (RootList2D* root :
         std::initializer_list<RootList2D*>{target->GetObjectRoot(), target->GetMaterialRoot(), target->GetLayerRoot()})
      EXPECT_EQ(root->IsEmpty(), !copied) << count;
  }
}

TEST(Document, NestingWithoutEndIsAnErrorAndNoCrash)
{
  ByteWriter w;
  w.Header().Start(110059, 0).Start(110107, 0);
  for (int i = 0; i < 100000; ++i)
    w.Start(110100, 0).Start(5154, 0).Start(110100, 0);
  AssertionCounter quiet;
  FileProblem problem;
  EXPECT_EQ(LoadFromBytes(w.bytes, 3, &problem), nullptr);
  EXPECT_EQ(problem.code, FILEERROR_CHUNK_STRUCTURE);
  EXPECT_EQ(Utf8(GetChunkPathText(problem)), "110059/110107/110100/5154/110100/110100/5154/110100/.../"
                                             "110100/5154/110100/110100/5154/110100/110100/5154");
}

TEST(RootLists, SkipWhatTheyDoNotKnowAndKeepTheNeighbours)
{
  auto object = [](std::u16string_view name) {
    ByteWriter w;
    w.Start(5154, 0).Start(110064, 0).Long(5140).Long(0).String(name).End().End();
    return w.bytes;
  };
  ByteWriter w;
  w.Header().Start(110059, 0).Start(110107, 0);
  w.Start(110100, 0).Append(object(u"gone")).End(); // the second list replaces the first
  w.Start(110100, 0).Append(object(u"one")).Start(5127, 0).Start(3, 3).Long(1).End().End();
  w.Start(110069, 0).Long(9).End().Append(object(u"two")).End().End();
  w.Start(424242, 1).String(u"unknown").End().End();
  DocumentPtr document = LoadFromBytes(w.bytes);
  ASSERT_NE(document, nullptr);
  ASSERT_EQ(document->GetObjectRoot()->GetCount(), 2);
  EXPECT_EQ(Utf8(document->GetFirstObject()->GetName()), "one");
  EXPECT_EQ(Utf8(document->GetFirstObject()->GetNext()->GetName()), "two");
  // What stood under the unknown label comes back behind them, also from a copy.
  const std::string unknown = ToHex(ByteWriter().Start(5127, 0).Start(3, 3).Long(1).End().End().bytes);
  DocumentPtr copy(NodeCast<BaseDocument>(document->MakeClone(0, nullptr)));
  ASSERT_NE(copy, nullptr);
  for (BaseDocument* each : {document.get(), copy.get()})
    EXPECT_NE(ToHex(SaveToBytes(*each)).find(unknown), std::string::npos);
}

TEST(RenderData, HasEveryDefaultInFileOrder)
{
  RenderData data;
  const BaseContainer& settings = data.GetDataInstance();
  EXPECT_EQ(settings.GetCount(), 133);
  EXPECT_EQ(settings.GetIndexId(0), 6014);
  EXPECT_EQ(settings.GetIndexId(132), 8022);
  EXPECT_EQ(settings.GetReal(5045), 6.283185307179586);
  EXPECT_EQ(settings.GetReal(5048), -1.5707963267948966);
  EXPECT_EQ(settings.GetContainerInstance(5702)->GetLong(10024), 353);
  RenderData back;
  back.GetDataInstance().Flush();
  ASSERT_TRUE(ReadInto(back, BytesOf(data)));
  EXPECT_EQ(back.GetDataInstance().GetCount(), 133);
  Bytes bytes = BytesOf(data);
  EXPECT_EQ(ToHex(Bytes(bytes.end() - 25, bytes.end())),
            ToHex(FromHex("01 11E1A717 00000000 01 00000084 00000001 0F FFFFFFFF 02 02")));
}

TEST(RenderData, KeepsEffectsPassesAndChildren)
{
  counting_memory::BalanceCheck balance;
  RenderData data;
  auto* effect = new BaseVideoPost;
  effect->SetName("Glow");
  effect->SetPluginId(1234);
  effect->GetSettings().SetLong(1, 2);
  data.GetVideoPosts().InsertLast(effect);
  auto* pass = new MultipassObject;
  pass->GetSettings().SetReal(3, 0.5);
  data.GetMultipasses().InsertLast(pass);
  data.GetExtraData().SetLong(8, 9);
  auto* copy = static_cast<RenderData*>(data.MakeClone(0, nullptr));
  ASSERT_NE(copy, nullptr);
  RenderData back;
  ASSERT_TRUE(ReadInto(back, BytesOf(*copy)));
  DeleteObj(copy);
  auto* readEffect = static_cast<BaseVideoPost*>(back.GetVideoPosts().GetFirst());
  ASSERT_NE(readEffect, nullptr);
  EXPECT_EQ(readEffect->GetPluginId(), 1234);
  EXPECT_EQ(readEffect->GetSettings().GetLong(1), 2);
  auto* readPass = static_cast<MultipassObject*>(back.GetMultipasses().GetFirst());
  ASSERT_NE(readPass, nullptr);
  EXPECT_EQ(readPass->GetSettings().GetReal(3), 0.5);
  EXPECT_EQ(readPass->GetDataInstance().GetLong(1002), 1);
  EXPECT_EQ(back.GetExtraData().GetLong(8), 9);
}

} // namespace
