// Stacks of blend layers: their file forms, their parameters at the ends of every range, and how layers are moved,
// copied and found.
#include "support/library.h"

namespace
{

// A custom value with its stack.
class Stack
{
 public:
  Stack() { value.SetType(kCustomBlendLayers); }

  iBlendDataType& Data() { return static_cast<iBlendDataType&>(*value.GetCustomDataType(kCustomBlendLayers)); }
  CBlendLayers& Layers() { return Data().GetLayers(); }
  BlendLayer* Add(Long type, Long id)
  {
    BlendLayer* layer = Layers().AppendLayer(type);
    layer->SetLayerId(id);
    return layer;
  }

  GeData value;
};

// "1 2(3 4) 5": the layer ids of a stack.
std::string Ids(const CBlendLayers& layers)
{
  std::string text;
  for (Long i = 0; i < layers.GetCount(); ++i) {
    BlendLayer* layer = layers.GetLayer(i);
    EXPECT_EQ(layer->GetParent(), &layers);
    text += (i ? " " : "") + std::to_string(layer->GetLayerId());
    if (BlendFolder* folder = layer->AsFolder())
      text += "(" + Ids(folder->GetChildren()) + ")";
  }
  return text;
}

double RealOf(const BlendLayer& layer, Long id)
{
  GeData value;
  EXPECT_TRUE(layer.GetLayerParameter(id, value)) << id;
  return value.GetReal();
}

// What opens a layer in a file.
std::string Head(int type, int id) { return "L" + std::to_string(type) + " B0 SL L" + std::to_string(id) + " L0 "; }

// A list of one layer of each type, ids 1 to 10, with values that differ from the defaults.
ByteWriter AllLayers(Long level)
{
  const std::string& value = FindRecordSample(level >= 2 ? "blend layers" : "blend layers 1").body;
  const std::size_t start = value.find("L#10");
  return ByteWriter().Append(Record(value.substr(start, value.find(" L2 ] ] C=0") - start)));
}

// Reads a stack with `body` in its chunk; a Long behind it must be in step.
bool ReadStack(Stack& stack, const Bytes& body)
{
  ByteWriter w;
  w.Header().Long(kCustomBlendLayers).Start(0, 2).Append(body).End().Long(77);
  MemoryReadFile memory(w.bytes);
  Long witness = 0;
  return stack.value.Read(memory.file) && memory.file.ReadLong(witness) && witness == 77;
}

} // namespace

TEST(BlendLayers, ReadFoldersByTheLevelOfTheirOwnList)
{
  // A folder of level 3 in a list of level 1, and one of level 0 in that.
  const std::string inner = Head(1, 2) + "L1 R1 B1 L1 L0 " + Head(7, 3) + "R0 R1 ";
  const std::string outer = Head(1, 1) + "L1 R1 B1 L1 L3 " + inner + "B0 " + Head(7, 4) + "R0 R1 L2";
  Stack stack;
  ASSERT_TRUE(ReadStack(stack, Record("L2 L1 " + outer)));
  EXPECT_EQ(Ids(stack.Layers()), "1(2(3)) 4");
  EXPECT_FALSE(stack.Layers().FindById(2)->IsEnabled());
  EXPECT_TRUE(stack.Layers().FindById(3)->IsEnabled());
}

