#include "compare/scene_diff.h"

#include <algorithm>
#include <charconv>
#include <unordered_set>

#include "listing/node_path.h"
#include "listing/parameter_names.h"
#include "listing/values.h"
#include "output/number_text.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

Scope ScopeFor(bool all)
{
  Scope scope;
  scope.keys = false; // they are compared one by one
  scope.words = false;
  scope.places = false;
  scope.origin = all;
  scope.identity = all;
  return scope;
}

// The name of the parameter that "data/500" or "params/90000" stands for.
const char* NameOf(const BaseList2D* node, std::string_view key)
{
  for (const std::string_view owner : {"data/", "params/", "container/"}) {
    if (!node || key.substr(0, owner.size()) != owner)
      continue;
    Long id = 0;
    const auto result = std::from_chars(key.data() + owner.size(), key.data() + key.size(), id);
    const bool isWhole = result.ec == std::errc() && result.ptr == key.data() + key.size();
    const ParameterRow* row = isWhole ? FindParameter(*node, id) : nullptr;
    return row ? row->name : nullptr;
  }
  return nullptr;
}

void RecordOwn(NodeRecord& record, BaseList2D& node, const Scope& scope) { SceneTeller(record, scope).TellOwn(node); }

} // namespace

RowsDifference CompareRows(const RowsValue& a, const RowsValue& b, const Comparison& comparison)
{
  RowsDifference difference;
  double rowA[NumberRows::kMostInRow];
  double rowB[NumberRows::kMostInRow];
  const long long both = std::min(a.Count(), b.Count());
  for (long long i = 0; i < both; ++i) {
    a.Get(i, rowA);
    b.Get(i, rowB);
    const auto areEqual = [&](double x, double y) { return comparison.AreEqual(x, y); };
    if (std::equal(rowA, rowA + a.Form().perRow, rowB, areEqual))
      continue;
    difference.first = difference.count == 0 ? i : difference.first;
    ++difference.count;
  }
  if (difference.first < 0 && a.Count() != b.Count())
    difference.first = both;
  difference.count += std::max(a.Count(), b.Count()) - both;
  return difference;
}

SceneDiff::SceneDiff(BaseDocument& a, BaseDocument& b, const DiffOptions& options, Report report)
    : a_(a), b_(b), match_(a, b), scope_(ScopeFor(options.all)), report_(std::move(report))
{
  comparison_.tolerance = options.tolerance;
  comparison_.partners = match_.AllOfA();
}

long long SceneDiff::Run()
{
  CompareNodes(a_, b_, "");
  return count_;
}

void SceneDiff::Tell(const Difference& difference)
{
  ++count_;
  report_(difference, comparison_);
}

void SceneDiff::CompareNodes(BaseList2D& a, BaseList2D& b, const std::string& path)
{
  CompareOwn(a, b, path);
  auto* trackA = NodeCast<CTrack>(&a);
  auto* trackB = NodeCast<CTrack>(&b);
  if (trackA && trackB)
    CompareTracks(*trackA, *trackB, path);
  for (const char* list : ListNamesOf(a, b))
    CompareLists(a, b, list, path);
}

void SceneDiff::CompareOwn(BaseList2D& a, BaseList2D& b, const std::string& path)
{
  NodeRecord recordA;
  NodeRecord recordB;
  RecordOwn(recordA, a, scope_);
  RecordOwn(recordB, b, scope_);
  CompareRecords(recordA, recordB, path.empty() ? "document" : path, &a);
}

void SceneDiff::CompareRecords(NodeRecord& recordA, NodeRecord& recordB, const std::string& path,
                               const BaseList2D* node)
{
  const std::vector<NodeRecord::Entry>& ofA = recordA.Sorted();
  const std::vector<NodeRecord::Entry>& ofB = recordB.Sorted();
  auto a = ofA.begin();
  auto b = ofB.begin();
  while (a != ofA.end() || b != ofB.end()) {
    const int order = a == ofA.end() ? 1 : b == ofB.end() ? -1 : a->key.compare(b->key);
    const Value* valueA = order <= 0 ? &a->value : nullptr;
    const Value* valueB = order >= 0 ? &b->value : nullptr;
    const std::string& key = valueA ? a->key : b->key;
    if (!valueA || !valueB || !comparison_.AreEqual(*valueA, *valueB))
      Tell({"changed", path, {}, key, NameOf(node, key), valueA, valueB});
    a += valueA ? 1 : 0;
    b += valueB ? 1 : 0;
  }
}

