// How far a long run is, in one line on standard error.

#include "convert/progress.h"

#include <cstdio>
#include <fmt/core.h>
#include <string>
#include <unistd.h>

namespace nls2::tool {

namespace {

using namespace std::chrono_literals;

constexpr const char *toLineStart = "\r\x1B[K";

std::string clockText(double seconds) {
  const auto whole = static_cast<uint64_t>(seconds);
  return fmt::format("{}:{:02}:{:02}", whole / 3600, whole / 60 % 60, whole % 60);
}

std::string lineOf(uint64_t bytes, std::optional<uint64_t> total, double seconds) {
  const double rate = seconds > 0 ? static_cast<double>(bytes) / seconds : 0;
  const std::string speed = fmt::format("{:.1f} MB/s", rate / 1e6);
  if (!total || *total < bytes || *total == 0) {
    return fmt::format("{:.1f} MB, {}", static_cast<double>(bytes) / 1e6, speed);
  }
  const std::string left =
      rate > 0 ? clockText(static_cast<double>(*total - bytes) / rate) : "unknown";
  return fmt::format("{}%, {}, {} left", bytes * 100 / *total, speed, left);
}

} // namespace

Progress::Progress(std::optional<bool> wanted, std::optional<uint64_t> total)
    : total_(total), next_(start_ + (wanted == true ? 0s : 1s)),
      isShown_(wanted.value_or(isatty(STDERR_FILENO) == 1)) {}

void Progress::update(uint64_t bytes) {
  const auto now = Clock::now();
  if (isShown_ && now >= next_) {
    next_ = now + 200ms;
    isThere_ = true;
    std::fprintf(stderr, "%s%s", toLineStart, lineOf(bytes, total_, seconds()).c_str());
  }
}

void Progress::clear() {
  if (isThere_) {
    std::fputs(toLineStart, stderr);
    isThere_ = false;
  }
}

double Progress::seconds() const {
  return std::chrono::duration<double>(Clock::now() - start_).count();
}

} // namespace nls2::tool
