#include "checks/scene_checks.h"

#include <algorithm>
#include <string_view>
#include <unordered_map>

#include "gltf/materials/picture_file.h"
#include "listing/node_path.h"
#include "listing/parameter_names.h"
#include "listing/scene_teller.h"
#include "output/number_text.h"
#include "scene_file.h"
#include "torvane/layers/layer_object.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/texture_tag.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr std::string_view kLinkMark = "alias2";
constexpr std::string_view kGoalMark = "agoal1";
constexpr std::size_t kNumberSize = 8;

bool HasMark(const StreamValue& value, std::string_view mark)
{
  return value.tag == kTagMemory && value.size >= static_cast<LLong>(mark.size() + kNumberSize) &&
         std::string_view(reinterpret_cast<const char*>(value.head), mark.size()) == mark;
}

unsigned long long NumberBehind(const StreamValue& value, std::string_view mark)
{
  unsigned long long number = 0;
  for (std::size_t i = 0; i < kNumberSize; ++i)
    number = number << 8 | value.head[mark.size() + i];
  return number;
}

constexpr int kLimitDigits = 6;

// "from 0 to 1", "above 0".
std::string RangeText(const ParameterRow& row)
{
  constexpr double kAny = std::numeric_limits<double>::infinity();
  if (row.least == std::numeric_limits<double>::min())
    return "above 0";
  const std::string least = row.least > -kAny ? "from " + NumberText(row.least, kLimitDigits) : std::string();
  const std::string most = row.most < kAny ? "to " + NumberText(row.most, kLimitDigits) : std::string();
  return least.empty() || most.empty() ? (least.empty() ? most : least + " up") : least + " " + most;
}

class Search
{
 public:
  Search(const std::filesystem::path& folder, std::vector<SceneWarning>& warnings)
      : folder_(folder), warnings_(warnings)
  {}

  // `path` is empty for the document.
  void Node(BaseList2D& node, const std::string& path)
  {
    Ranges(node, path);
    Picture(node, path);
    Tag(node, path);
    for (const NodeList& list : NodeLists(node))
      List(list, ListPath(path, list.name));
  }

 private:
  void Warn(const char* kind, const std::string& path, const std::string& message)
  {
    warnings_.push_back({kind, path, message});
  }

  void List(const NodeList& list, const std::string& path)
  {
    Labels labels;
    std::unordered_map<std::string, int> names;
    for (BaseList2D* node = list.root ? list.root->GetFirst() : nullptr; node; node = node->GetNext()) {
      Node(*node, Below(path, labels.Next(*node)));
      // Materials share names whenever layers of one source do, and nothing finds them by name.
      const bool isNamed = NodeCast<BaseObject>(node) || NodeCast<LayerObject>(node);
      if (isNamed && node->GetName().Content() && ++names[ToUtf8(node->GetName())] == 2)
        Warn("name", Below(path, ToUtf8(node->GetName())), "the name stands more than once in this list");
    }
  }

  void Range(const ParameterRow& row, double number, const std::string& path)
  {
    if (number < row.least || number > row.most)
      Warn("range", path,
           std::string(row.name) + " (" + std::to_string(row.id) + ") is " + NumberText(number, kLimitDigits) +
               ": it goes " + RangeText(row));
  }

  void Ranges(BaseList2D& node, const std::string& path)
  {
    GeData value;
    for (const ParameterRow& row : NamedParametersOf(node)) {
      if (!GetHeldParameter(node, row.id, value))
        continue;
      if (value.GetType() == kDataVector) {
        const Vector& parts = value.GetVector();
        Range(row, std::min({parts.x, parts.y, parts.z}), path);
        Range(row, std::max({parts.x, parts.y, parts.z}), path);
      } else if (value.GetType() == kDataReal || value.GetType() == kDataLong) {
        Range(row, value.GetReal(), path);
      }
    }
  }

  void Picture(BaseList2D& node, const std::string& path)
  {
    const auto* shader = NodeCast<BaseShader>(&node);
    if (!shader || !shader->HasBitmapFilename())
      return;
    const std::string name = ToUtf8(shader->BitmapFilename().GetString());
    std::error_code error;
    if (missing_.count(name) == 0 && !std::filesystem::is_regular_file(gltf::LocatePicture(folder_, name), error)) {
      missing_.insert(name);
      Warn("picture", path, "the picture \"" + name + "\" is missing");
    }
  }

  void Tag(BaseList2D& node, const std::string& path)
  {
    if (!NodeCast<BaseTag>(&node))
      return;
    if (node.GetType() == kTagTexture && !node.GetDataInstance().GetLink(kTextureMaterial))
      Warn("link", path, "the texture tag has no material");
    if (node.GetType() == kTagTarget && !node.GetDataInstance().GetLink(kTargetLink))
      Warn("link", path, "the target tag has no target");
  }

  const std::filesystem::path& folder_;
  std::vector<SceneWarning>& warnings_;
  std::unordered_set<std::string> missing_; // each is told once
};

} // namespace

void LinkCheck::See(const StreamValue& value)
{
  if (HasMark(value, kGoalMark))
    goals_.insert(NumberBehind(value, kGoalMark));
  else if (HasMark(value, kLinkMark) && NumberBehind(value, kLinkMark) != 0)
    links_.push_back({value.offset, NumberBehind(value, kLinkMark)});
}

void LinkCheck::AddWarnings(std::vector<SceneWarning>& warnings) const
{
  for (const Link& link : links_) {
    if (goals_.count(link.number) == 0)
      warnings.push_back(
          {"link", "", "byte " + std::to_string(link.offset) + ": the link leads to nothing in the file"});
  }
}

void AddSceneWarnings(BaseDocument& document, const std::filesystem::path& folder, std::vector<SceneWarning>& warnings)
{
  if (!document.GetFirstObject())
    warnings.push_back({"empty", "", "the scene has no objects"});
  Search(folder, warnings).Node(document, "");
}

} // namespace q7r
