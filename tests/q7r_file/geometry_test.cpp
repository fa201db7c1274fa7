// Objects of points: their own chunks, the operations that resize their tags, splines, and copies.
#include "support/library.h"

namespace
{

// Chunks around a selection of the one segment (n, n).
std::string Selection(const char* chunk, const std::string& n)
{
  return std::string("[") + chunk + ",0 [110011,0 L1 L" + n + " L" + n + " ] ] ";
}

// All that polygon data can hold, in the order of a file.
Bytes AllPolygonChunks()
{
  std::string chunks;
  int n = 1;
  for (const char* chunk : {"110117", "110118", "110119", "110120", "110128", "110129", "110132"})
    chunks += Selection(chunk, std::to_string(n++));
  return Record(chunks + "[110133,1 L2 L3 U7 U8 U4294967295 L0 ]");
}

bool EndsWith(const Bytes& whole, const Bytes& end)
{
  return whole.size() >= end.size() &&
         std::equal(end.begin(), end.end(), whole.end() - static_cast<std::ptrdiff_t>(end.size()));
}

bool Holds(const Bytes& whole, const Bytes& part)
{
  return std::search(whole.begin(), whole.end(), part.begin(), part.end()) != whole.end();
}

BaseArrayTag* AddTag(BaseObject& object, Long type, Long count)
{
  auto* tag = static_cast<BaseArrayTag*>(object.MakeTag(type));
  EXPECT_TRUE(tag->ResizeTagArray(count));
  return tag;
}

} // namespace

TEST(PolygonObject, KeepsItsSelectionsAndNgonsBehindTheTransform)
{
  BaseObject* object = AllocObject(kObjectPolygon);
  EXPECT_EQ(BytesOf(*GetPolygonData(*object)), Bytes());
  EXPECT_TRUE(ReadInto(*object, AllPolygonChunks()) && GetPolygonData(*object)->GetPhongBreakEdges().IsSelected(7));
  EXPECT_EQ(GetPolygonData(*object)->GetNgons()->GetCount(), 2);
  EXPECT_TRUE(EndsWith(BytesOf(*object), AllPolygonChunks()));

  auto* clone = static_cast<BaseObject*>(object->MakeClone(0, nullptr));
  auto* bare = static_cast<BaseObject*>(object->MakeClone(kCopyNoNgons, nullptr));
  DeleteObj(object);
  EXPECT_EQ(ToHex(BytesOf(*GetPolygonData(*clone))), ToHex(AllPolygonChunks()));
  EXPECT_EQ(GetPolygonData(*bare)->GetNgons(), nullptr);
  EXPECT_TRUE(GetPolygonData(*bare)->GetHiddenEdges().IsSelected(6));

  PointObjectData points;
  EXPECT_TRUE(clone->GetObjectData()->CopyTo(points, 0, nullptr) && points.CopyTo(*clone->GetObjectData(), 0, nullptr));
  EXPECT_EQ(points.GetPointSelection().SegmentCount(), 0) << "data of another class";
  EXPECT_TRUE(GetPolygonData(*clone)->GetPointSelection().IsSelected(1));
  DeleteObj(clone);
  DeleteObj(bare);
}

