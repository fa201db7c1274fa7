// How far an export has come, judged by what a plug-in asks for: it names each layer once before it reads its streams,
// over and over from the start of the composition to the end of the work area.
#pragma once

#include "host/model/composition.h"

#include <cstdint>
#include <functional>

namespace host
{

class Progress
{
 public:
  // Gets the share that is done, from 0 to 1. It never falls.
  using Listener = std::function<void(double share)>;

  void Listen(Listener listener) { listener_ = std::move(listener); }
  // An export of this composition begins.
  void Start(const Composition& composition);
  // The next layer is begun.
  void BeginLayer()
  {
    ++begun_;
    Tell(0);
  }
  // A stream of that layer is read at this frame. Single values, read at the work area's start, tell nothing.
  void ReadFrame(double frame)
  {
    if (frame != singleFrame_)
      Tell(frame);
  }

 private:
  void Tell(double frame);

  Listener listener_;
  std::uint64_t layers_ = 0; // each use of a composition counts its own
  std::uint64_t begun_ = 0;
  double singleFrame_ = 0;
  double frames_ = 1; // from time 0 to the last one that is read
  double share_ = 0;
};

} // namespace host
