#include "gltf/scene/light.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <utility>

#include "gltf/motion/animation.h"
#include "gltf/scene/color.h"
#include "gltf/text.h"
#include "torvane/objects/light_object_data.h"
#include "torvane/values/ge_data.h"

namespace gltf
{

using namespace _torvane_;

namespace
{

constexpr Real kLeastAngle = 0.001;
constexpr Real kInnerShare = 0.999; // of the outer angle: equal ones are an error

GeData Parameter(BaseObject& object, Long id)
{
  GeData value;
  for (const LightParameterRange& range : kLightParameters) {
    if (range.first == id) // of an object without light data
      value = range.kind == LightKind::kVector ? GeData(Vector(range.number, range.number, range.number))
                                               : GeData(range.number);
  }
  object.GetParameterById(id, value);
  return value;
}

// The intensity of a brightness of 1. A white surface at the distance of half the picture's width, or lit from afar, is
// then as bright as the scene's lights of 100 % make it.
Real FullIntensity(const SceneSettings& settings, Long type, const IESLight* measured)
{
  const Real distance = 0.5 * settings.width * settings.unit;
  if (type == kLightIES && measured)
    return std::max(Finite(measured->GetLumens()), 0.0) / (4.0 * kPi);
  return type == kLightPoint || type == kLightSpot || type == kLightIES ? kPi * distance * distance : kPi;
}

Real OuterCone(Real angle)
{
  const Real half = 0.5 * angle;
  return half > kLeastAngle ? std::min(half, kHalfPi) : kLeastAngle;
}

Real InnerCone(Real angle, Real outer)
{
  const Real half = 0.5 * angle;
  return half > 0.0 ? std::min(half, kInnerShare * outer) : 0.0;
}

// What a colour component above 1 takes over into the intensity.
Real Excess(const Vector& linear) { return std::max(LargestOf(linear), 1.0); }

class LightWriter
{
 public:
  LightWriter(Context& context, BaseObject& object, TrackSet& tracks)
      : context_(context),
        object_(object),
        tracks_(tracks),
        measured_(GetIESLight(&object)),
        type_(Parameter(object, kLightType).GetLong()),
        full_(FullIntensity(context.settings, type_, measured_)),
        color_(Parameter(object, kLightColor).GetVector()),
        brightness_(Parameter(object, kLightBrightness).GetReal())
  {}

  std::size_t Write()
  {
    context_.output.UseExtension("KHR_lights_punctual");
    SampleColor();
    const Vector linear = ToLinear(color_);
    Json light = {{"type", TypeName()},
                  {"color", ToJson(linear * (1.0 / Excess(linear)))},
                  {"intensity", Finite(Intensity(brightness_) * restExcess_)}};
    if (type_ == kLightSpot) {
      const Real outer = OuterCone(Parameter(object_, kLightOuterAngle).GetReal());
      light["spot"] = {{"innerConeAngle", InnerCone(Parameter(object_, kLightInnerAngle).GetReal(), outer)},
                       {"outerConeAngle", outer}};
    }
    light["extras"]["q7r"] = Extras();
    TellLosses();
    const std::size_t index = context_.output.lights.Add(light);
    pointer_ = "/extensions/KHR_lights_punctual/lights/" + std::to_string(index) + "/";
    AddColorChannels();
    if (type_ == kLightSpot)
      AddConeChannels();
    return index;
  }

 private:
  const char* TypeName() const
  {
    return type_ == kLightSpot ? "spot" : type_ == kLightPoint || type_ == kLightIES ? "point" : "directional";
  }

  Real Intensity(Real brightness) const { return full_ * std::max(brightness, 0.0); }

  Json Extras() const
  {
    Json extras = {{"brightness", Finite(brightness_)}, {"shadow", Parameter(object_, kLightShadow).GetLong()}};
    if (type_ == kLightIES && measured_) {
      extras["maker"] = ToUtf8(measured_->manufacturer);
      extras["name"] = ToUtf8(measured_->luminaire.Content() ? measured_->luminaire : measured_->luminaireCatalogue);
      extras["lumens"] = Finite(measured_->GetLumens());
      extras["maximum"] = Finite(measured_->maxCandela);
    }
    return extras;
  }

