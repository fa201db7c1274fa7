// A bar on standard error for work that takes long. It is drawn on a terminal only, by a thread that isn't one of
// many, and only once the work has taken half a second; it is wiped out at the end.
#pragma once

#include <chrono>
#include <string>

namespace q7r
{

class ProgressBar
{
 public:
  explicit ProgressBar(std::string what);
  ~ProgressBar() { Clear(); }
  ProgressBar(const ProgressBar&) = delete;
  ProgressBar& operator=(const ProgressBar&) = delete;

  // The share that is done, from 0 to 1. Quick when nothing new is to be seen.
  void Show(double share)
  {
    if (isTerminal_ && static_cast<int>(share * kSteps) != shown_)
      Draw(static_cast<int>(share * kSteps));
  }
  // Wipes the bar out, before something else is printed.
  void Clear();

 private:
  static constexpr int kSteps = 100;

  void Draw(int percent);

  std::string what_;
  std::chrono::steady_clock::time_point start_ = std::chrono::steady_clock::now();
  bool isTerminal_;
  bool isDrawn_ = false;
  int shown_ = -1;
};

} // namespace q7r
