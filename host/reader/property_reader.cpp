#include "host/reader/property_reader.h"

#include <algorithm>

namespace host
{

namespace
{

// One component of a split position.
constexpr StreamInfo kSplitComponent{AEGP_LayerStream_POSITION, "position", AEGP_StreamType_OneD, {0}};

class PropertyReader
{
 public:
  PropertyReader(const JsonDocument& document, const StreamInfo& info, const Value& defaults)
      : document_(document), defaults_(defaults), dimensions_(static_cast<std::size_t>(info.Dimensions()))
  {}

  Value Components(const Json& json, const Value& defaults) const;
  std::vector<Keyframe> Keyframes(const Json& list) const;
  std::vector<Value> Samples(const Json& list) const;

 private:
  Keyframe ReadKeyframe(const Json& json, const Keyframe* previous) const;
  Value ValueOf(const Json& json, const Json* previousJson, const Keyframe* previous) const;
  std::vector<Easing> EasingOf(const Json& json) const;
  double Entry(const Json& json, std::size_t component) const;
  void AddPath(Keyframe& from, const Keyframe& to, const Json& json) const;

  const JsonDocument& document_;
  const Value& defaults_;
  std::size_t dimensions_;
};

// A number or an array of numbers; entries beyond the property's dimensions are passed over.
Value PropertyReader::Components(const Json& json, const Value& defaults) const
{
  constexpr const char* kExpected = "expected a number or an array of numbers";
  Value value = defaults;
  if (json.is_number()) {
    value[0] = json.get<double>();
    return value;
  }
  if (!json.is_array())
    document_.Refuse(json, kExpected);
  for (std::size_t i = 0; i < json.size(); ++i) {
    if (!json[i].is_number())
      document_.Refuse(json, kExpected);
    if (i < dimensions_)
      value[i] = json[i].get<double>();
  }
  return value;
}

// The number itself, or the entry of an array, whose first one serves for those that are missing.
double PropertyReader::Entry(const Json& json, std::size_t component) const
{
  const bool isList = json.is_array() && !json.empty();
  const Json& entry = isList ? json[component < json.size() ? component : 0] : json;
  if (!entry.is_number())
    document_.Refuse(json, "expected a number or an array of numbers");
  return entry.get<double>();
}

std::vector<Easing> PropertyReader::EasingOf(const Json& json) const
{
  const Json* out = document_.Find(json, "o");
  const Json* in = document_.Find(json, "i");
  if (!out || !in)
    return {};
  const Json* const numbers[4] = {&document_.Require(*out, "x"), &document_.Require(*out, "y"),
                                  &document_.Require(*in, "x"), &document_.Require(*in, "y")};
  const bool isOneForAll = std::none_of(std::begin(numbers), std::end(numbers),
                                        [](const Json* n) { return n->is_array() && n->size() > 1; });
  std::vector<Easing> easing;
  for (std::size_t c = 0; c < (isOneForAll ? 1 : dimensions_); ++c)
    easing.push_back({Entry(*numbers[0], c), Entry(*numbers[1], c), Entry(*numbers[2], c), Entry(*numbers[3], c)});
  return easing;
}

// `s`; older files state it as the `e` of the keyframe before. One that has neither stays where it was.
Value PropertyReader::ValueOf(const Json& json, const Json* previousJson, const Keyframe* previous) const
{
  if (const Json* start = document_.Find(json, "s"))
    return Components(*start, defaults_);
  if (!previousJson)
    document_.RefuseMember(json, "s", "missing");
  if (const Json* end = document_.Find(*previousJson, "e"))
    return Components(*end, defaults_);
  return previous->value;
}

Keyframe PropertyReader::ReadKeyframe(const Json& json, const Keyframe* previous) const
{
  Keyframe key;
  const Json& time = document_.Require(json, "t");
  key.time = document_.Number(time);
  if (previous && key.time < previous->time)
    document_.Refuse(time, "before the keyframe ahead of it");
  key.hold = document_.FlagOr(json, "h", false) ? Hold::kValue : Hold::kNone;
  key.easing = EasingOf(json);
  return key;
}

void PropertyReader::AddPath(Keyframe& from, const Keyframe& to, const Json& json) const
{
  const auto handle = [&](const char* key) {
    const Json* found = document_.Find(json, key);
    return found ? Components(*found, Value{}) : Value{};
  };
  const Value out = handle("to"), in = handle("ti");
  if (out == Value{} && in == Value{})
    return;
  Value p1 = from.value, p2 = to.value;
  for (std::size_t c = 0; c < dimensions_; ++c) {
    p1[c] += out[c];
    p2[c] += in[c];
  }
  from.path = std::make_unique<BezierPath>(from.value, p1, p2, to.value);
}

std::vector<Keyframe> PropertyReader::Keyframes(const Json& list) const
{
  std::vector<Keyframe> keys;
  keys.reserve(list.size());
  for (std::size_t i = 0; i < list.size(); ++i) {
    const Json* previousJson = i > 0 ? &list[i - 1] : nullptr;
    const Keyframe* previous = i > 0 ? &keys.back() : nullptr;
    Keyframe key = ReadKeyframe(list[i], previous);
    key.value = ValueOf(list[i], previousJson, previous);
    if (i > 0)
      AddPath(keys.back(), key, *previousJson);
    keys.push_back(std::move(key));
  }
  return keys;
}

std::vector<Value> PropertyReader::Samples(const Json& list) const
{
  if (document_.Array(list).empty())
    document_.Refuse(list, "expected one value or more");
  std::vector<Value> samples;
  samples.reserve(list.size());
  for (const Json& entry : list)
    samples.push_back(Components(entry, defaults_));
  return samples;
}

bool IsSplit(const JsonDocument& document, const StreamInfo& info, const Json& json)
{
  return &info == FindStreamInfo(AEGP_LayerStream_POSITION) && document.FlagOr(json, "s", false);
}

void FillSplit(const JsonDocument& document, const Json& json, const Value& defaults, Property& property)
{
  std::vector<Property> components;
  for (std::size_t c = 0; c < 3; ++c) {
    constexpr const char* kKeys[3] = {"x", "y", "z"};
    components.push_back(
        std::move(*ReadProperty(document, kSplitComponent, document.Find(json, kKeys[c]), {defaults[c]})));
  }
  property.SetSplit(std::move(components));
}

void FillKeyed(const JsonDocument& document, const Json& json, const PropertyReader& reader, const Value& defaults,
               Property& property)
{
  const Json& values = document.Require(json, "k");
  if (values.is_array() && !values.empty() && values.front().is_object())
    property.SetKeyframes(reader.Keyframes(values));
  else
    property.SetConstant(reader.Components(values, defaults));
  const Json* expression = document.Find(json, "x");
  if (expression)
    property.SetExpression(document.Text(*expression));
}

} // namespace

std::unique_ptr<Property> ReadProperty(const JsonDocument& document, const StreamInfo& info, const Json* json,
                                       const Value& defaults)
{
  auto property = std::make_unique<Property>(info);
  property->SetConstant(defaults);
  if (!json)
    return property;
  const PropertyReader reader(document, info, defaults);
  if (IsSplit(document, info, *json))
    FillSplit(document, *json, defaults, *property);
  else
    FillKeyed(document, *json, reader, defaults, *property);
  if (const Json* samples = document.Find(*json, "samples"))
    property->SetSamples(reader.Samples(*samples));
  return property;
}

} // namespace host
