// The tracks of an object by the parameter that they drive.
#pragma once

#include <cstddef>
#include <vector>

#include "gltf/account.h"
#include "gltf/motion/timeline.h"
#include "torvane/nodes/base_list.h"

namespace gltf
{

using _torvane_::Long;

class TrackSet
{
 public:
  TrackSet() = default; // of a node without tracks
  // Of two tracks on one parameter the first counts. Tracks without keys don't.
  explicit TrackSet(const _torvane_::BaseList2D& node);

  bool IsEmpty() const { return tracks_.empty(); }
  // The curve of a parameter, of one of its components (0 to 2) or of the whole (-1); null without a track. The track
  // counts as used.
  const _torvane_::CCurve* Take(Long id, int component = -1);
  // The three components of a parameter, with the values that they have without a track.
  void TakeVector(Long id, const Vector& still, Input (&inputs)[3]);
  // For a node that draws nothing: its tracks are no loss.
  void TakeAll();
  // Tells the tracks that nobody took.
  void TellRest(Account& account) const;

  std::size_t CountKeys() const;
  // The first key of all tracks that a file may hold; 0 when none is before it.
  Real Earliest() const;

 private:
  struct Track
  {
    Long id;
    int component; // -1 for the whole parameter, -2 for what isn't a component
    const _torvane_::CCurve* curve;
    bool used;
  };
  std::vector<Track> tracks_;
};

// The tracks of a node that has no counterpart, told as of one kind.
void TellTracks(const _torvane_::BaseList2D& node, Loss loss, Account& account);

} // namespace gltf
