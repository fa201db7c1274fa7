// What the listing for programs gives beside names: numbers of links and layers, places in the world, whole tracks.

#include "support/library.h"
#include "support/run_q7r.h"

TEST(SceneTree, TellsNodesOfOneNameApart)
{
  const DocumentPtr document = NewDocument();
  Material* materials[2] = {AllocMaterial(), AllocMaterial()};
  for (Material* material : materials)
    document->InsertMaterial(material); // the second one is the first then
  LayerObject* layer = AllocLayer();
  document->InsertLayer(layer);
  document->InsertLayer(AllocLayer());
  BaseObject* root = AllocObject(kObjectNull);
  document->InsertObject(root);
  root->SetFrozenPos({0, 0, 5});
  root->SetRelPos({1, 2, 3});
  root->SetDisabled(1);
  BaseObject* camera = AllocObject(kObjectCamera);
  camera->InsertUnderLast(root);
  camera->SetRelPos({10, 0, 0});
  camera->SetLayer(layer);
  camera->SetParameterById(kObjectDisplayColor, Vector(0.5, 1, 0));
  camera->SetParameterById(kObjectColorMode, Long{1});
  NodeCast<TextureTag>(camera->MakeTag(kTagTexture))->SetMaterial(materials[0]);
  ASSERT_TRUE(document->SetSceneCamera(camera));
  CTrack* track = CTrack::Alloc(camera, kObjectRenderMode, "Track");
  track->SetParameterById(kTrackAfter, Long{3});
  track->GetCurve(4, 1)->AddKey(BaseTime(1, 2));
  camera->InsertTrackLast(track);
  const TempFolder folder;
  WriteWholeFile(folder / "scene.q7r", SaveToBytes(*document));

  const RunResult run = RunQ7r("tree --json " + Quoted(folder / "scene.q7r"));
  ASSERT_EQ(run.status, 0) << run.err;
  const Json tree = Json::parse(run.out);
  EXPECT_EQ(tree["document"]["unit"], Json::parse(R"({"factor": 1.0, "code": 3, "metres": 0.01})"));
  EXPECT_EQ(tree["views"][0]["draws"][0]["sceneCameraIndex"], Json({0, 0}));
  const Json& top = tree["objects"][0];
  EXPECT_EQ(top["frozen"],
            Json::parse(R"({"pos": [0.0, 0.0, 5.0], "scale": [1.0, 1.0, 1.0], "rot": [0.0, 0.0, 0.0]})"));
  EXPECT_EQ(top["disabled"], 1);
  EXPECT_EQ(top["layerIndex"], nullptr);
  const Json& below = top["children"][0];
  EXPECT_EQ(below["global"], Json::parse("[11.0, 2.0, 8.0, 1.0, 0.0, 0.0, 0.0, 1.0, 0.0, 0.0, 0.0, 1.0]"));
  EXPECT_EQ(below["layerIndex"], Json::array({1}));
  EXPECT_EQ(below["displayColor"], Json({0.5, 1.0, 0.0}));
  EXPECT_EQ(below["colorMode"], 1);
  EXPECT_EQ(below["tags"][0]["data"]["1010"], "Mat");
  EXPECT_EQ(below["tags"][0]["links"], Json({{"1010", Json::array({1})}}));
  EXPECT_EQ(below["tracks"][0]["before"], 1);
  EXPECT_EQ(below["tracks"][0]["after"], 3);
  EXPECT_EQ(below["tracks"][0]["curves"]["4"][0]["time"], Json({1.0, 2.0}));
}
