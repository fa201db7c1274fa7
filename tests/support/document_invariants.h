// What holds for every document, whatever it was read from and whatever was done to it. For tests and fuzz targets.
#pragma once

#include <vector>

#include "torvane/animation/ctrack.h"
#include "torvane/document/base_document.h"
#include "torvane/materials/base_material.h"
#include "torvane/objects/base_object.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/base_tag.h"
#include "torvane/views/base_draw.h"

// Looks for the first thing that is broken. Keeps its own stack: documents nest deep.
class DocumentInvariants
{
 public:
  // Null when all holds, else what doesn't.
  static const char* FindBroken(_torvane_::BaseDocument& document)
  {
    DocumentInvariants check;
    check.CheckNode(document);
    for (_torvane_::RootList2D* root : std::initializer_list<_torvane_::RootList2D*>{
             document.GetObjectRoot(), document.GetMaterialRoot(), document.GetLayerRoot(),
             document.GetRenderDataRoot(), document.GetViewPanelRoot()})
      check.Add(root, nullptr);
    while (!check.broken_ && !check.lists_.empty()) {
      _torvane_::RootList2D* root = check.lists_.back();
      check.lists_.pop_back();
      check.CheckList(*root);
    }
    return check.broken_;
  }

 private:
  DocumentInvariants() = default;

  void Require(bool holds, const char* what)
  {
    if (!holds && !broken_)
      broken_ = what;
  }

  void Add(_torvane_::RootList2D* root, const _torvane_::BaseList2D* owner)
  {
    if (!root)
      return;
    Require(root->GetOwner() == owner, "a list has another owner than the node that holds it");
    lists_.push_back(root);
  }

  void CheckList(_torvane_::RootList2D& root)
  {
    _torvane_::LLong count = 0;
    const _torvane_::BaseList2D* before = nullptr;
    for (_torvane_::BaseList2D* node = root.GetFirst(); node && !broken_; node = node->GetNext()) {
      Require(node->GetPrev() == before, "a member's neighbour doesn't lead back to it");
      Require(node->GetNodeKind().Is(root.GetMemberKind()), "a list holds a node of another class");
      Require(!node->GetListHead() || node->GetListHead() == &root, "a member names another list");
      Require(node->GetDocument() == root.GetDocument(), "a member has another document than its list");
      CheckNode(*node);
      before = node;
      ++count;
    }
    Require(root.GetLast() == before && root.GetCount() == count, "a list doesn't end with its last member");
  }

  void CheckNode(_torvane_::BaseList2D& node)
  {
    using namespace _torvane_;
    Require(node.GetGoal().node == &node, "a node's goal names another node");
    CheckLink(node.GetLinkInstance());
    Add(node.GetShaderRoot(), &node);
    Add(node.GetTrackRoot(), &node);
    if (auto* inner = NodeCast<BaseList4D>(&node))
      Add(inner->GetChildRoot(), &node);
    if (auto* object = NodeCast<BaseObject>(&node)) {
      Add(&object->GetTagRoot(), &node);
      CheckData(object->GetObjectData(), node);
      for (BaseTag* tag = object->GetFirstTag(); tag; tag = tag->GetNext())
        Require(tag->GetObject() == object, "a tag names another object");
    } else if (auto* tag = NodeCast<BaseTag>(&node)) {
      CheckData(tag->GetNodeData(), node);
    } else if (auto* settings = NodeCast<RenderData>(&node)) {
      Add(&settings->GetVideoPosts(), &node);
      Add(&settings->GetMultipasses(), &node);
    } else if (auto* panel = NodeCast<ViewPanel>(&node)) {
      Add(&panel->GetDraws(), &node);
    } else if (auto* draw = NodeCast<BaseDraw>(&node)) {
      CheckLink(draw->GetSceneCamera());
    } else if (auto* track = NodeCast<CTrack>(&node)) {
      CheckCurves(*track);
    }
  }

  void CheckData(const _torvane_::NodeData* data, const _torvane_::BaseList2D& node)
  {
    Require(!data || data->GetNode() == &node, "a node's data name another node");
    Require(!data || node.GetNodeKind().Is(data->GetOwnerKind()), "a node has data that are for another class");
  }

  void CheckLink(const _torvane_::GeAliasLink& link)
  {
    const _torvane_::GeListNode* target = link.GetLink();
    Require(!target || (target->GetGoal().node == target && target->GetGoal().HasLinks()), "a link leads nowhere");
  }

  void CheckCurves(_torvane_::CTrack& track)
  {
    using namespace _torvane_;
    for (Long number = 1; number <= 10; ++number) {
      CCurve* curve = track.GetCurve(number, 0);
      for (Long i = 0; curve && i < curve->GetKeyCount(); ++i) {
        const CKey* key = curve->GetKey(i);
        Require(!key || key->GetCurve() == curve, "a key names another curve"); // null without memory for nodes
      }
    }
  }

  std::vector<_torvane_::RootList2D*> lists_;
  const char* broken_ = nullptr;
};
