#include "gltf/motion/sampling.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace gltf
{

namespace
{

constexpr double kTolerance = 1e-6;

// The times of all readers, ascending, each once.
std::vector<Real> UnionOfTimes(const std::vector<InputReader>& readers)
{
  std::vector<Real> all;
  for (const InputReader& reader : readers) {
    const std::vector<Real>& times = reader.Times();
    if (all.empty()) {
      all = times;
    } else if (!times.empty() && times != all) {
      const auto middle = static_cast<std::ptrdiff_t>(all.size());
      all.insert(all.end(), times.begin(), times.end());
      std::inplace_merge(all.begin(), all.begin() + middle, all.end());
      all.erase(std::unique(all.begin(), all.end()), all.end());
    }
  }
  return all;
}

class ChannelSampler
{
 public:
  ChannelSampler(const std::vector<Input>& inputs, const Shape& shape, Timeline& timeline, Output& output)
      : shape_(shape),
        timeline_(timeline),
        writer_(shape.width, timeline, output),
        readers_(inputs.begin(), inputs.end()),
        values_(inputs.size()),
        out_(shape.width),
        times_(UnionOfTimes(readers_))
  {
    auto has = [this](auto test) { return std::any_of(readers_.begin(), readers_.end(), test); };
    steps_ = has([](const InputReader& r) { return r.HasSteps(); }) &&
             !has([](const InputReader& r) { return r.HasSlopes(); });
  }

  Samples Run()
  {
    for (std::size_t i = 0; i < times_.size(); ++i) {
      Evaluate(times_[i]);
      writer_.Add(times_[i], out_.data());
      if (i + 1 < times_.size() && !steps_)
        FillPiece(times_[i], times_[i + 1]);
    }
    Samples samples = writer_.Take();
    samples.steps = steps_;
    return samples;
  }

 private:
  void Evaluate(Real time)
  {
    for (std::size_t i = 0; i < readers_.size(); ++i)
      values_[i] = readers_[i].At(time);
    shape_.compute(values_.data(), out_.data());
  }

  // What stands between two keys beside them. The readers stand at the first one.
  void FillPiece(Real from, Real to)
  {
    const bool isShort = to - from <= 1.001 * timeline_.FrameLength();
    bool bake = false;
    bool jumps = false;
    for (const InputReader& reader : readers_) {
      if (isShort && !mayStep_)
        break;
      const Piece piece = reader.PieceHere();
      bake = bake || piece == Piece::kSpline || (shape_.bent && piece == Piece::kLinear);
      jumps = jumps || piece == Piece::kStep;
    }
    if (bake && !isShort) {
      for (const Real time : timeline_.Between(from, to)) {
        Evaluate(time);
        writer_.Add(time, out_.data());
      }
    }
    if (jumps)
      HoldBefore(from, to);
  }

  // The values before a jump at `to` once more: in the frame before, or, if that isn't behind `from`, as late as a time
  // in single precision can be.
  void HoldBefore(Real from, Real to)
  {
    const Real frame = timeline_.FrameBefore(to);
    if (timeline_.ToSingle(frame) > timeline_.ToSingle(from)) {
      Evaluate(frame);
      writer_.Add(frame, out_.data());
      return;
    }
    const float late = std::nextafter(timeline_.ToSingle(to), -std::numeric_limits<float>::infinity());
    if (late <= timeline_.ToSingle(from))
      return;
    Evaluate(std::nextafter(to, from));
    writer_.AddSingle(late, out_.data());
  }

  const Shape& shape_;
  Timeline& timeline_;
  SampleWriter writer_;
  std::vector<InputReader> readers_;
  std::vector<Real> values_;
  std::vector<Real> out_;
  std::vector<Real> times_;
  bool steps_ = false;
  bool mayStep_ = std::any_of(readers_.begin(), readers_.end(), [](const InputReader& r) { return r.HasSteps(); });
};

// The slopes that lines from an anchor may have to pass all keys behind it.
class Cone
{
 public:
  explicit Cone(std::size_t width) : low_(width), high_(width) {}

  void Start(double time, const float* values)
  {
    time_ = time;
    anchor_ = values;
    std::fill(low_.begin(), low_.end(), -std::numeric_limits<double>::infinity());
    std::fill(high_.begin(), high_.end(), std::numeric_limits<double>::infinity());
  }
  // Whether the line from the anchor to a key passes all keys that were narrowed by.
  bool Reaches(double time, const float* values) const
  {
    for (std::size_t c = 0; c < low_.size(); ++c) {
      const double slope = (double{values[c]} - double{anchor_[c]}) / (time - time_);
      if (!(slope >= low_[c] && slope <= high_[c]))
        return false;
    }
    return true;
  }
  void Narrow(double time, const float* values, double tolerance)
  {
    for (std::size_t c = 0; c < low_.size(); ++c) {
      const double way = double{values[c]} - double{anchor_[c]};
      low_[c] = std::max(low_[c], (way - tolerance) / (time - time_));
      high_[c] = std::min(high_[c], (way + tolerance) / (time - time_));
    }
  }

 private:
  double time_ = 0.0;
  const float* anchor_ = nullptr;
  std::vector<double> low_;
  std::vector<double> high_;
};

double LargestOf(const std::vector<float>& values)
{
  double largest = 0.0;
  for (const float value : values)
    largest = std::max(largest, std::fabs(double{value}));
  return largest;
}

bool AreNear(const float* a, const float* b, std::size_t width, double tolerance)
{
  for (std::size_t c = 0; c < width; ++c) {
    if (!(std::fabs(double{a[c]} - double{b[c]}) <= tolerance))
      return false;
  }
  return true;
}

// The keys of straight lines that stay, by index.
std::vector<std::size_t> KeptOfLines(const Samples& samples, double tolerance)
{
  const std::size_t count = samples.times.size();
  const float* values = samples.values.data();
  std::vector<std::size_t> kept = {0};
  Cone cone(samples.width);
  cone.Start(double{samples.times[0]}, values);
  for (std::size_t i = 1; i < count; ++i) {
    if (!cone.Reaches(double{samples.times[i]}, values + i * samples.width)) {
      kept.push_back(i - 1);
      cone.Start(double{samples.times[i - 1]}, values + (i - 1) * samples.width);
    }
    cone.Narrow(double{samples.times[i]}, values + i * samples.width, tolerance);
  }
  if (kept.back() != count - 1)
    kept.push_back(count - 1);
  return kept;
}

std::vector<std::size_t> KeptOfSteps(const Samples& samples, double tolerance)
{
  std::vector<std::size_t> kept = {0};
  for (std::size_t i = 1; i < samples.times.size(); ++i) {
    const float* values = samples.values.data();
    if (!AreNear(values + i * samples.width, values + kept.back() * samples.width, samples.width, tolerance))
      kept.push_back(i);
  }
  return kept;
}

} // namespace

SampleWriter::SampleWriter(std::size_t width, const Timeline& timeline, Output& output)
    : timeline_(timeline), output_(output)
{
  samples_.width = width;
}

void SampleWriter::Add(Real time, const Real* values) { AddSingle(timeline_.ToSingle(time), values); }

void SampleWriter::AddSingle(float time, const Real* values)
{
  if (!samples_.times.empty() && time <= samples_.times.back()) {
    samples_.times.pop_back();
    samples_.values.resize(samples_.values.size() - samples_.width);
    if (!samples_.times.empty() && time <= samples_.times.back())
      return; // out of order: only by rounding of what was made here
  }
  samples_.times.push_back(time);
  for (std::size_t c = 0; c < samples_.width; ++c)
    samples_.values.push_back(output_.ToSingle(values[c]));
}

Samples Sample(const std::vector<Input>& inputs, const Shape& shape, Timeline& timeline, Output& output)
{
  return ChannelSampler(inputs, shape, timeline, output).Run();
}

void MakeContinuous(Samples& quaternions)
{
  std::vector<float>& v = quaternions.values;
  for (std::size_t i = 4; i < v.size(); i += 4) {
    const float dot = v[i] * v[i - 4] + v[i + 1] * v[i - 3] + v[i + 2] * v[i - 2] + v[i + 3] * v[i - 1];
    if (dot < 0.0F)
      std::transform(v.begin() + static_cast<std::ptrdiff_t>(i), v.begin() + static_cast<std::ptrdiff_t>(i + 4),
                     v.begin() + static_cast<std::ptrdiff_t>(i), [](float c) { return 0.0F - c; });
  }
}

void Thin(Samples& samples, double least)
{
  if (samples.times.empty())
    return;
  const double tolerance = kTolerance * std::max(least, LargestOf(samples.values));
  const std::vector<std::size_t> kept =
      samples.steps ? KeptOfSteps(samples, tolerance) : KeptOfLines(samples, tolerance);
  const std::size_t width = samples.width;
  for (std::size_t i = 0; i < kept.size(); ++i) {
    samples.times[i] = samples.times[kept[i]];
    std::copy_n(samples.values.begin() + static_cast<std::ptrdiff_t>(kept[i] * width), width,
                samples.values.begin() + static_cast<std::ptrdiff_t>(i * width));
  }
  samples.times.resize(kept.size());
  samples.values.resize(kept.size() * width);
  const bool still = kept.size() < 2 || (kept.size() == 2 && AreNear(samples.values.data(),
                                                                     samples.values.data() + width, width, tolerance));
  if (still) {
    samples.times.clear();
    samples.values.clear();
  }
}

} // namespace gltf
