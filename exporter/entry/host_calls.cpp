#include "exporter/entry/host_calls.h"

#include "exporter/entry/plugin_state.h"

namespace exporter
{

using _torvane_::String;
using _torvane_::UniChar;

HostText::HostText(HostCalls& host) : host_(host)
{
  if (host_.Good())
    host_.GetSuites().Get<AEGP_MemorySuite1>();
}

const void* HostText::Lock()
{
  void* text = nullptr;
  if (!handle_ || !host_(&AEGP_MemorySuite1::AEGP_LockMemHandle, handle_, &text))
    return nullptr;
  locked_ = true;
  return text;
}

const A_char* HostText::Lock8() { return static_cast<const A_char*>(Lock()); }

String HostText::Take16()
{
  static_assert(sizeof(A_UTF16Char) == sizeof(UniChar));
  String text(static_cast<const UniChar*>(Lock()));
  Release();
  return text;
}

void HostText::Release()
{
  if (handle_ && locked_)
    host_.GiveBack(&AEGP_MemorySuite1::AEGP_UnlockMemHandle, handle_);
  if (handle_)
    host_.GiveBack(&AEGP_MemorySuite1::AEGP_FreeMemHandle, handle_);
  locked_ = false;
  handle_ = nullptr;
}

HostStream::~HostStream()
{
  if (stream_)
    suites_->Get<AEGP_StreamSuite9>().AEGP_DisposeStream(stream_);
}

void HostStream::Open(HostCalls& host, AEGP_LayerH layer, AEGP_LayerStream which)
{
  if (StreamIsLegal(host, layer, which)) {
    host(&AEGP_StreamSuite9::AEGP_GetNewLayerStream, PluginId, layer, which, &stream_);
    suites_ = &host.GetSuites();
  }
}

void HostStream::Dispose(HostCalls& host)
{
  if (stream_)
    host.GiveBack(&AEGP_StreamSuite9::AEGP_DisposeStream, stream_);
  stream_ = nullptr;
}

bool StreamIsLegal(HostCalls& host, AEGP_LayerH layer, AEGP_LayerStream which)
{
  A_Boolean legal = 1;
  if (!layer)
    return false;
  host(&AEGP_StreamSuite7::AEGP_IsStreamLegal, layer, which, &legal);
  return legal != 0;
}

A_long StreamVaries(HostCalls& host, AEGP_StreamRefH stream)
{
  A_long keyframes = 0;
  A_Boolean hasExpression = 1;
  A_Boolean varies = 0;
  if (!stream)
    return 0;
  host(&AEGP_KeyframeSuite4::AEGP_GetStreamNumKFs, stream, &keyframes);
  host(&AEGP_StreamSuite9::AEGP_GetExpressionState, PluginId, stream, &hasExpression);
  if (hasExpression)
    host(&AEGP_StreamSuite9::AEGP_IsStreamTimevarying, stream, &varies);
  return varies ? 1 : keyframes;
}

bool ReadStream(HostCalls& host, AEGP_StreamRefH stream, const A_Time& time, AEGP_StreamVal2& value)
{
  AEGP_StreamValue2 read = {};
  if (!host(&AEGP_StreamSuite9::AEGP_GetNewStreamValue, PluginId, stream, AEGP_LTimeMode_CompTime, &time, 0, &read))
    return false;
  value = read.val;
  return host(&AEGP_StreamSuite9::AEGP_DisposeStreamValue, &read);
}

} // namespace exporter