void SceneDiff::CompareLists(BaseList2D& a, BaseList2D& b, const char* list, const std::string& path)
{
  const Members ofA = MembersOf(a, list);
  const Members ofB = MembersOf(b, list);
  const std::string above = ListPath(path, list);
  const std::unordered_set<const BaseList2D*> isHere(ofB.begin(), ofB.end());
  Members here; // the partners in this list, in the order of the first scene
  Labels labelsOfA;
  for (BaseList2D* member : ofA) {
    const std::string memberPath = Below(above, labelsOfA.Next(*member));
    BaseList2D* partner = match_.PartnerOfA(*member);
    if (!partner) {
      Tell({"removed", memberPath});
      FindMovedBelow(*member, memberPath);
    } else if (isHere.count(partner) == 0) {
      ReportMoved(*member, *partner, memberPath);
    } else {
      here.push_back(partner);
      CompareNodes(*member, *partner, memberPath);
    }
  }
  CompareOrder(here, ofB, above);
  Labels labelsOfB;
  for (const BaseList2D* member : ofB) {
    const std::string memberPath = Below(above, labelsOfB.Next(*member));
    if (!match_.PartnerOfB(*member))
      Tell({"added", memberPath});
  }
}

void SceneDiff::CompareOrder(const Members& a, const Members& b, const std::string& path)
{
  std::unordered_map<const BaseList2D*, std::size_t> places;
  for (const BaseList2D* member : b)
    places.emplace(member, places.size());
  const auto isBefore = [&](const BaseList2D* x, const BaseList2D* y) { return places[x] < places[y]; };
  if (!std::is_sorted(a.begin(), a.end(), isBefore))
    Tell({"order", path});
}

void SceneDiff::ReportMoved(BaseList2D& a, BaseList2D& b, const std::string& path)
{
  Tell({"moved", path, "objects/" + PathText(b)});
  CompareNodes(a, b, path);
}

void SceneDiff::FindMovedBelow(BaseList2D& removed, const std::string& path)
{
  if (!NodeCast<BaseObject>(&removed))
    return;
  Labels labels;
  for (BaseList2D* child : MembersOf(removed, "children")) {
    const std::string childPath = Below(path, labels.Next(*child));
    if (BaseList2D* partner = match_.PartnerOfA(*child))
      ReportMoved(*child, *partner, childPath);
    else
      FindMovedBelow(*child, childPath);
  }
}

void SceneDiff::CompareTracks(CTrack& a, CTrack& b, const std::string& path)
{
  CompareCurves(a.GetCurve(1, 0), b.GetCurve(1, 0), Below(path, "keys"));
  for (Long number = kCurveFirst; number <= kCurveLast; ++number)
    CompareCurves(a.GetCurve(number, 0), b.GetCurve(number, 0), Below(path, "curves/" + std::to_string(number)));
}

// By their times: both curves have their keys in ascending order.
void SceneDiff::CompareCurves(const CCurve* curveA, const CCurve* curveB, const std::string& path)
{
  CKey scratchA;
  CKey scratchB;
  for (Long a = 0, b = 0;;) {
    const CKey* keyA = curveA ? curveA->PeekKey(a, scratchA) : nullptr;
    const CKey* keyB = curveB ? curveB->PeekKey(b, scratchB) : nullptr;
    if (!keyA && !keyB)
      return;
    const bool isOne = keyA && keyB && comparison_.AreEqual(keyA->GetTime().Get(), keyB->GetTime().Get());
    const bool isOfA = keyA && (isOne || !keyB || keyA->GetTime().Get() < keyB->GetTime().Get());
    const bool isOfB = isOne || !isOfA;
    const std::string keyPath = Below(path, NumberText((isOfA ? keyA : keyB)->GetTime().Get()));
    if (isOne)
      CompareKeys(*keyA, *keyB, keyPath);
    else
      Tell({isOfA ? "removed" : "added", keyPath});
    a += isOfA ? 1 : 0;
    b += isOfB ? 1 : 0;
  }
}

void SceneDiff::CompareKeys(const CKey& a, const CKey& b, const std::string& path)
{
  const auto haveEqualBits = [&] {
    return a.GetNBit(-1) == b.GetNBit(-1) && a.GetNBit(-2) == b.GetNBit(-2) && a.GetNBit(-3) == b.GetNBit(-3) &&
           a.GetNBit(-4) == b.GetNBit(-4);
  };
  if (a.IsEqual(b) && haveEqualBits())
    return;
  NodeRecord recordA;
  NodeRecord recordB;
  SceneTeller(recordA, scope_).TellKey(a);
  SceneTeller(recordB, scope_).TellKey(b);
  CompareRecords(recordA, recordB, path, nullptr);
}

} // namespace q7r