TEST(BlendLayers, RefuseDamagedStacks)
{
  Stack stack;
  EXPECT_FALSE(ReadStack(stack, Record("L1 L3 " + Head(11, 1) + "B1 L2")));
  const Reports reports = TakeReports();
  ASSERT_GE(reports.size(), 2U);
  EXPECT_TRUE(reports[0] == "blendlayers:41" && reports[1] == "blendlayers:152");
  EXPECT_EQ(stack.value.GetType(), kDataNil);

  // A Colorize layer without a gradient: the values behind it are read, but the list has failed.
  MemoryReadFile memory(
      ByteWriter().Header().Append(Record("L1 L3 " + Head(6, 1) + "L2 [132,1 L-1 L1 L15 L1 ] B1 B1 B1 L77")).bytes);
  CBlendLayers layers;
  Long witness = 0;
  EXPECT_FALSE(layers.ReadList(memory.file, true));
  EXPECT_TRUE(memory.file.ReadLong(witness) && witness == 77);
  EXPECT_EQ(RealOf(*layers.GetLayer(0), 2003), 1);

  // Folders in folders without end.
  ByteWriter deep;
  for (int i = 0; i < 20000; ++i)
    deep.Append(Record("L1 L3 " + Head(1, 1) + "L1 R1 B1"));
  EXPECT_FALSE(ReadStack(stack = Stack(), deep.bytes));
}

TEST(BlendLayers, StartWithTheirDefaults)
{
  // values: by parameter id
  const std::tuple<Long, const char*, Long, std::vector<std::pair<Long, double>>> cases[] = {
      {1, "Folder", 1, {{2000, 1}, {2001, 1}, {2002, 1}}},
      {2, "BlendShader", 1, {{2000, 1}, {2001, 1}}},
      {3, "B/C/G", 0, {{2000, 0}, {2001, 0}, {2002, 1}}},
      {4, "HLS", 0, {{2000, 0}, {2001, 0}, {2002, 0}, {2003, 0}}},
      {5, "Posterize", 0, {{2000, 5}, {2001, 0.1}}},
      {6, "Colorize", 0, {{2000, 0}, {2002, 0}, {2003, 0}}},
      {7, "Clamp", 0, {{2000, 0}, {2001, 1}}},
      {8, "Clip", 0, {{2000, 0}, {2001, 1}}},
      {9, "Distort", 1, {{2000, 13}, {2001, 0.1}, {2002, 5}, {2003, 1}, {2004, 1}, {2005, 0}, {2006, 3}}},
      {10, "Transform", 1, {{2000, 0}, {2001, 0}, {2002, 0}}},
  };
  Stack stack;
  EXPECT_EQ(stack.Data().GetBlendVersion(), 2);
  for (const auto& [type, name, mark, values] : cases) {
    BlendLayer* layer = stack.Add(type, type);
    EXPECT_EQ(layer->GetLayerType(), type);
    EXPECT_EQ(Utf8(layer->GetName()), name);
    EXPECT_EQ(layer->GetLayerMark(), mark) << name;
    EXPECT_TRUE(layer->IsOpen() && layer->IsEnabled() && !layer->IsSelected());
    for (const auto& [id, value] : values)
      EXPECT_EQ(RealOf(*layer, id), value) << name << ' ' << id;
    for (Long id : {1000, 1001, 1002}) {
      EXPECT_EQ(RealOf(*layer, id), id == 1000 ? 1 : 0);
      EXPECT_TRUE(layer->SetLayerParameter(id, GeData(1)));
      EXPECT_EQ(RealOf(*layer, id), 1);
    }
    GeData value;
    EXPECT_FALSE(layer->GetLayerParameter(2007, value) || layer->SetLayerParameter(2007, GeData(1)));
  }
  GeData vector;
  EXPECT_TRUE(stack.Layers().GetLayer(9)->GetLayerParameter(2003, vector) && vector.GetVector() == Vector(1, 1, 1));
  EXPECT_EQ(stack.Layers().AppendLayer(0), nullptr);
  EXPECT_EQ(CBlendLayers::AllocObject(), nullptr);
  EXPECT_EQ(TakeReports(), (Reports{"blendlayers:41", "blendlayers:16"}));
}

