// Whole documents: the layout of the file, old modes and tools, partial loads, damage, merging and copying.
#include "support/library.h"

namespace
{

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
  EXPECT_TRUE(child->GetUp() == parent && child->GetDocument() == &document);
  EXPECT_TRUE(TargetOf(child) == parent && TargetOf(parent) == child);
  EXPECT_EQ(child->GetLayer(), document.GetFirstLayer());
  CTrack* track = child->FindTrack({{903, 0, 0}, {1000, 0, 0}});
  ASSERT_NE(track, nullptr);
  ASSERT_EQ(track->GetCurve(1, 0)->GetKeyCount(), 3);
  EXPECT_EQ(track->GetCurve(1, 0)->GetKey(2)->GetValue(), 1.0);
  EXPECT_EQ(document.GetPref().GetFps(), 25);
}

TEST(DocumentFile, BeginsAndEndsAsEveryReaderExpects)
{
  const Bytes bytes = SaveToBytes(*NewDocument());
  const Bytes start = ByteWriter().Header().Append(Record("[110059,0 [110024,2 L13000 B0 B0 ] [110050,7 L0")).bytes;
  EXPECT_EQ(ToHex(bytes.data(), start.size()), ToHex(start));
  // The preferences and the state, and nothing behind them.
  const Bytes end = Record("[110015,4 L0 L30 T0 T3 T0 T3 4( B1 ) R1 3( B0 ) ] [110059,12 T0 L11 L12574 "
                           "4( B1 B1 B1 B0 ) 16( B0 ) F B0 L0 F L0 5( K0 ) K K0 3( V=0 ) [0,0 ");
  EXPECT_NE(std::search(bytes.begin(), bytes.end(), end.begin(), end.end()), bytes.end());
  const Bytes tail = Record("B0 L0 L0 R0.5 R0.5 B0 B0 L0 B0 K L200000088 L1 B0 B0 B1 B0 B1 7( B0 ) ] ]");
  EXPECT_EQ(ToHex({bytes.end() - static_cast<long>(tail.size()), bytes.end()}), ToHex(tail));
}

TEST(DocumentFile, ASceneComesBackWhole)
{
  const DocumentPtr back = LoadFromBytes(SaveToBytes(*MakeScene()));
  ASSERT_NE(back, nullptr);
  ExpectScene(*back);
  EXPECT_EQ(back->GetLoadedVersion(), 13000);
  EXPECT_EQ(back->GetRenderDataRoot()->GetCount(), 1);
  EXPECT_EQ(Utf8(ParameterOf(*back, kDocumentWriterText).GetString()), "TORVANE Saver V5 - Krokior (#1027408)");
  EXPECT_EQ(back->GetNBit(-1), 0x3C0000u);
}

TEST(DocumentFile, EveryCutGivesNullAndLeaksNothing)
{
  Bytes whole = SaveToBytes(*MakeScene());
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
  const Bytes whole = SaveToBytes(*MakeScene());
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
  const Bytes header = ByteWriter().Header().bytes;
  const std::tuple<const char*, Bytes, Long, Long> cases[] = {
      {"nothing", {}, 3, FILEERROR_WRONG_VALUE},
      {"another ident", ByteWriter().Header("Q7R5").Start(110059, 0).End().bytes, 3, FILEERROR_WRONG_VALUE},
      {"the header alone", header, 3, FILEERROR_READ},
      {"a value before the frame", ByteWriter().Header().Long(1).bytes, 3, FILEERROR_WRONG_VALUE},
      {"a value inside the frame", ByteWriter().Header().Start(110059, 0).Long(1).bytes, 3, FILEERROR_CHUNK_STRUCTURE},
      {"an old version where a current one is asked for",
       ByteWriter().Header("Q7R6", 12599).Start(110059, 0).End().bytes, LoadObjects | LoadRequireCurrent,
       FILEERROR_OLD_VERSION},
  };
  for (const auto& [name, bytes, flags, code] : cases) {
    SCOPED_TRACE(name);
    FileProblem problem;
    EXPECT_EQ(LoadFromBytes(bytes, flags, &problem), nullptr);
    EXPECT_EQ(problem.code, code);
  }
  EXPECT_NE(LoadFromBytes(ByteWriter().Header("Q7R6", 99000).Start(110059, 0).End().bytes), nullptr);
}

