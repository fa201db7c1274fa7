#include "machine_limits.h"

#include <bit>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <vector>

#include "measure.h"

namespace benchmarks
{

namespace
{

// As much as the mesh of a million points, and too much for the heap to keep: every run gets fresh memory.
constexpr std::size_t kDoubles = 9'000'000;
constexpr std::size_t kValues = 4'000'000;
constexpr std::size_t kNodes = 1'000'000;
constexpr std::size_t kPiece = 64 * 1024;
constexpr std::size_t kValueBuffer = 16 * 1024;
constexpr std::size_t kValueSize = 9;

struct CloseFile
{
  void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, CloseFile>;

File Open(const ScratchFile& scratch, const char* mode)
{
  File file(std::fopen(scratch.Path().c_str(), mode));
  if (!file) {
    std::perror(scratch.Path().c_str());
    std::exit(2);
  }
  return file;
}

std::uint64_t Swapped(double value) { return __builtin_bswap64(std::bit_cast<std::uint64_t>(value)); }

// Things a second: one run to warm up, then the best of three.
template <typename Work>
double Rate(std::size_t things, Work&& work)
{
  const Run best = InFreshProcess([&] {
    work();
    return BestOfThree([&] { return Measure(work); });
  });
  return static_cast<double>(things) / best.time.count();
}

// The same in memory fresh from the system: the best of three runs in a process of its own each.
template <typename Work>
double FreshRate(std::size_t things, Work&& work)
{
  const Run best = BestOfThree([&] { return InFreshProcess([&] { return Measure(work); }); });
  return static_cast<double>(things) / best.time.count();
}

void WriteDoubles(const ScratchFile& scratch, const std::vector<double>& values)
{
  scratch.Remove();
  File file = Open(scratch, "wb");
  std::vector<std::uint64_t> buffer(kPiece / sizeof(double));
  for (std::size_t done = 0; done < values.size(); done += buffer.size()) {
    const std::size_t count = std::min(buffer.size(), values.size() - done);
    for (std::size_t i = 0; i < count; ++i)
      buffer[i] = Swapped(values[done + i]);
    std::fwrite(buffer.data(), sizeof(double), count, file.get());
  }
}

void ReadDoubles(const ScratchFile& scratch)
{
  File file = Open(scratch, "rb");
  std::vector<std::uint64_t> buffer(kPiece / sizeof(double));
  std::unique_ptr<double[]> values(new double[kDoubles]);
  for (std::size_t done = 0; done < kDoubles;) {
    const std::size_t count = std::fread(buffer.data(), sizeof(double), buffer.size(), file.get());
    if (count == 0)
      break;
    for (std::size_t i = 0; i < count && done < kDoubles; ++i, ++done)
      values[done] = std::bit_cast<double>(__builtin_bswap64(buffer[i]));
  }
  benchmark::DoNotOptimize(values.get());
}

void WriteValues(const ScratchFile& scratch)
{
  scratch.Remove();
  File file = Open(scratch, "wb");
  std::vector<unsigned char> buffer(kValueBuffer);
  std::size_t fill = 0;
  for (std::size_t i = 0; i < kValues; ++i) {
    if (fill + kValueSize > buffer.size()) {
      std::fwrite(buffer.data(), 1, fill, file.get());
      fill = 0;
    }
    buffer[fill] = 19;
    const std::uint64_t bits = Swapped(static_cast<double>(i));
    std::memcpy(&buffer[fill + 1], &bits, sizeof bits);
    fill += kValueSize;
  }
  std::fwrite(buffer.data(), 1, fill, file.get());
}

void ReadValues(const ScratchFile& scratch)
{
  File file = Open(scratch, "rb");
  std::vector<unsigned char> buffer(kValueBuffer);
  std::size_t place = 0;
  std::size_t end = 0;
  double sum = 0;
  for (std::size_t i = 0; i < kValues; ++i) {
    if (end - place < kValueSize) {
      std::memmove(buffer.data(), &buffer[place], end - place);
      end -= place;
      place = 0;
      end += std::fread(&buffer[end], 1, buffer.size() - end, file.get());
      if (end < kValueSize)
        break;
    }
    std::uint64_t bits = 0;
    std::memcpy(&bits, &buffer[place + 1], sizeof bits);
    sum += buffer[place] == 19 ? std::bit_cast<double>(__builtin_bswap64(bits)) : 0;
    place += kValueSize;
  }
  benchmark::DoNotOptimize(sum);
}

struct Node
{
  Node* next;
  std::uint64_t fields[7];
};
static_assert(sizeof(Node) == 64);

// The process ends with the nodes in place.
void AllocateNodes()
{
  Node* first = nullptr;
  for (std::size_t i = 0; i < kNodes; ++i) {
    auto* node = static_cast<Node*>(std::malloc(sizeof(Node)));
    *node = {first, {i, i, i, i, i, i, i}};
    first = node;
  }
  benchmark::DoNotOptimize(first);
}

} // namespace

double DoubleWriteLimit()
{
  static const double rate = [] {
    const ScratchFile scratch;
    const std::vector<double> values(kDoubles, 1.0 / 3);
    return Rate(kDoubles, [&] { WriteDoubles(scratch, values); });
  }();
  return rate;
}

double DoubleReadLimit()
{
  static const double rate = [] {
    const ScratchFile scratch;
    WriteDoubles(scratch, std::vector<double>(kDoubles, 1.0 / 3));
    return FreshRate(kDoubles, [&] { ReadDoubles(scratch); });
  }();
  return rate;
}

double ValueWriteLimit()
{
  static const double rate = [] {
    const ScratchFile scratch;
    return Rate(kValues, [&] { WriteValues(scratch); });
  }();
  return rate;
}

double ValueReadLimit()
{
  static const double rate = [] {
    const ScratchFile scratch;
    WriteValues(scratch);
    return Rate(kValues, [&] { ReadValues(scratch); });
  }();
  return rate;
}

double NodeLimit()
{
  static const double rate = FreshRate(kNodes, AllocateNodes);
  return rate;
}

} // namespace benchmarks
