// What is done with one setting of a blend layer, whatever its kind.
#pragma once

#include "torvane/shaders/blend_layers.h"

namespace _torvane_
{

class GeData;
class HyperFile;

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

inline constexpr const char* kBlendModule = "blendlayers"; // in reports

} // namespace _torvane_
