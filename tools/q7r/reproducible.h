// --reproducible: what is written follows from what is read.
#pragma once

#include <CLI/CLI.hpp>
#include <optional>
#include <string_view>

#include "torvane/document/base_document.h"
#include "torvane/math/crc.h"
#include "torvane/time/reproducible_run.h"

namespace q7r
{

void AddReproducibleOption(CLI::App& verb, bool& isWanted);

// The work on one output, from the reading of its inputs to its last byte; does nothing unless it is wanted. The date
// is that of SOURCE_DATE_EPOCH (seconds since 1970, UTC), else that of the last save of the scene that is read, else
// the first day of 1980.
class Reproduction
{
 public:
  // Throws Failure for a SOURCE_DATE_EPOCH that is no date.
  explicit Reproduction(bool isWanted);

  // Everything that the output follows from, before it is made; the order counts.
  void Take(std::string_view content);
  // The last input was taken: until the end of this object, what is drawn follows from it.
  void Begin();
  // Lets a scene's own date count.
  void TakeDate(_torvane_::BaseDocument& document);

  bool IsWanted() const { return isWanted_; }

 private:
  bool isWanted_;
  _torvane_::Crc64 sum_;
  std::optional<_torvane_::DateTime> epoch_;
  std::optional<_torvane_::ReproducibleRun> run_;
};

} // namespace q7r
