// What each single byte of a code page means, and where two pages differ in it.
#pragma once

#include "codepage/code_page.h"
#include "json.h"

#include <array>
#include <string>

namespace nls2::tool {

struct ByteMeaning {
  enum Kind { character, leadByte, shift, none };

  Kind kind = none;
  std::u16string text; // of a character; empty for all else
};

struct ByteChart {
  int32_t page = 0;
  std::array<ByteMeaning, 256> bytes;
};

// Throws failure where no byte of the page is a character by itself.
ByteChart chartOf(const CodePage &page);

std::string chartAsText(const ByteChart &chart);
Json chartAsJson(const ByteChart &chart);

// The bytes whose characters differ.
std::string differenceAsText(const ByteChart &a, const ByteChart &b);
Json differenceAsJson(const ByteChart &a, const ByteChart &b);

} // namespace nls2::tool
