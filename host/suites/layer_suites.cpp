// The suites that deal with layers, cameras, lights and their streams.
#include "host/suites/host_state.h"

#include "host/model/timing.h"

namespace host
{

namespace
{

// --- Layers

A_Err GetCompNumLayers(AEGP_CompH comp, A_long* count)
{
  return Operation("AEGP_GetCompNumLayers", [&](HostState&) -> Outcome {
    if (!comp || !count)
      return "no composition or no place for the result";
    *count = static_cast<A_long>(FromHandle(comp)->layers.size());
    return kDone;
  });
}

A_Err GetCompLayerByIndex(AEGP_CompH comp, A_long index, AEGP_LayerH* layer)
{
  return Operation("AEGP_GetCompLayerByIndex", [&](HostState&) -> Outcome {
    if (!comp || !layer)
      return "no composition or no place for the result";
    const std::vector<Layer*>& layers = FromHandle(comp)->layers;
    if (index < 0 || static_cast<std::size_t>(index) >= layers.size())
      return "no layer of this index";
    *layer = ToHandle(layers[static_cast<std::size_t>(index)]);
    return kDone;
  });
}

A_Err GetLayerName(AEGP_PluginID, AEGP_LayerH layer, AEGP_MemHandle* layerName, AEGP_MemHandle* sourceName)
{
  return Operation("AEGP_GetLayerName", [&](HostState& state) -> Outcome {
    if (!layer)
      return NotGiven(layer);
    const Layer& found = *FromHandle(layer);
    state.progress.BeginLayer();
    if (layerName)
      *layerName = state.NewUtf16(found.name);
    if (sourceName)
      *sourceName = state.NewUtf16(found.source ? found.source->name : "");
    return kDone;
  });
}

// --- Cameras and lights

A_Err GetCameraType(AEGP_LayerH layer, AEGP_CameraType* type)
{
  return Query("AEGP_GetCameraType", layer, type, [&](HostState&, const Layer& found) -> Outcome {
    if (found.type != AEGP_ObjectType_CAMERA)
      return "the layer is no camera";
    *type = found.cameraType;
    return kDone;
  });
}

A_Err GetCameraFilmSize(AEGP_LayerH layer, AEGP_FilmSizeUnits* units, A_FpLong* size)
{
  return Query("AEGP_GetCameraFilmSize", layer, size ? units : nullptr, [&](HostState&, const Layer& found) -> Outcome {
    if (found.type != AEGP_ObjectType_CAMERA)
      return "the layer is no camera";
    *units = found.filmSizeUnits;
    *size = found.filmSize;
    return kDone;
  });
}

A_Err GetLightType(AEGP_LayerH layer, AEGP_LightType* type)
{
  return Query("AEGP_GetLightType", layer, type, [&](HostState&, const Layer& found) -> Outcome {
    if (found.type != AEGP_ObjectType_LIGHT)
      return "the layer is no light";
    *type = found.lightType;
    return kDone;
  });
}

// --- Streams

// The property behind a stream; null when it is not legal on the layer.
Property* FindProperty(const Layer& layer, AEGP_LayerStream which)
{
  const StreamInfo* info = FindStreamInfo(which);
  return info ? layer.streams[StreamIndex(*info)].get() : nullptr;
}

A_Err IsStreamLegal(AEGP_LayerH layer, AEGP_LayerStream which, A_Boolean* isLegal)
{
  return Query("AEGP_IsStreamLegal", layer, isLegal, [&](HostState&, const Layer& found) {
    *isLegal = FindProperty(found, which) != nullptr;
    return kDone;
  });
}

A_Err GetNewLayerStream(AEGP_PluginID, AEGP_LayerH layer, AEGP_LayerStream which, AEGP_StreamRefH* stream)
{
  return Query("AEGP_GetNewLayerStream", layer, stream, [&](HostState& state, const Layer& found) -> Outcome {
    Property* property = FindProperty(found, which);
    if (!property)
      return "the stream is not legal on this layer";
    // All handles to one stream are alike; the property counts them.
    ++property->openHandles;
    ++state.balance.streams;
    *stream = ToHandle(property);
    return kDone;
  });
}

A_Err DisposeStream(AEGP_StreamRefH stream)
{
  return Operation<CallKind::kRelease>("AEGP_DisposeStream", [&](HostState& state) -> Outcome {
    Property* property = FromHandle(stream);
    if (!property)
      return NotGiven(stream);
    --property->openHandles;
    --state.balance.streams;
    return kDone;
  });
}

A_Err GetStreamType(AEGP_StreamRefH stream, AEGP_StreamType* type)
{
  return Query("AEGP_GetStreamType", stream, type, [&](HostState&, const Property& found) {
    *type = found.Info().type;
    return kDone;
  });
}

AEGP_StreamVal2 ToStreamValue(AEGP_StreamType type, const Value& value)
{
  AEGP_StreamVal2 result{};
  if (type == AEGP_StreamType_COLOR)
    result.color = {.alphaF = 1, .redF = value[0], .greenF = value[1], .blueF = value[2]};
  else if (type == AEGP_StreamType_OneD)
    result.one_d = value[0];
  else
    result.three_d = {value[0], value[1], value[2]};
  return result;
}

// Layers begin at composition time 0, so that layer time is composition time.
A_Err GetNewStreamValue(AEGP_PluginID, AEGP_StreamRefH stream, AEGP_LTimeMode, const A_Time* time,
                        A_Boolean preExpression, AEGP_StreamValue2* value)
{
  return Query("AEGP_GetNewStreamValue", stream, value, [&](HostState& state, const Property& found) -> Outcome {
    if (!time || time->scale == 0)
      return "no time";
    const double frame = FrameAt(*time, state.project.frameDuration);
    state.progress.ReadFrame(frame);
    value->streamH = stream;
    value->val = ToStreamValue(found.Info().type, found.At(frame, preExpression != 0));
    ++state.balance.streamValues;
    return kDone;
  });
}

A_Err DisposeStreamValue(AEGP_StreamValue2* value)
{
  return Operation<CallKind::kRelease>("AEGP_DisposeStreamValue", [&](HostState& state) -> Outcome {
    if (!value || !value->streamH)
      return "not a value that the host has given out";
    value->streamH = nullptr;
    --state.balance.streamValues;
    return kDone;
  });
}

A_Err GetExpressionState(AEGP_PluginID, AEGP_StreamRefH stream, A_Boolean* isOn)
{
  return Query("AEGP_GetExpressionState", stream, isOn, [&](HostState&, const Property& found) {
    *isOn = found.HasExpression();
    return kDone;
  });
}

} // namespace

AEGP_LayerSuite13 MakeLayerSuite()
{
  AEGP_LayerSuite13 suite{};
  suite.AEGP_GetCompNumLayers = GetCompNumLayers;
  suite.AEGP_GetCompLayerByIndex = GetCompLayerByIndex;
  suite.AEGP_GetLayerSourceItem = Tell<"AEGP_GetLayerSourceItem", &Layer::source>;
  suite.AEGP_GetLayerName = GetLayerName;
  suite.AEGP_GetLayerFlags = Tell<"AEGP_GetLayerFlags", &Layer::flags>;
  suite.AEGP_GetLayerObjectType = Tell<"AEGP_GetLayerObjectType", &Layer::type>;
  suite.AEGP_IsLayer3D = Tell<"AEGP_IsLayer3D", &Layer::is3D>;
  suite.AEGP_GetLayerID = Tell<"AEGP_GetLayerID", &Layer::id>;
  suite.AEGP_GetLayerParent = Tell<"AEGP_GetLayerParent", &Layer::parent>;
  return suite;
}

AEGP_CameraSuite2 MakeCameraSuite()
{
  AEGP_CameraSuite2 suite{};
  suite.AEGP_GetCameraType = GetCameraType;
  suite.AEGP_GetCameraFilmSize = GetCameraFilmSize;
  return suite;
}

AEGP_LightSuite2 MakeLightSuite()
{
  AEGP_LightSuite2 suite{};
  suite.AEGP_GetLightType = GetLightType;
  return suite;
}

AEGP_StreamSuite9 MakeStreamSuite()
{
  AEGP_StreamSuite9 suite{};
  suite.AEGP_IsStreamLegal = IsStreamLegal;
  suite.AEGP_GetNewLayerStream = GetNewLayerStream;
  suite.AEGP_DisposeStream = DisposeStream;
  suite.AEGP_IsStreamTimevarying = Tell<"AEGP_IsStreamTimevarying", &Property::IsTimeVarying>;
  suite.AEGP_GetStreamType = GetStreamType;
  suite.AEGP_GetNewStreamValue = GetNewStreamValue;
  suite.AEGP_DisposeStreamValue = DisposeStreamValue;
  suite.AEGP_GetExpressionState = GetExpressionState;
  return suite;
}

AEGP_StreamSuite7 MakeOlderStreamSuite()
{
  AEGP_StreamSuite7 suite{};
  suite.AEGP_IsStreamLegal = IsStreamLegal;
  return suite;
}

AEGP_KeyframeSuite4 MakeKeyframeSuite()
{
  AEGP_KeyframeSuite4 suite{};
  suite.AEGP_GetStreamNumKFs = Tell<"AEGP_GetStreamNumKFs", &Property::KeyframeCount>;
  return suite;
}

} // namespace host
