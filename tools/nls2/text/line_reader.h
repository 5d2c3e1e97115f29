// The lines of a file, or its records of one length, one after another.
#pragma once

#include "io/input_file.h"
#include "text/decoder.h"

#include <cstdint>
#include <optional>
#include <vector>

namespace nls2::tool {

// The line feed of a code page. Throws Error where the page cannot be cut into lines that mean the
// same by themselves.
inline std::string lineTerminator(int32_t page) {
  const CodePage opened(page, "--codepage");
  const auto lineFeed = opened.encoded(u'\n');
  if (!lineFeed) {
    throw usageError("code page {} has no line feed to end lines", page);
  }
  switch (ucnv_getType(opened.converter())) {
  case UCNV_UTF16: // the byte order is at the start of the text, as states are
  case UCNV_UTF32:
  case UCNV_HZ:
  case UCNV_ISO_2022:
  case UCNV_SCSU:
  case UCNV_COMPOUND_TEXT:
    throw usageError("lines of code page {} depend on the text before them; translate "
                     "it first, UTF-16 or UTF-32 with a signature to a page without",
                     page);
  default:
    return lineFeed->bytes;
  }
}

// The paths of a command that reads standard input where it is given none.
inline std::vector<std::string> inputsOf(const std::vector<std::string> &given) {
  return given.empty() ? std::vector<std::string>{"-"} : given;
}

class LineReader {
public:
  // The terminator is after every line, at a multiple of its length from the line's start; empty
  // for records of one length. Throws Error.
  LineReader(const std::string &path, const std::string &terminator, std::size_t recordLength = 0)
      : input_(path), terminator_(terminator), recordLength_(recordLength) {}

  // The next line without its terminator, valid until the next call; nothing at the end. A last
  // line need not have its terminator, a last record must be whole. Throws Error.
  std::optional<std::string_view> next() {
    std::size_t scanned = 0;
    std::size_t end = findEnd(scanned);
    while (end == std::string::npos && !ended_ && buffer_.size() - start_ <= Decoder::mostBytes) {
      fill();
      end = findEnd(scanned);
    }
    const bool isWhole = end != std::string::npos;
    const std::string_view line = std::string_view(buffer_).substr(start_, end);
    if (!isWhole && line.empty()) {
      return {};
    }
    ++number_;
    offset_ = dropped_ + start_;
    start_ += line.size() + (isWhole ? terminator_.size() : 0);
    if (line.size() > Decoder::mostBytes) {
      fail(fmt::format(": it has more than {} bytes", Decoder::mostBytes));
    }
    if (!isWhole && terminator_.empty()) {
      fail(fmt::format(": the input ends after {} of {} bytes; is --record-length {} right?",
                       line.size(), recordLength_, recordLength_));
    }
    return line;
  }

  // Throws Error: what is wrong with the last line, after the file's name, the line's number and
  // its first byte's offset.
  [[noreturn]] void fail(const std::string &what) const {
    throw failure("{}: {} {} at byte {}{}", input_.name(), terminator_.empty() ? "record" : "line",
                  number_, offset_, what);
  }

  uint64_t number() const { return number_; } // of the last line, from 1

private:
  // The length of the next line, or npos where it does not end in the buffer. Its first `scanned`
  // bytes hold no terminator.
  std::size_t findEnd(std::size_t &scanned) const {
    const std::string_view rest = std::string_view(buffer_).substr(start_);
    if (terminator_.empty()) {
      return recordLength_ <= rest.size() ? recordLength_ : rest.npos;
    }
    std::size_t end = rest.find(terminator_, scanned);
    while (end != rest.npos && end % terminator_.size() != 0) {
      end = rest.find(terminator_, end + 1);
    }
    scanned = rest.size() - rest.size() % terminator_.size();
    return end;
  }

  void fill() {
    constexpr std::size_t chunk = std::size_t{128} * 1024;
    dropped_ += start_;
    buffer_.erase(0, start_);
    start_ = 0;
    const std::size_t have = buffer_.size();
    buffer_.resize(have + chunk);
    const std::size_t got = input_.read(buffer_.data() + have, chunk);
    buffer_.resize(have + got);
    ended_ = got == 0;
  }

  InputFile input_;
  const std::string terminator_;
  const std::size_t recordLength_;
  std::string buffer_;
  std::size_t start_ = 0; // of the next line
  uint64_t dropped_ = 0;  // bytes that were before the buffer
  uint64_t offset_ = 0;   // of the last line
  uint64_t number_ = 0;
  bool ended_ = false;
};

} // namespace nls2::tool
