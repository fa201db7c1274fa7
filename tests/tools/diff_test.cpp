// q7r diff: sees every change, and nothing where there is none.

#include "support/full_scene.h"
#include "support/library.h"
#include "support/run_q7r.h"

namespace
{

using full_scene::MakeFullScene;

std::string Save(const TempFolder& folder, const std::string& name, BaseDocument& document)
{
  WriteWholeFile(folder / name, SaveToBytes(document));
  return folder / name;
}

RunResult Diff(const std::string& a, const std::string& b, const std::string& options = {})
{
  return RunQ7r("diff " + options + " " + Quoted(a) + " " + Quoted(b));
}

template <class Tag>
Tag* FindTag(BaseDocument& document, Long type)
{
  return static_cast<Tag*>(document.GetFirstObject()->GetTag(type));
}

BaseObject* FindBelow(BaseDocument& document, Long type)
{
  BaseObject* object = document.GetFirstObject()->GetDown();
  while (object && object->GetType() != type)
    object = object->GetNext();
  return object;
}

BaseObject* Taken(BaseObject* object)
{
  object->RemoveFromList();
  return object;
}

Material& FirstMaterial(BaseDocument& document)
{
  BaseMaterial* material = document.GetFirstMaterial();
  while (!NodeCast<Material>(material))
    material = material->GetNext();
  return *NodeCast<Material>(material);
}

struct Change
{
  const char* what;
  std::function<void(BaseDocument&)> make;
  std::vector<std::string> says; // of the one line
};

const std::string kText = full_scene::kText;

const Change kChanges[] = {
    {"a parameter with a name",
     [](BaseDocument& d) { FindBelow(d, kObjectCamera)->SetParameterById(500, 50.0); },
     {"changed", "data/500 (focalLength): 36 -> 50"}},
    {"a light's parameter",
     [](BaseDocument& d) { FindBelow(d, kObjectLight)->SetParameterById(kLightBrightness, 0.5); },
     {"params/90001 (brightness): 1 -> 0.5"}},
    {"the place",
     [](BaseDocument& d) { FindBelow(d, kObjectPlane)->SetRelPos(Vector(1, 2, 3)); },
     {"objects/" + kText + "/" + kText, "  pos: (0, 0, 0) -> (1, 2, 3)"}},
    {"a new object",
     [](BaseDocument& d) { full_scene::AddObject(d, kObjectSky)->SetName("New"); },
     {"added    objects/New"}},
    {"an object less",
     [](BaseDocument& d) { const ObjectPtr sky(Taken(FindBelow(d, kObjectSky))); },
     {"removed  objects/" + kText}},
    {"an object elsewhere",
     [](BaseDocument& d) { d.InsertObject(Taken(FindBelow(d, kObjectPlane)), d.GetFirstObject()); },
     {"moved    objects/" + kText + "/" + kText, " -> objects/" + kText}},
    {"the order",
     [](BaseDocument& d) { Taken(d.GetFirstObject()->GetDownLast())->InsertUnder(d.GetFirstObject()); },
     {"order    objects/" + kText}},
    {"a name",
     [](BaseDocument& d) { FindBelow(d, kObjectPlane)->SetName("Wall"); },
     {"changed", "  name: \"" + kText + "\" -> \"Wall\""}},
    {"a point",
     [](BaseDocument& d) { FindTag<PointTag>(d, kTagPoint)->GetArray()[2].y = 5; },
     {"values: 1 of 3 entries, from entry 2 on: (0, 0, 0) -> (0, 5, 0)"}},
    {"more polygons",
     [](BaseDocument& d) { FindTag<PolygonTag>(d, kTagPolygon)->ResizeTagArray(5); },
     {"values: 2 of 5 entries, from entry 3 on: none -> (0, 0, 0, 0)"}},
    {"texture coordinates",
     [](BaseDocument& d) {
       const Vector quad[4] = {{0.5, 0, 0}, {}, {}, {}};
       FindTag<UVWTag>(d, kTagUVW)->WritePolygonUVW(0, quad);
     },
     {"tags/UVW", "values: 1 of 3 entries"}},
    {"a closed segment",
     [](BaseDocument& d) { FindTag<SegmentTag>(d, kTagSegment)->GetArray()[1].closed = 1; },
     {"values/1/1: false -> true"}},
    {"a selection",
     [](BaseDocument& d) { GetPolygonData(*d.GetFirstObject())->GetHiddenEdges().SelectAdd(7); },
     {"selections/hiddenEdges: absent -> "}},
    {"a key's value",
     [](BaseDocument& d) { d.GetFirstObject()->GetFirstTrack()->GetCurve(1, 0)->GetKey(1)->SetValue(nullptr, 9); },
     {"tracks/" + kText + "/keys/0.04  value: 0.5 -> 9"}},
    {"a new key",
     [](BaseDocument& d) { d.GetFirstObject()->GetFirstTrack()->GetCurve(2, 1)->AddKey(BaseTime(3, 2)); },
     {"added", "curves/2/1.5"}},
    {"a key's text",
     [](BaseDocument& d) {
       CCurve* curve = d.GetFirstTrack()->GetNext()->GetCurve(1, 0);
       curve->GetKey(0)->SetGeData(curve, GeData(String("b")));
     },
     {"tracks/" + kText, "keys/0  data: ", " -> \"b\""}},
    {"a material's colour",
     [](BaseDocument& d) { FirstMaterial(d).GetDataInstance().SetVector(kMaterialColor, Vector(1, 0, 0)); },
     {"materials/" + kText, "data/2100 (color)", " -> (1, 0, 0)"}},
    {"a channel", [](BaseDocument& d) { FirstMaterial(d).SwitchChannel(5, 1); }, {"channels/5: 0 -> 1"}},
    {"a shader's picture",
     [](BaseDocument& d) { FirstMaterial(d).GetShaders()->SetBitmapFilename(Filename("b.png")); },
     {"shaders/", "(filename)", "-> \"b.png\""}},
    {"a link",
     [](BaseDocument& d) { FirstMaterial(d).GetDataInstance().SetLink(kMaterialColorShader, nullptr); },
     {"(colorShader): -> ", "none"}},
    {"a gradient",
     [](BaseDocument& d) {
       BaseContainer& data = d.GetFirstObject()->GetDataInstance();
       for (Long id = 700000; id < 700040; ++id) {
         if (CustomData* gradient = data.GetCustomDataType(id, kCustomGradient))
           static_cast<GradientData*>(gradient)->GetSettings().SetLong(kGradientInterpolation, 3);
       }
     },
     {"settings/1000"}},
    {"a layer's switch",
     [](BaseDocument& d) { d.GetFirstLayer()->SetFlag(4, true); },
     {"layers/", "flags/4: false -> true"}},
    {"the layer of an object", [](BaseDocument& d) { d.GetFirstObject()->SetLayer(nullptr); }, {"layer: -> ", "none"}},
    {"the render size",
     [](BaseDocument& d) { d.GetFirstRenderData()->GetDataInstance().SetReal(kRenderWidth, 64); },
     {"renderData/", "(width)"}},
    {"a multipass",
     [](BaseDocument& d) {
       NodeCast<MultipassObject>(d.GetFirstRenderData()->GetMultipasses().GetFirst())->GetSettings().SetLong(5, 5);
     },
     {"multipasses/", "settings/5: absent -> 5"}},
    {"the view's camera",
     [](BaseDocument& d) {
       auto* panel = NodeCast<ViewPanel>(d.GetViewPanelRoot()->GetFirst());
       panel->GetBaseDraw(1)->GetEditorCamera()->SetRelPos({0, 1, 0});
     },
     {"views/View/draws/Draw[2]", "camera/pos"}},
    {"the frame rate", [](BaseDocument& d) { d.GetPref().SetFps(12); }, {"changed  document  fps: 30 -> 12"}},
    {"a setting of the document", [](BaseDocument& d) { d.GetSettings(4).SetReal(7, 0.5); }, {"settings/4/7"}},
};

} // namespace

