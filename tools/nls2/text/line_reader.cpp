// The lines of a file, or its records of one length, one after another.

#include "text/line_reader.h"

#include "codepage/code_page.h"
#include "errors.h"
#include "nls2.h"

#include <algorithm>
#include <array>
#include <fmt/core.h>
#include <unicode/ucnv.h>

namespace nls2::tool {

namespace {

constexpr std::size_t chunkLength = std::size_t{128} * 1024;

// The byte order, or the state at a line's start, depends on text before the line.
bool needsTextBefore(const CodePage &page) {
  constexpr std::array types{UCNV_UTF16,    UCNV_UTF32, UCNV_HZ,
                             UCNV_ISO_2022, UCNV_SCSU,  UCNV_COMPOUND_TEXT};
  return std::find(types.begin(), types.end(), ucnv_getType(page.converter())) != types.end();
}

} // namespace

std::string lineTerminator(int32_t page) {
  const CodePage opened(page, "--codepage");
  const auto lineFeed = opened.encoded(u'\n');
  if (!lineFeed) {
    throw usageError("code page {} has no line feed to end lines", page);
  }
  if (needsTextBefore(opened)) {
    throw usageError("lines of code page {} depend on the text before them; translate "
                     "it first, UTF-16 or UTF-32 with a signature to a page without",
                     page);
  }
  return lineFeed->bytes;
}

// The next line's end in the buffer, or npos.
std::size_t LineReader::findEnd() {
  if (format_.terminator.empty()) {
    const std::size_t end = start_ + format_.recordLength;
    return end <= buffer_.size() ? end : std::string::npos;
  }
  const std::size_t unit = format_.terminator.size();
  std::size_t end = unit == 1 ? buffer_.find(format_.terminator.front(), scanned_)
                              : buffer_.find(format_.terminator, scanned_);
  while (unit != 1 && end != std::string::npos && (end - start_) % unit != 0) {
    end = buffer_.find(format_.terminator, end + 1);
  }
  if (end == std::string::npos) {
    scanned_ = std::max(start_, buffer_.size() - std::min(unit - 1, buffer_.size()));
  }
  return end;
}

void LineReader::fill() {
  dropped_ += start_;
  buffer_.erase(0, start_);
  scanned_ -= start_;
  start_ = 0;
  const std::size_t have = buffer_.size();
  buffer_.resize(have + chunkLength);
  const std::size_t got = input_.read(buffer_.data() + have, chunkLength, -1);
  buffer_.resize(have + got);
  ended_ = got == 0;
}

// The line from start_ to there is the last one.
void LineReader::begin(std::size_t end, std::string_view &line) {
  ++number_;
  offset_ = dropped_ + start_;
  line = std::string_view(buffer_).substr(start_, end - start_);
  if (line.size() > Decoder::mostBytes) {
    fail({fmt::format("it has more than {} bytes", Decoder::mostBytes), {}});
  }
}

bool LineReader::next(std::string_view &line) {
  std::size_t end = findEnd();
  while (end == std::string::npos && !ended_ && buffer_.size() - start_ <= Decoder::mostBytes) {
    fill();
    end = findEnd();
  }
  if (end == std::string::npos) {
    return last(line);
  }
  begin(end, line);
  start_ = scanned_ = end + format_.terminator.size();
  return true;
}

bool LineReader::last(std::string_view &line) {
  if (start_ == buffer_.size()) {
    return false;
  }
  begin(buffer_.size(), line);
  start_ = scanned_ = buffer_.size();
  if (format_.terminator.empty()) {
    fail({fmt::format("the input ends after {} of {} bytes; is --record-length {} right?",
                      line.size(), format_.recordLength, format_.recordLength),
          {}});
  }
  return true;
}

void LineReader::fail(const TextFault &fault) const {
  const char *unit = format_.terminator.empty() ? "record" : "line";
  throw failure(
      "{}",
      describe(fmt::format("{}: {} {} at byte {}", input_.name(), unit, number_, offset_), fault));
}

} // namespace nls2::tool
