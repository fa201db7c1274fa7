#include "tree_text.h"

#include <algorithm>
#include <iterator>

#include "node_details.h"
#include "torvane/math/ge_math.h"
#include "torvane/objects/base_object.h"

namespace q7r
{

// The first is the form of what stands alone. Children have that of the list that their parent stands in.
const TreeText::ListForm TreeText::kLists[] = {
    {"document", nullptr, "document", "  "},
    {"objects", "objects", "", "  "},
    {"materials", "materials", "", "  "},
    {"layers", "layers", "", "  "},
    {"renderData", "render settings", "", "  "},
    {"views", "views", "panel", "  "},
    {"draws", nullptr, "", ""},
    {"tags", nullptr, "tag", " "},
    {"tracks", nullptr, "track", " "},
    {"shaders", nullptr, "shader", "  "},
    {"videoPosts", nullptr, "video post", "  "},
    {"multipasses", nullptr, "multipass", "  "},
};

const TreeText::ListForm* TreeText::FormOfKey() const
{
  if (key_ == "children")
    return levels_.back().form;
  const auto* form = std::find_if(std::begin(kLists), std::end(kLists), [&](const auto& f) { return f.list == key_; });
  return form != std::end(kLists) ? form : nullptr;
}

void TreeText::BeginNode(const ListForm& form)
{
  levels_.push_back({Kind::kNode, &form});
  isPending_ = true;
  for (std::string* part : {&type_, &name_, &details_, &summary_})
    part->clear();
}

void TreeText::BeginObject(Layout)
{
  if (levels_.empty()) // the scene as a whole
    levels_.push_back({Kind::kOther, nullptr});
  else if (levels_.size() == 1 && key_ == kLists[0].list)
    BeginNode(kLists[0]);
  else if (levels_.back().kind == Kind::kList)
    BeginNode(*levels_.back().form);
  else
    levels_.push_back({Kind::kOther, nullptr});
}

void TreeText::EndObject()
{
  const Level level = levels_.back();
  if (level.kind == Kind::kNode && isPending_)
    PrintNode();
  levels_.pop_back();
  if (level.kind == Kind::kNode)
    --depth_;
}

void TreeText::BeginArray(Layout)
{
  const bool isOfScene = levels_.size() == 1;
  const ListForm* form = isOfScene || IsInNode() ? FormOfKey() : nullptr;
  if (form && isPending_)
    PrintNode();
  if (form && isOfScene) {
    depth_ = 0;
    Print(form->heading);
    depth_ = 1;
  }
  levels_.push_back({form ? Kind::kList : Kind::kOther, form});
}

void TreeText::Integer(long long value)
{
  if (!IsInNode())
    return;
  if (key_ == "renderMode" && value == _torvane_::kObjectModeOff)
    details_ += "  not rendered";
  else if (key_ == "childCount" && value > 0)
    Print("(" + std::to_string(value) + (value == 1 ? " child)" : " children)"));
}

void TreeText::Text(std::string_view utf8)
{
  if (!IsInNode())
    return;
  if (key_ == "typeName")
    type_ = utf8;
  else if (key_ == "name")
    name_.append("\"").append(utf8).append("\"");
  else if (key_ == "summary")
    summary_ = utf8;
  else if (key_ == "below" && !utf8.empty())
    details_.append("  below \"").append(utf8).append("\"");
}

void TreeText::Rows(const NumberRows& rows)
{
  double numbers[3] = {};
  if (!IsInNode() || rows.count != 3 || rows.perRow != 1)
    return;
  for (int i = 0; i < 3; ++i)
    rows.get(rows.entries, i, &numbers[i]);
  const auto areAll = [&](double value) {
    return std::all_of(std::begin(numbers), std::end(numbers), [value](double n) { return n == value; });
  };
  if (key_ == "pos")
    details_ += "  pos " + NumbersText(numbers);
  else if (key_ == "rot" && !areAll(0.0))
    details_ += "  rot " + NumbersText(numbers, _torvane_::RadiansToDegrees(1.0));
  else if (key_ == "scale" && !areAll(1.0))
    details_ += "  scale " + NumbersText(numbers);
}

void TreeText::Link(const void* target, std::string_view name)
{
  if (IsInNode() && target && key_ == "layer")
    details_.append("  layer \"").append(name).append("\"");
}

void TreeText::PrintNode()
{
  const ListForm& form = *levels_.back().form;
  std::string line = form.prefix;
  // A tag without a name of its own is told by its type; other things show that they have none.
  if (name_ == "\"\"" && !type_.empty() && form.prefix[0] != '\0')
    name_.clear();
  for (const std::string& part : {type_, name_}) {
    if (!part.empty())
      line += (line.empty() ? "" : " ") + part;
  }
  line += details_;
  if (!summary_.empty())
    line += form.gap + summary_;
  Print(line);
  isPending_ = false;
  ++depth_;
}

void TreeText::Print(std::string_view line) const { output_(std::string(2 * depth_, ' ').append(line)); }

} // namespace q7r