TEST(DocumentFile, PartialLoadsReadNoMoreThanTheyNeed)
{
  Bytes whole = SaveToBytes(*MakeScene());
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

TEST(DocumentState, TranslatesOldModesAndTools)
{
  const auto load = [](Long mode, Long tool) {
    const std::string state = "[110059,0 [110059,0 T1 L" + std::to_string(mode) + " L" + std::to_string(tool);
    return LoadFromBytes(
        ByteWriter().Header().Append(Record(state + " 32( B0 ) F B0 L0 F L0 K70 K71 K72 K73 K74 K75 ] ]")).bytes);
  };
  for (auto [mode, expected] :
       {std::pair<Long, Long>{2, 11}, {8, 11}, {10, 11}, {15, 11}, {-1, 11}, {0, 0}, {4, 4}, {14, 14}}) {
    DocumentPtr document = load(mode, 1);
    EXPECT_EQ(document->GetMode(), expected);
    EXPECT_EQ(document->GetDataInstance().GetBool(50016), mode == 2);
    for (Long i : {0, 1, 2, 3})
      EXPECT_EQ(document->GetSettings(i).GetLong(70 + i), 70 + i);
    EXPECT_EQ(document->GetSettings(4).GetLong(75), 75); // the one before it is dropped
    EXPECT_EQ(document->GetSettings(5).GetCount(), 0);
  }
  const Long tools[][2] = {{12110, 200000089}, {12111, 200000090}, {12152, 200000088}, {12256, 200000086},
                           {12572, 200000084}, {12573, 200000085}, {12574, 200000083}, {77, 77}};
  for (const auto& [tool, expected] : tools)
    EXPECT_EQ(load(0, tool)->GetActiveTool(), expected);
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
  EXPECT_EQ(document->GetPref().GetMaxTime(), BaseTime(5.0, 1.0));
  EXPECT_EQ(document->GetPref().GetLoopMin(), BaseTime(5.0, 1.0));
  document->SetParameterById(kDocumentMaxTime, GeData(BaseTime(4.0, 1.0)));
  EXPECT_TRUE(document->GetPref().GetMaxTime() == BaseTime(5.0, 1.0));
  document->SetParameterById(kDocumentMaxTime, GeData(BaseTime(8.0, 1.0)));
  document->SetParameterById(kDocumentLoopMax, GeData(BaseTime(20.0, 1.0)));
  EXPECT_TRUE(document->GetPref().GetLoopMax() == BaseTime(8.0, 1.0));
  document->SetParameterById(kDocumentMinTime, GeData(BaseTime(-5000.0, 1.0)));
  EXPECT_TRUE(document->GetPref().GetMinTime() == BaseTime(-600.0, 1.0));

  document->SetParameterById(kDocumentTool, GeData(200000089));
  document->SetParameterById(kDocumentFirstAxisLock + 2, GeData(false));
  EXPECT_EQ(ParameterOf(*document, kDocumentFirstAxisLock + 2).GetLong(), 0);
  document->SetParameterById(kDocumentTool, GeData(1)); // the row of all other tools
  EXPECT_EQ(ParameterOf(*document, kDocumentFirstAxisLock + 2).GetLong(), 1);

  document->SetParameterById(kDocumentInverseSwitch, GeData(false));
  EXPECT_TRUE(document->GetDataInstance().GetBool(100004828));
  document->GetParameter({{kDocumentColor, kDataVector, 0}, {kVectorY, 0, 0}}, value);
  EXPECT_EQ(value.GetReal(), 0.38);
  document->GetDataInstance().SetLong(2113, 0);
  EXPECT_TRUE(ParameterOf(*document, kDocumentColor).GetVector() == Vector(0.8, 0.8, 0.8));
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
  for (const auto& [date, parameter, year] : {std::tuple<Long, Long, Long>{kInfoSaveDate, kDocumentSaveText, 2001},
                                              {kInfoCreationDate, kDocumentCreationText, 1999}}) {
    data.RemoveData(date);
    EXPECT_EQ(text(parameter), "none");
    const Real day = GetJulianDay({year, 2, 3, 4, 5, 6});
    LLong bits = 0;
    std::memcpy(&bits, &day, sizeof bits);
    data.SetLLong(date, bits);
    EXPECT_EQ(text(parameter), std::to_string(year) + "/02/03 04:05:06");
  }
  EXPECT_FALSE(document->SetParameterById(kDocumentSaveText, GeData(String("no"))));
}

TEST(Document, CopiesWithLinksInsideTheCopy)
{
  DocumentPtr document = MakeScene();
  DocumentPtr copy(static_cast<BaseDocument*>(document->MakeClone(0, nullptr)));
  ASSERT_NE(copy, nullptr);
  document.reset();
  ExpectScene(*copy);
}

TEST(Document, MergesBehindNothingButAboveWhatIsThere)
{
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
  EXPECT_TRUE(child->GetDocument() == target.get() && child->GetUp() == TargetOf(child));
  EXPECT_TRUE(child->GetLayer() == target->GetFirstLayer() && target->GetRenderDataRoot()->GetCount() == 2);
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
    object->SetRelPos({1, 0, 0});
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
      const DocumentPtr copy(static_cast<BaseDocument*>(back->MakeClone(0, nullptr)));
      EXPECT_TRUE(copy && depthOf(*copy) == depth);
    } else {
      EXPECT_EQ(error, FILEERROR_TOO_DEEP) << depth;
    }
  }
  EXPECT_EQ(last->GetGlobalMatrix().off, Vector(HyperFile::kMaxLoopDepth + 1, 0, 0));
  EXPECT_GE(saved, HyperFile::kMaxLoopDepth - 3);
  EXPECT_LT(saved, HyperFile::kMaxLoopDepth);
}

