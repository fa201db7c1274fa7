#include "scene_counts.h"

#include "torvane/animation/ctrack.h"
#include "torvane/materials/base_material.h"
#include "torvane/nodes/node_sink.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/base_tag.h"
#include "torvane/views/base_draw.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

void CountTracks(const BaseList2D& node, SceneCounts& counts)
{
  for (CTrack* track = node.GetFirstTrack(); track; track = track->GetNext()) {
    ++counts.tracks;
    for (Long number = 1; number <= kCurveLast; ++number) {
      if (CCurve* curve = track->GetCurve(number, 0))
        counts.keys += curve->GetKeyCount();
    }
  }
}

void CountNodes(BaseList2D* first, SceneCounts& counts);

// A node and all that it owns: every one of them may move.
void CountNode(BaseList2D& node, SceneCounts& counts)
{
  CountTracks(node, counts);
  CountNodes(node.GetShaders(), counts);
  if (auto* inTree = NodeCast<BaseList4D>(&node))
    CountNodes(inTree->GetDown(), counts);
  if (auto* object = NodeCast<BaseObject>(&node)) {
    ++counts.objects[object->GetType()];
    CountNodes(object->GetFirstTag(), counts);
  } else if (NodeCast<BaseTag>(&node)) {
    ++counts.tags[node.GetType()];
  } else if (NodeCast<BaseMaterial>(&node)) {
    ++counts.materials;
  } else if (auto* settings = NodeCast<RenderData>(&node)) {
    CountNodes(settings->GetVideoPosts().GetFirst(), counts);
    CountNodes(settings->GetMultipasses().GetFirst(), counts);
  } else if (auto* panel = NodeCast<ViewPanel>(&node)) {
    CountNodes(panel->GetDraws().GetFirst(), counts);
  } else if (auto* draw = NodeCast<BaseDraw>(&node)) {
    if (draw->HasEditorCamera())
      CountTracks(*draw->GetEditorCamera(), counts); // not an object of the scene
  }
}

void CountNodes(BaseList2D* first, SceneCounts& counts)
{
  for (BaseList2D* node = first; node; node = node->GetNext())
    CountNode(*node, counts);
}

// What belongs to the document itself, and what hangs in its lists.
void CountDocument(BaseDocument& document, SceneCounts& counts)
{
  CountNode(document, counts);
  for (RootList2D* root :
       {static_cast<RootList2D*>(document.GetObjectRoot()), static_cast<RootList2D*>(document.GetMaterialRoot()),
        static_cast<RootList2D*>(document.GetLayerRoot()), static_cast<RootList2D*>(document.GetRenderDataRoot()),
        static_cast<RootList2D*>(document.GetViewPanelRoot())})
    CountNodes(root->GetFirst(), counts);
}

class Counter : public NodeSink
{
 public:
  explicit Counter(SceneCounts& counts) : counts_(counts) {}
  void Take(BaseList2D& node) override { CountNode(node, counts_); }
  void TakeBack() override { isExact_ = false; }
  bool IsExact() const { return isExact_; }

 private:
  SceneCounts& counts_;
  bool isExact_ = true;
};

} // namespace

SceneCounts CountScene(BaseDocument& document)
{
  SceneCounts counts;
  CountDocument(document, counts);
  return counts;
}

DocumentPtr CountFile(const std::string& path, SceneCounts& counts)
{
  Counter counter(counts);
  DocumentPtr document = LoadScene(path, &counter);
  if (!counter.IsExact()) {
    counts = {};
    document = LoadScene(path);
  }
  CountDocument(*document, counts);
  return document;
}

} // namespace q7r