TEST(PolygonObject, StaysInStepWithStrangeChunks)
{
  // points: selected
  const std::tuple<const char*, const char*, bool, Long, Long> rows[] = {
      {"nothing inside", "[110117,0 ]", true, 1, 2},
      {"an empty set", "[110117,0 [110011,0 L0 ] ]", true, 0, 2},
      {"another chunk inside", "[110117,0 [9,0 L1 ] L2 ]", true, 1, 2},
      {"more than the set", "[110117,3 [110011,4 L0 L5 ] L6 ]", true, 0, 2},
      {"a value", "[110117,0 L1 ]", false, 1, 2},
      {"n-gons of level 0", "[110133,0 L9 ]", true, 1, 2},
      {"n-gons of level 2", "[110133,2 L9 ]", true, 1, 2},
      {"other n-gons", "[110133,1 L1 L1 U4 L8 ]", true, 1, 1},
      {"no n-gons", "[110133,1 L0 ]", true, 1, 0},
      {"too many n-gons", "[110133,1 L2147483647 L1 U4 ]", false, 1, 0},
      {"a negative count", "[110133,1 L-1 ]", false, 1, 0},
      {"too many edges", "[110133,1 L1 L2147483647 U4 ]", false, 1, 1},
      {"edges of another kind", "[110133,1 L1 L2 U4 L4 ]", false, 1, 1},
  };
  for (const auto& [what, chunk, read, points, ngons] : rows) {
    BaseObject* object = AllocObject(kObjectPolygon);
    ASSERT_TRUE(ReadInto(*object, AllPolygonChunks()));
    EXPECT_EQ(ReadInto(*object, Record(chunk + std::string(" [1234,0 ]"))), read) << what;
    EXPECT_EQ(GetPolygonData(*object)->GetPointSelection().SelectedCount(), points) << what;
    EXPECT_EQ(GetPolygonData(*object)->GetNgons()->GetCount(), ngons) << what;
    DeleteObj(object);
  }
}

TEST(PolygonObject, ResizesAllTagsInStep)
{
  BaseObject* object = AllocObject(kObjectPolygon);
  EXPECT_TRUE(ResizePolygons(*object, -1, -1, -1) && ResizePolygons(*object, 0, 0, 0));
  EXPECT_EQ(object->GetFirstTag(), nullptr) << "nothing is no reason to make a tag";
  BaseTag* plugin = NewObj<BaseTag>(kTagPlugin, kTagPoint); // bears the number of another class
  object->InsertTag(plugin);
  EXPECT_TRUE(ResizePolygons(*object, 4, 2, 3));
  EXPECT_EQ(GetPointCount(*object), 4);
  EXPECT_EQ(GetPolygonCount(*object), 2);
  EXPECT_EQ(GetPolygonData(*object)->GetNgons()->GetCount(), 3);

  GetPointTag(*object)->GetArray()[3] = Vector(1, 2, 3);
  BaseArrayTag* maps[] = {AddTag(*object, kTagVertexMap, 4), AddTag(*object, kTagVertexMap, 1)};
  BaseArrayTag* normals = AddTag(*object, kTagNormal, 4);
  EXPECT_TRUE(AddUVWTag(*object));
  auto* uvw = static_cast<UVWTag*>(object->GetTag(kTagUVW));
  EXPECT_EQ(uvw->GetCount(), 2);
  EXPECT_TRUE(ResizePolygons(*object, 6, 5, -1));
  for (const BaseArrayTag* tag : {maps[0], maps[1], normals})
    EXPECT_EQ(tag->GetCount(), 6);
  EXPECT_EQ(GetPointTag(*object)->GetArray()[3], Vector(1, 2, 3));
  EXPECT_EQ(GetPointTag(*object)->GetArray()[5], Vector());
  EXPECT_EQ(GetPolygonCount(*object), 5);
  EXPECT_EQ(uvw->GetCount(), 5);
  EXPECT_EQ(GetPolygonData(*object)->GetNgons()->GetCount(), 3);

  EXPECT_TRUE(ResizePolygons(*object, -1, -1, 0));
  EXPECT_EQ(GetPolygonData(*object)->GetNgons(), nullptr);
  EXPECT_EQ(GetPointCount(*object) + GetPolygonCount(*object), 11);
  EXPECT_TRUE(ResizePolygons(*object, 0, 0, 0));
  EXPECT_EQ(GetPointCount(*object), 0);
  EXPECT_EQ(maps[1]->GetCount(), 0);
  EXPECT_EQ(GetPolygonCount(*object), 5) << "a polygon tag is never emptied";
  EXPECT_EQ(uvw->GetCount(), 0);
  DeleteObj(object);

  BaseObject plain(kObjectNull);
  EXPECT_TRUE(ResizePolygons(plain, 1, -1, 0));
  EXPECT_FALSE(ResizePolygons(plain, -1, -1, 1)) << "no place for n-gons";
}

