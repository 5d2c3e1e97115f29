// Shows the progress of a long run in one line on standard error.
#pragma once

#include "io/signals.h"

#include <chrono>
#include <cstdint>
#include <cstdio>
#include <fmt/core.h>
#include <optional>
#include <string>
#include <unistd.h>

namespace nls2::tool {

class Progress {
public:
  // Shown if standard error is a terminal and the run lasts longer than a second, or if `wanted`.
  // `total` is the size of the input, if known.
  Progress(bool wanted, std::optional<uint64_t> total)
      : total_(total.value_or(0)), next_(start_ + std::chrono::seconds(wanted ? 0 : 1)),
        isShown_(wanted || isatty(STDERR_FILENO) == 1) {}
  ~Progress() { clearProgress(); }
  Progress(const Progress &) = delete;
  Progress &operator=(const Progress &) = delete;

  // Call it when `bytes` of the input have been processed.
  void update(uint64_t bytes) {
    const auto now = Clock::now();
    if (isShown_ && now >= next_) {
      next_ = now + std::chrono::milliseconds(200);
      catchEndingSignals();
      clearProgress();
      std::fputs(line(bytes, now - start_).c_str(), stderr);
      progressIsShown = true;
    }
  }

private:
  using Clock = std::chrono::steady_clock;

  std::string line(uint64_t bytes, std::chrono::duration<double> passed) const {
    const double rate = passed.count() > 0 ? static_cast<double>(bytes) / passed.count() : 0;
    const std::string speed = fmt::format("{:.1f} MB/s", rate / 1e6);
    if (total_ < bytes || total_ == 0) {
      return fmt::format("{:.1f} MB, {}", static_cast<double>(bytes) / 1e6, speed);
    }
    const auto left =
        static_cast<uint64_t>(rate > 0 ? static_cast<double>(total_ - bytes) / rate : 0);
    const std::string time = fmt::format("{}:{:02}:{:02}", left / 3600, left / 60 % 60, left % 60);
    return fmt::format("{}%, {}, {} left", bytes * 100 / total_, speed,
                       rate > 0 ? time : "unknown");
  }

  const uint64_t total_; // 0: not known
  const Clock::time_point start_ = Clock::now();
  Clock::time_point next_; // when the line is due
  const bool isShown_;     // at all
};

} // namespace nls2::tool
