#include "exporter/walk/composition_settings.h"

#include <algorithm>

#include "torvane/document/base_document.h"
#include "torvane/render/render_data.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

constexpr Real kMostFrames = 2147483647.0;

BaseTime ToBaseTime(const A_Time& time) { return BaseTime(time.value, time.scale == 0 ? 1.0 : time.scale); }

// Whole frames in the work area. The order of the operations decides the last frame at rates such as 29.97, whose
// frame duration has no exact double: the quotient stays below the whole number there. `fallback` where there is no
// such number.
Long CountFrames(const A_Time& area, const A_Time& frame, Long fallback)
{
  if (frame.value == 0 || frame.scale == 0 || area.scale == 0)
    return fallback;
  Real count = area.value / ((static_cast<Real>(frame.value) / frame.scale) * area.scale);
  return count > -kMostFrames && count < kMostFrames ? static_cast<Long>(count) : fallback;
}

// The sum without reducing it, as render settings hold it.
BaseTime AddUnreduced(const BaseTime& a, const BaseTime& b)
{
  return BaseTime::Raw(a.GetNumerator() * b.GetDenominator() + b.GetNumerator() * a.GetDenominator(),
                       a.GetDenominator() * b.GetDenominator());
}

RenderData* ProvideRenderData(BaseDocument& document)
{
  RenderData* data = document.GetActiveRenderData();
  if (!data)
    data = document.GetFirstRenderData();
  if (!data && (data = AllocRenderData()))
    document.InsertRenderData(data);
  return data;
}

void SetTimes(BaseDocument& document, const BaseTime& start, const BaseTime& lastFrame)
{
  document.SetParameterById(kDocumentMinTime, start);
  document.SetParameterById(kDocumentLoopMin, start);
  document.SetParameterById(kDocumentMaxTime, lastFrame);
  document.SetParameterById(kDocumentLoopMax, lastFrame);
}

} // namespace

bool ReadCompositionSettings(ExportContext& context, AEGP_CompH composition, AEGP_ItemH compositionItem, A_long& width,
                             A_long& height)
{
  if (!compositionItem)
    return false;
  BaseDocument& document = *context.document;
  HostCalls host(*context.suites);
  A_FpLong fps = context.framesPerSecond;
  A_Ratio aspect = {1, 1};
  host(&AEGP_CompSuite15::AEGP_GetCompFramerate, composition, &fps);
  context.framesPerSecond = static_cast<Long>(std::clamp(fps + 0.5, 0.0, kMostFrames));
  document.SetParameterById(kDocumentFps, context.framesPerSecond);
  host(&AEGP_CompSuite15::AEGP_GetCompWorkAreaStart, composition, &context.workAreaStart);
  const BaseTime start = ToBaseTime(context.workAreaStart);
  host(&AEGP_CompSuite15::AEGP_GetCompWorkAreaDuration, composition, &context.workAreaDuration);
  host(&AEGP_CompSuite15::AEGP_GetCompFrameDuration, composition, &context.frameDuration);
  host(&AEGP_ItemSuite13::AEGP_GetItemDimensions, compositionItem, &width, &height);
  host(&AEGP_ItemSuite13::AEGP_GetItemPixelAspectRatio, compositionItem, &aspect);
  if (aspect.den != 0)
    context.pixelAspect = static_cast<Real>(aspect.num) / aspect.den;
  const Real filmAspect = height == 0 ? 0.0 : static_cast<Real>(width) / height * context.pixelAspect;
  context.frameCount = CountFrames(context.workAreaDuration, context.frameDuration, context.frameCount);
  const BaseTime end = AddUnreduced(start, ToBaseTime(context.workAreaDuration));
  SetTimes(document, start, start + KeyTime(context, context.frameCount - 1));

  RenderData* settings = ProvideRenderData(document);
  if (!settings)
    return false;
  settings->SetParameterById(kRenderFrameRate, fps);
  settings->SetParameterById(kRenderWidth, static_cast<Real>(width));
  settings->SetParameterById(kRenderHeight, static_cast<Real>(height));
  settings->SetParameterById(kRenderFrameFrom, start);
  settings->SetParameterById(kRenderFrameTo, end);
  settings->SetParameterById(kRenderPixelAspect, context.pixelAspect);
  settings->SetParameterById(kRenderFilmAspect, filmAspect);
  settings->SetParameterById(kRenderFrameMode, Long{2});
  return true;
}

} // namespace exporter