  void TellLosses()
  {
    if (brightness_ < 0.0)
      context_.output.account.Tell(Loss::kNegativeBrightness);
    if (type_ == kLightIES && measured_)
      context_.output.account.Tell(Loss::kMeasuredLight);
  }

  Samples SampleOf(const std::vector<Input>& inputs, const Shape& shape)
  {
    return Sample(inputs, shape, context_.timeline, context_.output);
  }

  void Add(const char* name, Samples samples)
  {
    Thin(samples, 0.0);
    AddPointerChannel(context_.output, pointer_ + name, samples, context_.options.pointers);
  }

  // The colour is sampled before anything is written: what it needs of the intensity stands there at rest too. Where
  // it is animated beyond what glTF allows the two hang together.
  void SampleColor()
  {
    Input parts[3];
    tracks_.TakeVector(kLightColor, color_, parts);
    std::vector<Input> inputs(std::begin(parts), std::end(parts));
    brightnessInput_ = {tracks_.Take(kLightBrightness), brightness_};
    exceeds_ = Exceeds(inputs);
    all_ = inputs;
    all_.push_back(brightnessInput_);
    colorSamples_ = SampleOf(exceeds_ ? all_ : inputs, {3, true, [](const Real* c, Real* out) {
                                                          const Vector linear = ToLinear(Vector(c[0], c[1], c[2]));
                                                          const Real part = 1.0 / Excess(linear);
                                                          out[0] = linear.x * part;
                                                          out[1] = linear.y * part;
                                                          out[2] = linear.z * part;
                                                        }});
    Thin(colorSamples_, 0.0);
    restExcess_ = colorSamples_.IsEmpty() || exceeds_ ? Excess(ToLinear(color_)) : 1.0;
  }

  // Whether a component is ever above 1 in motion.
  bool Exceeds(const std::vector<Input>& color)
  {
    const Shape shape = {1, true,
                         [](const Real* c, Real* out) { out[0] = LargestOf(ToLinear(Vector(c[0], c[1], c[2]))); }};
    const Samples samples = SampleOf(color, shape);
    return std::any_of(samples.values.begin(), samples.values.end(), [](float value) { return value > 1.0F; });
  }

  void AddColorChannels()
  {
    Add("color", std::move(colorSamples_));
    if (exceeds_)
      Add("intensity", SampleOf(all_, {1, true, [this](const Real* c, Real* out) {
                                         out[0] = Intensity(c[3]) * Excess(ToLinear(Vector(c[0], c[1], c[2])));
                                       }}));
    else if (brightnessInput_.curve)
      Add("intensity", SampleOf({brightnessInput_}, {1, false, [this](const Real* b, Real* out) {
                                                       out[0] = Intensity(b[0]) * restExcess_;
                                                     }}));
  }

  void AddConeChannels()
  {
    const std::vector<Input> angles = {
        {tracks_.Take(kLightInnerAngle), Parameter(object_, kLightInnerAngle).GetReal()},
        {tracks_.Take(kLightOuterAngle), Parameter(object_, kLightOuterAngle).GetReal()}};
    if (!angles[0].curve && !angles[1].curve)
      return;
    Add("spot/innerConeAngle",
        SampleOf(angles, {1, false, [](const Real* a, Real* out) { out[0] = InnerCone(a[0], OuterCone(a[1])); }}));
    Add("spot/outerConeAngle",
        SampleOf(angles, {1, false, [](const Real* a, Real* out) { out[0] = OuterCone(a[1]); }}));
  }

  Context& context_;
  BaseObject& object_;
  TrackSet& tracks_;
  const IESLight* measured_;
  Long type_;
  Real full_;
  Vector color_; // as the scene has it
  Real brightness_;
  Input brightnessInput_{};
  std::vector<Input> all_; // the colour's components and the brightness
  Samples colorSamples_;
  bool exceeds_ = false;
  Real restExcess_ = 1.0; // what the intensity at rest takes over from the colour
  std::string pointer_;
};

} // namespace

std::size_t AddLight(Context& context, BaseObject& object, TrackSet& tracks)
{
  return LightWriter(context, object, tracks).Write();
}

} // namespace gltf
