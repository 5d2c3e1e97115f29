// A text file in any encoding, read as UTF-8.
#pragma once

#include "io/input_file.h"

#include <cstdint>
#include <string>
#include <unicode/ucnv.h>

namespace nls2::tool {

class TextStream {
public:
  // The converter must outlive the stream. "-" is standard input. Throws Error.
  TextStream(const std::string &path, UConverter *converter);
  TextStream(const TextStream &) = delete; // the converter counts into it
  TextStream &operator=(const TextStream &) = delete;

  // The next part of the text; empty at the end. Throws Error.
  std::string read();

  // So far: byte sequences that are not valid in the encoding, and lone surrogates, which UTF-8
  // cannot hold. Each was replaced.
  uint64_t replaced() const { return replaced_; }

  const std::string &name() const { return input_.name(); }

private:
  void decode(const char *bytes, std::size_t length);
  std::string takeText();

  InputFile input_;
  UConverter *converter_;
  std::u16string units_; // decoded, but not yet handed out
  uint64_t replaced_ = 0;
  bool ended_ = false;
};

} // namespace nls2::tool