TEST(BlendLayers, BringValuesIntoTheirRanges)
{
  constexpr double kFree = 1e300; // no range
  const std::tuple<Long, Long, Long, double, double> cases[] = {
      {1, 2001, 0, 0, 1},          {2, 2001, 0, 0, 1},          {3, 2000, 0, -1, 1}, {3, 2001, 1, -1, 1},
      {3, 2002, 2, 0.1, 10},       {4, 2000, 0, -180, 180},     {4, 2001, 1, -1, 1}, {4, 2002, 2, -1, 1},
      {5, 2000, 1, 1, 255},        {5, 2001, 0, 0, 1},          {6, 2000, 0, 0, 6},  {7, 2000, 0, 0, 1000},
      {8, 2001, 1, 0, 1000},       {9, 2001, 0, -1, 1},         {9, 2002, 1, 0, 20}, {9, 2003, 2, -kFree, kFree},
      {9, 2004, 3, -kFree, kFree}, {10, 2000, 0, -kFree, kFree}};
  for (const auto& [type, id, sub, low, high] : cases) {
    SCOPED_TRACE(::testing::Message() << "type " << type << " sub " << sub);
    Stack stack;
    BlendLayer* layer = stack.Add(type, 7);
    const Long path = 10000 + 7 * 20 + sub;
    for (const double given : {low, high, -5000.0, 5000.0}) {
      const double kept = std::clamp(given, low, high);
      EXPECT_TRUE(stack.Data().SetParameter(path, GeData(given)));
      GeData value;
      EXPECT_TRUE(stack.Data().GetParameter(path, value) && value.GetReal() == kept);
      EXPECT_EQ(RealOf(*layer, id), kept);
    }
    EXPECT_TRUE(layer->SetLayerParameter(id, GeData(5000.0)));
    EXPECT_EQ(RealOf(*layer, id), 5000);
  }
  Stack stack;
  BlendLayer* hsl = stack.Add(kBlendHSL, 0);
  const ParameterPath hue = 10000, second = 10001, flag = 10003;
  EXPECT_TRUE(stack.Data().SetParameter(hue, GeData(200.0)));
  EXPECT_EQ(RealOf(*hsl, 2000), 180);
  EXPECT_TRUE(stack.Data().SetParameter(flag, GeData(true)) && stack.Data().SetParameter(hue, GeData(200.0)));
  EXPECT_EQ(RealOf(*hsl, 2000), 200);
  EXPECT_TRUE(stack.Data().SetParameter(hue, GeData(361.0)) && stack.Data().SetParameter(second, GeData(-0.5)));
  EXPECT_EQ(RealOf(*hsl, 2000), 360);
  EXPECT_EQ(RealOf(*hsl, 2001), 0);
}

TEST(BlendLayers, RouteAParameterToItsLayer)
{
  Stack stack;
  stack.Add(kBlendBC, 1);
  auto* folder = stack.Add(kBlendFolder, 2)->AsFolder();
  BlendLayer* transform = folder->GetChildren().AppendLayer(kBlendTransform);
  transform->SetLayerId(3);
  stack.Add(kBlendColorize, 4);

  ULong flags = 0;
  GeData value;
  EXPECT_TRUE(stack.Data().GetValue(10025, value, flags)); // the layer hasn't this sub
  EXPECT_EQ(flags, 0U);
  EXPECT_TRUE(stack.Data().GetValue(10022, value, flags));
  EXPECT_EQ(flags, 2U);
  EXPECT_EQ(value.GetReal(), 1.0);
  EXPECT_FALSE(stack.Data().GetParameter(10025, value) || stack.Data().SetParameter(10025, GeData(1.0)));
  for (Long none : {0, 9999, 10000, 10019, 10100})
    EXPECT_FALSE(stack.Data().GetValue(none, value, flags) || stack.Data().SetValue(none, GeData(1.0), flags)) << none;
  // A component of a Vector, below a folder.
  EXPECT_TRUE(stack.Data().SetParameter({{10063}, {1001}}, GeData(9.0)));
  EXPECT_TRUE(stack.Data().GetParameter(10063, value) && value.GetVector() == Vector(1, 9, 1));
  EXPECT_TRUE(stack.Data().GetParameter({{10063}, {1001}}, value) && value.GetReal() == 9.0);
  EXPECT_FALSE(stack.Data().SetParameter({{10063}, {1003}}, GeData(9.0)));
  EXPECT_TRUE(stack.Data().SetParameter(10064, GeData(Vector(1, 2, 3))));

  // Parts of a gradient, and the whole.
  EXPECT_TRUE(stack.Data().SetParameter({{10081}, {1000}}, GeData(6)) && stack.Data().GetParameter(10081, value));
  EXPECT_EQ(static_cast<GradientData*>(value.GetCustom())->GetSettings().GetLong(1000), 6);
  EXPECT_TRUE(stack.Data().SetParameter({{10081}, {1000}}, GeData(2)) && stack.Data().SetParameter(10081, value));
  EXPECT_TRUE(stack.Data().GetParameter({{10081}, {1000}}, value) && value.GetLong() == 6);
  EXPECT_FALSE(stack.Data().GetParameter({{10081}, {10500}}, value));
  EXPECT_FALSE(stack.Data().SetParameter({{10081}, {10500}}, GeData(1.0)));
  EXPECT_EQ(TakeReports(), (Reports{"blendlayers:1235", "blendlayers:1259"}));
}