TEST(Diff, TellsEachChangeInOneLine)
{
  const TempFolder folder;
  const DocumentPtr document = MakeFullScene();
  document->SetSceneCamera(FindBelow(*document, kObjectCamera));
  const std::string before = Save(folder, "a.q7r", *document);
  for (const Change& change : kChanges) {
    SCOPED_TRACE(change.what);
    const DocumentPtr changed = LoadFromBytes(ReadWholeFile(before));
    ASSERT_TRUE(changed);
    change.make(*changed);
    const RunResult run = Diff(before, Save(folder, "b.q7r", *changed));
    EXPECT_EQ(run.status, 1) << run.err;
    EXPECT_EQ(std::count(run.out.begin(), run.out.end(), '\n'), 1) << run.out;
    for (const std::string& part : change.says)
      EXPECT_NE(run.out.find(part), std::string::npos) << part << " is not in " << run.out;
  }
}

TEST(Diff, LeavesOutWhatDoesNotMatter)
{
  const TempFolder folder;
  const std::string one = Save(folder, "one.q7r", *MakeFullScene());
  const std::string other = Save(folder, "other.q7r", *MakeFullScene()); // other markers, another moment
  const std::string again = folder / "again.q7r";
  ASSERT_EQ(RunQ7r("resave " + Quoted(one) + " " + Quoted(again)).status, 0);
  for (const std::string& file : {one, other, again}) {
    const RunResult run = Diff(one, file);
    EXPECT_EQ(run.status, 0) << run.out;
    EXPECT_EQ(run.out, "the scenes are the same\n");
  }
  EXPECT_EQ(Diff(one, other, "--all").status, 1);
  EXPECT_EQ(Diff(one, folder / "none.q7r").status, 2);

  const DocumentPtr near = LoadFromBytes(ReadWholeFile(one));
  FindBelow(*near, kObjectPlane)->SetRelPos({1e-7, 0, 0});
  FindTag<PointTag>(*near, kTagPoint)->GetArray()[0].x = 1e-7;
  const std::string moved = Save(folder, "near.q7r", *near);
  EXPECT_EQ(Diff(one, moved, "--tolerance 1e-6").status, 0);
  const RunResult quiet = Diff(one, moved, "--quiet");
  EXPECT_EQ(quiet.status, 1);
  EXPECT_EQ(quiet.out + quiet.err, "");
  const Json json = Json::parse(Diff(one, moved, "--json").out);
  EXPECT_EQ(json["count"], 2);
  EXPECT_EQ(json["same"], false);
  EXPECT_EQ(json["differences"][1]["b"], Json({1e-7, 0.0, 0.0}));
  EXPECT_EQ(json["differences"][0]["a"], Json({{"entries", 3}}));
}

