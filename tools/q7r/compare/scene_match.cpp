#include "compare/scene_match.h"

#include <algorithm>
#include <cstring>

#include "listing/scene_teller.h"
#include "scene_file.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

std::string MarkerKey(const BaseList2D& node)
{
  const NodeMarker& marker = node.GetMarker();
  return {reinterpret_cast<const char*>(marker.bytes), sizeof marker.bytes};
}

// What a track drives is a part of what it is.
std::string PathKey(const CTrack& track)
{
  std::string key;
  for (Long i = 0; i < track.GetPath().GetLevelCount(); ++i)
    key += "/" + std::to_string(track.GetPath()[i].id);
  return key;
}

std::string NameKey(const BaseList2D& node)
{
  const CTrack* track = NodeCast<CTrack>(&node);
  return std::to_string(node.GetType()) + (track ? PathKey(*track) : "") + " " + ToUtf8(node.GetName());
}

// All objects that have no partner, from the top down.
void CollectLonely(BaseList2D* first, const SceneMatch::Partners& partners, Members& lonely)
{
  for (BaseList2D* node = first; node; node = node->GetNext()) {
    if (partners.find(node) == partners.end())
      lonely.push_back(node);
    if (const auto* object = NodeCast<BaseObject>(node))
      CollectLonely(object->GetDown(), partners, lonely);
  }
}

} // namespace

Members MembersOf(BaseList2D& node, const char* name)
{
  Members members;
  for (const NodeList& list : NodeLists(node)) {
    if (std::strcmp(list.name, name) != 0)
      continue;
    for (BaseList2D* member = list.root ? list.root->GetFirst() : nullptr; member; member = member->GetNext())
      members.push_back(member);
  }
  return members;
}

std::vector<const char*> ListNamesOf(BaseList2D& a, BaseList2D& b)
{
  std::vector<const char*> names;
  for (BaseList2D* node : {&a, &b}) {
    for (const NodeList& list : NodeLists(*node)) {
      if (std::none_of(names.begin(), names.end(), [&](const char* name) { return !std::strcmp(name, list.name); }))
        names.push_back(list.name);
    }
  }
  return names;
}

SceneMatch::SceneMatch(BaseDocument& a, BaseDocument& b)
{
  Join(a, b);
  MatchPending();
  MatchMoved(a, b);
}

BaseList2D* SceneMatch::Find(const Partners& partners, const BaseList2D& node)
{
  const auto found = partners.find(&node);
  // The map serves comparisons that look at no node; all in it were given as nodes that may change.
  return found != partners.end() ? const_cast<BaseList2D*>(static_cast<const BaseList2D*>(found->second)) : nullptr;
}

void SceneMatch::Join(BaseList2D& a, BaseList2D& b)
{
  ofA_.emplace(&a, &b);
  ofB_.emplace(&b, &a);
  pending_.emplace_back(&a, &b);
}

// Joins the members without a partner that have equal keys: the first of them with the first, and so on.
void SceneMatch::JoinBy(Key key, const Members& a, const Members& b, bool onlySingle)
{
  std::unordered_map<std::string, Members> byKey;
  for (auto member = b.rbegin(); member != b.rend(); ++member) {
    if (!PartnerOfB(**member))
      byKey[key(**member)].push_back(*member); // the first comes last
  }
  std::unordered_map<std::string, int> ofA;
  for (BaseList2D* member : a) {
    if (onlySingle && !PartnerOfA(*member))
      ++ofA[key(*member)];
  }
  for (BaseList2D* member : a) {
    const auto found = PartnerOfA(*member) ? byKey.end() : byKey.find(key(*member));
    if (found == byKey.end() || found->second.empty())
      continue;
    if (onlySingle && (found->second.size() != 1 || ofA[found->first] != 1))
      continue;
    Join(*member, *found->second.back());
    found->second.pop_back();
  }
}

void SceneMatch::MatchLists(BaseList2D& a, BaseList2D& b)
{
  for (const char* list : ListNamesOf(a, b)) {
    const Members ofA = MembersOf(a, list);
    const Members ofB = MembersOf(b, list);
    JoinBy(MarkerKey, ofA, ofB, false);
    JoinBy(NameKey, ofA, ofB, false);
  }
}

void SceneMatch::MatchPending()
{
  while (!pending_.empty()) {
    const auto [a, b] = pending_.back();
    pending_.pop_back();
    MatchLists(*a, *b);
  }
}

void SceneMatch::MatchMoved(BaseDocument& a, BaseDocument& b)
{
  for (const Key key : {MarkerKey, NameKey}) {
    Members ofA;
    Members ofB;
    CollectLonely(a.GetFirstObject(), ofA_, ofA);
    CollectLonely(b.GetFirstObject(), ofB_, ofB);
    JoinBy(key, ofA, ofB, true);
    MatchPending();
  }
}

} // namespace q7r