TEST(BlendLayers, MoveWithinAndBetweenFolders)
{
  Stack stack;
  CBlendLayers& layers = stack.Layers();
  BlendLayer* first = stack.Add(kBlendBC, 1);
  BlendLayer* folder = stack.Add(kBlendFolder, 2);
  BlendLayer* inner = folder->AsFolder()->GetChildren().AppendLayer(kBlendFolder);
  inner->SetLayerId(3);
  BlendLayer* last = stack.Add(kBlendClip, 4);
  const std::tuple<BlendLayer*, BlendLayer*, Long, bool, const char*> moves[] = {
      {first, folder, 2, true, "2(3()) 1 4"},  {last, first, 0, true, "2(3()) 4 1"},
      {first, last, 0, true, "2(3()) 1 4"},    {last, folder, 1, true, "2(4 3()) 1"},
      {first, inner, 1, true, "2(4 3(1))"},    {first, last, 1, false, "2(4 3(1))"},
      {folder, inner, 1, false, "2(4 3(1))"},  {folder, first, 0, false, "2(4 3(1))"},
      {folder, folder, 1, false, "2(4 3(1))"}, {first, first, 2, true, "2(4 3(1))"},
      {first, nullptr, 2, true, "1 2(4 3())"}, {inner, nullptr, 0, true, "3() 1 2(4)"},
      {first, folder, 7, true, "3() 1 2(4)"},  {nullptr, folder, 1, false, "3() 1 2(4)"},
      {last, inner, 2, true, "3() 4 1 2()"},
  };
  for (const auto& [layer, target, place, moved, ids] : moves) {
    EXPECT_EQ(layers.MoveLayer(layer, target, place), moved) << ids;
    EXPECT_EQ(Ids(layers), ids);
  }
  BlendLayer* fresh = stack.Add(kBlendFolder, 5);
  EXPECT_FALSE(counting_memory::WithoutMemory([&] { return layers.MoveLayer(last, fresh, 1); }));
  EXPECT_EQ(Ids(layers), "3() 4 1 2() 5()");
  CBlendLayers::RemoveLayerFromParent(last);
  EXPECT_EQ(last->GetParent(), nullptr);
  EXPECT_TRUE(layers.MoveLayer(last, inner, 0));
  EXPECT_EQ(Ids(layers), "4 3() 1 2() 5()");
  EXPECT_FALSE(folder->AsFolder()->GetChildren().RemoveLayer(last));
  EXPECT_TRUE(layers.RemoveLayer(last));
  CBlendLayers::DeleteLayer(last);
  EXPECT_EQ(Ids(layers), "3() 1 2() 5()");
}

