// Polygons, splines and points of scenes from elsewhere.
#include "tests/gltf/converted_scene.h"

namespace
{

using namespace gltf_test;

class GltfGeometry : public GltfScene
{
 protected:
  // Points on the corners of a square of 100, and one far off.
  BaseObject* AddMesh(const char* name, const std::vector<PolygonCorners>& polygons)
  {
    BaseObject* object = Add(kObjectPolygon, name);
    EXPECT_TRUE(ResizePolygons(*object, 5, static_cast<Long>(polygons.size()), -1));
    const Vector points[] = {{0, 0, 0}, {0, 100, 0}, {100, 100, 0}, {100, 0, 50}, {1e6, 0, 0}};
    std::copy(std::begin(points), std::end(points), GetPointTag(*object)->GetArray());
    if (PolygonTag* tag = GetPolygonTag(*object)) // there is none for no polygons
      std::copy(polygons.begin(), polygons.end(), tag->GetArray());
    return object;
  }
  template <class Tag>
  static Tag* AddTag(BaseObject& object, Long type, const char* name = "")
  {
    auto* tag = static_cast<Tag*>(object.MakeTag(type));
    tag->SetName(String(name));
    return tag;
  }
};

TEST_F(GltfGeometry, PolygonsBecomeTrianglesOfTheOtherWinding)
{
  AddMesh("mesh", {{0, 1, 2, 3}, {0, 1, 2, 2}, {1, 1, 2, 2}, {0, 0, 1, 2}, {0, 1, 2, 9}, {-1, 0, 1, 2}});
  const Converted scene = Convert();
  const Json& primitive = scene.Primitive("mesh");
  ExpectNear(scene.Numbers(primitive["attributes"]["POSITION"]), {0, 0, 0, 1, 1, 0, 0, 1, 0, 1, 0, -0.5}, 1e-6);
  // 0 1 2 3 in the scene are the vertices 0 2 1 3.
  ExpectNear(scene.Numbers(primitive["indices"]), {0, 1, 2, 0, 3, 1, 0, 1, 2, 0, 1, 2});
  EXPECT_EQ(scene.Lost(Loss::kBrokenPolygon), 2U);
  EXPECT_EQ(primitive["attributes"].size(), 1U);
  EXPECT_FALSE(primitive.contains("mode"));
  const Json& accessor = scene.json["accessors"][primitive["attributes"]["POSITION"].get<std::size_t>()];
  ExpectNear(accessor["min"], {0, 0, -0.5});
  ExpectNear(accessor["max"], {1, 1, 0});
  EXPECT_EQ(scene.json["bufferViews"][0]["target"], 34962);
  EXPECT_EQ(scene.json["bufferViews"][1]["target"], 34963);
}

TEST_F(GltfGeometry, CornersShareVerticesWhereTheyAreEqual)
{
  BaseObject* mesh = AddMesh("mesh", {{0, 1, 2, 2}, {0, 2, 3, 3}});
  ASSERT_TRUE(AddUVWTag(*mesh));
  auto* uvw = NodeCast<UVWTag>(mesh->GetTag(kTagUVW));
  uvw->WritePolygonUVW(0, {{0, 0.25, 0}, {0, 1, 0}, {1, 1, 0}, {1, 1, 0}});
  uvw->WritePolygonUVW(1, {{0, 0.25, 0}, {0.5, 1, 0}, {1, 0, 0}, {1, 0, 0}});
  auto* normals = AddTag<NormalTag>(*mesh, kTagNormal);
  ASSERT_TRUE(normals->ResizeTagArray(2));
  normals->WritePolygonNormals(0, {{0, 0, -1}, {0, 0, -1}, {0.5, 0, 0.5}, {0, 0, 0}});
  normals->WritePolygonNormals(1, {{0, 0, -1}, {0, 0, 0}, {0, 1, 0}, {0, 1, 0}});
  mesh->InsertTag(MakeTag(5612));
  auto* heat = AddTag<VertexMapTag>(*mesh, kTagVertexMap, "heat");
  ASSERT_TRUE(heat->ResizeTagArray(5));
  heat->GetArray()[3] = 0.5F;
  const Converted scene = Convert();
  const Json& attributes = scene.Primitive("mesh")["attributes"];
  ExpectNear(scene.Numbers(scene.Primitive("mesh")["indices"]), {0, 1, 2, 0, 3, 4});
  ExpectNear(scene.Numbers(attributes["TEXCOORD_0"]), {0, 0.25, 1, 1, 0, 1, 1, 0, 0.5, 1}, 1e-6);
  const double half = std::sqrt(0.5);
  const std::vector<double> expected = {0, 0, 1, half, 0, -half, 0, 0, 1, 0, 1, 0};
  const std::vector<double> found = scene.Numbers(attributes["NORMAL"]);
  ExpectNear(std::vector<double>(found.begin(), found.begin() + 12), expected, 1e-3);
  EXPECT_NEAR(std::hypot(found[12], found[13], found[14]), 1, 1e-6) << "a corner without a normal takes the face's";
  ExpectNear(scene.Numbers(attributes["_WEIGHT_0"]), {0, 0, 0, 0.5, 0});
  EXPECT_EQ(scene.json["meshes"][0]["extras"]["q7r"]["weights"], Json({"heat"}));
  EXPECT_EQ(scene.Lost(Loss::kSmoothing), 0U);
}

TEST_F(GltfGeometry, EachMaterialDrawsItsSelection)
{
  BaseObject* mesh = AddMesh("mesh", {{0, 1, 2, 2}, {0, 2, 3, 3}, {1, 2, 3, 3}, {1, 3, 4, 4}});
  for (const auto& [name, first, last] :
       {std::tuple{"left", 0, 0}, std::tuple{"both", 0, 1}, std::tuple{"other", 2, 2}, std::tuple{"last", 3, 3}})
    ASSERT_TRUE(AddTag<SelectionTag>(*mesh, kTagPolygonSelection, name)->GetSelect().SelectAll(first, last));
  // Tags go in at the top: the last one made is the first one.
  AddTexture(*mesh, *AddMaterial("nowhere", {1, 1, 1}))->GetDataInstance().SetString(1006, "none");
  AddTexture(*mesh, *AddMaterial("green", {0, 1, 0}))->GetDataInstance().SetString(1006, "left");
  Material* red = AddMaterial("red", {1, 0, 0});
  AddTexture(*mesh, *red)->GetDataInstance().SetString(1006, "both");
  AddTexture(*mesh, *red)->GetDataInstance().SetString(1006, "last");
  const Converted scene = Convert();
  const Json& primitives = scene.json["meshes"][0]["primitives"];
  ASSERT_EQ(primitives.size(), 3U);
  EXPECT_FALSE(scene.MaterialOf("mesh", 0).contains("name")) << "what no tag covers is grey";
  EXPECT_EQ(scene.MaterialOf("mesh", 1)["name"], "red");
  EXPECT_EQ(scene.Numbers(primitives[1]["indices"]).size(), 6U) << "what two tags of one material draw";
  EXPECT_EQ(scene.MaterialOf("mesh", 2)["name"], "green");
  EXPECT_EQ(scene.Numbers(primitives[2]["indices"]).size(), 3U);
  EXPECT_EQ(scene.Lost(Loss::kTextureSelection), 1U);
  EXPECT_EQ(scene.json["meshes"][0]["extras"]["q7r"]["selections"],
            Json::parse(R"([{"name": "other", "of": "polygons", "count": 1}])"));
  EXPECT_EQ(scene.Lost(Loss::kSelection), 1U);
}

TEST_F(GltfGeometry, ManyVerticesTakeWideIndices)
{
  for (const Long count : {65535, 65536}) {
    BaseObject* mesh = Add(kObjectPolygon, count == 65535 ? "narrow" : "wide");
    ASSERT_TRUE(ResizePolygons(*mesh, count, count / 3 + 1, -1));
    for (Long i = 0; i < count; ++i)
      GetPointTag(*mesh)->GetArray()[i] = Vector(i, i % 7, 0);
    for (Long i = 0; i <= count / 3; ++i) {
      const Long last = std::min(3 * i + 2, count - 1);
      GetPolygonTag(*mesh)->GetArray()[i] = {last - 2, last - 1, last, last};
    }
  }
  const Converted scene = Convert();
  auto typeOf = [&](const char* name) {
    return scene.json["accessors"][scene.Primitive(name)["indices"].get<std::size_t>()]["componentType"];
  };
  EXPECT_EQ(typeOf("narrow"), 5123);
  EXPECT_EQ(typeOf("wide"), 5125);
}

TEST_F(GltfGeometry, TellsWhatMeshesLose)
{
  const TempFolder folder;
  WriteWholeFile(folder / "a.jpg", {0xFF, 0xD8, 0xFF, 0xC0, 0, 8, 8, 0, 1, 0, 1, 0, 0xFF, 0xDA, 0, 2, 0xFF, 0xD9});
  options.sceneFolder = folder.Path();
  BaseObject* mesh = AddMesh("mesh", {{0, 1, 2, 2}});
  Material* picture = AddMaterial("picture", {1, 0, 0});
  picture->BindChannelBitmap(kMaterialColorShader, Filename("a.jpg"));
  AddTexture(*mesh, *picture);
  AddTag<UVWTag>(*mesh, kTagUVW);
  AddTag<VertexMapTag>(*mesh, kTagVertexMap);
  mesh->InsertTag(MakeTag(5612));
  const Converted scene = Convert();
  EXPECT_EQ(scene.Lost(Loss::kBrokenTag), 2U);
  EXPECT_EQ(scene.Lost(Loss::kNoCoordinates), 1U);
  EXPECT_EQ(scene.Lost(Loss::kSmoothing), 1U);
  EXPECT_FALSE(scene.MaterialOf("mesh")["pbrMetallicRoughness"].contains("baseColorTexture"));
}

TEST_F(GltfGeometry, SplinesAreLines)
{
  SplineObject* curve = AllocSpline(5, 4);
  curve->SetName("curve");
  ASSERT_TRUE(ResizeSpline(*curve, 5, 3));
  document->InsertObject(curve);
  for (Long i = 0; i < 5; ++i)
    GetPointTag(*curve)->GetArray()[i] = Vector(100 * i, 0, 0);
  for (const Long bent : {0, 3}) // the second closes its loop
    GetTangentTag(*curve)->GetArray()[bent].right = Vector(0, 100, 0);
  GetSegmentTag(*curve)->GetArray()[0] = {2, 0};
  GetSegmentTag(*curve)->GetArray()[1] = {2, 1};
  GetSegmentTag(*curve)->GetArray()[2] = {1, 0};
  SplineObject* other = AllocSpline(3, 3);
  other->SetName("other");
  document->InsertObject(other);
  const Converted scene = Convert();
  ASSERT_EQ(scene.json["meshes"][scene.Node("curve")["mesh"].get<std::size_t>()]["primitives"].size(), 2U);
  EXPECT_EQ(scene.Primitive("curve", 0)["mode"], 3);
  EXPECT_EQ(scene.Primitive("curve", 1)["mode"], 2);
  const std::vector<double> line = scene.Numbers(scene.Primitive("curve", 0)["attributes"]["POSITION"]);
  ASSERT_EQ(line.size(), 3U * 17);
  // Half way: a quarter of both ends, and three eighths of each control point.
  ExpectNear(std::vector<double>(line.begin() + 24, line.begin() + 27), {0.5, 0.375, 0}, 1e-6);
  const std::vector<double> loop = scene.Numbers(scene.Primitive("curve", 1)["attributes"]["POSITION"]);
  ASSERT_EQ(loop.size(), 3U * 17);
  ExpectNear(std::vector<double>(loop.begin() + 27, loop.begin() + 30), {2.5, 0.375, 0}, 1e-6);
  EXPECT_EQ(scene.Numbers(scene.Primitive("other")["attributes"]["POSITION"]).size(), 9U);
  EXPECT_EQ(scene.Lost(Loss::kSplineType), 1U);
}

TEST_F(GltfGeometry, PointsAloneArePoints)
{
  BaseObject* points = AddMesh("points", {});
  const Converted scene = Convert();
  EXPECT_EQ(scene.Primitive("points")["mode"], 0);
  EXPECT_EQ(scene.Numbers(scene.Primitive("points")["attributes"]["POSITION"]).size(), 15U);
  ASSERT_TRUE(ResizePoints(*points, 0));
  EXPECT_FALSE(Convert().Node("points").contains("mesh"));
}

} // namespace