TEST(PolygonObject, TakesAnotherNumberOfNgonsWithTheirEdges)
{
  NgonData ngons;
  const ULong edges[] = {5, 6, 7};
  EXPECT_TRUE(ngons.Resize(3) && ngons.SetEdges(0, edges, 3) && ngons.SetEdges(2, edges, 1));
  EXPECT_FALSE(ngons.SetEdges(3, edges, 1) || ngons.SetEdges(-1, edges, 1));
  EXPECT_TRUE(ngons.Resize(2) && ngons.Resize(4));
  EXPECT_TRUE(ngons.GetEntry(0)->edges[2] == 7u && ngons.GetEntry(2)->count == 0);
  EXPECT_EQ(ngons.GetEntry(4), nullptr);
  EXPECT_TRUE(ngons.Resize(-3) && ngons.GetCount() == 0);
}

TEST(Geometry, SurvivesLittleMemory)
{
  EveryFailedAllocation([] {
    const Owned<BaseObject> object(AllocObject(kObjectPolygon));
    return object && ResizePolygons(*object, 4, 2, 3) && AddUVWTag(*object) && ResizePolygons(*object, 5, 3, 9);
  });
  EveryFailedAllocation([] {
    const Owned<SplineObject> spline(AllocSpline(3, 1));
    return spline && ResizeSpline(*spline, 5, 2) && GetTangentTag(*spline)->GetCount() == 5;
  });
}

TEST(SplineObject, HasTangentsAsItsTypeAsks)
{
  EXPECT_EQ(AllocSpline(kMaxSplinePoints + 1, 0), nullptr);
  SplineObject* spline = AllocSpline(0, 1);
  ASSERT_NE(GetTangentTag(*spline), nullptr);
  EXPECT_EQ(GetTangentTag(*spline)->GetCount(), 0);
  const BaseContainer& data = spline->GetDataInstance();
  EXPECT_TRUE(data.GetLong(kSplineType) == 1 && data.GetLong(1001) == 3);
  EXPECT_TRUE(data.FindData(1002) && !data.GetBool(1002));
  EXPECT_TRUE(data.GetLong(1003) == 8 && data.GetReal(1004) == 5.0 / 180.0 * 3.141592653589793);
  EXPECT_EQ(data.GetReal(1005), 5.0);

  EXPECT_TRUE(ResizeSpline(*spline, 3, 2));
  EXPECT_EQ(GetTangentTag(*spline)->GetCount(), 3);
  GetTangentTag(*spline)->GetArray()[1].left = Vector(1, 1, 1);
  for (const Long type : {0, 3, 5, 1, 2, 4}) {
    EXPECT_TRUE(SetSplineType(*spline, type));
    EXPECT_EQ(GetTangentTag(*spline) != nullptr, type == 1 || type == 2 || type == 4) << type;
    EXPECT_EQ(data.GetLong(kSplineType), type);
  }
  EXPECT_EQ(GetTangentTag(*spline)->GetCount(), 3);
  EXPECT_EQ(GetTangentTag(*spline)->GetArray()[1].left, Vector()) << "the old values are gone";
  DeleteObj(spline);
}

