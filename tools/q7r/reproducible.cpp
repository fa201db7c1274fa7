#include "reproducible.h"

#include <charconv>
#include <chrono>
#include <cstdlib>
#include <cstring>

#include "report.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr DateTime kNoDate = {1980, 1, 1, 0, 0, 0};
constexpr const char* kVariable = "SOURCE_DATE_EPOCH";

DateTime InUtc(long long seconds)
{
  using namespace std::chrono;
  constexpr long long kDay = 86400;
  const long long day = seconds / kDay;
  const auto rest = static_cast<Long>(seconds % kDay);
  const year_month_day date{sys_days{days{day}}};
  return {static_cast<int>(date.year()),
          static_cast<Long>(static_cast<unsigned>(date.month())),
          static_cast<Long>(static_cast<unsigned>(date.day())),
          rest / 3600,
          rest / 60 % 60,
          rest % 60};
}

std::optional<DateTime> EpochDate()
{
  constexpr long long kMost = 253402300799; // the end of the year 9999
  const char* const text = std::getenv(kVariable);
  if (!text || !*text)
    return std::nullopt;
  const char* const end = text + std::strlen(text);
  long long seconds = -1;
  const std::from_chars_result result = std::from_chars(text, end, seconds);
  if (result.ec != std::errc() || result.ptr != end || seconds < 0 || seconds > kMost)
    throw Failure(std::string(kVariable) + " is \"" + text + "\", no number of seconds since 1970");
  return InUtc(seconds);
}

} // namespace

void AddReproducibleOption(CLI::App& verb, bool& isWanted)
{
  verb.add_flag(
      "--reproducible", isWanted,
      "give the same bytes in every run: identifiers follow from what is read; the date is SOURCE_DATE_EPOCH, "
      "else that of the scene that is read, else 1980-01-01");
}

Reproduction::Reproduction(bool isWanted) : isWanted_(isWanted), epoch_(isWanted ? EpochDate() : std::nullopt) {}

void Reproduction::Take(std::string_view content)
{
  sum_.Update(content.data(), static_cast<LLong>(content.size()));
  sum_.UpdateByte(0); // between two
}

void Reproduction::Begin()
{
  if (isWanted_)
    run_.emplace(sum_.GetCrc(), epoch_.value_or(kNoDate));
}

void Reproduction::TakeDate(BaseDocument& document)
{
  const LLong bits = document.GetDataInstance().GetLLong(kInfoSaveDate);
  Real day = 0.0;
  std::memcpy(&day, &bits, sizeof day);
  if (run_ && !epoch_ && day > 0.0)
    run_->SetNow(FromJulianDay(day));
}

} // namespace q7r
