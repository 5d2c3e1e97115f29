// Text of a code page as UTF-16, through one converter that stays open.
#pragma once

#include "codepage/code_page.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace nls2::tool {

// Why a text cannot be used, and at which of its bytes where one is to blame.
struct TextFault {
  std::string reason;
  std::optional<std::size_t> offset;
};

// "a, column 3: ..." or "a: ...".
std::string describe(const std::string &place, const TextFault &fault);

// Whether all bytes are below 0x80.
bool isAscii(std::string_view bytes);

// For one thread at a time.
class Decoder {
public:
  static constexpr std::size_t mostBytes = std::size_t{1} << 30;

  // Throws usageError where the page does not open; `option` is who named it.
  Decoder(int32_t page, const char *option);

  // Decodes a text of at most mostBytes. Bytes that are not valid in the page are a fault.
  std::optional<TextFault> decode(std::string_view bytes);
  // The last text that decode() accepted, valid until the next call.
  std::u16string_view text() const { return {units_.data(), length_}; }

  // Cuts nulls off the text's end; more text after a null is a fault.
  std::optional<TextFault> cutNulls();
  void cutBlanks(); // tabs and all space characters

  // A text in the page; characters that the page lacks become its substitution character.
  std::string encode(const std::string &utf8) const;

  bool isUtf8() const { return isUtf8_; }
  const CodePage &page() const { return page_; }

private:
  bool decodeUtf8(std::string_view bytes);
  TextFault invalidBytes(std::size_t consumed) const;

  const CodePage page_;
  bool isUtf8_;
  std::u16string units_;
  std::size_t length_ = 0;
};

} // namespace nls2::tool
