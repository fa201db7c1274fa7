// The settings of blend layers, and what is done with one of them, whatever its kind.
#pragma once

#include <initializer_list>

#include "torvane/shaders/blend_layers.h"

namespace _torvane_
{

class GeData;
class HyperFile;

inline constexpr const char* kBlendModule = "blendlayers"; // in reports
inline constexpr Long kNoBlendSub = -1;

// One setting of a layer: where it lies and how it is reached.
struct BlendField
{
  enum Kind : UChar
  {
    kLong,
    kBool,
    kReal,
    kVector,
    kLink,
    kGradient,
    kLayers, // the parameter is the link of the first layer
  };

  BlendField() = default;
  template <class T>
  BlendField(T& field, Long fieldId, Long fieldSub = kNoBlendSub, Real lowest = 0.0, Real highest = -1.0,
             Long level = 0)
      : value(&field), kind(KindOf(field)), id(fieldId), sub(fieldSub), low(lowest), high(highest), sinceLevel(level)
  {}

  Bool HasRange() const { return low <= high; }
  template <class T>
  T& As() const
  {
    return *static_cast<T*>(value);
  }

  void* value = nullptr;
  Kind kind = kLong;
  Long id = 0;            // of GetLayerParameter; 0: none
  Long sub = kNoBlendSub; // of GetLayerValue
  Real low = 0.0;         // the range to which SetLayerValue clamps
  Real high = -1.0;
  Long sinceLevel = 0; // of a flag: lower levels don't hold it, and it becomes false

 private:
  static Kind KindOf(const Long&) { return kLong; }
  static Kind KindOf(const Bool&) { return kBool; }
  static Kind KindOf(const Real&) { return kReal; }
  static Kind KindOf(const Vector&) { return kVector; }
  static Kind KindOf(const GeAliasLink&) { return kLink; }
  static Kind KindOf(const GradientData&) { return kGradient; }
  static Kind KindOf(const CBlendLayers&) { return kLayers; }
};

// The settings of a layer in file order.
struct BlendFields
{
  static constexpr Long kMost = 7;

  BlendFields(std::initializer_list<BlendField> list)
  {
    for (const BlendField& field : list)
      fields[count++] = field;
  }
  const BlendField* begin() const { return fields; }
  const BlendField* end() const { return fields + count; }

  BlendField fields[kMost];
  Long count = 0;
};

// False after a failure and for a value that the field can't take.
Bool ReadField(HyperFile& file, Long level, const BlendField& field);
Bool WriteField(HyperFile& file, const BlendField& field);
// Two fields of one place in layers of one type.
Bool FieldsDiffer(const BlendField& a, const BlendField& b);
Bool CopyField(const BlendField& source, const BlendField& destination, TransArray* translation);

// The whole setting, as GetLayerParameter gives and takes it.
Bool GetField(const BlendField& field, GeData& value);
Bool SetField(const BlendField& field, const GeData& value);
// The setting or a part of it, as GetLayerValue gives and takes it. False for a part that it lacks.
Bool GetFieldPart(const BlendField& field, const ParameterPath& path, GeData& value);
Bool SetFieldPart(const BlendField& field, const ParameterPath& path, const GeData& value);

} // namespace _torvane_
