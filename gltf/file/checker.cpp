#include "gltf/file/checker.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstring>
#include <set>
#include <stdexcept>

#include <nlohmann/json.hpp>

namespace gltf
{

namespace
{

using ParsedJson = nlohmann::json;

struct Fault : std::runtime_error
{
  using std::runtime_error::runtime_error;
};

void Require(bool holds, const std::string& what)
{
  if (!holds)
    throw Fault(what);
}

constexpr int kFloatType = 5126;
constexpr std::size_t kFileHeader = 12;
constexpr std::size_t kPartHeader = 8;

class GlbChecker
{
 public:
  explicit GlbChecker(const std::vector<std::uint8_t>& file) : file_(file) {}

  void Run()
  {
    OpenContainer();
    Require(json_.at("asset").at("version") == "2.0", "the version isn't 2.0");
    CheckNoEmptyArrays();
    CheckExtensions();
    CheckViews();
    for (std::size_t i = 0; i < Count("accessors"); ++i)
      CheckAccessor(i);
    CheckNodes();
    CheckMeshes();
    CheckMaterials();
    CheckAnimation();
  }

 private:
  std::uint32_t Word(std::size_t place) const
  {
    Require(place + 4 <= file_.size(), "the file is too short");
    return static_cast<std::uint32_t>(file_[place]) | static_cast<std::uint32_t>(file_[place + 1]) << 8 |
           static_cast<std::uint32_t>(file_[place + 2]) << 16 | static_cast<std::uint32_t>(file_[place + 3]) << 24;
  }

  void OpenContainer()
  {
    Require(Word(0) == 0x46546C67 && Word(4) == 2 && Word(8) == file_.size(), "the header is wrong");
    const std::size_t length = Word(kFileHeader);
    Require(Word(kFileHeader + 4) == 0x4E4F534A && length % 4 == 0, "the first chunk isn't JSON");
    const std::size_t begin = kFileHeader + kPartHeader;
    Require(begin + length <= file_.size(), "the JSON is cut");
    json_ = ParsedJson::parse(file_.begin() + static_cast<std::ptrdiff_t>(begin),
                              file_.begin() + static_cast<std::ptrdiff_t>(begin + length));
    Require(json_.contains("buffers") == (begin + length < file_.size()), "bytes and buffers don't go together");
    if (!json_.contains("buffers"))
      return;
    const std::size_t chunk = begin + length;
    bytes_ = chunk + kPartHeader;
    bytesSize_ = json_.at("buffers").at(0).at("byteLength").get<std::size_t>();
    Require(Word(chunk + 4) == 0x004E4942 && bytes_ + Word(chunk) == file_.size(), "the bytes are cut");
    Require(bytesSize_ <= Word(chunk) && Word(chunk) - bytesSize_ < 4, "the buffer has another length");
  }

  std::size_t Count(const char* name) const { return json_.contains(name) ? json_.at(name).size() : 0; }

  // An index into one of the arrays.
  std::size_t Index(const ParsedJson& value, const char* name) const
  {
    Require(value.is_number_unsigned() && value.get<std::size_t>() < Count(name),
            std::string("no such one of ") + name);
    return value.get<std::size_t>();
  }

  void CheckNoEmptyArrays() const
  {
    for (const auto& [name, value] : json_.items())
      Require(!value.is_array() || !value.empty(), name + " is empty");
  }

  void CheckExtensions() const
  {
    std::set<std::string> used;
    std::vector<const ParsedJson*> open = {&json_};
    while (!open.empty()) {
      const ParsedJson& value = *open.back();
      open.pop_back();
      for (const auto& [name, inner] : value.items()) {
        if (name == "extensions" && value.is_object()) {
          for (const auto& [extension, ignored] : inner.items())
            used.insert(extension);
        }
        Require(!inner.is_null(), name + " is null");
        if (inner.is_structured())
          open.push_back(&inner);
      }
    }
    Require(ParsedJson(used) == json_.value("extensionsUsed", ParsedJson::array()), "the extensions used are others");
  }

  void CheckViews() const
  {
    std::size_t end = 0;
    for (std::size_t i = 0; i < Count("bufferViews"); ++i) {
      const ParsedJson& view = json_.at("bufferViews")[i];
      const std::size_t offset = view.at("byteOffset");
      const std::size_t length = view.at("byteLength");
      Require(offset % 4 == 0 && offset >= end && length > 0 && length <= bytesSize_ && offset <= bytesSize_ - length,
              "view " + std::to_string(i) + " lies elsewhere");
      end = offset + length;
    }
  }

