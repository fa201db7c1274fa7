// Reads the transform streams of a layer.
#pragma once

#include "exporter/walk/export_context.h"
#include "exporter/walk/transform.h"

namespace exporter
{

constexpr Vector ToVector(const AEGP_ThreeDVal& value) { return {value.x, value.y, value.z}; }

// The four rotation streams of the context, which must all be there. False when the host fails.
bool ReadRotation(HostCalls& host, const ExportContext& context, const A_Time& time, LayerSample& sample);

// The rotation streams and the position stream of the context, which must all be there, and the anchor and the scale if
// there are such streams; the scale only if the rules use it. False when the host fails.
bool ReadLayerSample(HostCalls& host, const ExportContext& context, const HostStream& anchorStream,
                     const HostStream& scaleStream, const A_Time& time, const TransformRules& rules,
                     LayerSample& sample);

} // namespace exporter
