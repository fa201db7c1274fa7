#include "exporter/walk/composition.h"

#include "exporter/entry/message_table.h"
#include "exporter/entry/plugin_state.h"
#include "exporter/walk/camera.h"
#include "exporter/walk/composition_settings.h"
#include "exporter/walk/light.h"
#include "exporter/walk/plane.h"
#include "torvane/tags/base_tag.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

// One pass over one composition. Everything that a round reads from the host is kept for the next: after the first
// failure the host is asked no more and the remaining rounds go over the layer that was read last, with what was read
// last, so that the number of rounds stays that of the layers.
class LayerList
{
 public:
  LayerList(ExportContext& context, AEGP_CompH composition, BaseObject* parentObject, A_long width, A_long height,
            LayerPass pass, AEGP_LayerH enclosingLayer)
      : context_(context),
        host_(*context.suites),
        composition_(composition),
        parentObject_(parentObject),
        width_(width),
        height_(height),
        pass_(pass),
        enclosingLayer_(enclosingLayer)
  {}

  bool Run();

 private:
  void VisitLayer(A_long index);
  void VisitAudioVideo();
  void VisitFootage();
  void VisitComposition();
  void ExportNested();
  void MakeSceneLayer();
  void Link() { Expect(LinkLayerObject(context_, parentObject_, sceneLayer_)); }
  void Expect(bool success)
  {
    if (!success)
      host_.Fail();
  }

  ExportContext& context_;
  HostCalls host_;
  AEGP_CompH composition_;
  BaseObject* parentObject_;
  A_long width_;
  A_long height_;
  LayerPass pass_;
  AEGP_LayerH enclosingLayer_;
  LayerObject* sceneLayer_ = nullptr;

  AEGP_LayerH layer_ = nullptr;
  A_Boolean is3D_ = 0;
  AEGP_ObjectType objectType_ = AEGP_ObjectType_NONE;
  AEGP_ItemH item_ = nullptr;
  AEGP_ItemType itemType_ = 0;
  AEGP_FootageH footage_ = nullptr;
  AEGP_FootageSignature signature_ = AEGP_FootageSignature_NONE;
  AEGP_CompH nested_ = nullptr;
  A_long nestedWidth_ = 0;
  A_long nestedHeight_ = 0;
};

bool LayerList::Run()
{
  A_long count = 0;
  host_(&AEGP_LayerSuite13::AEGP_GetCompNumLayers, composition_, &count);
  for (A_long index = 0; index < count; ++index)
    VisitLayer(index);
  return host_.Good();
}

void LayerList::VisitLayer(A_long index)
{
  host_(&AEGP_LayerSuite13::AEGP_GetCompLayerByIndex, composition_, index, &layer_);
  host_(&AEGP_LayerSuite13::AEGP_IsLayer3D, layer_, &is3D_);
  if (!is3D_)
    return;
  host_(&AEGP_LayerSuite13::AEGP_GetLayerObjectType, layer_, &objectType_);
  context_.layer = layer_;
  context_.enclosingLayer = enclosingLayer_;
  if (pass_ == LayerPass::kLink && enclosingLayer_ && !sceneLayer_)
    MakeSceneLayer();
  switch (objectType_) {
  case AEGP_ObjectType_AV:
    VisitAudioVideo();
    break;
  case AEGP_ObjectType_LIGHT:
    pass_ == LayerPass::kLink ? Link() : Expect(ExportLight(context_));
    break;
  case AEGP_ObjectType_CAMERA:
    pass_ == LayerPass::kLink ? Link() : Expect(ExportCamera(context_, width_, height_));
    break;
  default: // texts and shapes have no place in a scene
    break;
  }
}

void LayerList::VisitAudioVideo()
{
  host_(&AEGP_LayerSuite13::AEGP_GetLayerSourceItem, layer_, &item_);
  if (!item_)
    return;
  host_(&AEGP_ItemSuite13::AEGP_GetItemType, item_, &itemType_);
  if (itemType_ == AEGP_ItemType_FOOTAGE)
    VisitFootage();
  else if (itemType_ == AEGP_ItemType_COMP)
    VisitComposition();
}

void LayerList::VisitFootage()
{
  host_(&AEGP_FootageSuite11::AEGP_GetMainFootageFromItem, item_, &footage_);
  if (!footage_)
    return;
  host_(&AEGP_FootageSuite11::AEGP_GetFootageSignature, footage_, &signature_);
  if (pass_ == LayerPass::kLink)
    Link();
  else
    Expect(ExportPlane(context_, item_, footage_, signature_ == AEGP_FootageSignature_SOLID, false) != nullptr);
}

void LayerList::VisitComposition()
{
  host_(&AEGP_CompSuite15::AEGP_GetCompFromItem, item_, &nested_);
  if (!nested_)
    return;
  // The link pass doesn't descend: what the composition holds was linked when it was made.
  pass_ == LayerPass::kLink ? Link() : ExportNested();
}

