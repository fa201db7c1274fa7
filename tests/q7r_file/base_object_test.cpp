// The chunks of scene objects, their parameters and their copies.
#include "q7r_file/objects/opaque_object_data.h"
#include "support/library.h"

namespace
{

constexpr Long kUnknownType = 1234567;

Bytes NodeDataChunk(Long type, Long level, const Bytes& body)
{
  ByteWriter writer;
  return writer.Start(110064, level).Long(type).Long(0).String(u"from data").Append(body).End().bytes;
}

// A body of values and nested chunks that nobody knows.
const Bytes kStrangeBody = ByteWriter().Long(42).Start(7, 1).String(u"inner").End().Real(0.5).bytes;

// Polygon or point data, as a client's class would be: it keeps what it is asked to read.
class PolygonLikeData : public NodeData
{
 public:
  explicit PolygonLikeData(Long diskType = kObjectPolygonLabel) : diskType_(diskType) {}
  Long GetDiskType() const override { return diskType_; }
  void WriteChunks(HyperFile& file) override
  {
    file.WriteChunkStart(110119, 3);
    file.WriteChunkEnd();
  }
  Bool ReadData(HyperFile& file, Long id, Long level) override
  {
    readId = id;
    readLevel = level;
    return file.SkipToEndChunk();
  }
  Long readId = 0, readLevel = 0;

 private:
  Long diskType_;
};

class SplineLikeObject : public BaseObject
{
 public:
  SplineLikeObject() : BaseObject(kObjectSpline) {}
  Long GetDiskType() const override { return kObjectSpline; }
};

class EntriesTag : public BaseTag
{
 public:
  EntriesTag(Long type, std::string entries) : BaseTag(type), entries_(std::move(entries)) {}
  const void* GetEntryBytes(LLong& size) const override
  {
    size = static_cast<LLong>(entries_.size());
    return entries_.data();
  }

 private:
  std::string entries_;
};

// The chunks of a new null; `entries` is the inside of its container.
Bytes NullBytes(const std::string& entries)
{
  return Record("[110050,7 L0 L0 [132,1 L-1 " + entries +
                "] C0 SA L0 L1 L0 k C1 M000102030405060708090A0B0C0D0E0F B0 ]"
                " [110069,2 L4 L0 L0 L0 L0 C0 ] [110064,0 L5140 L0 SA ] [110052,9 V0,0,0 V1,1,1 V0,0,0 L2 L2 L0 B0 "
                "V1,1,1 L0 V0,0,0 L0 Y0,0,0,1,0,0,0,1,0,0,0,1 B0 B0 U0 L6 ]");
}

BaseObject* MakeNamed(const char* name, BaseObject* parent = nullptr)
{
  BaseObject* object = AllocObject(kObjectNull);
  object->SetName(String(name));
  object->InsertUnderLast(parent);
  return object;
}

} // namespace

TEST(BaseObject, WritesItsChunksByteForByteAndTheCheckSumOneWriteLater)
{
  BaseObject* object = MakeNamed("A");
  SetCountingMarker(*object);
  EXPECT_EQ(ToHex(BytesOf(*object)), ToHex(NullBytes("")));
  EXPECT_EQ(ToHex(BytesOf(*object)), ToHex(NullBytes("L1020800 L15 L0 ")));
  object->GetDataInstance().SetLong(7, 1);
  EXPECT_EQ(ToHex(BytesOf(*object)), ToHex(NullBytes("L1020800 L15 L0 L7 L15 L1 ")));
  for (const Real stored : {0.5, 0.0}) { // what is stored as a Real stays one
    object->GetDataInstance().Flush();
    object->GetDataInstance().SetReal(kKeyModelCheckSum, stored);
    BytesOf(*object);
    EXPECT_EQ(ToHex(BytesOf(*object)), ToHex(NullBytes("L1020800 L19 R0 ")));
  }
  DeleteObj(object);
}

