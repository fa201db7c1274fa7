// Keys as they are read for a file: curves with a cursor, and the document's frames.
#pragma once

#include <cstddef>
#include <vector>

#include "gltf/account.h"
#include "gltf/scene/frames.h"
#include "torvane/animation/ccurve.h"

namespace gltf
{

// No curve takes a key that is further from 0, in seconds.
inline constexpr Real kTimeLimit = 10000.0;

// The frames of the document, and how many values may be made between its keys.
class Timeline
{
 public:
  // `fps` is above 0. `earliest` is the first key's time or 0; all times are moved so that it is not negative. `keys`
  // is the number of keys in the scene.
  Timeline(int fps, Real earliest, std::size_t keys, Account& account);

  // What is added to every time, in seconds.
  Real Offset() const { return offset_; }
  // A time as the file holds it.
  float ToSingle(Real time) const { return static_cast<float>(time + offset_) + 0.0F; }
  // The times of the frames between two times. As a scene of few bytes may span hours, there is a limit to what is
  // made out of it; beyond it the frames are spread over the stretch more widely, which is told.
  // `cost` is what one value takes, in units of a plain one.
  std::vector<Real> Between(Real from, Real to, std::size_t cost = 1);
  // The last frame before a time.
  Real FrameBefore(Real time) const;
  Real FrameLength() const { return 1.0 / fps_; }

 private:
  static constexpr Real kNear = 1e-3; // of a frame: a key so near to a frame stands on it

  Real fps_;
  Real offset_;
  std::size_t budget_; // values that may still be made
  Account& account_;
};

// A number that may have a curve.
struct Input
{
  const _torvane_::CCurve* curve = nullptr; // null: it keeps its value
  Real still = 0.0;
};

enum class Piece
{
  kFlat,
  kLinear,
  kStep,
  kSpline,
};

// Reads an input at rising times.
class InputReader
{
 public:
  explicit InputReader(const Input& input);

  // In seconds, strictly rising; empty without a curve.
  const std::vector<Real>& Times() const { return times_; }
  // The value at a time that is not before that of the last call.
  Real At(Real time);
  // How the value runs on from the time of the last call of At.
  Piece PieceHere() const;
  // True if any piece of the curve is a step, and if any is linear or a spline, and not flat.
  bool HasSteps() const;
  bool HasSlopes() const;

 private:
  Piece PieceOf(std::size_t key) const;
  bool IsLevel(std::size_t key) const;
  _torvane_::KeyValues KeyAt(std::size_t key) const;

  Input input_;
  std::vector<Real> times_;
  std::vector<_torvane_::Long> keys_; // their places in the curve
  std::size_t next_ = 0;              // the first key behind the time of the last call
};

} // namespace gltf
