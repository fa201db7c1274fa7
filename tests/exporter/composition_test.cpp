#include "export_fixture.h"

namespace
{

using namespace export_test;

GeData Setting(BaseList2D* node, Long id) { return ParameterOf(*node, id); }

// "1/25", not reduced.
std::string TimeOf(BaseList2D* node, Long id)
{
  const BaseTime time = Setting(node, id).GetTime();
  return std::to_string(std::lround(time.GetNumerator())) + "/" + std::to_string(std::lround(time.GetDenominator()));
}

TEST(CompositionSettings, GoToTheDocumentAndTheRenderSettings)
{
  // The end is that of the render settings.
  const std::tuple<const char*, Long, std::string, std::string, std::string, Real, Real, Real> cases[] = {
      // 30 frames of 1001/30000 s, which come out as 29: start 10010/30000, last frame start + 28/30, end start +
      // 1001/1000.
      {R"({"fr":29.97,"ip":0,"op":99,"w":720,"h":480,"layers":[],"ae":{"workArea":[10,40],"pixelAspect":[10,11]}})", 30,
       "1001/3000", "1267/1000", "4004000/3000000", 29.97, 10.0 / 11.0, 1.5 * (10.0 / 11.0)},
      // One frame counts none.
      {R"({"fr":29.97,"ip":0,"op":1,"w":720,"h":480,"layers":[]})", 30, "0/1", "0/1", "1001/30000", 29.97, 1, 1.5},
      {R"({"fr":25,"ip":3,"op":4,"w":100,"h":200,"layers":[]})", 25, "3/25", "3/25", "100/625", 25, 1, 0.5},
      // The document's range begins at -600 s at the earliest; -5/30 s lies within.
      {R"({"fr":30,"ip":-5,"op":10,"w":100,"h":100,"layers":[]})", 30, "-1/6", "3/10", "4/12", 30, 1, 1},
  };
  for (const auto& [what, fps, start, last, end, rate, pixelAspect, filmAspect] : cases) {
    Exported exported(what);
    EXPECT_TRUE(exported.succeeded) << what;
    BaseDocument* document = exported.document.get();
    EXPECT_EQ(Setting(document, kDocumentFps).GetLong(), fps) << what;
    for (const Long id : {kDocumentMinTime, kDocumentLoopMin})
      EXPECT_EQ(TimeOf(document, id), start) << what;
    for (const Long id : {kDocumentMaxTime, kDocumentLoopMax})
      EXPECT_EQ(TimeOf(document, id), last) << what;
    BaseList2D* render = document->GetActiveRenderData();
    EXPECT_EQ(Setting(render, kRenderFrameRate).GetReal(), rate) << what;
    EXPECT_EQ(TimeOf(render, kRenderFrameFrom), start) << what;
    EXPECT_EQ(TimeOf(render, kRenderFrameTo), end) << what;
    EXPECT_EQ(Setting(render, kRenderPixelAspect).GetReal(), pixelAspect) << what;
    EXPECT_EQ(Setting(render, kRenderFilmAspect).GetReal(), filmAspect) << what;
    EXPECT_EQ(Setting(render, kRenderFrameMode).GetLong(), 2) << what;
    EXPECT_EQ(document->GetFirstRenderData()->GetNext(), nullptr) << what;
  }
}

TEST(CompositionSettings, MakeRenderSettingsWhereThereAreNone)
{
  host::StandaloneHost host(host::LoadCompositionText(Composition(""), "test.json", "/"));
  host.Start(EntryPointFunc);
  BaseDocument* document = BaseDocument::Alloc();
  document->GetRenderDataRoot()->FreeAll();
  EXPECT_TRUE(exporter::ExportComposition(document));
  ASSERT_NE(document->GetFirstRenderData(), nullptr);
  EXPECT_EQ(Setting(document->GetFirstRenderData(), kRenderWidth).GetReal(), 1000);
  EXPECT_EQ(Setting(document->GetFirstRenderData(), kRenderHeight).GetReal(), 500);
  BaseDocument::Free(document);
}

const std::string kCube = R"({"id":"cube","nm":"Cube","w":300,"h":200,"layers":[)" +
                          Solid("Front", R"("p":{"k":[150,100,0]})", R"("ae":{"locked":true})") + "," +
                          Solid("Back", "", R"("parent":5)") + "," + Layer(3, "Pivot", "", R"("ind":5)") + "]}";

TEST(CompositionWalk, BuildsTheTreeThatTheHostShows)
{
  const std::string flat = R"({"ty":1,"nm":"Flat","ind":1,"sw":9,"sh":9,"sc":"#fff","ks":{}})";
  const std::string cubeAsset = R"("assets":[)" + kCube + "]";
  const std::string outer =
      R"("assets":[)" + kCube + R"(,{"id":"outer","nm":"Outer","layers":[)" + Layer(0, "C1", "", R"("refId":"cube")") +
      "," + Layer(0, "C2", "", R"("refId":"cube","parent":8)") + "," + Layer(3, "N", "", R"("ind":8)") + "]}]";
  const std::tuple<const char*, std::string, const char*> cases[] = {
      {"no layer", Composition(""), "Main"},
      {"layer order, parents, targets",
       Composition(Solid("A", "", R"("parent":3)") + "," + Solid("B") + "," + Layer(3, "N", "", R"("ind":3)") + "," +
                   Layer(13, "Cam", R"("a":{"k":[0,0,9]})", R"("parent":3)")),
       "Main(B N(A Cam.Target Cam))"},
      {"2D layers, texts and shapes are left out",
       Composition(flat + "," + Solid("A", "", R"("parent":1)") + "," + Layer(5, "T", "") + "," + Layer(4, "S", "")),
       "Main(A)"},
      {"a missing source", Composition(Layer(2, "A", "", R"("refId":"none")") + "," + Solid("B")), "Main(B)"},
      {"a nested composition used twice",
       Composition(Layer(0, "P", "", R"("refId":"cube")") + "," + Solid("A") + "," +
                       Layer(0, "Q", "", R"("refId":"cube")"),
                   cubeAsset),
       "Main(P(Front Pivot(Back)) A Q(Front Pivot(Back)))"},
      {"two levels, each used twice",
       Composition(Layer(0, "P", "", R"("refId":"outer")") + "," + Layer(0, "Q", "", R"("refId":"outer")"), outer),
       "Main(P(C1(Front Pivot(Back)) N(C2(Front Pivot(Back)))) Q(C1(Front Pivot(Back)) N(C2(Front Pivot(Back)))))"},
      {"a layer without a name has that of its source", Composition(Layer(0, "", "", R"("refId":"cube")"), cubeAsset),
       "Main(Cube(Front Pivot(Back)))"},
  };
  for (const auto& [what, json, tree] : cases) {
    Exported exported(json);
    EXPECT_TRUE(exported.succeeded) << what;
    EXPECT_EQ(exported.Tree(), tree) << what;
    EXPECT_EQ(exported.Root()->GetNext(), nullptr) << what;
    EXPECT_TRUE(exported.host.Reports().empty()) << what;
  }
}

TEST(CompositionWalk, IsSilentWithoutAnActiveComposition)
{
  host::StandaloneHost host(host::LoadCompositionText(Composition(Solid("A")), "test.json", "/"));
  host.Start(EntryPointFunc);
  EXPECT_FALSE(exporter::ExportComposition(nullptr));
  BaseDocument* document = BaseDocument::Alloc();
  const host::Item* solid = &host.GetProject().items.back();
  ASSERT_EQ(solid->kind, host::ItemKind::kSolid);
  for (const host::Item* item : {static_cast<const host::Item*>(nullptr), solid}) {
    host.Activate(item);
    EXPECT_FALSE(exporter::ExportComposition(document));
    EXPECT_EQ(document->GetFirstObject(), nullptr);
  }
  EXPECT_TRUE(host.Reports().empty());
  BaseDocument::Free(document);
}

// "name:flags" from the first on, the flags as digits.
std::string SceneLayers(const BaseDocument& document)
{
  std::string layers;
  for (LayerObject* layer = document.GetFirstLayer(); layer; layer = layer->GetNext()) {
    layers += (layers.empty() ? "" : " ") + Text(layer->GetName()) + ":";
    for (Long flag = 0; flag < kLayerFlagCount; ++flag)
      layers += layer->GetFlag(flag) ? '1' : '0';
  }
  return layers;
}

std::string LayerOf(const BaseObject& object) { return object.GetLayer() ? Text(object.GetLayer()->GetName()) : "-"; }

TEST(SceneLayers, HoldNestedCompositionsAndLockedLayers)
{
  const std::string locked = R"("ae":{"locked":true})";
  Exported exported(Composition(Solid("A", "", locked) + "," + Layer(13, "Cam", R"("a":{"k":[0,0,9]})", locked) + "," +
                                    Solid("B") + "," + Layer(0, "P", "", R"("refId":"cube")") + "," +
                                    Layer(0, "Words", "", R"("refId":"text")") + "," +
                                    Layer(0, "Empty", "", R"("refId":"flat")"),
                                R"("assets":[)" + kCube + R"(,{"id":"text","layers":[)" + Layer(5, "T", "") +
                                    R"(]},{"id":"flat","layers":[{"ty":1,"sw":9,"sh":9,"sc":"#fff","ks":{}}]}])"));
  // New layers come first. A text alone makes a scene layer, a flat layer does not.
  EXPECT_EQ(SceneLayers(*exported.document), "Words:000101111 P:000101111 Lock Layer:011111111");
  const std::pair<const char*, const char*> layers[] = {
      {"A", "Lock Layer"}, {"Cam", "Lock Layer"}, {"Cam.Target", "Lock Layer"}, {"B", "-"}, {"P", "-"}, {"Front", "P"},
      {"Back", "P"},       {"Main", "-"},
  };
  for (auto [object, layer] : layers)
    EXPECT_EQ(LayerOf(exported.Object(object)), layer) << object;
}

TEST(CompositionWalk, RepeatsTheLayerThatWasReadLastAfterAFailure)
{
  // The second of four layers fails when its id is asked for. Rounds three and four make it again; the last copy has
  // the id's place in the tree, the others stay beside the root, which gets no name.
  const std::string json = Composition(Solid("A") + "," + Solid("B") + "," + Solid("C") + "," + Solid("D"));
  int idsAsked = 0;
  for (std::uint64_t n = 1; idsAsked < 2; ++n) {
    ASSERT_LT(n, 1000u);
    host::StandaloneHost host(host::LoadCompositionText(json, "test.json", "/"));
    ASSERT_EQ(host.Start(EntryPointFunc), 0);
    host.FailCall(host.CallCount() + n);
    BaseDocument* document = BaseDocument::Alloc();
    const bool succeeded = exporter::ExportComposition(document);
    idsAsked += host.LastError().find("AEGP_GetLayerID") != std::string::npos;
    if (idsAsked == 2) {
      EXPECT_FALSE(succeeded);
      EXPECT_EQ(Tree(document->GetFirstObject()), "(A B) B B");
      EXPECT_EQ(host.Reports().size(), 1u);
    }
    BaseDocument::Free(document);
  }
}

} // namespace
