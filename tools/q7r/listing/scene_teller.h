// What a scene holds, told once for all listings: for programs, for people and for comparing.
#pragma once

#include <string>
#include <utility>

#include "node_index.h"
#include "node_lists.h"
#include "output/value_sink.h"
#include "torvane/animation/ctrack.h"
#include "torvane/document/base_document.h"
#include "torvane/materials/base_material.h"
#include "torvane/tags/base_tag.h"
#include "torvane/views/base_draw.h"

namespace q7r
{

// How much is told.
struct Scope
{
  bool data = true;      // containers, parameters and arrays; without them what a line for people takes
  bool keys = true;      // of tracks
  bool words = true;     // what numbers mean, in words and by names
  bool places = true;    // what follows from where nodes stand: numbers in lists, places in the world
  bool origin = true;    // who wrote the file and when, and the like
  bool identity = false; // markers and states of nodes
  int depth = -1;        // levels of children; -1: all
  std::string objects;   // a pattern for names: these objects alone, with all below them; empty: everything
};

class SceneTeller
{
 public:
  SceneTeller(ValueSink& sink, Scope scope) : sink_(sink), scope_(std::move(scope)) {}

  // The members of an object: the document and its lists.
  void TellScene(_torvane_::BaseDocument& document);
  // The members that tell a node without its lists.
  void TellOwn(_torvane_::BaseList2D& node);
  // An object for a key.
  void TellKey(const _torvane_::CKey& key);

 private:
  void TellList(const NodeList& list, int depth);
  void TellNode(_torvane_::BaseList2D& node, int depth);
  void TellMatches(_torvane_::BaseList2D* first, const std::string& above);
  void TellLists(_torvane_::BaseList2D& node, int depth);
  void TellObject(_torvane_::BaseObject& object);
  void TellObjectData(_torvane_::BaseObject& object);
  void TellTag(_torvane_::BaseTag& tag);
  void TellMaterial(_torvane_::BaseMaterial& material);
  void TellDocument(_torvane_::BaseDocument& document);
  void TellDraw(_torvane_::BaseDraw& draw);
  void TellTrack(_torvane_::CTrack& track);
  void TellKeys(const _torvane_::CCurve& curve);
  void TellCurves(_torvane_::CTrack& track);
  void TellParticulars(_torvane_::BaseList2D& node);
  void TellData(_torvane_::BaseList2D& node);
  void TellKept(_torvane_::BaseList2D& node);
  void TellIdentity(_torvane_::BaseList2D& node);

  ValueSink& sink_;
  const Scope scope_;
  NodeIndex index_;
  _torvane_::Matrix up_; // the global matrix of the object above
};

} // namespace q7r