TEST(BaseObject, SumsThePointsAndPolygonsOfPolygonObjectsAlone)
{
  for (Long type : {kObjectPolygon, kObjectNull}) {
    BaseObject object(type);
    object.InsertTag(NewObj<EntriesTag>(kTagPoint, "12345"));
    object.InsertTag(NewObj<EntriesTag>(kTagPolygon, "6789"));
    BytesOf(object);
    EXPECT_EQ(static_cast<ULong>(object.GetDataInstance().GetLong(kKeyModelCheckSum, 1)),
              type == kObjectPolygon ? 0xCBF43926u : 0u);
  }
}

// The matrices and the values of the oldest files, which a new file doesn't hold.
TEST(BaseObject, DerivesItsMatricesFromATransformThatIsRead)
{
  const std::tuple<const char*, Long, bool> rows[] = {{"transform 0 before 7500", 6, false},
                                                      {"transform 1 before 7500", 6, false},
                                                      {"transform 6 before 11600", 6, true},
                                                      {"transform 8", 6, false},
                                                      {"transform", 8, false},
                                                      {"frozen transform", 4, true}};
  for (const auto& [name, order, frozen] : rows) {
    SCOPED_TRACE(name);
    const RecordSample& sample = FindRecordSample(name);
    BaseObject object(kObjectNull);
    ByteWriter chunk;
    chunk.Start(110052, sample.level).Append(Record(sample.body, sample.version)).End();
    ASSERT_TRUE(ReadInto(object, chunk.bytes, sample.version));
    const bool oldest = sample.version < 7500;
    const bool modes = !oldest || sample.level >= 1;
    EXPECT_EQ(object.GetName(), String(oldest ? "name" : ""));
    EXPECT_EQ(object.GetDataInstance().GetLong(3), oldest ? 3 : 0);
    EXPECT_EQ(object.GetEditorMode(), modes ? 1 : 2);
    EXPECT_EQ(object.GetRenderMode(), modes ? 0 : 2);
    EXPECT_EQ(object.GetDisabled(), modes ? 1 : 0);
    EXPECT_EQ(object.GetRotationOrder(), order);
    EXPECT_EQ(object.GetStoredMatrix().off, oldest ? Vector() : Vector(8, 9, 10));
    EXPECT_EQ(object.GetAbsPos(), frozen ? Vector(23, 23.5, 22.75) : object.GetRelPos());
    EXPECT_EQ(object.GetAbsScale(), frozen ? Vector(24, 24.5, 23.75) : object.GetRelScale());
    EXPECT_EQ(object.GetAbsRot(), frozen ? Vector(25, 25.5, 24.75) : object.GetRelRot());
    Matrix rotation = AnglesToMatrix({3, 3.5, 2.75}, order);
    rotation.off = Vector(1, 1.5, 0.75);
    EXPECT_EQ(object.GetRelativeNormalizedMatrix(), rotation);
    EXPECT_EQ(object.GetFrozenTransformMatrix().v1,
              frozen ? AnglesToMatrix({22, 22.5, 21.75}, order).v1 : Vector(1, 0, 0));
  }
}

TEST(BaseObject, OpaqueDataLeaveTheEndTagToTheirOwner)
{
  for (Long version : {6000, 13000}) {
    ByteWriter whole;
    whole.Header("Q7R6", version).Append(kStrangeBody).End();
    MemoryReadFile memory(whole.bytes);
    OpaqueObjectData data(kObjectSkin, 0, kObjectGeneric);
    ASSERT_TRUE(data.ReadData(memory.file, 110064, 5));
    EXPECT_TRUE(memory.file.SkipToEndChunk());
    EXPECT_EQ(memory.file.GetPosition(), static_cast<LLong>(whole.bytes.size()));
    EXPECT_EQ(data.GetChunkLevel(), 5);
    OpaqueObjectData copy(kObjectSkin, 0, kObjectGeneric);
    OpaqueObjectData other(kObjectSky, 0, kObjectGeneric);
    EXPECT_TRUE(data.CopyTo(copy, 0, nullptr));
    EXPECT_FALSE(data.CopyTo(other, 0, nullptr));
    EXPECT_EQ(ToHex(BytesOf(copy)), ToHex(kStrangeBody));
    EXPECT_EQ(copy.GetChunkLevel(), 5);
  }
}