TEST(SplineObject, ResizesPointsTangentsAndSegments)
{
  int number = 0; // segmentsThen: -1 where there is no tag
  const std::tuple<Long, Long, Long, Long, Long> rows[] = {{8, -1, 8, -1, 8}, {8, 2, 8, 2, 8}, {4, -1, 4, 2, 4},
                                                           {-1, 3, 4, 3, 4},  {0, 1, 0, 1, 4}, {5, 0, 5, -1, 5},
                                                           {5, 0, 5, -1, 5}};
  SplineObject* spline = AllocSpline(1, 2);
  BaseArrayTag* map = AddTag(*spline, kTagVertexMap, 1);
  for (const auto& [points, segments, pointsThen, segmentsThen, tangentsThen] : rows) {
    SCOPED_TRACE(++number);
    EXPECT_TRUE(ResizeSpline(*spline, points, segments));
    EXPECT_EQ(GetPointCount(*spline), pointsThen);
    EXPECT_EQ(map->GetCount(), pointsThen);
    EXPECT_EQ(GetTangentTag(*spline)->GetCount(), tangentsThen);
    const SegmentTag* tag = GetSegmentTag(*spline);
    EXPECT_EQ(tag ? tag->GetCount() : -1, segmentsThen);
  }
  DeleteObj(spline);
}

TEST(SplineObject, KeepsItsSelectionsInItsOwnChunkOnce)
{
  const Bytes chunks = Record(Selection("110117", "4") + Selection("110118", "6"));
  SplineObject* spline = AllocSpline(2, 0);
  EXPECT_TRUE(ReadInto(*spline, chunks));
  BaseObject parent(kObjectNull);
  spline->InsertUnder(&parent);
  const Bytes bytes = BytesOf(parent);
  EXPECT_TRUE(Holds(bytes, Record("[5101,0"))) << "its label";
  const auto first = std::search(bytes.begin(), bytes.end(), chunks.begin(), chunks.end());
  ASSERT_NE(first, bytes.end());
  EXPECT_EQ(std::search(first + 1, bytes.end(), chunks.begin(), chunks.end()), bytes.end());

  BaseObject again(kObjectNull);
  EXPECT_TRUE(ReadInto(again, bytes));
  BaseObject* read = again.GetDown();
  ASSERT_NE(read, nullptr);
  EXPECT_EQ(read->GetName(), String("Spline")) << "a spline without a name";
  EXPECT_EQ(GetPointCount(*read), 2);
  EXPECT_TRUE(Holds(BytesOf(again), chunks));
  read->SetName(String("arc"));
  EXPECT_TRUE(ReadInto(*read, Record("[110069,2 L0 C0 ]")) && read->GetName() == String("arc"));
}

TEST(PointObject, ComesBackFromAFileUnderItsLabel)
{
  BaseObject* object = AllocObject(kObjectPointBased);
  static_cast<PointObjectData*>(object->GetObjectData())->GetHiddenPoints().SelectAdd(3);
  const Bytes chunks = Record(Selection("110118", "3"));
  ResizePoints(*object, 2);
  BaseObject parents[] = {BaseObject(kObjectNull), BaseObject(kObjectNull), BaseObject(kObjectNull)};
  object->InsertUnder(&parents[0]);
  for (int i = 0; i < 3; ++i) {
    BaseObject* member = parents[i].GetDown();
    ASSERT_NE(member, nullptr);
    EXPECT_TRUE(member->GetType() == kObjectPointBased && member->GetDiskType() == kObjectPoint);
    EXPECT_EQ(GetPointCount(*member), 2);
    EXPECT_TRUE(Holds(BytesOf(parents[i]), chunks) && (i == 2 || ReadInto(parents[i + 1], BytesOf(parents[i]))));
  }
}

TEST(PolygonObject, RunsWhenItsPolygonsHavePoints)
{
  for (const auto& [points, polygons, runs] :
       {std::tuple<Long, Long, bool>{-1, -1, true}, std::tuple<Long, Long, bool>{3, -1, true},
        std::tuple<Long, Long, bool>{3, 1, true}, std::tuple<Long, Long, bool>{-1, 1, false}}) {
    BaseObject* object = AllocObject(kObjectPolygon);
    ResizePolygons(*object, points, polygons, -1);
    EXPECT_EQ(object->Execute(), runs) << points << ", " << polygons;
    DeleteObj(object);
  }
}
