// Scenes that come out the same, byte by byte, whenever and wherever they are made.
#pragma once

#include "torvane/time/date_time.h"
#include "torvane/types.h"

namespace _torvane_
{

// While one of these lives, its thread makes nothing that would be other in another run: the markers of nodes follow
// from the seed and from the order in which they are drawn, "now" is a date that is given, clocks stand still, and the
// ids of links are counted anew. Other threads notice nothing. Of several the one that was made last is in force; they
// have to go in the opposite order.
//
// A seed must follow from what the scene is made of: two scenes of one seed share their markers. Nodes that were made
// during one run and linked there may not be put into a file of another.
class ReproducibleRun
{
 public:
  ReproducibleRun(ULLong seed, const DateTime& now) noexcept;
  ~ReproducibleRun();
  ReproducibleRun(const ReproducibleRun&) = delete;
  ReproducibleRun& operator=(const ReproducibleRun&) = delete;

  // The one in force on this thread, or null.
  static ReproducibleRun* GetCurrent() noexcept;

  void SetNow(const DateTime& now) noexcept { now_ = now; }
  const DateTime& GetNow() const noexcept { return now_; }
  // The next 16 bytes of an identifier.
  void TakeUuid(UChar* bytes) noexcept;
  // The next id of a link's target, from 2^32 on: below are those made outside of all runs.
  ULLong TakeLinkId() noexcept { return nextLinkId_++; }

 private:
  static constexpr ULLong kFirstLinkId = ULLong{1} << 32;

  ULLong seed_;
  ULLong drawn_ = 0;
  ULLong nextLinkId_ = kFirstLinkId;
  DateTime now_;
  ReproducibleRun* before_;
};

} // namespace _torvane_