  static std::size_t WidthOf(const ParsedJson& accessor)
  {
    const std::string type = accessor.at("type");
    return type == "SCALAR" ? 1 : static_cast<std::size_t>(type.at(3) - '0');
  }

  std::vector<double> Numbers(std::size_t index) const
  {
    const ParsedJson& accessor = json_.at("accessors")[index];
    const ParsedJson& view = json_.at("bufferViews").at(accessor.at("bufferView").get<std::size_t>());
    const int type = accessor.at("componentType");
    const std::size_t size = type == 5123 ? 2 : 4;
    const std::size_t count = accessor.at("count").get<std::size_t>() * WidthOf(accessor);
    Require(view.at("byteLength") == count * size, "accessor " + std::to_string(index) + " doesn't fill its view");
    std::vector<double> numbers(count);
    for (std::size_t i = 0; i < count; ++i) {
      std::uint32_t bits = 0;
      std::memcpy(&bits, file_.data() + bytes_ + view.at("byteOffset").get<std::size_t>() + i * size, size);
      numbers[i] = type == kFloatType ? double{std::bit_cast<float>(bits)} : static_cast<double>(bits);
    }
    return numbers;
  }

  void CheckAccessor(std::size_t index) const
  {
    const ParsedJson& accessor = json_.at("accessors")[index];
    const std::size_t width = WidthOf(accessor);
    const std::vector<double> numbers = Numbers(index);
    const std::string name = "accessor " + std::to_string(index);
    Require(!numbers.empty(), name + " is empty");
    Require(std::all_of(numbers.begin(), numbers.end(), [](double n) { return std::isfinite(n); }),
            name + " isn't finite");
    for (std::size_t c = 0; accessor.contains("min") && c < width; ++c) {
      double low = numbers[c];
      double high = numbers[c];
      for (std::size_t i = c; i < numbers.size(); i += width) {
        low = std::min(low, numbers[i]);
        high = std::max(high, numbers[i]);
      }
      Require(accessor.at("min").at(c) == low && accessor.at("max").at(c) == high, name + " has other bounds");
    }
  }

  static void RequireUnit(const double* q, std::size_t count, const std::string& what)
  {
    double length = 0.0;
    for (std::size_t i = 0; i < count; ++i)
      length += q[i] * q[i];
    Require(std::fabs(length - 1.0) < 1e-3, what + " isn't of length 1");
  }

  void CheckNodes() const
  {
    std::vector<bool> hasParent(Count("nodes"));
    auto take = [&](const ParsedJson& list) {
      for (const ParsedJson& child : list) {
        const std::size_t index = Index(child, "nodes");
        Require(!hasParent[index], "node " + std::to_string(index) + " hangs in two places");
        hasParent[index] = true;
      }
    };
    const ParsedJson& scene = json_.at("scenes").at(json_.at("scene").get<std::size_t>());
    if (scene.contains("nodes"))
      take(scene.at("nodes"));
    std::set<std::string> names;
    for (std::size_t i = 0; i < Count("nodes"); ++i) {
      const ParsedJson& node = json_.at("nodes")[i];
      CheckNode(node);
      if (node.contains("children"))
        take(node.at("children"));
      Require(!node.contains("name") || names.insert(node.at("name")).second, "a name stands twice");
    }
    // Each node is reached just once, and there are no further ones: the graph is a tree.
    Require(std::find(hasParent.begin(), hasParent.end(), false) == hasParent.end(), "a node hangs nowhere");
  }

  void CheckNode(const ParsedJson& node) const
  {
    if (node.contains("mesh"))
      Index(node.at("mesh"), "meshes");
    if (node.contains("camera"))
      Index(node.at("camera"), "cameras");
    if (node.contains("rotation"))
      RequireUnit(node.at("rotation").get<std::vector<double>>().data(), 4, "a rotation");
    const ParsedJson light = node.value("/extensions/KHR_lights_punctual/light"_json_pointer, ParsedJson());
    Require(light.is_null() || light < json_.at("extensions").at("KHR_lights_punctual").at("lights").size(),
            "no such light");
  }

  void CheckMeshes() const
  {
    for (std::size_t i = 0; i < Count("meshes"); ++i) {
      for (const ParsedJson& primitive : json_.at("meshes")[i].at("primitives"))
        CheckPrimitive(primitive);
    }
  }

