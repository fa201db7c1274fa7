// The light: object data that keep every setting in a field of their own, write them as one run of values, and may
// carry a measured light distribution.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/nodes/private_chunk.h"
#include "torvane/objects/ies_light.h"
#include "torvane/objects/light_parameters.h"

namespace _torvane_
{

class BaseDocument;
class BaseObject;

inline constexpr Long kLevelLight = 6;
inline constexpr Long kMaxLightKnots = 40;
constexpr Long ClampLightKnotCount(Long count)
{
  return count < 0 ? 0 : count > kMaxLightKnots ? kMaxLightKnots : count;
}

// A record of the list that kLightKnotCount counts.
struct LightKnot
{
  Real position = 0.0;
  Real value = 0.0;
  Vector color;
  Long mode = 0;
};

// Values that the light keeps for other programs and doesn't interpret.
struct LightExtraBlock
{
  struct Layer
  {
    Bool flags[3] = {false, false, false};
    Long modes[2] = {0, 0};
    Real numbers[5] = {0.0, 0.0, 0.0, 0.0, 0.0};
    Vector color;
    Long last = 0;
  };
  static constexpr Long kCount = 5;

  LightKnot head;
  Layer layers[kCount];
  LightKnot knots[kCount];
};

struct LightBody;

class LightObjectData : public NodeData
{
 public:
  static constexpr NodeKindOf<LightObjectData> kNodeKind{"light data", &NodeData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }
  const NodeKind& GetOwnerKind() const override;

  // With the defaults of kLightParameters.
  LightObjectData() = default;
  ~LightObjectData() override;

  Bool IsInstanceOf(Long type) const override { return type == kObjectLight || NodeData::IsInstanceOf(type); }
  void WriteChunks(HyperFile& file) override;
  // Fails for data of another type and when memory is short.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  // Answer the ids of kLightParameters, those of Vectors by component too, and leave all others to the object.
  // kLightKnotCount is brought into its range.
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;
  Long GetChunkLevel() const override { return kLevelLight; }
  // The body of every level and file version. A distribution that reads badly is left out; the light stays.
  Bool ReadData(HyperFile& file, Long id, Long level) override;

  // Null when memory is short. There are kMaxLightKnots knots, of which kLightKnotCount count.
  LightKnot* GetKnots() { return NeedSettings() ? settings_->knots : nullptr; }
  LightExtraBlock* GetExtraBlock() { return NeedSettings() ? &settings_->extraBlock : nullptr; }

  // The measured distribution, or null. The light owns it.
  IESLight* GetIES() const { return iesLight_; }
  // Deletes the present distribution and takes over another one (may be null).
  void AdoptIES(IESLight* light);

 private:
  friend struct LightBody; // the order of a light in a file

  struct Settings
  {
    Long longs[CountLightParameters(LightKind::kLong)];
    Real reals[CountLightParameters(LightKind::kReal)];
    Bool bools[CountLightParameters(LightKind::kBool)];
    Vector vectors[CountLightParameters(LightKind::kVector)];
    LightKnot knots[kMaxLightKnots];
    LightExtraBlock extraBlock;
  };

  static const Settings& GetDefaults();
  const Settings& GetSettings() const { return settings_ ? *settings_ : GetDefaults(); }
  Settings* NeedSettings();

  Settings* settings_ = nullptr; // owned; null while all are the defaults
  IESLight* iesLight_ = nullptr; // owned
};

// Puts a copy of `parsed` on a light and sets its parameters and entries by it; null takes the distribution away. The
// sizes are brought from metres to the unit of `document` (null: they stay). `parsed` is normalised and stays the
// caller's. False unless `object` is a light with light data.
Bool SetIESLight(BaseObject* object, IESLight* parsed, BaseDocument* document);

// The distribution of a light, or null.
IESLight* GetIESLight(const BaseObject* object);

} // namespace _torvane_
