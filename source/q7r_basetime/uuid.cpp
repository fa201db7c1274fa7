#include "torvane/time/uuid.h"

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

#ifdef _WIN32

Bool TakeRandom(UChar* bytes)
{
  return BCryptGenRandom(nullptr, bytes, kUuidSize, BCRYPT_USE_SYSTEM_PREFERRED_RNG) >= 0;
}

#else

// The system is asked for many identifiers at once; each thread has its own stock. A child process must not hand out
// the stock of its parent again, so every fork makes the stocks void.
constexpr std::size_t kStockSize = 256; // as much as the system gives without ever being interrupted

struct Stock
{
  UChar bytes[kStockSize];
  std::size_t left;
  unsigned process;
};

std::atomic<unsigned> gProcess{0};
[[maybe_unused]] const int kForkWatch =
    pthread_atfork(nullptr, nullptr, [] { gProcess.fetch_add(1, std::memory_order_relaxed); });

Bool TakeRandom(UChar* bytes)
{
  static thread_local Stock stock{};
  unsigned process = gProcess.load(std::memory_order_relaxed);
  if (stock.left == 0 || stock.process != process) {
    stock.left = 0;
    if (getentropy(stock.bytes, kStockSize) != 0)
      return false;
    stock.left = kStockSize;
    stock.process = process;
  }
  stock.left -= kUuidSize;
  std::memcpy(bytes, stock.bytes + stock.left, kUuidSize);
  return true;
}

#endif

} // namespace

void CreateUuid(UChar* bytes) noexcept
{
  if (ReproducibleRun* run = ReproducibleRun::GetCurrent())
    run->TakeUuid(bytes);
  else if (!TakeRandom(bytes))
    ReportBaseTime(__LINE__, "the system gives no random identifier");
}

} // namespace _torvane_
