// Which node of one scene is which node of another.
#pragma once

#include <string>
#include <unordered_map>
#include <vector>

#include "torvane/document/base_document.h"

namespace q7r
{

using Members = std::vector<_torvane_::BaseList2D*>;

// The members of the list of that name; none where the node has no such list.
Members MembersOf(_torvane_::BaseList2D& node, const char* list);
// The names of the lists that either node has, in order.
std::vector<const char*> ListNamesOf(_torvane_::BaseList2D& a, _torvane_::BaseList2D& b);

class SceneMatch
{
 public:
  using Partners = std::unordered_map<const void*, const void*>;

  // Members of a list are the same if their markers are, else if their types and names are, in their order; objects
  // also if they stand elsewhere and one of a kind is left over on each side.
  SceneMatch(_torvane_::BaseDocument& a, _torvane_::BaseDocument& b);

  // The node of the other scene, or null.
  _torvane_::BaseList2D* PartnerOfA(const _torvane_::BaseList2D& node) const { return Find(ofA_, node); }
  _torvane_::BaseList2D* PartnerOfB(const _torvane_::BaseList2D& node) const { return Find(ofB_, node); }
  const Partners& AllOfA() const { return ofA_; }

 private:
  using Key = std::string (*)(const _torvane_::BaseList2D& node);

  static _torvane_::BaseList2D* Find(const Partners& partners, const _torvane_::BaseList2D& node);
  void Join(_torvane_::BaseList2D& a, _torvane_::BaseList2D& b);
  void JoinBy(Key key, const Members& a, const Members& b, bool onlySingle);
  void MatchLists(_torvane_::BaseList2D& a, _torvane_::BaseList2D& b);
  void MatchMoved(_torvane_::BaseDocument& a, _torvane_::BaseDocument& b);
  void MatchPending();

  Partners ofA_;
  Partners ofB_;
  std::vector<std::pair<_torvane_::BaseList2D*, _torvane_::BaseList2D*>> pending_; // pairs whose lists are due
};

} // namespace q7r