// What nobody understands is compared byte by byte, wherever it stands.
TEST(Diff, ComparesKeptBytes)
{
  const TempFolder folder;
  const auto write = [&](const char* name, int changed) {
    const auto byte = [changed](int place) { return std::string(place == changed ? "L1 " : "L0 "); };
    const Bytes body = Record("[110059,0 [777002,1 " + byte(1) + "] [110107,0 [110100,0 [5154,0 [777001,3 " + byte(2) +
                              "] [110064,9 L1012345 L SFog " + byte(3) + "] [110108,0 [110100,0 [5691,0 [110064,8 " +
                              "L1012346 L SMark " + byte(4) + "] ] ] ] ] ] ] ]");
    WriteWholeFile(folder / name, ByteWriter().Header().Append(body).bytes);
    return folder / name;
  };
  const std::string same = write("same.q7r", 0);
  const char* const says[] = {"document  kept/0/crc64", "objects/Fog  kept/0/crc64", "objects/Fog  raw/crc64",
                              "objects/Fog/tags/Mark  raw/crc64"};
  for (int i = 0; i < 4; ++i) {
    const RunResult run = Diff(same, write("other.q7r", i + 1));
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.out.find(std::string("changed  ") + says[i]), 0U) << run.out;
  }
}

TEST(Check, WarnsOfWhatIsOdd)
{
  const TempFolder folder;
  const DocumentPtr document = NewDocument();
  const std::string empty = Save(folder, "empty.q7r", *document);
  EXPECT_EQ(RunQ7r("check " + Quoted(empty)).out, empty + ": warning: the scene has no objects\n");
  for (int i = 0; i < 3; ++i)
    full_scene::AddObject(*document, kObjectCamera)->SetName("Eye");
  BaseObject* camera = document->GetFirstObject();
  camera->GetDataInstance().SetReal(500, -1);
  camera->MakeTag(kTagTexture);
  Material* material = AllocMaterial();
  material->BindChannelBitmap(kMaterialColorShader, Filename("a.png"));
  document->InsertMaterial(material);
  document->GetFirstRenderData()->GetDataInstance().SetReal(kRenderFrameRate, 0);
  const std::string odd = Save(folder, "odd.q7r", *document);
  const RunResult run = RunQ7r("check " + Quoted(odd));
  const RunResult quiet = RunQ7r("check --quiet " + Quoted(odd));
  EXPECT_EQ(run.status + quiet.status, 2);
  EXPECT_EQ(quiet.out, "");
  EXPECT_EQ(std::count(run.out.begin(), run.out.end(), '\n'), 5) << run.out;
  for (const char* part :
       {"objects/Eye: the name stands more than once in this list", "focalLength (500) is -1: it goes above 0",
        "tags/Texture: the texture tag has no material", "the picture \"a.png\" is missing", "frameRate (5020) is 0"})
    EXPECT_NE(run.out.find(part), std::string::npos) << part << " is not in\n" << run.out;
  // A picture beside the scene is there, whatever folder the scene names.
  WriteWholeFile(folder / "a.png", {1});
  EXPECT_EQ(RunQ7r("check " + Quoted(odd)).out.find("a.png"), std::string::npos);
  // A link whose target another program left out.
  const Bytes linked = Record("[110059,0 [110107,0 [110100,0 [5140,0 [777001,1 k7 ] ] ] ] ]");
  WriteWholeFile(folder / "link.q7r", ByteWriter().Header().Append(linked).bytes);
  EXPECT_NE(RunQ7r("check " + Quoted(folder / "link.q7r")).out.find("the link leads to nothing"), std::string::npos);
}
