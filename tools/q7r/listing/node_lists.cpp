#include "node_lists.h"

#include "torvane/document/base_document.h"
#include "torvane/layers/layer_object.h"
#include "torvane/materials/base_material.h"
#include "torvane/objects/base_object.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/views/base_draw.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

// Also of layers, render settings and so on, whose children hang in lists of different classes.
const RootList2D* ChildrenOf(BaseList2D& node)
{
  const auto* inTree = NodeCast<BaseList4D>(&node);
  return inTree ? inTree->GetChildRoot() : nullptr;
}

} // namespace

void NodeLists::Add(const char* name, const RootList2D* root, bool always)
{
  if (always || (root && root->HasContent()))
    lists_[count_++] = {name, root};
}

NodeLists::NodeLists(BaseList2D& node)
{
  auto* object = NodeCast<BaseObject>(&node);
  auto* document = NodeCast<BaseDocument>(&node);
  const bool isShader = NodeCast<BaseShader>(&node) != nullptr;
  const bool isLayer = NodeCast<LayerObject>(&node) != nullptr;
  if (object)
    Add("tags", &object->GetTagRoot(), true);
  Add("tracks", node.GetTrackRoot(), object != nullptr);
  Add("shaders", node.GetShaders() ? node.GetShaderRoot() : nullptr, NodeCast<BaseMaterial>(&node) != nullptr);
  if (auto* settings = NodeCast<RenderData>(&node)) {
    Add("videoPosts", &settings->GetVideoPosts(), false);
    Add("multipasses", &settings->GetMultipasses(), false);
  }
  if (auto* panel = NodeCast<ViewPanel>(&node))
    Add("draws", &panel->GetDraws(), true);
  if (document) {
    Add("objects", document->GetObjectRoot(), true);
    Add("materials", document->GetMaterialRoot(), true);
    Add("layers", document->GetLayerRoot(), true);
    Add("renderData", document->GetRenderDataRoot(), true);
    Add("views", document->GetViewPanelRoot(), true);
  }
  Add("children", ChildrenOf(node), object || isShader || isLayer);
}

} // namespace q7r
