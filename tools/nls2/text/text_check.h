// Whether a text may be handed to the library: it replaces bytes that do not convert without a
// word, and some of its functions look no further than the first null.
#pragma once

#include "codepage/code_page.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <unicode/ucnv.h>

namespace nls2::tool {

// Whether a function sees all of a text that has a null inside.
enum class Nulls { areText, endText };

class TextCheck {
public:
  // The code page must open.
  TextCheck(int32_t page, std::size_t mostBytes, Nulls nulls);

  // Why the text cannot be handed on; nothing where it can.
  std::optional<std::string> refusal(std::string_view text);

private:
  UErrorCode convert(std::string_view text);
  bool hasTextBehindNull() const;

  const CodePage page_;
  const std::size_t mostBytes_;
  const Nulls nulls_;
  std::u16string buffer_;
  std::size_t length_ = 0; // of the last text, in the buffer
};

} // namespace nls2::tool