TEST(BaseObject, ALoadedContainerStaysWhatItWasWhenDataAreMade)
{
  // The client knows the plane but doesn't read it: the loop skips the chunk and the object lives.
  BaseObject object(kObjectGeneric);
  ASSERT_TRUE(ReadInto(object,
                       Record("[110050,0 L0 L0 K1100 C0 Splane ] [110064,0 L5168 L0 Sdata L42 [7,1 Sinner ] R0.5 ] "
                              "[110052,0 V1,2,3 V1,1,1 V0,0,0 2( Y0,0,0,1,0,0,0,1,0,0,0,1 ) L0 L0 L0 ]"),
                       7500));
  ASSERT_NE(object.GetObjectData(), nullptr);
  EXPECT_EQ(object.GetObjectData()->GetNode(), &object);
  EXPECT_TRUE(object.Execute());
  EXPECT_TRUE(object.GetName() == String("plane") && object.GetDataInstance().GetCount() == 1);
  EXPECT_TRUE(object.GetDataInstance().GetLong(1100) == 1100 && object.GetRelPos() == Vector(1, 2, 3));
}

TEST(BaseObject, PolygonChunksStandBesideTheTransformAndReachTheData)
{
  // beside: else inside the node data chunk
  const std::string own = "01 00 01 AE 27 00 00 00 03 02"; // chunk 110119
  for (const auto& [type, beside] : {std::tuple<Long, bool>{kObjectPolygon, true}, {kObjectJoint, false}}) {
    BaseObject object(type);
    auto* data = NewObj<PolygonLikeData>();
    for (int i = 0; i < 2; ++i)
      object.SetObjectData(data); // the second time nothing changes
    EXPECT_EQ(object.GetDiskType(), kObjectPolygonLabel);
    const std::string hex = ToHex(BytesOf(object));
    const std::size_t place = hex.find(own);
    ASSERT_NE(place, std::string::npos);
    EXPECT_EQ(place > hex.find("01 00 01 AD E4"), beside);
    if (beside) {
      EXPECT_EQ(place + own.size(), hex.size());
    }
    ASSERT_TRUE(ReadInto(object, FromHex(own)));
    EXPECT_EQ(data->readId, beside ? 110119 : 0);
    EXPECT_EQ(data->readLevel, beside ? 3 : 0);
  }
}

TEST(BaseObject, ASplineWritesItsChunksWithoutAChunkAroundThem)
{
  const std::string start = "01 00 01 AD F0"; // chunk 110064
  SplineLikeObject object;
  EXPECT_EQ(ToHex(BytesOf(object)).find(start), std::string::npos);
  object.SetObjectData(NewObj<PolygonLikeData>(kObjectPoint));
  const std::string hex = ToHex(BytesOf(object));
  EXPECT_EQ(hex.find(start), std::string::npos);
  EXPECT_LT(hex.find("01 00 01 AE 27 00 00 00 03 02"), hex.find("01 00 01 AD E4")); // 110119, then 110052
  // Values that nobody knows can't stand among an object's chunks: they keep theirs.
  const Bytes unknown = NodeDataChunk(kUnknownType, 2, kStrangeBody);
  ASSERT_TRUE(ReadInto(object, unknown));
  EXPECT_NE(ToHex(BytesOf(object)).find(ToHex(unknown)), std::string::npos);
}

