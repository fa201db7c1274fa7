// Calls to the host: one running error for a function, and handles that find their way back to the host on every path.
#pragma once

#include <type_traits>

#include "exporter/entry/export_suites.h"
#include "torvane/text/ge_string.h"

namespace exporter
{

// Makes host calls as long as none has failed; from then on calls are passed over and their results stay as they were.
class HostCalls
{
 public:
  explicit HostCalls(ExportSuites& suites) : suites_(suites) {}
  HostCalls(const HostCalls&) = delete;
  HostCalls& operator=(const HostCalls&) = delete;

  // Calls an operation through the suite that declares it, which is acquired first if need be. True while no error
  // stands.
  template <class Suite, class... Parameters>
  bool operator()(A_Err (*Suite::*operation)(Parameters...), std::type_identity_t<Parameters>... arguments)
  {
    if (error_ == 0)
      error_ = (suites_.Get<Suite>().*operation)(arguments...);
    return error_ == 0;
  }

  // For calls that give something back: they are made although an error stands.
  template <class Suite, class... Parameters>
  void GiveBack(A_Err (*Suite::*operation)(Parameters...), std::type_identity_t<Parameters>... arguments)
  {
    A_Err result = (suites_.Get<Suite>().*operation)(arguments...);
    if (error_ == 0)
      error_ = result;
  }

  bool Good() const { return error_ == 0; }
  A_Err GetError() const { return error_; }
  // Notes a failure that is not the host's. An error that stands already stays.
  void Fail() { error_ = error_ == 0 ? kOwnFailure : error_; }

  ExportSuites& GetSuites() { return suites_; }

 private:
  static constexpr A_Err kOwnFailure = 1;

  ExportSuites& suites_;
  A_Err error_ = 0;
};

// A text that the host hands over in a memory handle.
class HostText
{
 public:
  // Acquires the memory suite, unless an error stands: a handle is only asked for when it can be freed again.
  explicit HostText(HostCalls& host);
  ~HostText() { Release(); }
  HostText(const HostText&) = delete;
  HostText& operator=(const HostText&) = delete;

  // Where a host call puts the handle. The text must hold none yet.
  AEGP_MemHandle* Out() { return &handle_; }
  // The zero-terminated bytes, valid until Release; null without a handle and when locking fails.
  const A_char* Lock8();
  // The UTF-16 text, copied; empty without a handle and when locking fails. The handle goes back to the host.
  _torvane_::String Take16();
  // Unlocks and frees the handle; without one does nothing.
  void Release();
  // Leaves the handle with the host as it stands, locked and not freed.
  void Abandon() { handle_ = nullptr; }

 private:
  const void* Lock();

  HostCalls& host_;
  AEGP_MemHandle handle_ = nullptr;
  bool locked_ = false;
};

// A stream of a layer.
class HostStream
{
 public:
  HostStream() = default;
  ~HostStream();
  HostStream(const HostStream&) = delete;
  HostStream& operator=(const HostStream&) = delete;

  // Gets the stream if it is legal for the layer. The object must hold none yet.
  void Open(HostCalls& host, AEGP_LayerH layer, AEGP_LayerStream which);
  // Gives the stream back; without one does nothing.
  void Dispose(HostCalls& host);

  AEGP_StreamRefH Get() const { return stream_; }
  explicit operator bool() const { return stream_ != nullptr; }

 private:
  ExportSuites* suites_ = nullptr; // set with the stream
  AEGP_StreamRefH stream_ = nullptr;
};

// Whether the layer has such a stream. True when the host does not answer, since the call that asks for the stream
// then fails in its turn; false for a null layer.
bool StreamIsLegal(HostCalls& host, AEGP_LayerH layer, AEGP_LayerStream which);

// Above 0 if the stream is to be animated: the number of its keyframes, or 1 for an expression that varies. 0 for a
// null stream.
A_long StreamVaries(HostCalls& host, AEGP_StreamRefH stream);

// The value of a stream at one time, after expressions, in composition time; it goes back to the host at once.
// `value` stays as it was when an error stands.
bool ReadStream(HostCalls& host, AEGP_StreamRefH stream, const A_Time& time, AEGP_StreamVal2& value);

} // namespace exporter
