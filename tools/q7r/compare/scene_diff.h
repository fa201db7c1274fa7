// What differs between two scenes in what they mean.
#pragma once

#include <functional>
#include <string>

#include "compare/node_record.h"
#include "compare/scene_match.h"
#include "listing/scene_teller.h"
#include "torvane/animation/ctrack.h"

namespace q7r
{

struct Difference
{
  const char* kind;           // "changed", "added", "removed", "moved", "order"
  std::string path;           // of the node: "objects/Body/Arm/tags/Texture"
  std::string to{};           // of a moved node: where it stands in the second scene
  std::string key{};          // of a change: "data/500"
  const char* name = nullptr; // of the parameter that the key stands for, or null
  const Value* a = nullptr;   // null: the first scene has no such value
  const Value* b = nullptr;
};

// The entries of two arrays that differ.
struct RowsDifference
{
  long long count = 0; // those that only one has included
  long long first = -1;
};
RowsDifference CompareRows(const RowsValue& a, const RowsValue& b, const Comparison& comparison);

struct DiffOptions
{
  double tolerance = 0.0; // numbers no further apart count as equal
  bool all = false;       // dates, who wrote the file, markers and states too
};

class SceneDiff
{
 public:
  using Report = std::function<void(const Difference&, const Comparison&)>;

  SceneDiff(_torvane_::BaseDocument& a, _torvane_::BaseDocument& b, const DiffOptions& options, Report report);

  // Reports every difference, and tells how many there are.
  long long Run();

 private:
  void CompareNodes(_torvane_::BaseList2D& a, _torvane_::BaseList2D& b, const std::string& path);
  void CompareOwn(_torvane_::BaseList2D& a, _torvane_::BaseList2D& b, const std::string& path);
  void CompareRecords(NodeRecord& a, NodeRecord& b, const std::string& path, const _torvane_::BaseList2D* node);
  void CompareLists(_torvane_::BaseList2D& a, _torvane_::BaseList2D& b, const char* list, const std::string& path);
  void CompareOrder(const Members& a, const Members& b, const std::string& path);
  void CompareTracks(_torvane_::CTrack& a, _torvane_::CTrack& b, const std::string& path);
  void CompareCurves(const _torvane_::CCurve* a, const _torvane_::CCurve* b, const std::string& path);
  void CompareKeys(const _torvane_::CKey& a, const _torvane_::CKey& b, const std::string& path);
  void FindMovedBelow(_torvane_::BaseList2D& removed, const std::string& path);
  void ReportMoved(_torvane_::BaseList2D& a, _torvane_::BaseList2D& b, const std::string& path);
  void Tell(const Difference& difference);

  _torvane_::BaseDocument& a_;
  _torvane_::BaseDocument& b_;
  const SceneMatch match_;
  Comparison comparison_;
  Scope scope_;
  Report report_;
  long long count_ = 0;
};

} // namespace q7r