TEST(BaseObject, ASplineLabelWhoseMemberTellsAnotherTypeComesBack)
{
  for (Long type : {kObjectPolygon, kObjectSpline, kObjectLight, kObjectCamera, kObjectPointBased, kObjectOldSpline,
                    kObjectNull, kObjectPlane, kObjectSky, kObjectJoint, kUnknownType}) {
    BaseObject* source = type == kUnknownType ? nullptr : AllocObject(type);
    const Bytes content = source ? BytesOf(*source) : NodeDataChunk(type, 2, kStrangeBody);
    const Long told = source ? source->GetType() : type;
    DeleteObj(source);
    for (Long label : {kObjectSpline, kObjectOldSpline, kObjectPoint, kObjectGeneric}) {
      SCOPED_TRACE("type " + std::to_string(type) + " under " + std::to_string(label));
      RootObject list;
      ASSERT_TRUE(ReadInto(list, ByteWriter().Start(110100, 0).Start(label, 0).Append(content).End().End().bytes));
      ASSERT_EQ(list.GetCount(), 1);
      if (label != kObjectGeneric || told != kObjectSpline) { // which alone has no chunk that tells it
        EXPECT_EQ(list.GetFirst()->GetType(), label == kObjectPoint && told == kObjectSpline ? kObjectPoint : told);
      }
      BytesOf(list); // stores the check sum
      const Bytes written = BytesOf(list);
      RootObject again;
      ASSERT_TRUE(ReadInto(again, written));
      ASSERT_EQ(again.GetCount(), 1);
      EXPECT_EQ(again.GetFirst()->GetType(), list.GetFirst()->GetType());
      EXPECT_EQ(ToHex(BytesOf(again)), ToHex(written));
      // A copy is the same but for its marker. Unknown types of plain objects have no class to be made of.
      RootObject copy;
      const bool copied = list.CopyWithTranslation(copy, 0, nullptr);
      EXPECT_EQ(copied, type != kUnknownType || label != kObjectGeneric);
      if (!copied)
        continue;
      for (RootObject* each : {&list, &copy})
        SetCountingMarker(*each->GetFirst());
      EXPECT_EQ(ToHex(BytesOf(copy)), ToHex(BytesOf(list)));
    }
  }
}

TEST(BaseObject, IsClonedWithTagsThatAreEmptyOrOddlyNumbered)
{
  BaseObject object(kObjectNull);
  for (Long type : {kTagUVW, kTagVertexMap, kTagOldVertexMap, kTagNormal, kTagPoint, kTagSegment, kTagWeight})
    object.MakeTag(type);
  object.GetTag(kTagWeight)->GetDataInstance().SetLong(1234567, 5);
  const Long entry = kTargetLink;
  object.GetTag(kTagWeight)->GetDataInstance().SetLong(entry, 77); // in place of a default
  BaseTag* odd = object.MakeTag(kTagPlugin);
  ASSERT_TRUE(ReadInto(*odd, NodeDataChunk(kTagPlugin, 2, kStrangeBody)));
  auto* clone = NodeCast<BaseObject>(object.MakeClone(0, nullptr));
  ASSERT_NE(clone, nullptr);
  BaseTag* tag = object.GetFirstTag();
  for (BaseTag* copy = clone->GetFirstTag(); copy; copy = copy->GetNext(), tag = tag->GetNext()) {
    ASSERT_NE(tag, nullptr);
    SetCountingMarker(*tag);
    SetCountingMarker(*copy);
    EXPECT_EQ(ToHex(BytesOf(*copy)), ToHex(BytesOf(*tag))) << tag->GetType();
    EXPECT_EQ(copy->GetObject(), clone);
  }
  EXPECT_EQ(tag, nullptr);
  DeleteObj(clone);
}

TEST(BaseObject, HandsItsDocumentToAllThatItHolds)
{
  BaseDocument document;
  BaseObject* object = MakeNamed("object");
  object->MakeTag(kTagProtection);
  MakeNamed("child", object)->MakeTag(kTagTarget);
  document.InsertObject(object);
  EXPECT_EQ(object->GetFirstTag()->GetDocument(), &document);
  EXPECT_EQ(object->GetDown()->GetFirstTag()->GetDocument(), &document);
  EXPECT_EQ(object->MakeTag(kTagTarget)->GetDocument(), &document);
}

TEST(BaseObject, MakesTheTypesOfItsTable)
{
  const std::set<Long> opaque = {kObjectSky, kObjectCloudGroup, kObjectCloud, kObjectJoint, kObjectSkin};
  std::set<Long> types = {5104, 5126, 5128, 5137, 5140, 5154, 5159, 5168, 5186, 1001003, 200000118};
  types.insert(opaque.begin(), opaque.end());
  for (Long type : types) {
    BaseObject* object = AllocObject(type);
    ASSERT_NE(object, nullptr) << type;
    EXPECT_EQ(NodeCast<OpaqueObjectData>(object->GetObjectData()) != nullptr, opaque.contains(type)) << type;
    EXPECT_EQ(object->GetObjectData() == nullptr, type == kObjectGeneric) << type;
    if (object->GetObjectData()) {
      EXPECT_EQ(object->GetObjectData()->GetNode(), object) << type;
    }
    DeleteObj(object);
  }
  for (Long type : {0, -1, 5099, 5127, 5130, 5132, 5135, 5138, 5139, 5141, 5144, 5151, 5155, 5158, 5187, kUnknownType})
    EXPECT_EQ(AllocObject(type), nullptr) << type;
}

