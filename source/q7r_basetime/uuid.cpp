#include "torvane/time/uuid.h"

#include <bit>
#include <cstring>

#include "q7r_basetime/basetime_log.h"
#include "torvane/time/reproducible_run.h"

#ifdef _WIN32
#include <windows.h>

#include <bcrypt.h>
#else
#include <atomic>

#include <pthread.h>
#include <unistd.h>
#ifdef __APPLE__ // elsewhere getentropy is in unistd.h
#include <sys/random.h>
#endif
#endif

namespace _torvane_
{

namespace
{

constexpr std::size_t kUuidSize = 16;
constexpr std::size_t kKeySize = 32;

#ifdef _WIN32

Bool TakeSeed(UChar* key) { return BCryptGenRandom(nullptr, key, kKeySize, BCRYPT_USE_SYSTEM_PREFERRED_RNG) >= 0; }

unsigned CountForks() { return 0; }

#else

std::atomic<unsigned> gForks{0};
[[maybe_unused]] const int kForkWatch =
    pthread_atfork(nullptr, nullptr, [] { gForks.fetch_add(1, std::memory_order_relaxed); });

Bool TakeSeed(UChar* key) { return getentropy(key, kKeySize) == 0; }

unsigned CountForks() { return gForks.load(std::memory_order_relaxed); }

#endif

// One block of the stream cipher ChaCha20 (RFC 8439) in counter mode, with a nonce of zeros.
void ChaChaBlock(const ULong (&key)[8], ULong counter, UChar* block)
{
  const ULong start[16] = {0x61707865, 0x3320646E, 0x79622D32, 0x6B206574, key[0],  key[1], key[2], key[3],
                           key[4],     key[5],     key[6],     key[7],     counter, 0,      0,      0};
  ULong x[16];
  std::memcpy(x, start, sizeof x);
  auto quarter = [&x](int a, int b, int c, int d) {
    x[a] += x[b];
    x[d] = std::rotl(x[d] ^ x[a], 16);
    x[c] += x[d];
    x[b] = std::rotl(x[b] ^ x[c], 12);
    x[a] += x[b];
    x[d] = std::rotl(x[d] ^ x[a], 8);
    x[c] += x[d];
    x[b] = std::rotl(x[b] ^ x[c], 7);
  };
  for (int round = 0; round < 10; ++round) {
    for (int i = 0; i < 4; ++i)
      quarter(i, 4 + i, 8 + i, 12 + i);
    for (int i = 0; i < 4; ++i)
      quarter(i, 4 + (i + 1) % 4, 8 + (i + 2) % 4, 12 + (i + 3) % 4);
  }
  for (int i = 0; i < 16; ++i)
    x[i] += start[i];
  std::memcpy(block, x, sizeof x);
}

// Random bytes without a call to the system for each: each thread has a generator that the system seeds once. The first
// bytes of what it makes become the key of what it makes next, so that nothing tells what was handed out before. A
// child process must not hand out again what its parent does, so every fork asks for a new seed.
class Generator
{
 public:
  Bool Take(UChar* bytes)
  {
    if ((left_ < kUuidSize || forks_ != CountForks()) && !Fill())
      return false;
    left_ -= kUuidSize;
    std::memcpy(bytes, stock_ + left_, kUuidSize);
    std::memset(stock_ + left_, 0, kUuidSize);
    return true;
  }

 private:
  static constexpr std::size_t kBlock = 64;
  static constexpr std::size_t kBlocks = 16;

  Bool Fill()
  {
    left_ = 0;
    if (!seeded_ || forks_ != CountForks()) {
      UChar seed[kKeySize];
      seeded_ = TakeSeed(seed);
      if (!seeded_)
        return false;
      std::memcpy(key_, seed, sizeof key_);
      forks_ = CountForks();
    }
    for (std::size_t i = 0; i < kBlocks; ++i)
      ChaChaBlock(key_, static_cast<ULong>(i), stock_ + i * kBlock);
    constexpr std::size_t kGiven = kBlock * kBlocks - kKeySize;
    std::memcpy(key_, stock_ + kGiven, kKeySize);
    left_ = kGiven;
    return true;
  }

  ULong key_[kKeySize / sizeof(ULong)] = {};
  UChar stock_[kBlock * kBlocks] = {};
  std::size_t left_ = 0;
  unsigned forks_ = 0;
  Bool seeded_ = false;
};

Bool TakeRandom(UChar* bytes)
{
  static thread_local Generator generator;
  return generator.Take(bytes);
}

} // namespace

void CreateUuid(UChar* bytes) noexcept
{
  if (ReproducibleRun* run = ReproducibleRun::GetCurrent())
    run->TakeUuid(bytes);
  else if (!TakeRandom(bytes))
    ReportBaseTime(__LINE__, "the system gives no random identifier");
}

} // namespace _torvane_
