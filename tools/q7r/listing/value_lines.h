// The values of a scene file, a line for each, as text and as JSON.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "output/value_sink.h"
#include "torvane/stream/stream_walker.h"

namespace q7r
{

// The chunks that enclose a value, by the offsets of their starts. A line tells the innermost one alone: with all of
// them the output would grow with the square of the depth.
class Nesting
{
 public:
  // To be told each value before it is printed and behind.
  void Leave(_torvane_::UChar tag)
  {
    if (tag == _torvane_::kTagChunkEnd)
      starts_.pop_back();
  }
  void Enter(const _torvane_::StreamValue& value)
  {
    if (value.tag == _torvane_::kTagChunkStart)
      starts_.push_back(value.offset);
  }

  std::size_t Depth() const { return starts_.size(); }
  void TellParent(ValueSink& sink) const;
  std::string Indent() const;

 private:
  std::vector<_torvane_::LLong> starts_;
};

// How values become lines on standard output. The bytes of a block come in pieces, before the walker gives the value
// itself.
class ValueLines
{
 public:
  virtual ~ValueLines() = default;
  virtual void Begin(const _torvane_::StreamValue& value, const Nesting& nesting) = 0;
  virtual void Bytes(const _torvane_::UChar* bytes, _torvane_::LLong size) = 0;
  virtual void End(const _torvane_::StreamValue& value) = 0;
  virtual void Finish() {} // behind the last one
};

// With all bytes of a block, or with the first 16 and a check sum of all.
std::unique_ptr<ValueLines> MakeTextLines(bool allBytes);
std::unique_ptr<ValueLines> MakeJsonLines(bool allBytes);

} // namespace q7r