TEST(BaseObject, TellsAndTakesItsParameters)
{
  BaseObject object(kObjectNull);
  for (Long id : {903, 904, 905, 908, 912, 917, 918, 919, 925, 926, 927}) {
    BaseObject one(kObjectNull);
    GeData value;
    ASSERT_TRUE(one.SetParameterById(id, GeData(Vector(0.1, 0.2, 0.3))));
    ASSERT_TRUE(one.SetParameter(ParameterPath({id, 0, 0}, {kVectorY, 0, 0}), GeData(0.7)));
    ASSERT_TRUE(one.SetParameter(ParameterPath({id, 0, 0}, {1003, 0, 0}), GeData(9.0))) << "no such component";
    EXPECT_EQ(ParameterOf(one, id).GetVector(), Vector(0.1, 0.7, 0.3)) << id;
    ASSERT_TRUE(one.GetParameter(ParameterPath({id, 0, 0}, {kVectorZ, 0, 0}), value));
    EXPECT_EQ(value.GetReal(), 0.3) << id;
  }
  object.SetParameterById(kObjectEnabled, GeData(false));
  EXPECT_EQ(object.GetDisabled(), 1);
  EXPECT_EQ(ParameterOf(object, kObjectEnabled).GetLong(), 0);
  object.SetParameterById(kObjectDisplayColor, GeData(Vector(2, -1, 0.5)));
  EXPECT_EQ(ParameterOf(object, kObjectDisplayColor).GetVector(), Vector(2, -1, 0.5)) << "as stored";
  EXPECT_EQ(ParameterOf(object, kObjectDisplayColor).GetVector(), Vector(1, 0, 0.5)) << "clamped by the first look";
  object.SetParameterById(4711, GeData(8));
  EXPECT_EQ(object.GetDataInstance().GetLong(4711), 8) << "all else lives in the container";
}

TEST(BaseObject, ClonesTakeTagsTransformAndChildrenAlong)
{
  BaseObject* source = MakeNamed("top");
  source->SetRelPos({1, 2, 3});
  source->SetFrozenRot({0.5, 0, 0});
  source->SetEditorMode(1);
  source->SetBit(2);
  source->MakeTag(kTagTarget)->SetName(String("tag"));
  MakeNamed("under first", MakeNamed("first", source));
  MakeNamed("second", source);

  BytesOf(*source); // stores the check sum
  auto* clone = static_cast<BaseObject*>(source->MakeClone(0, nullptr));
  ASSERT_NE(clone, nullptr);
  EXPECT_EQ(ToHex(WithoutMarkers(BytesOf(*clone))), ToHex(WithoutMarkers(BytesOf(*source))));
  EXPECT_EQ(clone->GetLocalMatrix(), source->GetLocalMatrix());
  EXPECT_TRUE(clone->GetTag(kTagTarget)->GetObject() == clone && clone->GetDownLast()->GetUp() == clone);
  DeleteObj(clone);

  clone = static_cast<BaseObject*>(source->MakeClone(kCopyNoChildren | kCopyNoBranches | kCopyNoInfo, nullptr));
  ASSERT_NE(clone, nullptr);
  EXPECT_TRUE(clone->GetDown() == nullptr && clone->GetFirstTag() == nullptr);
  EXPECT_FALSE(clone->GetBit(2));

  BaseObject other(kObjectCamera);
  for (const ULong flags : {kCopyNoBranches, kCopyNoGoal}) {
    EXPECT_TRUE(BaseObject(kObjectNull).CopyTo(other, flags, nullptr));
    EXPECT_EQ(CountReports(), flags == kCopyNoBranches ? 0 : 1) << "a copy onto another type";
  }
  DeleteObj(clone);
  DeleteObj(source);
}
