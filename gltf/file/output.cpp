#include "gltf/file/output.h"

#include <algorithm>
#include <bit>
#include <cfloat>
#include <cmath>

namespace gltf
{

static_assert(std::endian::native == std::endian::little, "views are written as they lie in memory");

namespace
{

constexpr int kFloat = 5126;
constexpr int kUShort = 5123;
constexpr int kUInt = 5125;
constexpr std::size_t kMaxShortVertices = 65535;
constexpr const char* kTypes[] = {"SCALAR", "VEC2", "VEC3", "VEC4"};

std::uint64_t HashOf(const void* data, std::size_t size)
{
  std::uint64_t hash = 14695981039346656037U; // FNV-1a
  for (const auto* byte = static_cast<const std::uint8_t*>(data); size > 0; --size, ++byte)
    hash = (hash ^ *byte) * 1099511628211U;
  return hash;
}

// {"min": [...], "max": [...]} by component.
Json BoundsOf(const std::vector<float>& values, std::size_t width)
{
  Json low = Json::array();
  Json high = Json::array();
  for (std::size_t c = 0; c < width; ++c) {
    float least = values[c];
    float most = values[c];
    for (std::size_t i = c; i < values.size(); i += width) {
      least = std::min(least, values[i]);
      most = std::max(most, values[i]);
    }
    low.push_back(least);
    high.push_back(most);
  }
  return {{"min", std::move(low)}, {"max", std::move(high)}};
}

// An array of the file, between texts, if it has an element.
void AddSection(LongText& text, const char* before, Section& section, const char* behind)
{
  if (section.Count() == 0)
    return;
  text += before;
  text.Take(section.Text());
  text += behind;
}

} // namespace

float Output::ToSingle(Real number)
{
  if (std::fabs(number) <= Real{FLT_MAX}) // false for a NaN
    return static_cast<float>(number) + 0.0F;
  account.Tell(Loss::kNumber);
  return static_cast<float>(Finite(number));
}

std::size_t Output::AddView(const void* data, std::size_t size, ViewTarget target)
{
  bytes_.Pad(4);
  Json view = {{"buffer", 0}, {"byteOffset", bytes_.Size()}, {"byteLength", size}};
  if (target != ViewTarget::kNone)
    view["target"] = static_cast<int>(target);
  bytes_.Append(data, size);
  return views_.Add(view);
}

std::size_t Output::AddAccessor(std::size_t view, int componentType, std::size_t count, const char* type,
                                const Json& bounds)
{
  Json accessor = {{"bufferView", view}, {"componentType", componentType}, {"count", count}, {"type", type}};
  accessor.update(bounds);
  return accessors_.Add(accessor);
}

std::size_t Output::AddFloats(const std::vector<float>& values, std::size_t width, ViewTarget target, bool bounds)
{
  const std::size_t view = AddView(values.data(), values.size() * sizeof(float), target);
  return AddAccessor(view, kFloat, values.size() / width, kTypes[width - 1],
                     bounds ? BoundsOf(values, width) : Json::object());
}

std::size_t Output::AddTimes(const std::vector<float>& times)
{
  const std::size_t size = times.size() * sizeof(float);
  const std::uint64_t hash = HashOf(times.data(), size);
  const auto [first, last] = times_.equal_range(hash);
  for (auto one = first; one != last; ++one) {
    if (one->second.count == times.size() && bytes_.Holds(one->second.offset, times.data(), size))
      return one->second.accessor;
  }
  bytes_.Pad(4);
  const std::size_t offset = bytes_.Size();
  const std::size_t accessor = AddFloats(times, 1, ViewTarget::kNone, true);
  times_.emplace(hash, Times{offset, times.size(), accessor});
  return accessor;
}

std::size_t Output::AddIndices(const std::vector<std::uint32_t>& indices, std::size_t vertices)
{
  if (vertices > kMaxShortVertices) {
    const std::size_t view = AddView(indices.data(), indices.size() * sizeof indices[0], ViewTarget::kIndices);
    return AddAccessor(view, kUInt, indices.size(), kTypes[0], Json::object());
  }
  std::vector<std::uint16_t> narrow(indices.size());
  std::transform(indices.begin(), indices.end(), narrow.begin(),
                 [](std::uint32_t index) { return static_cast<std::uint16_t>(index); });
  const std::size_t view = AddView(narrow.data(), narrow.size() * sizeof narrow[0], ViewTarget::kIndices);
  return AddAccessor(view, kUShort, indices.size(), kTypes[0], Json::object());
}

std::size_t Output::AddBytes(const std::vector<std::uint8_t>& bytes)
{
  return AddView(bytes.data(), bytes.size(), ViewTarget::kNone);
}

void Output::AddAnimation(LongText& text, const Json& animation)
{
  if (animationChannels.Count() == 0)
    return;
  AddSection(text, ",\"animations\":[{\"channels\":[", animationChannels, "]");
  AddSection(text, ",\"samplers\":[", animationSamplers, "]");
  text += (animation.empty() ? "}" : "," + Dump(animation).substr(1)) + "]"; // with the brace that closes it
}

LongText Output::Finish(const std::string& generator, const Json& scene, const Json& animation,
                        const std::string& bufferUri)
{
  LongText text;
  text += "{\"asset\":" + Dump({{"version", "2.0"}, {"generator", generator}});
  if (!extensions_.empty())
    text += ",\"extensionsUsed\":" + Dump(extensions_);
  text += ",\"scene\":0,\"scenes\":[" + Dump(scene) + "]";
  AddSection(text, ",\"nodes\":[", nodes, "]");
  AddSection(text, ",\"cameras\":[", cameras, "]");
  AddSection(text, ",\"meshes\":[", meshes, "]");
  AddSection(text, ",\"materials\":[", materials, "]");
  AddSection(text, ",\"textures\":[", textures, "]");
  AddSection(text, ",\"images\":[", images, "]");
  AddSection(text, ",\"samplers\":[", samplers, "]");
  AddAnimation(text, animation);
  AddSection(text, ",\"accessors\":[", accessors_, "]");
  AddSection(text, ",\"bufferViews\":[", views_, "]");
  if (bytes_.Size() > 0) {
    Json buffer = {{"byteLength", bytes_.Size()}};
    if (!bufferUri.empty())
      buffer["uri"] = bufferUri;
    text += ",\"buffers\":[" + Dump(buffer) + "]";
  }
  AddSection(text, ",\"extensions\":{\"KHR_lights_punctual\":{\"lights\":[", lights, "]}}");
  text += "}";
  return text;
}

} // namespace gltf