void LayerList::ExportNested()
{
  BaseObject* plane = ExportPlane(context_, item_, nullptr, false, true);
  if (!plane) {
    host_.Fail();
    return;
  }
  host_(&AEGP_ItemSuite13::AEGP_GetItemDimensions, item_, &nestedWidth_, &nestedHeight_);
  LayerIndex::Use use(context_.layers, nested_);
  Expect(ExportLayerList(context_, nested_, nullptr, nestedWidth_, nestedHeight_, LayerPass::kCreate, layer_));
  Expect(ExportLayerList(context_, nested_, plane, nestedWidth_, nestedHeight_, LayerPass::kLink, layer_));
}

// The scene layer that all objects of a nested composition share.
void LayerList::MakeSceneLayer()
{
  constexpr Long kFirst = kLayerFirstFlag + 1;
  sceneLayer_ = AllocLayer();
  if (!sceneLayer_)
    return;
  sceneLayer_->SetName(parentObject_->GetName());
  context_.document->InsertLayer(sceneLayer_);
  sceneLayer_->SetParameterById(kFirst, false);
  sceneLayer_->SetParameterById(kFirst + 1, false);
}

// The composition that is the active item; null when there is none.
AEGP_CompH GetActiveComposition(HostCalls& host, AEGP_ItemH& item)
{
  AEGP_ItemType type = 0;
  AEGP_CompH composition = nullptr;
  host(&AEGP_ItemSuite13::AEGP_GetActiveItem, &item);
  if (!item)
    return nullptr;
  host(&AEGP_ItemSuite13::AEGP_GetItemType, item, &type);
  if (type != AEGP_ItemType_COMP)
    return nullptr;
  host(&AEGP_CompSuite15::AEGP_GetCompFromItem, item, &composition);
  return composition;
}

} // namespace

bool ExportComposition(BaseDocument* document)
{
  if (!document)
    return false;
  const AllocationWatch watch;
  ExportSuites suites(BasicSuite);
  ExportContext context;
  HostCalls host(suites);
  AEGP_ItemH item = nullptr;
  A_long width = 0;
  A_long height = 0;
  AEGP_CompH composition = GetActiveComposition(host, item);
  if (!composition)
    return false;
  context.document = document;
  context.suites = &suites;
  if (document->GetFirstObject())
    context.layers.Distrust();
  ReadCompositionSettings(context, composition, item, width, height);

  LayerIndex::Use use(context.layers, composition);
  if (host.Good() && !ExportLayerList(context, composition, nullptr, width, height, LayerPass::kCreate, nullptr))
    host.Fail();
  BaseObject* root = AllocObject(kObjectNull);
  if (!root)
    return false;
  document->InsertObject(root);
  if (host.Good()) {
    HostText name(host);
    host(&AEGP_ItemSuite13::AEGP_GetItemName, PluginId, item, name.Out());
    root->SetName(name.Take16());
  }
  if (!ExportLayerList(context, composition, root, width, height, LayerPass::kLink, nullptr))
    host.Fail();
  if (watch.Failed())
    host.Fail();
  if (!host.Good())
    suites.Get<AEGP_UtilitySuite11>().AEGP_ReportInfo(PluginId, GetMessage(Message::kExportProblems));
  return host.Good();
}

bool ExportLayerList(ExportContext& context, AEGP_CompH composition, BaseObject* parentObject, A_long width,
                     A_long height, LayerPass pass, AEGP_LayerH enclosingLayer)
{
  if (!composition || (pass == LayerPass::kLink && !parentObject))
    return false;
  return LayerList(context, composition, parentObject, width, height, pass, enclosingLayer).Run();
}

bool LinkLayerObject(ExportContext& context, BaseObject* parentObject, LayerObject* sceneLayer)
{
  HostCalls host(*context.suites);
  AEGP_LayerH parentLayer = nullptr;
  AEGP_LayerIDVal layerId = kNoLayerId;
  AEGP_LayerIDVal parentId = kNoLayerId;
  host(&AEGP_LayerSuite13::AEGP_GetLayerParent, context.layer, &parentLayer);
  host(&AEGP_LayerSuite13::AEGP_GetLayerID, context.layer, &layerId);
  if (parentLayer)
    host(&AEGP_LayerSuite13::AEGP_GetLayerID, parentLayer, &parentId);

  BaseObject* first = context.document->GetFirstObject();
  BaseObject* object = context.layers.Find(first, layerId);
  BaseObject* newParent = parentLayer ? context.layers.Find(first, parentId) : nullptr;
  if (!newParent)
    newParent = parentObject;
  if (!object)
    return host.Good();
  BaseTag* targetTag = object->GetTag(kTagTarget);
  auto* target = targetTag ? NodeCast<BaseObject>(targetTag->GetDataInstance().GetLink(kTargetLink)) : nullptr;
  for (BaseObject* node : {target, object}) {
    if (node && sceneLayer)
      node->SetLayer(sceneLayer);
    if (!node || !newParent)
      continue;
    node->RemoveFromList();
    if (!node->InsertUnderLast(newParent))
      context.document->InsertObject(node);
  }
  return host.Good();
}

} // namespace exporter
