// Gradients: a colour for each position from 0 to 1, told by knots, with an optional second gradient for transparency.
// A gradient is the custom value of type kCustomGradient in a container.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/values/base_container.h"
#include "torvane/values/custom_data.h"

namespace _torvane_
{

// Entries of a gradient's settings.
inline constexpr Long kGradientInterpolation = 1000; // Long, 0 to 7
inline constexpr Long kGradientKnots = 1001;         // container of the knots, a container each
inline constexpr Long kGradientCacheFlag = 1003;     // Bool

// Entries of a knot.
inline constexpr Long kKnotColor = 1000;      // Vector
inline constexpr Long kKnotBrightness = 1001; // Real
inline constexpr Long kKnotPosition = 1002;   // Real
inline constexpr Long kKnotBias = 1003;       // Real
inline constexpr Long kKnotId = 1004;         // Long, 0 until the knot is given one

// Parameter ids: kGradientInterpolation, and those of a knot, kGradientFirstKnot + 100 * knot id + field. Fields are
// those of GradientKnotField. A part of the transparency gradient has the offset in front.
inline constexpr Long kGradientFirstKnot = 10000;
inline constexpr Long kGradientIdsPerKnot = 100;
inline constexpr Long kGradientAlphaOffset = 1000000000;

enum GradientKnotField : Long
{
  kFieldColor = 0, // as a whole, or a component by the level kVectorX, kVectorY or kVectorZ below
  kFieldBrightness = 1,
  kFieldPosition = 2,
  kFieldBias = 3,
};

// Set in the flags of a parameter call that was answered.

// A knot as the evaluation uses it.
struct GradientKnot
{
  Vector color;
  Real brightness;
  Real position;
  Real bias;   // where between this knot and the next one the middle of the blend lies, 0 to 1
  ULong index; // the knot's place in the container
};

class GradientData : public CustomData
{
 public:
  static constexpr NodeKindOf<GradientData> kNodeKind{"gradient", &CustomData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // Without knots.
  GradientData();
  explicit GradientData(const CustomDataType&) : GradientData() {}
  ~GradientData() override;
  GradientData(const GradientData&) = delete; // use CopyGradient
  GradientData& operator=(const GradientData&) = delete;

  Long GetTypeId() const override { return kCustomGradient; }
  Long GetChunkLevel() const override { return 1; }
  Bool IsEqual(const CustomData& other) const override;
  Bool CopyTo(CustomData& destination, TransArray* translation) const override;
  Bool Read(HyperFile& file, Long level) override;
  void Write(HyperFile& file) const override;
  Bool GetValue(const ParameterPath& path, GeData& value, ULong& flags) const override
  {
    return GetGradientValue(path, value, flags);
  }
  Bool SetValue(const ParameterPath& path, const GeData& value, ULong& flags) override
  {
    return SetGradientValue(path, value, flags);
  }

  // The values of the chunk, without its end. Below level 1 nothing is read and the gradient stays as it is. Knots
  // without an id get one; the transparency of a file of version 11004 or below gets white knots whose brightness
  // is scaled by their old colour. False after a failure, which the file's error tells.
  Bool ReadGradient(HyperFile& file, Long level);
  Bool WriteGradient(HyperFile& file) const;

  // A part of the gradient by its path; an empty path is the gradient as a whole. An answered call gives true and sets
  // kParameterAnswered. A cache that was prepared before stays as it is.
  Bool GetGradientValue(const ParameterPath& path, GeData& value, ULong& flags) const;
  Bool SetGradientValue(const ParameterPath& path, const GeData& value, ULong& flags);

  // Collects the knots, sorted by position, for EvaluateGradient, and those of the transparency too. False, without a
  // cache, when memory is short. Without knots there is none either, and that is no failure.
  Bool PrepareGradient();
  void FreeGradientCache();
  // The colour, brightness included, at a position, from the cache. Beyond the ends it is that of the first or last
  // knot. False without a cache and for an interpolation that isn't from 0 to 7.
  Bool EvaluateGradient(Real position, Vector& color) const;
  // Turns the gradient round: what was at position p comes to 1 - p. The transparency is a gradient of its own. Leaves
  // no cache. Nothing happens to fewer than two knots, or when memory is short.
  void MirrorGradient();

  BaseContainer& GetSettings() { return settings_; }
  const BaseContainer& GetSettings() const { return settings_; }
  // The transparency gradient, or null; it stays the gradient's.
  GradientData* GetAlpha() { return alpha_; }
  const GradientData* GetAlpha() const { return alpha_; }
  // The transparency gradient, made if there is none; null when memory is short.
  GradientData* NeedAlpha();
  void DropAlpha() { DeleteObj(alpha_); }
  Bool IsAlpha() const { return isAlpha_ != 0; }
  Bool IsFromOldFile() const { return fromOldFile_ != 0; }
  // The cache; null without one.
  const GradientKnot* GetKnotCache() const { return knotCache_; }
  Long GetKnotCount() const { return knotCount_; }
  Long GetInterpolation() const { return interpolation_; }
  Bool GetCacheFlag() const { return cacheFlag_ != 0; }

 private:
  friend Bool CopyGradient(const GradientData& source, GradientData& destination, TransArray* translation);
  friend Bool GradientsDiffer(const GradientData& a, const GradientData& b);

  BaseContainer* FindKnot(Long knotId) const;
  const GradientData* PartOf(Long& id) const;
  Bool FillCache(Long count);
  void StoreCache();
  Long FindLowerKnot(Real position) const;

  BaseContainer settings_;
  GradientKnot* knotCache_ = nullptr; // owned
  Long knotCount_ = 0;
  Long interpolation_ = 0;
  Long cacheFlag_ = 0;
  GradientData* alpha_ = nullptr; // owned
  Long isAlpha_ = 0;              // 1 on a transparency gradient: its colours are grey
  Long fromOldFile_ = 0;          // 1 when it came from a file of version 11004 or below
};

// Makes `destination` equal to `source`. A cache that it still has is reported and freed. False when memory is short.
Bool CopyGradient(const GradientData& source, GradientData& destination, TransArray* translation = nullptr);

// True when the settings differ, or those of the transparency, or only one has transparency.
Bool GradientsDiffer(const GradientData& a, const GradientData& b);

// Gives each knot without an id the next free one, above those in use. With `convertAlpha` the knots of a transparency
// gradient become white and the first component of their colour goes into the brightness.
void NumberKnots(GradientData& gradient, Bool convertAlpha);

} // namespace _torvane_
