// The lines of a file, or its records of one length, one after another.
#pragma once

#include "io/input_file.h"
#include "text/decoder.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace nls2::tool {

struct LineFormat {
  std::string terminator;       // after every line, at a multiple of its length from the line's
                                // start; empty for records
  std::size_t recordLength = 0; // of records
};

// The terminator of lines in a code page. Throws Error where the page cannot be cut into
// lines that mean the same by themselves.
std::string lineTerminator(int32_t page);

class LineReader {
public:
  // Throws Error.
  LineReader(const std::string &path, const LineFormat &format) : input_(path), format_(format) {}

  // The next line without its terminator, valid until the next call; false at the end. A last line
  // need not have its terminator, a last record must be whole. Throws Error.
  bool next(std::string_view &line);

  // Throws Error with the file's name, the last line's number and its first byte's offset.
  [[noreturn]] void fail(const TextFault &fault) const;

  const std::string &name() const { return input_.name(); }
  uint64_t number() const { return number_; } // of the last line, from 1

private:
  std::size_t findEnd();
  void fill();
  bool last(std::string_view &line);
  void begin(std::size_t end, std::string_view &line);

  InputFile input_;
  const LineFormat format_;
  std::string buffer_;
  std::size_t start_ = 0;   // of the next line
  std::size_t scanned_ = 0; // no terminator ends before this place
  uint64_t dropped_ = 0;    // bytes that were before the buffer
  uint64_t offset_ = 0;     // of the last line
  uint64_t number_ = 0;
  bool ended_ = false;
};

} // namespace nls2::tool
