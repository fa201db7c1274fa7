// The chunks of scene objects, in every form that files hold them in, their parameters and their copies.
#include <functional>
#include <string>

#include <gtest/gtest.h>

#include "q7r_file/node_bytes.h"
#include "q7r_file/objects/opaque_object_data.h"
#include "support/assertion_counter.h"
#include "support/counting_memory.h"
#include "torvane/document/base_document.h"
#include "torvane/objects/base_object.h"
#include "torvane/tags/base_tag.h"
#include "torvane/values/ge_data.h"

namespace
{

using namespace _torvane_;

constexpr Long kUnknownType = 1234567;

// The chunks of a new null that is named "A", as of docs/format.md. `container` stands between the container's id and
// its end.
std::string NullHex(const std::string& container)
{
  const std::string zero = " 0000000000000000 ";
  const std::string one = " 3FF0000000000000 ";
  const std::string zeros = zero + zero + zero;
  const std::string ones = one + one + one;
  return "01 0001ADE2 00000007  0F 00000000  0F 00000000  01 00000084 00000001 0F FFFFFFFF" + container + "02" +
         "0C 00  82 00000002 0041  0F 00000000  0F 00000001 0F 00000000"
         "80 0000000E 616C69617332 0000000000000000"
         "0C 01 80 00000010 000102030405060708090A0B0C0D0E0F  15 00  02"
         "01 0001ADF5 00000002  0F 00000004  0F 00000000 0F 00000000 0F 00000000 0F 00000000  0C 00  02"
         "01 0001ADF0 00000000  0F 00001414  0F 00000000  82 00000002 0041  02"
         "01 0001ADE4 00000009  17" +
         zeros + "17" + ones + "17" + zeros + "0F 00000002  0F 00000002  0F 00000000  15 00  17" + ones +
         "0F 00000000  17" + zeros + "0F 00000000  19" + zeros + one + zero + zero + zero + one + zero + zero + zero +
         one + "15 00  15 00  10 00000000  0F 00000006  02";
}

Bytes Chunk(Long id, Long level, const std::function<void(ByteWriter&)>& body)
{
  ByteWriter writer;
  writer.Start(id, level);
  body(writer);
  return writer.End().bytes;
}

Bytes NodeDataChunk(Long type, Long level, const Bytes& body)
{
  return Chunk(110064, level, [&](ByteWriter& w) { w.Long(type).Long(0).String(u"from data").Append(body); });
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
  Long readId = 0;
  Long readLevel = 0;

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
  EXPECT_EQ(ToHex(BytesOf(*object)), ToHex(FromHex(NullHex(""))));
  EXPECT_EQ(ToHex(BytesOf(*object)), ToHex(FromHex(NullHex("0F 000F9380 0F 0000000F 0F 00000000"))));
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

TEST(BaseObject, ReadsEveryFormOfTheTransformChunk)
{
  counting_memory::BalanceCheck balance;
  for (Long version : {6000, 7499, 7500, 11599, 11600, 13000}) {
    for (Long level = 0; level <= 10; ++level) {
      SCOPED_TRACE(testing::Message() << "version " << version << ", level " << level);
      const bool oldest = version < 7500;
      const bool old = version < 11600;
      auto from = [&](Long least) { return !oldest && (!old || level >= least); };
      const bool frozen = from(6);
      const bool ordered = !old && level >= 8;
      Bytes chunk = Chunk(110052, level, [&](ByteWriter& w) {
        if (oldest)
          w.Start(132, 1).Long(-1).Long(77).Long(15).Long(5).End();
        w.Vector(1, 2, 3).Vector(2, 3, 4).Vector(0.1, 0.2, 0.3);
        if (old) // the second matrix mirrors x, and z by the number beside its diagonal
          w.IdentityMatrix().Matrix({0, 0, 0, -1, 0, 0, 0, 1, -1, 0, 0, 1});
        if (oldest)
          w.String(u"old name");
        if (!oldest || level >= 1)
          w.Long(0).Long(1).Long(1);
        if (from(1)) {
          w.Bool(true);
          if (old)
            w.Bool(true);
          w.Vector(0.1, 0.5, 0.9);
        }
        if (from(2))
          w.Long(11);
        if (from(3))
          w.Vector(7, 8, 9).Long(12);
        if (from(4))
          w.Matrix({1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12});
        if (from(5)) {
          w.Bool(true).Start(110107, 0).Start(110100, 0).Start(5154, 0).Append(NodeDataChunk(5140, 0, {}));
          w.End().End().End().Bool(false);
        }
        if (frozen) {
          w.ULong(2).Vector(10, 20, 30).Vector(1, 1, 1).Vector(0.4, 0, 0).Vector(11, 22, 33).Vector(3, 2, 1);
          w.Vector(0.5, 0.6, 0.7);
        }
        if (ordered)
          w.Long(3);
        w.String(u"from a later level");
      });
      BaseObject object(kObjectNull);
      ASSERT_TRUE(ReadInto(object, chunk, version));
      EXPECT_EQ(object.GetRelPos(), Vector(1, 2, 3));
      EXPECT_EQ(object.GetRelScale(), old ? Vector(-2, 3, -4) : Vector(2, 3, 4));
      EXPECT_EQ(object.GetRelRot(), Vector(0.1, 0.2, 0.3));
      EXPECT_EQ(object.GetName(), String(oldest ? "old name" : ""));
      EXPECT_EQ(object.GetDataInstance().GetLong(77), oldest ? 5 : 0);
      const bool modes = !oldest || level >= 1;
      EXPECT_EQ(object.GetEditorMode(), modes ? 0 : 2);
      EXPECT_EQ(object.GetRenderMode(), modes ? 1 : 2);
      EXPECT_EQ(object.GetDisabled(), modes ? 1 : 0);
      GeData value;
      object.GetParameterById(kObjectDisplayFlag, value);
      EXPECT_EQ(value.GetLong(), from(1) ? 1 : 0);
      object.GetParameterById(kObjectDisplayColor, value);
      EXPECT_EQ(value.GetVector(), from(1) ? Vector(0.1, 0.5, 0.9) : Vector(1, 1, 1));
      object.GetParameterById(kObjectColorMode, value);
      EXPECT_EQ(value.GetLong(), from(2) ? 11 : 0);
      object.GetParameterById(kObjectStoredVector, value);
      EXPECT_EQ(value.GetVector(), from(3) ? Vector(7, 8, 9) : Vector());
      object.GetParameterById(kObjectStoredMode, value);
      EXPECT_EQ(value.GetLong(), from(3) ? 12 : 0);
      EXPECT_EQ(object.GetStoredMatrix().off, from(4) ? Vector(1, 2, 3) : Vector());
      EXPECT_EQ(object.GetFrozenFlags(), frozen ? kFrozenPos : 0u);
      EXPECT_EQ(object.GetFrozenRot(), frozen ? Vector(0.4, 0, 0) : Vector());
      EXPECT_EQ(object.GetAbsPos(), frozen ? Vector(11, 22, 33) : object.GetRelPos());
      EXPECT_EQ(object.GetAbsScale(), frozen ? Vector(3, 2, 1) : object.GetRelScale());
      EXPECT_EQ(object.GetAbsRot(), frozen ? Vector(0.5, 0.6, 0.7) : object.GetRelRot());
      EXPECT_EQ(object.GetRotationOrder(), ordered && level >= 9 ? 3 : 6);
      Matrix rotation = AnglesToMatrix({0.1, 0.2, 0.3}, object.GetRotationOrder());
      rotation.off = Vector(1, 2, 3);
      EXPECT_EQ(object.GetRelativeNormalizedMatrix(), rotation);
      EXPECT_EQ(object.GetFrozenTransformMatrix().v1,
                frozen ? AnglesToMatrix({0.4, 0, 0}, object.GetRotationOrder()).v1 : Vector(1, 0, 0));
    }
  }
}

TEST(BaseObject, OpaqueDataLeaveTheEndTagToTheirOwner)
{
  for (Long version : {6000, 13000}) {
    const Bytes chunk = Chunk(110064, 5, [](ByteWriter& w) { w.Append(kStrangeBody); });
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
  ByteWriter chunks;
  chunks.Start(110050, 0).Long(0).Long(0).Start(132, 1).Long(-1).Long(1100).Long(15).Long(3).End();
  chunks.UChar(0).String(u"plane").End().Append(NodeDataChunk(kObjectPlane, 0, kStrangeBody));
  chunks.Start(110052, 0).Vector(1, 2, 3).Vector(1, 1, 1).Vector(0, 0, 0).IdentityMatrix().IdentityMatrix();
  chunks.Long(0).Long(0).Long(0).End();
  BaseObject object(kObjectGeneric);
  ASSERT_TRUE(ReadInto(object, chunks.bytes, 7500));
  ASSERT_NE(object.GetObjectData(), nullptr);
  EXPECT_EQ(object.GetObjectData()->GetNode(), &object);
  EXPECT_TRUE(object.Execute());
  EXPECT_EQ(object.GetName(), String("plane"));
  EXPECT_EQ(object.GetDataInstance().GetCount(), 1);
  EXPECT_EQ(object.GetDataInstance().GetLong(1100), 3);
  EXPECT_EQ(object.GetRelPos(), Vector(1, 2, 3));
}

TEST(BaseObject, PolygonChunksStandBesideTheTransformAndReachTheData)
{
  struct Row
  {
    Long type;
    bool beside; // else inside the node data chunk
  };
  const std::string own = "01 00 01 AE 27 00 00 00 03 02"; // chunk 110119
  for (const Row& row : {Row{kObjectPolygon, true}, Row{kObjectJoint, false}}) {
    BaseObject object(row.type);
    auto* data = NewObj<PolygonLikeData>();
    object.SetObjectData(data);
    EXPECT_EQ(object.GetDiskType(), kObjectPolygonLabel);
    const std::string hex = ToHex(BytesOf(object));
    const std::size_t place = hex.find(own);
    ASSERT_NE(place, std::string::npos);
    EXPECT_EQ(place > hex.find("01 00 01 AD E4"), row.beside);
    if (row.beside) {
      EXPECT_EQ(place + own.size(), hex.size());
    }
    ASSERT_TRUE(ReadInto(object, FromHex(own)));
    EXPECT_EQ(data->readId, row.beside ? 110119 : 0);
    EXPECT_EQ(data->readLevel, row.beside ? 3 : 0);
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
  counting_memory::BalanceCheck balance;
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
  counting_memory::BalanceCheck balance;
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
  for (Long type : {5104, 5126, 5128, 5137, 5140, 5154, 5159, 5168, 5186, 1001003, 1011146, 1019363, 200000118}) {
    BaseObject* object = AllocObject(type);
    ASSERT_NE(object, nullptr) << type;
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
  for (Long id : {901, 902, 907, 913, 928}) {
    GeData value;
    ASSERT_TRUE(object.SetParameterById(id, GeData(static_cast<Long>(id % 5))));
    ASSERT_TRUE(object.GetParameterById(id, value));
    EXPECT_EQ(value.GetLong(), id % 5) << id;
  }
  for (Long id : {903, 904, 905, 908, 912, 917, 918, 919, 925, 926, 927}) {
    BaseObject one(kObjectNull);
    GeData value;
    ASSERT_TRUE(one.SetParameterById(id, GeData(Vector(0.1, 0.2, 0.3))));
    ASSERT_TRUE(one.SetParameter(ParameterPath({id, 0, 0}, {kVectorY, 0, 0}), GeData(0.7)));
    ASSERT_TRUE(one.SetParameter(ParameterPath({id, 0, 0}, {1003, 0, 0}), GeData(9.0))) << "no such component";
    ASSERT_TRUE(one.GetParameterById(id, value));
    EXPECT_EQ(value.GetVector(), Vector(0.1, 0.7, 0.3)) << id;
    ASSERT_TRUE(one.GetParameter(ParameterPath({id, 0, 0}, {kVectorZ, 0, 0}), value));
    EXPECT_EQ(value.GetReal(), 0.3) << id;
  }
  GeData value;
  object.SetParameterById(kObjectEnabled, GeData(false));
  EXPECT_EQ(object.GetDisabled(), 1);
  object.GetParameterById(kObjectEnabled, value);
  EXPECT_EQ(value.GetLong(), 0);
  object.SetParameterById(kObjectDisplayColor, GeData(Vector(2, -1, 0.5)));
  object.GetParameterById(kObjectDisplayColor, value);
  EXPECT_EQ(value.GetVector(), Vector(2, -1, 0.5)) << "as stored";
  object.GetParameterById(kObjectDisplayColor, value);
  EXPECT_EQ(value.GetVector(), Vector(1, 0, 0.5)) << "clamped by the first look";
  object.SetParameterById(4711, GeData(8));
  EXPECT_EQ(object.GetDataInstance().GetLong(4711), 8) << "all else lives in the container";
}

TEST(BaseObject, ClonesTakeTagsTransformAndChildrenAlong)
{
  counting_memory::BalanceCheck balance;
  BaseObject* source = MakeNamed("top");
  source->SetRelPos({1, 2, 3});
  source->SetFrozenRot({0.5, 0, 0});
  source->SetEditorMode(1);
  source->SetBit(2);
  source->MakeTag(kTagTarget)->SetName(String("tag"));
  MakeNamed("under first", MakeNamed("first", source));
  MakeNamed("second", source);

  auto* clone = static_cast<BaseObject*>(source->MakeClone(0, nullptr));
  ASSERT_NE(clone, nullptr);
  EXPECT_EQ(clone->GetAbsPos(), source->GetAbsPos());
  EXPECT_EQ(clone->GetLocalMatrix(), source->GetLocalMatrix());
  EXPECT_EQ(clone->GetEditorMode(), 1);
  EXPECT_TRUE(clone->GetBit(2));
  ASSERT_NE(clone->GetTag(kTagTarget), nullptr);
  EXPECT_EQ(clone->GetTag(kTagTarget)->GetObject(), clone);
  EXPECT_EQ(clone->GetTag(kTagTarget)->GetName(), String("tag"));
  ASSERT_NE(clone->GetDown(), nullptr);
  EXPECT_EQ(clone->GetDown()->GetName(), String("first"));
  EXPECT_EQ(clone->GetDown()->GetDown()->GetName(), String("under first"));
  EXPECT_EQ(clone->GetDownLast()->GetName(), String("second"));
  EXPECT_EQ(clone->GetDownLast()->GetUp(), clone);
  DeleteObj(clone);

  clone = static_cast<BaseObject*>(source->MakeClone(kCopyNoChildren | kCopyNoBranches | kCopyNoInfo, nullptr));
  ASSERT_NE(clone, nullptr);
  EXPECT_EQ(clone->GetDown(), nullptr);
  EXPECT_EQ(clone->GetFirstTag(), nullptr);
  EXPECT_FALSE(clone->GetBit(2));

  AssertionCounter reports;
  BaseObject other(kObjectCamera);
  EXPECT_TRUE(BaseObject(kObjectNull).CopyTo(other, 0, nullptr));
  EXPECT_EQ(reports.Take(), 1) << "a copy onto another type";
  DeleteObj(clone);
  DeleteObj(source);
}

TEST(BaseObject, AChainOfAThousandWritesReadsCopiesAndDies)
{
  counting_memory::BalanceCheck balance;
  RootObject root;
  BaseObject* last = nullptr;
  for (int depth = 0; depth < 1000; ++depth) {
    BaseObject* object = AllocObject(kObjectNull);
    if (last)
      object->InsertUnder(last);
    else
      root.InsertLast(object);
    object->SetRelPos({1, 0, 0});
    last = object;
  }
  EXPECT_EQ(last->GetGlobalMatrix().off, Vector(1000, 0, 0));
  const Bytes bytes = BytesOf(root);
  RootObject again;
  ASSERT_TRUE(ReadInto(again, bytes));
  RootObject copy;
  ASSERT_TRUE(again.CopyWithTranslation(copy, 0, nullptr));
  int depth = 0;
  for (auto* object = static_cast<BaseObject*>(copy.GetFirst()); object; object = object->GetDown())
    ++depth;
  EXPECT_EQ(depth, 1000);
}
