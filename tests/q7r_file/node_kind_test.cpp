// Classes of nodes: what a number of type promises and a class doesn't hold.
#include "support/library.h"

namespace
{

// A plug-in's tag of a type, with content that only the plug-in knows.
Bytes PluginTagChunk(Long type)
{
  return ByteWriter().Start(110064, 3).Long(type).Long(0).String(u"t").Long(42).Start(7, 1).Real(1.5).End().End().bytes;
}

} // namespace

TEST(NodeKind, ATagGetsNoDataThatAreMadeForObjects)
{
  for (Long type : {kObjectPolygon, kObjectLight, kObjectCamera, kObjectPlane}) {
    SCOPED_TRACE(type);
    BaseObject object(kObjectNull);
    BaseTag* tag = object.MakeTag(kTagPlugin);
    ASSERT_TRUE(ReadInto(*tag, PluginTagChunk(type)));
    EXPECT_EQ(tag->GetNodeData(), nullptr);
    GeData value;
    for (Long id : {kCameraFieldOfView, kCameraUseTarget, kLightType}) {
      tag->SetParameterById(id, GeData(1.0));
      EXPECT_TRUE(tag->GetParameterById(id, value)); // of the tag's container
    }
    GeListNode* clone = tag->MakeClone(0, nullptr);
    ASSERT_NE(clone, nullptr);
    for (BaseList2D* each : {static_cast<BaseList2D*>(tag), NodeCast<BaseList2D>(clone)})
      EXPECT_NE(ToHex(BytesOf(*each)).find(ToHex(PluginTagChunk(type))), std::string::npos);
    DeleteObj(clone);
  }
  // Data that were given by hand all the same find no object behind their node.
  BaseTag tag(kTagPlugin, kObjectCamera);
  tag.SetNodeData(NewObj<CameraObjectData>());
  GeData value;
  EXPECT_FALSE(ParameterOf(tag, kCameraUseTarget).GetBool());
}

TEST(NodeKind, ACopyOntoAnotherClassOfTheSameNumberFailsAndTouchesNothing)
{
  TextureTag texture;
  DisplayTag display;
  SelectionTag selection(kTagPointSelection);
  VertexMapTag oldMap(kTagOldVertexMap);
  ASSERT_TRUE(oldMap.ResizeTagArray(3));
  PointTag points;
  Material material;
  LayerObject layer;
  BaseList2D* const sources[] = {&texture, &display, &selection, &oldMap, &points, &material, &layer};
  for (BaseList2D* source : sources) {
    SCOPED_TRACE(source->GetNodeKind().name);
    BaseTag tag(source->GetType());
    BaseMaterial plain(source->GetType());
    BaseObject object(source->GetType());
    for (BaseList2D* target : std::initializer_list<BaseList2D*>{&tag, &plain, &object}) {
      SetCountingMarker(*target);
      BytesOf(*target); // the first write leaves its marks
      const Bytes before = BytesOf(*target);
      EXPECT_FALSE(source->CopyWithTranslation(*target, 0, nullptr)) << target->GetNodeKind().name;
      EXPECT_EQ(BytesOf(*target), before) << target->GetNodeKind().name;
    }
  }
}

TEST(NodeKind, AListTakesItsOwnClassAlone)
{
  BaseDocument* document = CreateDocument();
  ASSERT_NE(document, nullptr);
  BaseObject* object = AllocObject(kObjectNull);
  RootList2D* const lists[] = {document->GetMaterialRoot(), document->GetLayerRoot(), document->GetRenderDataRoot(),
                               document->GetViewPanelRoot(), &object->GetTagRoot()};
  BaseTag tag(kTagProtection);
  int refused = 0;
  for (RootList2D* list : lists) {
    const LLong count = list->GetCount();
    EXPECT_FALSE(list->InsertFirst(object)) << ++refused;
    EXPECT_FALSE(list->InsertLast(object)) << ++refused;
    EXPECT_EQ(list->GetCount(), count);
  }
  EXPECT_FALSE(document->GetObjectRoot()->InsertLast(&tag));
  EXPECT_EQ(CountReports(), 2 * 5 + 1);
  EXPECT_EQ(tag.GetDocument(), nullptr);
  DeleteObj(object);
  BaseDocument::Free(document);
}

TEST(NodeKind, WhatLeavesItsListForgetsWhereItStood)
{
  BaseDocument* document = CreateDocument();
  BaseObject* parent = AllocObject(kObjectNull);
  BaseObject* child = AllocObject(kObjectNull);
  document->InsertObject(parent);
  child->InsertUnder(parent);
  BaseTag* tag = child->MakeTag(kTagProtection);
  Material* material = AllocMaterial();
  document->InsertMaterial(material);
  ASSERT_EQ(tag->GetDocument(), document);
  tag->RemoveFromList();
  EXPECT_TRUE(!tag->GetObject() && !tag->GetDocument());
  BaseObject other(kObjectNull);
  other.GetTagRoot().InsertFirst(tag);
  EXPECT_EQ(tag->GetObject(), &other);
  child->InsertTag(tag);
  EXPECT_TRUE(tag->GetObject() == child && !other.GetFirstTag());
  parent->RemoveFromList();
  material->RemoveFromList();
  BaseDocument::Free(document);
  for (BaseList2D* node : std::initializer_list<BaseList2D*>{parent, child, tag, material})
    EXPECT_EQ(node->GetDocument(), nullptr) << node->GetNodeKind().name;
  EXPECT_EQ(material->GetListHead(), nullptr);
  DeleteObj(parent);
  DeleteObj(material);
}

TEST(NodeKind, TheCheckOfADocumentSeesWhatIsBroken)
{
  DocumentPtr document = NewDocument();
  BaseObject* object = AllocObject(kObjectCamera);
  document->InsertObject(object);
  BaseTag* tag = object->MakeTag(kTagProtection);
  EXPECT_EQ(DocumentInvariants::FindBroken(*document), nullptr);
  const auto breaks = [&](auto&& change, auto&& mend) {
    change();
    EXPECT_NE(DocumentInvariants::FindBroken(*document), nullptr);
    mend();
    EXPECT_EQ(DocumentInvariants::FindBroken(*document), nullptr);
  };
  breaks([&] { tag->SetObject(nullptr); }, [&] { tag->SetObject(object); });
  breaks([&] { tag->SetDocument(nullptr); }, [&] { tag->SetDocument(document.get()); });
  breaks([&] { object->SetListHead(&object->GetTagRoot()); }, [&] { object->SetListHead(document->GetObjectRoot()); });
  breaks([&] { object->GetObjectData()->SetNode(tag); }, [&] { object->GetObjectData()->SetNode(object); });
  breaks([&] { object->GetTagRoot().SetOwner(nullptr); }, [&] { object->GetTagRoot().SetOwner(object); });
}

TEST(NodeKind, ALinkToAnythingGivesOnlyWhatIsAskedFor)
{
  BaseDocument* document = CreateDocument();
  BaseObject object(kTypeLayer); // the type of a layer
  BaseObject node(kObjectNull);
  for (GeListNode* target : std::initializer_list<GeListNode*>{&object, &document->GetPref()}) {
    node.GetLinkInstance().SetLink(target);
    EXPECT_EQ(node.GetLayer(), nullptr);
    GeAliasLink link;
    link.SetLink(target);
    Material material;
    material.GetDataInstance().SetData(3000, GeData(link));
    EXPECT_EQ(material.ChannelShaderOf(3000), nullptr);
  }
  BaseDocument::Free(document);
}