TEST(BlendLayers, FindAndSelectDepthFirst)
{
  Stack stack;
  stack.Add(kBlendBC, 1);
  CBlendLayers& children = stack.Add(kBlendFolder, 2)->AsFolder()->GetChildren();
  children.AppendLayer(kBlendClip)->SetLayerId(5);
  stack.Add(kBlendClamp, 5);
  EXPECT_TRUE(stack.Layers().FindById(5) == children.GetLayer(0) && stack.Layers().FindById(6) == nullptr);
  EXPECT_EQ(stack.Layers().FirstSelected(), nullptr);
  stack.Layers().GetLayer(2)->SetSelected(true);
  EXPECT_EQ(stack.Layers().FirstSelected(), stack.Layers().GetLayer(2));
  children.GetLayer(0)->SetSelected(true);
  EXPECT_EQ(stack.Layers().FirstSelected(), children.GetLayer(0));
  stack.Layers().ClearSelection();
  EXPECT_EQ(stack.Layers().FirstSelected(), nullptr);
}

TEST(BlendLayers, CopyAndCompareEverySetting)
{
  Stack stack;
  ASSERT_TRUE(ReadStack(stack, AllLayers(3).Long(2).bytes));
  const GeData copy(stack.value);
  EXPECT_TRUE(copy.IsEqual(stack.value));
  auto& copied = static_cast<iBlendDataType&>(*copy.GetCustom());
  EXPECT_EQ(Ids(copied.GetLayers()), "1() 2 3 4 5 6 7 8 9 10");
  for (Long i = 0; i < 10; ++i) {
    BlendLayer& layer = *copied.GetLayers().GetLayer(i);
    const BlendLayer& other = *stack.Layers().GetLayer(i);
    for (Long id = 1000; id <= 2006; ++id) {
      GeData value;
      if (!layer.GetLayerParameter(id, value) || (value.GetType() != kDataLong && value.GetType() != kDataReal))
        continue;
      EXPECT_FALSE(layer.LayersDiffer(other));
      EXPECT_TRUE(layer.SetLayerParameter(id, GeData(value.GetReal() == 0 ? 1 : 0)));
      EXPECT_TRUE(layer.LayersDiffer(other) && !copy.IsEqual(stack.value)) << i << ' ' << id;
      EXPECT_TRUE(layer.LayersEqualIgnoringFlags(other, 0) && layer.SetLayerParameter(id, value));
    }
    EXPECT_FALSE(layer.CopyLayerTo(*stack.Layers().GetLayer((i + 1) % 10), nullptr));
  }
  EXPECT_TRUE(copy.IsEqual(stack.value));
  BlendLayer& folder = *copied.GetLayers().GetLayer(0);
  folder.AsFolder()->GetChildren().AppendLayer(kBlendBC);
  EXPECT_TRUE(folder.LayersDiffer(*stack.Layers().GetLayer(0)));
  EXPECT_FALSE(folder.LayersEqualIgnoringFlags(*stack.Layers().GetLayer(0), 0));
  stack.Layers().GetLayer(0)->AsFolder()->GetChildren().AppendLayer(kBlendBC);
  EXPECT_TRUE(copy.IsEqual(stack.value));
  stack.Data().SetBlendVersion(3);
  EXPECT_FALSE(copy.IsEqual(stack.value));
}

// What a reader would refuse isn't written.
TEST(BlendLayers, AreRefusedInASaveWhenTheyNestTooDeepToBeReadAgain)
{
  Stack stack;
  CBlendLayers* layers = &stack.Layers();
  for (Long lists = 1; lists <= HyperFile::kMaxLoopDepth + 1; ++lists) {
    if (lists == 100 || lists >= HyperFile::kMaxLoopDepth) {
      const bool fits = lists <= HyperFile::kMaxLoopDepth;
      Long error = FILEERROR_NONE;
      const Bytes written = WriteToMemory(
          [&](HyperFile& file) {
            stack.value.Write(file);
            error = file.GetError();
          },
          true);
      EXPECT_EQ(error, fits ? FILEERROR_NONE : FILEERROR_TOO_DEEP) << lists;
      MemoryReadFile again(written);
      Stack back;
      EXPECT_TRUE(back.value.Read(again.file) == fits || lists > 100) << lists;
    }
    layers = &layers->AppendLayer(kBlendFolder)->AsFolder()->GetChildren();
  }
}

