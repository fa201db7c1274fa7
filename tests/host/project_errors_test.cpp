// Projects that can't be used, or only in part: a refusal with the place, or a reading, whatever the bytes.
#include "project_stage.h"

#include "host/writer/composition_writer.h"

namespace project_tests
{

// The line that the bytes are refused with; empty when all of it is read and written.
std::string Refusal(const std::string& bytes)
{
  try {
    const auto file = Open(bytes);
    const std::size_t count = file->Compositions().size();
    for (std::size_t i = 0; i < count; ++i) {
      const host::Project project = file->Read(i);
      if (project.root->frames < 1000)
        host::WriteComposition(project);
      for (const host::Layer& layer : project.layers)
        for (const auto& property : layer.streams)
          for (int frame = -30; property && frame < 300; frame += 30)
            property->At(frame);
    }
  } catch (const host::CompositionError& error) {
    return error.what();
  }
  return "";
}

// A project with something of each kind.
std::vector<Node> FullRoot()
{
  Layer solid{.id = 10, .source = 50};
  Add(solid.transform, "ADBE Position",
      Body({.components = 3,
            .form = 0x0E,
            .keys = {WideKey(0, kLinear, kBezier, {0, 0, 0}, {0, 0, 0, 0.5}, {}, {9, 9, 9}),
                     WideKey(9000, kBezier, kBezier, {5, 6, 7}, {}, {}, {}, true),
                     WideKey(25600, kBezier, kHold, {8, 8, 8}, {3, 0.5, 0, 0}, {1, 1, 1}, {})}}));
  Node turn =
      Body({.form = 0x06, .keys = {WideKey(0, kLinear, kLinear, {0}, {}), WideKey(9000, kLinear, kLinear, {0}, {})}});
  Add(solid.transform, "ADBE Orientation",
      List("otst", {turn, List("otky", {Chunk("otda", Data().Reals(0, {1, 2, 3})),
                                        Chunk("otda", Data().Reals(0, {4, 5, 6}))})}));
  Layer camera{.id = 11, .kind = 2, .parent = 10, .switches = 0x44};
  Add(camera.camera, "ADBE Camera Zoom",
      Body({.keys = {PlainKey(0, kBezier, kBezier, {100}, {{1, 0.5, 2, 0.5}}),
                     PlainKey(25600, kBezier, kBezier, {100}, {{1, 0.5, 2, 0.5}})}}));
  Comp inner{.id = 2, .name = "Inner", .layers = {MakeLayer({.id = 30, .source = 60})}};
  Comp comp = WithLayers({MakeLayer(solid), MakeLayer(camera), MakeLayer({.id = 12, .source = 2})});
  comp.duration[0] = inner.duration[0] = 1;
  const Data numbers = Settings(8, 8).U32(172, 1).U32(176, 9).U32(180, 4);
  return Root({MakeItem(comp), MakeItem(inner), kSolid, Footage(60, "/seq", true, numbers, {Utf8("a"), Utf8(".png")})},
              1);
}

// The chunk that the names lead to, each the first of its id or kind, or the one that its number tells.
Node& Find(std::vector<Node>& nodes, const std::string& path)
{
  const std::size_t slash = path.find('/');
  std::string name = path.substr(0, slash);
  std::size_t number = 1;
  if (const std::size_t blank = name.find(' '); blank != std::string::npos) {
    number = std::stoul(name.substr(blank));
    name.resize(blank);
  }
  const auto found = std::find_if(nodes.begin(), nodes.end(), [&](const Node& node) {
    return (node.id == name || node.kind.substr(0, node.kind.find(' ')) == name) && --number == 0;
  });
  if (found == nodes.end())
    throw std::runtime_error("no " + path);
  return slash == std::string::npos ? *found : Find(found->children, path.substr(slash + 1));
}

TEST(ProjectErrors, NameTheFileThePlaceAndWhatWasExpected)
{
  struct Fault
  {
    const char* path;
    std::size_t at; // of the bytes that are replaced; kCut: the data end after so many bytes as `value` says
    std::int64_t value;
    std::size_t width;
    const char* reason;
  };
  constexpr std::size_t kCut = 1000;
  const char* const kKeys = "Fold/Item/Layr/tdgp/tdgp/tdbs/list/";
  const std::string header = std::string(kKeys) + "lhd3", items = std::string(kKeys) + "ldat";
  const Fault faults[] = {
      {"Fold/Item/cdta", kCut, 100, 0, "expected 142 bytes or more, not 100"},
      {"Fold/Item/cdta", 140, 0, 2, "expected a size from 1 to 30000, not 0"},
      {"Fold/Item/cdta", 144, 0, 4, "expected a pixel aspect ratio above 0"},
      {"Fold/Item/cdta", 156, 0, 2, "expected a frame rate above 0 and not above 999"},
      {"Fold/Item/cdta", 8, 0, 4, "expected ticks for a frame and for a second above 0"},
      {"Fold/Item/cdta", 48, 0, 4, "expected a duration above 0"},
      {"Fold/Item/cdta", 28, 2, 4, "the work area ends before it starts"},
      {"Fold/Item/Layr/ldta", kCut, 131, 0, "expected 132 bytes or more, not 131"},
      {"Fold/Item/Layr/ldta", 132, 10, 4, "the chain of parents loops"},
      {"Fold/Item 2/Layr/ldta", 40, 1, 4, "composition \"Main\" contains itself"},
      {"Fold/Item 3/Pin/sspc", 32, 30001, 2, "expected a size from 0 to 30000, not 30001"},
      {"Fold/Item 3/Pin/opti", 14, 0x7FC00000, 4, "expected a colour"},
      {"Fold/Item 4/Pin/Als2/alas", 0, '[', 1, "expected JSON with the text \"fullpath\""},
      {"Fold/Item/Layr/tdgp/tdgp/tdbs/tdb4", 2, 5, 2, "expected 1 to 4 components, not 5"},
      {"Fold/Item/Layr/tdgp/tdgp/tdbs/tdb4", 12, 0, 4, "expected ticks for a second above 0"},
      {header.c_str(), 16, 100, 4, "expected items of 128 bytes, not 100"},
      {items.c_str(), kCut, 380, 0, "expected 3 items of 128 bytes"},
      {items.c_str(), 256, 5, 4, "keyframe 3 lies before the one ahead of it"},
      {items.c_str(), 56, 0x7FF00000, 4, "expected finite numbers"},
      {"Fold/Item/Layr/tdgp/tdgp/otst/otky/otda 2", kCut, 20, 0, "expected 24 bytes or more, not 20"},
  };
  EXPECT_EQ("", Refusal(BinaryFile(FullRoot())));
  EXPECT_EQ("", Refusal(XmlFile(FullRoot())));
  for (const Fault& fault : faults) {
    std::vector<Node> root = FullRoot();
    Node& node = Find(root, fault.path);
    if (fault.at == kCut)
      node.data.resize(static_cast<std::size_t>(fault.value));
    else
      for (std::size_t i = 0; i < fault.width; ++i)
        node.data[fault.at + i] = static_cast<char>(fault.value >> (8 * (fault.width - 1 - i)));
    const std::string binary = Refusal(BinaryFile(root)), xml = Refusal(XmlFile(root));
    // A layer that is at fault is named, not its data.
    const std::string path = fault.path;
    const bool isWhole = std::string(fault.reason).find("loops") != std::string::npos ||
                         std::string(fault.reason).find("itself") != std::string::npos;
    const std::string place = " (" + (isWhole ? path.substr(0, path.rfind('/')) : path) + "): " + fault.reason;
    EXPECT_TRUE(binary.starts_with("shot.aep: byte ") && binary.ends_with(place)) << binary << "\nnot" << place;
    if (path.find("alas") == std::string::npos) { // attributes there
      EXPECT_TRUE(xml.starts_with("shot.aep: line ") && xml.ends_with(place)) << xml << "\nnot" << place;
    }
  }
}

TEST(ProjectErrors, TellFilesThatAreNone)
{
  const std::string good = BinaryFile(FullRoot());
  std::string loop = good, deep = "<AfterEffectsProject>";
  for (int i = 0; i < 3000; ++i)
    deep += "<Fold>";
  const std::pair<std::string, const char*> cases[] = {
      {"", "byte 0: expected an After Effects project"},
      {"RIFF" + good.substr(4), "byte 0: expected an After Effects project"},
      {good.substr(0, 100), "byte 4: the chunks are to take"},
      {BinaryFile({Chunk("head", Data(20))}), "expected a list Fold"},
      {BinaryFile({Chunk("Fold", "")}), "expected a list Fold"},
      {BinaryFile({}) + "x", "expected a list Fold"},
      {"RIFX" + std::string(Data().U32(0, 9)) + "Egg!" + "Fold" + "x", "byte 12: the header of a chunk passes the end"},
      {"<html/>", "line 1: expected the element AfterEffectsProject"},
      {"\n\n<AfterEffectsProject>\n<a>", "line 4: not XML"},
      {"<AfterEffectsProject>\n<head bdata=\"0g\"/></AfterEffectsProject>",
       "line 2: bdata of head: expected hexadecimal digits"},
      {"<AfterEffectsProject><head bdata=\"012\"/></AfterEffectsProject>",
       "line 1: bdata of head: an odd number of digits"},
      {deep + "</Fold>", "not XML"},
      {"<AfterEffectsProject/>", "line 1: expected a list Fold"},
      {"<?xml version=\"1.0\"?>\n<AfterEffectsProject>\n<Fold2/></AfterEffectsProject>",
       "line 2: expected a list Fold"},
  };
  for (const auto& [bytes, reason] : cases) {
    const std::string refusal = Refusal(bytes);
    EXPECT_NE(refusal.find(reason), std::string::npos) << refusal << "\ndoes not say " << reason;
  }
  std::string nested = "<AfterEffectsProject>";
  for (int i = 0; i < 2000; ++i)
    nested += "<Fold>";
  for (int i = 0; i < 2000; ++i)
    nested += "</Fold>";
  EXPECT_EQ("shot.aep: line 1: nested deeper than 1000", Refusal(nested + "</AfterEffectsProject>"));
}

TEST(ProjectErrors, ComeAtAnyCutAndAnyByteInsteadOfACrash)
{
  const std::string good = BinaryFile(FullRoot());
  for (std::size_t length = 12; length < good.size(); length += 13) {
    std::string cut = good.substr(0, length); // in a block of its own size
    cut.replace(4, 4, std::string(Data().U32(0, static_cast<std::int64_t>(length - 8))));
    Refusal(cut);
  }
  for (std::size_t at = 12; at < good.size(); at += 3) {
    std::string changed = good;
    changed[at] = at % 2 ? '\xFF' : '\x01';
    Refusal(changed);
  }
  const std::string xml = XmlFile(FullRoot());
  for (std::size_t length = 0; length < xml.size(); length += 37)
    EXPECT_NE("", Refusal(xml.substr(0, length)));
}

TEST(ProjectErrors, FoldersAndCompositionsMayNestDeep)
{
  // 3,000 folders, one in the other: that isn't compositions' nesting.
  std::string inner = Binary(MakeItem(Comp{}));
  for (int i = 0; i < 3000; ++i) {
    const auto wrap = [](const std::string& kind, const std::string& data) {
      return "LIST" + std::string(Data().U32(0, static_cast<std::int64_t>(data.size() + 4))) + kind + data;
    };
    inner = wrap("Item", Binary(Chunk("idta", Data(84).U16(0, 1).U32(16, 900))) + wrap("Sfdr", inner));
  }
  const std::string fold =
      "LIST" + std::string(Data().U32(0, static_cast<std::int64_t>(inner.size() + 4))) + "Fold" + inner;
  const std::string file =
      "RIFX" + std::string(Data().U32(0, static_cast<std::int64_t>(fold.size() + 4))) + "Egg!" + fold;
  EXPECT_EQ(1U, Open(file)->Compositions().size());
  std::vector<Node> items;
  for (unsigned i = 1; i <= 1002; ++i) {
    Comp comp{.id = i, .layers = {MakeLayer({.id = i, .source = i + 1})}};
    items.push_back(MakeItem(comp));
  }
  EXPECT_NE(Refusal(BinaryFile(Root(items))).find("compositions nested deeper than 1000"), std::string::npos);
}

TEST(ProjectWarnings, TellOfAVersionThatIsNotKnown)
{
  std::vector<Node> root = Root({MakeItem(Comp{})});
  EXPECT_TRUE(Read(root).warnings.empty());
  root[0].data = Data(20).U32(4, (3U << 26) + (3U << 19));
  ASSERT_EQ(1U, Read(root).warnings.size());
  EXPECT_EQ("shot.aep: saved by version 27 of After Effects, newer than any that is known here",
            Read(root).warnings[0]);
}

} // namespace project_tests
