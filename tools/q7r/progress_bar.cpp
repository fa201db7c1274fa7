#include "progress_bar.h"

#include <cstdio>

#include "output/terminal.h"
#include "report.h"

namespace q7r
{

namespace
{

constexpr int kWidth = 40;
constexpr std::chrono::milliseconds kPatience(500);

} // namespace

ProgressBar::ProgressBar(std::string what)
    : what_(std::move(what)),
      isTerminal_(IsTerminal(StandardStream::kError) && !TheTalk().quiet && !ToldTogether::IsInForce())
{}

void ProgressBar::Draw(int percent)
{
  shown_ = percent;
  if (std::chrono::steady_clock::now() - start_ < kPatience)
    return;
  const std::string bar(static_cast<std::size_t>(percent * kWidth / kSteps), '#');
  std::fprintf(stderr, "\r%s [%-*s] %3d %%", what_.c_str(), kWidth, bar.c_str(), percent);
  std::fflush(stderr);
  isDrawn_ = true;
}

void ProgressBar::Clear()
{
  if (!isDrawn_)
    return;
  std::fprintf(stderr, "\r%*s\r", static_cast<int>(what_.size()) + kWidth + 9, "");
  std::fflush(stderr);
  isDrawn_ = false;
}

} // namespace q7r
