// Points, polygons, splines and selections as the program lists them, and through a resave.

#include "support/library.h"
#include "support/run_q7r.h"

namespace
{

template <class Tag>
Tag* AddTag(BaseObject& object, Long type, const char* name = "")
{
  auto* tag = static_cast<Tag*>(object.MakeTag(type));
  tag->SetName(String(name));
  return tag;
}

// Two triangles with all that can hang on them.
BaseObject* MakeRoof()
{
  BaseObject* roof = AllocObject(kObjectPolygon);
  roof->SetName(String("roof"));
  EXPECT_TRUE(ResizePolygons(*roof, 3, 2, 1) && AddUVWTag(*roof));
  for (Long i = 0; i < 3; ++i)
    GetPointTag(*roof)->GetArray()[i] = Vector(i, 0.1 * i, -i);
  GetPolygonTag(*roof)->GetArray()[1] = {2, 1, 0, 0};
  const Vector corners[4] = {Vector(0.25, 0.5, 0), Vector(), Vector(), Vector(1, 0, 0)};
  static_cast<UVWTag*>(roof->GetTag(kTagUVW))->WritePolygonUVW(1, corners);
  auto* map = AddTag<VertexMapTag>(*roof, kTagVertexMap, "heat");
  EXPECT_TRUE(map->ResizeTagArray(3));
  map->GetArray()[2] = 0.5f;
  auto* normals = AddTag<NormalTag>(*roof, kTagNormal);
  EXPECT_TRUE(normals->ResizeTagArray(1));
  normals->GetArray()[0].components[11] = -32000;
  BaseSelect& tops = AddTag<SelectionTag>(*roof, kTagPointSelection, "tops")->GetSelect();
  EXPECT_TRUE(tops.SelectAll(5, 9) && tops.SelectAdd(2));
  const ULong edges[] = {4, 5};
  EXPECT_TRUE(GetPolygonData(*roof)->GetNgons()->SetEdges(0, edges, 2));
  EXPECT_TRUE(GetPolygonData(*roof)->GetHiddenEdges().SelectAdd(7));
  return roof;
}

BaseObject* MakeArc()
{
  SplineObject* arc = AllocSpline(1, 2);
  arc->SetName(String("arc"));
  EXPECT_TRUE(ResizeSpline(*arc, 1, 2));
  GetTangentTag(*arc)->GetArray()[0] = {Vector(1, 2, 3), Vector(4, 5, 6)};
  GetSegmentTag(*arc)->GetArray()[1] = {4, 1};
  return arc;
}

std::string WriteScene(const TempFolder& folder)
{
  BaseDocument* document = CreateDocument();
  document->InsertObject(MakeArc());
  document->InsertObject(MakeRoof());
  const std::string path = folder / "scene.q7r";
  EXPECT_TRUE(SaveDocument(document, Filename(String(path.c_str())), 0));
  DeleteObj(document);
  return path;
}

Json TreeOf(const std::string& path)
{
  const RunResult run = RunQ7r("tree --json " + Quoted(path));
  EXPECT_EQ(run.status, 0) << run.err;
  return Json::parse(run.out, nullptr, false);
}

} // namespace

TEST(GeometryTree, ShowsEveryValueAndAResaveKeepsThem)
{
  const TempFolder folder;
  const std::string scene = WriteScene(folder);
  const std::string again = folder / "again.q7r";
  const RunResult resaved = RunQ7r("resave " + Quoted(scene) + " " + Quoted(again));
  EXPECT_EQ(resaved.status, 0) << resaved.err;

  const Json roofTags = Json::parse(R"([
    [5674, "tops", [[2, 2], [5, 9]]],
    [5711, "", [[0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, -32000]]],
    [5682, "heat", [0.0, 0.0, 0.5]],
    [5671, "UVW", [[[0.0, 0.0, 0.0], [0.0, 0.0, 0.0], [0.0, 0.0, 0.0], [0.0, 0.0, 0.0]],
                   [[0.25, 0.5, 0.0], [0.0, 0.0, 0.0], [0.0, 0.0, 0.0], [1.0, 0.0, 0.0]]]],
    [5604, "", [[0, 0, 0, 0], [2, 1, 0, 0]]],
    [5600, "", [[0.0, 0.0, 0.0], [1.0, 0.1, -1.0], [2.0, 0.2, -2.0]]]])");
  const Json arcTags = Json::parse(R"([
    [5672, "", [[0, false], [4, true]]],
    [5600, "", [[0.0, 0.0, 0.0]]],
    [5617, "", [[[1.0, 2.0, 3.0], [4.0, 5.0, 6.0]]]]])");
  for (const std::string& path : {scene, again}) {
    const Json objects = TreeOf(path)["objects"];
    ASSERT_EQ(objects.size(), 2u);
    for (std::size_t i = 0; i < 2; ++i) {
      Json tags = Json::array();
      for (const Json& tag : objects[i]["tags"])
        tags.push_back({tag["type"], tag["name"], tag["values"]});
      EXPECT_EQ(tags, i == 0 ? roofTags : arcTags) << path;
    }
    EXPECT_EQ(objects[0]["selections"], Json::parse(R"({"hiddenEdges": [[7, 7]]})"));
    EXPECT_EQ(objects[0]["ngons"], Json::parse("[[4, 5]]"));
    EXPECT_FALSE(objects[1].contains("selections") || objects[1].contains("ngons"));
  }
}

TEST(GeometryTree, CountsInWords)
{
  const TempFolder folder;
  const RunResult run = RunQ7r("tree " + Quoted(WriteScene(folder)));
  EXPECT_EQ(run.status, 0) << run.err;
  for (const char* line : {"Polygon \"roof\"  pos (0, 0, 0)  3 points, 2 polygons, 1 n-gon, 1 edge hidden\n",
                           "    tag Point Selection \"tops\" 6 selected\n", "    tag Vertex Map \"heat\" 3 weights\n",
                           "    tag UVW \"UVW\" 2 polygons\n", "    tag Normals 1 polygon\n",
                           "Spline \"arc\"  pos (0, 0, 0)  1 point\n", "    tag Segments 2 segments\n"})
    EXPECT_NE(run.out.find(line), std::string::npos) << line << "is missing in\n" << run.out;
}

// A selection tag whose count no file of this size can hold.
TEST(GeometryTree, RefusesAHostileCountAtOnce)
{
  ByteWriter file;
  file.Header().Start(110059, 0).Start(110107, 0).Start(110100, 0).Start(5154, 0).Start(110108, 0).Start(110100, 0);
  file.Start(5673, 0).Start(110011, 0).Long(INT_MAX).Long(1).Long(2);
  for (int i = 0; i < 8; ++i)
    file.End();
  ASSERT_LT(file.bytes.size(), 150u);
  const TempFolder folder;
  WriteWholeFile(folder / "bad.q7r", file.bytes);
  const RunResult run = RunQ7r("tree " + Quoted(folder / "bad.q7r"));
  EXPECT_EQ(run.status, 2);
  EXPECT_NE(run.err.find("byte 90, in chunk 110059/110107/110100/5154/110108/110100/5673/110011:"), std::string::npos)
      << run.err;
}
