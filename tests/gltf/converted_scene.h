// Scenes composed for a conversion, and what comes out of it as JSON and numbers.
#pragma once

#include "gltf/converter.h"
#include "gltf/file/checker.h"
#include "support/library.h"
#include "support/run_q7r.h"

namespace gltf_test
{

using gltf::Loss;

inline constexpr double kQuarter = 1.5707963267948966;

struct KeyPoint
{
  double time, value;
  Long interpolation = kInterpolationLinear;
};

// A converted document. Every one of them passes the checker.
class Converted
{
 public:
  Converted(BaseDocument& document, const gltf::Options& options) : model_(gltf::Convert(document, options))
  {
    json = Json::parse(model_.json.Joined());
    if (options.bufferName.empty()) {
      EXPECT_EQ(gltf::CheckGlb(gltf::ToGlb(model_)), "");
    }
    model_.bytes.ForEachBlock(
        [this](const std::uint8_t* data, std::size_t size) { bytes_.insert(bytes_.end(), data, data + size); });
  }

  std::size_t Lost(Loss loss, int detail = 0) const { return model_.account.CountOf(loss, detail); }
  const gltf::Account& Account() const { return model_.account; }
  const gltf::Model& Model() const { return model_; }

  // The node of an object's name.
  const Json& Node(const std::string& name) const
  {
    for (const Json& node : json.at("nodes")) {
      if (node.value("name", "") == name)
        return node;
    }
    throw std::runtime_error("no node " + name);
  }
  std::size_t IndexOf(const std::string& name) const
  {
    return static_cast<std::size_t>(&Node(name) - &json.at("nodes")[0]);
  }
  const Json& Extras(const std::string& name) const { return Node(name).at("extras").at("q7r"); }
  const Json& Primitive(const std::string& name, std::size_t index = 0) const
  {
    return json.at("meshes").at(Node(name).at("mesh").get<std::size_t>()).at("primitives").at(index);
  }
  const Json& MaterialOf(const std::string& name, std::size_t index = 0) const
  {
    return json.at("materials").at(Primitive(name, index).at("material").get<std::size_t>());
  }

  std::vector<double> Numbers(const Json& accessorIndex) const
  {
    const Json& accessor = json.at("accessors").at(accessorIndex.get<std::size_t>());
    const Json& view = json.at("bufferViews").at(accessor.at("bufferView").get<std::size_t>());
    const std::size_t offset = view.at("byteOffset");
    const std::size_t count = view.at("byteLength");
    const int type = accessor.at("componentType");
    const std::size_t size = type == 5123 ? 2 : 4;
    std::vector<double> numbers;
    for (std::size_t i = 0; i < count; i += size) {
      std::uint32_t bits = 0;
      std::memcpy(&bits, bytes_.data() + offset + i, size);
      numbers.push_back(type == 5126 ? double{std::bit_cast<float>(bits)} : static_cast<double>(bits));
    }
    return numbers;
  }

  // Keys of the channel of a node, or of a pointer; empty without one.
  struct Channel
  {
    std::vector<double> times;
    std::vector<double> values;
    std::string interpolation;
  };
  Channel ChannelOf(const std::string& node, const std::string& path) const
  {
    return FindChannel(Json{{"node", IndexOf(node)}, {"path", path}});
  }
  Channel PointerChannel(const std::string& pointer) const
  {
    return FindChannel({{"path", "pointer"}, {"extensions", {{"KHR_animation_pointer", {{"pointer", pointer}}}}}});
  }

  Json json;

 private:
  Channel FindChannel(const Json& target) const
  {
    if (!json.contains("animations"))
      return {};
    const Json& animation = json.at("animations")[0];
    for (const Json& channel : animation.at("channels")) {
      if (channel.at("target") != target)
        continue;
      const Json& sampler = animation.at("samplers").at(channel.at("sampler").get<std::size_t>());
      return {Numbers(sampler.at("input")), Numbers(sampler.at("output")), sampler.value("interpolation", "LINEAR")};
    }
    return {};
  }

  gltf::Model model_;
  std::vector<std::uint8_t> bytes_;
};

class GltfScene : public testing::Test
{
 protected:
  BaseObject* Add(Long type, const char* name, BaseObject* parent = nullptr)
  {
    BaseObject* object = AllocObject(type);
    object->SetName(String(name, STRINGENCODING_UTF8));
    if (parent)
      object->InsertUnderLast(parent);
    else if (last_)
      object->InsertAfter(last_);
    else
      document->InsertObject(object);
    if (!parent)
      last_ = object;
    return object;
  }
  BaseObject* AddPlane(const char* name, double width, double height, Material* material = nullptr)
  {
    BaseObject* plane = Add(kObjectPlane, name);
    plane->SetParameterById(1230, width);
    plane->SetParameterById(1231, height);
    plane->SetParameterById(1300, Long{5});
    if (material)
      AddTexture(*plane, *material);
    return plane;
  }
  static TextureTag* AddTexture(BaseObject& object, Material& material)
  {
    auto* tag = static_cast<TextureTag*>(object.MakeTag(kTagTexture));
    tag->GetDataInstance().SetLong(1004, 6);
    tag->SetMaterial(&material);
    return tag;
  }
  Material* AddMaterial(const char* name, const Vector& color)
  {
    Material* material = AllocMaterial();
    material->SetName(String(name));
    material->SetParameterById(2100, color);
    document->InsertMaterial(material);
    return material;
  }
  static CTrack* AddTrack(BaseList2D& node, const ParameterPath& path, const std::vector<KeyPoint>& keys)
  {
    CTrack* track = CTrack::Alloc(&node, path, "Track");
    CCurve* curve = track->GetCurve(1, 1);
    for (const KeyPoint& point : keys) {
      CKey* key = curve->AddKey(BaseTime(std::round(point.time * 120000), 120000));
      key->SetValue(curve, point.value);
      key->SetInterpolation(curve, point.interpolation);
    }
    node.InsertTrackLast(track);
    return track;
  }
  static ParameterPath Component(Long vector, Long component)
  {
    return {ParameterLevel{vector, kDataVector, 0}, ParameterLevel{kVectorX + component, kDataReal, 0}};
  }
  static void SetTarget(BaseObject& object, BaseObject& target)
  {
    object.MakeTag(kTagTarget)->GetDataInstance().SetLink(kTargetLink, &target);
  }

  Converted Convert() { return Converted(*document, options); }

  DocumentPtr document = NewDocument();
  gltf::Options options;

 private:
  BaseObject* last_ = nullptr;
};

inline void ExpectNear(const Json& actual, const std::vector<double>& expected, double tolerance = 1e-9)
{
  ASSERT_EQ(actual.size(), expected.size()) << actual;
  for (std::size_t i = 0; i < expected.size(); ++i)
    EXPECT_NEAR(actual[i].get<double>(), expected[i], tolerance) << "at " << i << " of " << actual;
}

} // namespace gltf_test
