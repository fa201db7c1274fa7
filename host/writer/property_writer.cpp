#include "host/writer/property_writer.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <limits>

namespace host
{

namespace
{

OrderedJson WriteValue(const Value& value, std::size_t dimensions)
{
  OrderedJson json = OrderedJson::array();
  for (std::size_t c = 0; c < dimensions; ++c)
    json.push_back(value[c]);
  return json;
}

// The handle that, added to `from`, gives `to` to the last bit.
double Handle(double from, double to)
{
  const double handle = to - from;
  for (const double candidate : {handle, std::nextafter(handle, std::numeric_limits<double>::infinity()),
                                 std::nextafter(handle, -std::numeric_limits<double>::infinity())})
    if (from + candidate == to)
      return candidate;
  return handle;
}

OrderedJson WriteHandle(const Value& from, const Value& to, std::size_t dimensions)
{
  Value handle{};
  for (std::size_t c = 0; c < dimensions; ++c)
    handle[c] = Handle(from[c], to[c]);
  return WriteValue(handle, dimensions);
}

constexpr std::size_t kOneCurve = 4; // control points

bool IsSayable(const Keyframe& key)
{
  return key.hold != Hold::kNextValue && (!key.path || key.path->Points().size() == kOneCurve) &&
         std::none_of(key.easing.begin(), key.easing.end(), [](const Easing& e) { return e.isBump; });
}

bool IsSayable(const Property& property)
{
  const std::vector<Keyframe>& keys = property.Keyframes();
  return (!property.IsTurning() || keys.size() < 2) &&
         std::all_of(keys.begin(), keys.end(), [](const Keyframe& key) { return IsSayable(key); });
}

OrderedJson WriteEasing(const std::vector<Easing>& easing, double Easing::*x, double Easing::*y)
{
  OrderedJson handle = {{"x", OrderedJson::array()}, {"y", OrderedJson::array()}};
  for (const Easing& curve : easing) {
    handle["x"].push_back(curve.*x);
    handle["y"].push_back(curve.*y);
  }
  return handle;
}

OrderedJson WriteKeyframe(const Keyframe& key, std::size_t dimensions, bool isLast)
{
  OrderedJson json = {{"t", key.time}, {"s", WriteValue(key.value, dimensions)}};
  if (key.hold != Hold::kNone)
    json["h"] = 1;
  if (isLast || key.hold != Hold::kNone || !IsSayable(key))
    return json;
  if (!key.easing.empty()) {
    json["o"] = WriteEasing(key.easing, &Easing::x1, &Easing::y1);
    json["i"] = WriteEasing(key.easing, &Easing::x2, &Easing::y2);
  }
  if (key.path) {
    const std::vector<Value>& points = key.path->Points();
    json["to"] = WriteHandle(points[0], points[1], dimensions);
    json["ti"] = WriteHandle(points[3], points[2], dimensions);
  }
  return json;
}

// The value or the keyframes.
OrderedJson WriteKeys(const Property& property)
{
  const auto dimensions = static_cast<std::size_t>(property.Info().Dimensions());
  const std::vector<Keyframe>& keys = property.Keyframes();
  if (keys.empty()) {
    const OrderedJson value = WriteValue(property.Constant(), dimensions);
    return {{"a", 0}, {"k", dimensions == 1 ? value[0] : value}};
  }
  OrderedJson list = OrderedJson::array();
  for (const Keyframe& key : keys)
    list.push_back(WriteKeyframe(key, dimensions, &key == &keys.back()));
  return {{"a", 1}, {"k", std::move(list)}};
}

OrderedJson WriteSamples(const Property& property, std::size_t lastFrame)
{
  const auto dimensions = static_cast<std::size_t>(property.Info().Dimensions());
  OrderedJson samples = OrderedJson::array();
  if (!property.Samples().empty()) {
    for (const Value& value : property.Samples())
      samples.push_back(WriteValue(value, dimensions));
    return samples;
  }
  for (std::size_t frame = 0; frame <= lastFrame; ++frame)
    samples.push_back(WriteValue(property.At(static_cast<double>(frame)), dimensions));
  return samples;
}

} // namespace

OrderedJson WriteProperty(const Property& property, std::size_t lastFrame)
{
  OrderedJson json;
  if (property.Split().empty()) {
    json = WriteKeys(property);
  } else {
    json["s"] = true;
    constexpr const char* kKeys[] = {"x", "y", "z"};
    for (std::size_t c = 0; c < std::min(std::size(kKeys), property.Split().size()); ++c)
      json[kKeys[c]] = WriteProperty(property.Split()[c], lastFrame);
  }
  if (!property.Expression().empty())
    json["x"] = property.Expression();
  if (!property.Samples().empty() || !IsSayable(property))
    json["samples"] = WriteSamples(property, lastFrame);
  return json;
}

} // namespace host