TEST(BlendLayers, NameAndReleaseTheirShader)
{
  BaseShader owner;
  BaseShader* shader = MakeShader(5833);
  shader->SetName("Stone");
  owner.InsertShaderLast(shader);
  Stack stack;
  BlendLayer* folder = stack.Add(kBlendFolder, 1);
  GeData value;
  EXPECT_TRUE(folder->GetLayerParameter(2003, value) && value.GetAliasLink() && !value.GetLink());
  EXPECT_FALSE(folder->SetLayerParameter(2003, value)); // no child to take it
  auto* layer = static_cast<BlendShader*>(folder->AsFolder()->GetChildren().AppendLayer(kBlendShader));
  GeAliasLink link;
  link.SetLink(shader);
  EXPECT_TRUE(folder->SetLayerParameter(2003, GeData(link)));
  EXPECT_EQ(layer->GetShader(), shader);
  EXPECT_TRUE(layer->GetLayerParameter(2002, value) && value.GetLink() == shader);
  EXPECT_FALSE(layer->SetLayerParameter(2002, GeData(1)));
  String name;
  layer->GetLayerName(name);
  EXPECT_EQ(Utf8(name), "Stone");
  EXPECT_EQ(Utf8(layer->GetName()), "Stone");

  // The copy of a node with the stack in its container leads to the copy's own shader.
  owner.GetDataInstance().SetData(1, stack.value);
  auto* clone = static_cast<BaseShader*>(owner.MakeClone(0, nullptr));
  auto* copied = static_cast<iBlendDataType*>(clone->GetDataInstance().GetCustomDataType(1, kCustomBlendLayers));
  GeAliasLink* copiedLink = copied->GetLayers().GetFirstLink();
  ASSERT_NE(copiedLink, nullptr);
  EXPECT_EQ(copiedLink->GetLink(), clone->GetShaders());
  EXPECT_NE(copiedLink->GetLink(), shader);
  DeleteObj(clone);

  EXPECT_TRUE(stack.Layers().RemoveLayer(folder)); // takes the shader along
  EXPECT_EQ(owner.GetShaders(), nullptr);
  EXPECT_EQ(layer->GetShader(), nullptr);
  layer->GetLayerName(name);
  EXPECT_EQ(Utf8(name), "BlendShader");
  CBlendLayers::DeleteLayer(folder);
}

TEST(BlendLayers, LetAShaderLiveThatHoldsTheirStack)
{
  BaseShader owner;
  BaseShader* outer = MakeShader(1011128);
  BaseShader* inner = MakeShader(1011128);
  owner.InsertShaderLast(outer);
  inner->InsertUnderLast(outer);
  BaseContainer group;
  group.SetData(1, Stack().value);
  inner->GetDataInstance().SetContainer(5, group);
  BaseContainer* settings = inner->GetDataInstance().GetContainerInstance(5);
  auto& layers = static_cast<iBlendDataType*>(settings->GetCustomDataType(1, kCustomBlendLayers))->GetLayers();
  for (BaseShader* target : {inner, outer}) {
    BlendLayer* folder = layers.AppendLayer(kBlendFolder);
    BlendLayer* layer = folder->AsFolder()->GetChildren().AppendLayer(kBlendShader);
    layer->GetLink()->SetLink(target);
    EXPECT_TRUE(layers.RemoveLayer(folder) && layers.GetCount() == 0);
    EXPECT_TRUE(owner.GetShaders() == outer && outer->GetDown() == inner);
    CBlendLayers::DeleteLayer(folder);
  }
}
