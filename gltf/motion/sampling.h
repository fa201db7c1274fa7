// What moves, as keys of a file: the values at the keys of all curves that have a part in it, with a value each frame
// where no straight line does, and without those that their neighbours give back.
#pragma once

#include <cstddef>
#include <functional>
#include <vector>

#include "gltf/file/output.h"
#include "gltf/motion/timeline.h"

namespace gltf
{

// The keys of one channel.
struct Samples
{
  std::size_t width = 1; // floats for each time
  bool steps = false;    // a value holds up to the next key
  std::vector<float> times;
  std::vector<float> values;

  bool IsEmpty() const { return times.empty(); }
};

// How the inputs of a channel make its value.
struct Shape
{
  std::size_t width = 1;
  bool bent = false; // a straight line of the inputs gives no straight line of values
  // `inputs` as many as there are, `values` of the width.
  std::function<void(const Real* inputs, Real* values)> compute;
};

// Collects the keys of a channel at rising times.
class SampleWriter
{
 public:
  SampleWriter(std::size_t width, const Timeline& timeline, Output& output);

  // Of two keys whose times are equal in single precision the later stays.
  void Add(Real time, const Real* values);
  // `time` as the file holds it already.
  void AddSingle(float time, const Real* values);
  Samples Take() { return std::move(samples_); }

 private:
  const Timeline& timeline_;
  Output& output_;
  Samples samples_;
};

// The value at the keys of all inputs, and between them as each piece asks. Empty without keys.
Samples Sample(const std::vector<Input>& inputs, const Shape& shape, Timeline& timeline, Output& output);

// Of the two signs of each quaternion the one nearer to the quaternion before.
void MakeContinuous(Samples& quaternions);

// Takes out the keys that those that are kept give back within 1e-6 of the largest component, or of `least` where that
// is more. Nothing stays of one key, and of keys that are all equal.
void Thin(Samples& samples, double least);

} // namespace gltf