  void CheckPrimitive(const ParsedJson& primitive) const
  {
    const ParsedJson& attributes = primitive.at("attributes");
    const ParsedJson& accessors = json_.at("accessors");
    const ParsedJson& position = accessors.at(Index(attributes.at("POSITION"), "accessors"));
    Require(position.contains("min"), "places without bounds");
    for (const auto& [name, index] : attributes.items())
      Require(accessors.at(Index(index, "accessors")).at("count") == position.at("count"),
              name + " is of another count");
    const ParsedJson& material = json_.at("materials").at(Index(primitive.at("material"), "materials"));
    const bool hasPicture = material.contains("/pbrMetallicRoughness/baseColorTexture"_json_pointer);
    Require(!hasPicture || attributes.contains("TEXCOORD_0"), "a picture without coordinates");
    if (!primitive.contains("indices"))
      return;
    const std::vector<double> indices = Numbers(Index(primitive.at("indices"), "accessors"));
    Require(indices.size() % 3 == 0, "half a triangle");
    Require(*std::max_element(indices.begin(), indices.end()) < position.at("count").get<double>(), "no such vertex");
    if (!attributes.contains("NORMAL"))
      return;
    const std::vector<double> normals = Numbers(attributes.at("NORMAL").get<std::size_t>());
    for (std::size_t i = 0; i < normals.size(); i += 3)
      RequireUnit(&normals[i], 3, "a normal");
  }

  void CheckMaterials() const
  {
    for (std::size_t i = 0; i < Count("materials"); ++i) {
      const ParsedJson& surface = json_.at("materials")[i].at("pbrMetallicRoughness");
      for (const ParsedJson& factor : surface.at("baseColorFactor"))
        Require(factor >= 0.0 && factor <= 1.0, "a colour out of range");
      if (surface.contains("baseColorTexture"))
        Index(surface.at("baseColorTexture").at("index"), "textures");
    }
    for (std::size_t i = 0; i < Count("textures"); ++i) {
      Index(json_.at("textures")[i].at("source"), "images");
      Index(json_.at("textures")[i].at("sampler"), "samplers");
    }
    for (std::size_t i = 0; i < Count("images"); ++i) {
      if (json_.at("images")[i].contains("bufferView"))
        Index(json_.at("images")[i].at("bufferView"), "bufferViews");
    }
  }

  void CheckAnimation() const
  {
    if (!json_.contains("animations"))
      return;
    const ParsedJson& animation = json_.at("animations").at(0);
    std::set<std::string> targets;
    for (const ParsedJson& channel : animation.at("channels")) {
      const ParsedJson& target = channel.at("target");
      Require(targets.insert(target.dump()).second, "two channels for one value");
      if (target.contains("node"))
        Index(target.at("node"), "nodes");
      else
        CheckPointer(target);
      CheckSampler(animation.at("samplers").at(channel.at("sampler").get<std::size_t>()), target.at("path"));
    }
  }

  void CheckPointer(const ParsedJson& target) const
  {
    const std::string pointer = target.at("extensions").at("KHR_animation_pointer").at("pointer");
    Require(json_.contains(ParsedJson::json_pointer(pointer)), pointer + " leads nowhere");
  }

  void CheckSampler(const ParsedJson& sampler, const std::string& path) const
  {
    const std::size_t input = Index(sampler.at("input"), "accessors");
    const std::size_t output = Index(sampler.at("output"), "accessors");
    const std::vector<double> times = Numbers(input);
    Require(json_.at("accessors")[input].contains("min") && times[0] >= 0.0, "times without bounds or below 0");
    for (std::size_t i = 1; i < times.size(); ++i)
      Require(times[i] > times[i - 1], "times don't rise");
    Require(json_.at("accessors")[output].at("count") == times.size(), "other numbers of times and values");
    const std::vector<double> values = Numbers(output);
    for (std::size_t i = 0; path == "rotation" && i < values.size(); i += 4)
      RequireUnit(&values[i], 4, "an animated rotation");
  }

  const std::vector<std::uint8_t>& file_;
  ParsedJson json_;
  std::size_t bytes_ = 0; // where the buffer begins
  std::size_t bytesSize_ = 0;
};

} // namespace

std::string CheckGlb(const std::vector<std::uint8_t>& file)
{
  try {
    GlbChecker(file).Run();
    return {};
  } catch (const std::exception& error) {
    return error.what();
  }
}

} // namespace gltf