TEST(Document, ACopyThatFailsLeavesNoNodesBehind)
{
  DocumentPtr source = NewDocument();
  AddObject(*source, "A")->MakeTag(kTagProtection);
  source->InsertMaterial(MakeMaterial(kMaterialStandard));
  source->InsertLayer(AllocLayer());
  EveryFailedAllocation([&] {
    DocumentPtr target = NewDocument();
    if (!target || source->CopyWithTranslation(*target, 0, nullptr))
      return target;
    EXPECT_TRUE(target->GetObjectRoot()->IsEmpty() && target->GetMaterialRoot()->IsEmpty());
    EXPECT_TRUE(target->GetLayerRoot()->IsEmpty());
    return DocumentPtr();
  });
}

TEST(Document, NestingWithoutEndIsAnErrorAndNoCrash)
{
  ByteWriter w;
  w.Header().Start(110059, 0).Start(110107, 0);
  for (int i = 0; i < 100000; ++i)
    w.Start(110100, 0).Start(5154, 0).Start(110100, 0);
  FileProblem problem;
  EXPECT_EQ(LoadFromBytes(w.bytes, 3, &problem), nullptr);
  EXPECT_EQ(problem.code, FILEERROR_TOO_DEEP);
  EXPECT_EQ(Utf8(GetChunkPathText(problem)), "110059/110107/110100/5154/110100/110100/5154/110100/.../"
                                             "110100/5154/110100/110100/5154/110100/110100/5154");
}

TEST(RootLists, SkipWhatTheyDoNotKnowAndKeepTheNeighbours)
{
  const auto object = [](const std::string& name) { return "[5154,0 [110064,0 L5140 L0 S" + name + " ] ] "; };
  const std::string unknown = "[5127,0 [3,3 L1 ] ] ";
  DocumentPtr document = LoadFromBytes(
      ByteWriter()
          .Header()
          .Append(Record("[110059,0 [110107,0 [110100,0 " + object("gone") + "] [110100,0 " + object("one") + unknown +
                         "[110069,0 L9 ] " + object("two") + "] ] [424242,1 Sunknown ] ]")) // a list replaces another
          .bytes);
  ASSERT_NE(document, nullptr);
  ASSERT_EQ(document->GetObjectRoot()->GetCount(), 2);
  EXPECT_EQ(Utf8(document->GetFirstObject()->GetName()), "one");
  EXPECT_EQ(Utf8(document->GetFirstObject()->GetNext()->GetName()), "two");
  // What stood under the unknown label comes back behind them, also from a copy.
  DocumentPtr copy(NodeCast<BaseDocument>(document->MakeClone(0, nullptr)));
  ASSERT_NE(copy, nullptr);
  for (BaseDocument* each : {document.get(), copy.get()})
    EXPECT_NE(ToHex(SaveToBytes(*each)).find(ToHex(Record(unknown))), std::string::npos);
}

} // namespace
