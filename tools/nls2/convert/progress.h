// How far a long run is, in one line on standard error.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>

namespace nls2::tool {

class Progress {
public:
  // Shown where standard error is a terminal and the run lasts longer than a second, unless
  // `wanted` says so or forbids it. `total` are the bytes of the input, where they are known.
  Progress(std::optional<bool> wanted, std::optional<uint64_t> total);
  ~Progress() { clear(); }
  Progress(const Progress &) = delete;
  Progress &operator=(const Progress &) = delete;

  void update(uint64_t bytes); // of the input, since the beginning
  void clear();
  double seconds() const;

private:
  using Clock = std::chrono::steady_clock;

  const std::optional<uint64_t> total_;
  const Clock::time_point start_ = Clock::now();
  Clock::time_point next_; // when the line is due
  bool isShown_;           // at all
  bool isThere_ = false;   // now
};

} // namespace nls2::tool
