#include "gltf/motion/timeline.h"

#include <algorithm>
#include <cmath>

namespace gltf
{

using namespace _torvane_;

namespace
{

// Values that may be made between keys: so many for a file, and so many for each of its keys.
constexpr std::size_t kValuesAtLeast = 200'000;
constexpr std::size_t kValuesPerKey = 1000;
constexpr std::size_t kLeastBetween = 16; // what a stretch gets in any case

} // namespace

Timeline::Timeline(int fps, Real earliest, std::size_t keys, Account& account)
    : fps_(fps),
      offset_(earliest < 0.0 ? -earliest : 0.0),
      budget_(kValuesAtLeast + kValuesPerKey * keys),
      account_(account)
{}

std::vector<Real> Timeline::Between(Real from, Real to, std::size_t cost)
{
  const Real first = std::floor(from * fps_ + kNear) + 1.0;
  const Real last = std::ceil(to * fps_ - kNear) - 1.0;
  if (!(last >= first))
    return {};
  auto count = static_cast<std::size_t>(last - first) + 1;
  const std::size_t allowed = std::max(budget_ / cost, kLeastBetween);
  Real step = 1.0;
  if (count > allowed) {
    step = std::ceil(static_cast<Real>(count) / static_cast<Real>(allowed));
    count = static_cast<std::size_t>(std::floor((last - first) / step)) + 1;
    account_.Tell(Loss::kCoarse);
  }
  budget_ -= std::min(budget_, count * cost);
  std::vector<Real> times(count);
  for (std::size_t i = 0; i < count; ++i)
    times[i] = (first + step * static_cast<Real>(i)) / fps_;
  return times;
}

Real Timeline::FrameBefore(Real time) const { return (std::ceil(time * fps_ - kNear) - 1.0) / fps_; }

InputReader::InputReader(const Input& input) : input_(input)
{
  const Long count = input.curve ? input.curve->GetKeyCount() : 0;
  times_.reserve(static_cast<std::size_t>(count));
  keys_.reserve(static_cast<std::size_t>(count));
  for (Long i = 0; i < count; ++i) {
    KeyValues key;
    input.curve->GetKeyValues(i, key);
    const Real time = key.time.Get();
    const bool rises = times_.empty() || time > times_.back();
    if (!rises || !(std::fabs(time) <= kTimeLimit)) // only a damaged file has such
      continue;
    times_.push_back(time);
    keys_.push_back(i);
  }
}

KeyValues InputReader::KeyAt(std::size_t key) const
{
  KeyValues values;
  input_.curve->GetKeyValues(keys_[key], values);
  return values;
}

Real InputReader::At(Real time)
{
  if (keys_.empty())
    return input_.still;
  while (next_ < times_.size() && times_[next_] <= time)
    ++next_;
  if (next_ == 0)
    return KeyAt(0).value;
  if (next_ == times_.size() || times_[next_ - 1] == time)
    return KeyAt(next_ - 1).value;
  return input_.curve->GetValue(time);
}

Piece InputReader::PieceHere() const { return next_ == 0 ? Piece::kFlat : PieceOf(next_ - 1); }

// From key `key` to the next one.
Piece InputReader::PieceOf(std::size_t key) const
{
  if (key + 1 >= keys_.size() || IsLevel(key))
    return Piece::kFlat;
  switch (KeyAt(key).interpolation) {
  case kInterpolationSpline:
    return Piece::kSpline;
  case kInterpolationLinear:
    return Piece::kLinear;
  default:
    return Piece::kStep;
  }
}

bool InputReader::IsLevel(std::size_t key) const
{
  const KeyValues here = KeyAt(key);
  if (here.value != KeyAt(key + 1).value)
    return false;
  if (here.interpolation != kInterpolationSpline)
    return true;
  const Long place = keys_[key];
  return input_.curve->GetTangents(place).rightValue == 0.0 && input_.curve->GetTangents(place + 1).leftValue == 0.0;
}

bool InputReader::HasSteps() const
{
  for (std::size_t i = 0; i + 1 < keys_.size(); ++i) {
    const Long type = KeyAt(i).interpolation;
    if (type != kInterpolationSpline && type != kInterpolationLinear)
      return true;
  }
  return false;
}

bool InputReader::HasSlopes() const
{
  for (std::size_t i = 0; i + 1 < keys_.size(); ++i) {
    const Piece piece = PieceOf(i);
    if (piece == Piece::kLinear || piece == Piece::kSpline)
      return true;
  }
  return false;
}

} // namespace gltf
