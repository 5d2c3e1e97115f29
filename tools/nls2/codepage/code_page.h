// Code pages as the commands see them: options that name one, and a page that is opened once and
// answers how it writes characters.
#pragma once

#include "nls2/code_page.hpp"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace nls2::tool {

constexpr int32_t utf8Page = 1208;

// The number of a code page that an option gives by number or by name. Whether the number opens is
// seen when the page is. Throws usageError.
int32_t parsePage(const char *option, const std::string &text);

// The converter of a page that an option gives by number, or by any name that ICU knows, be it
// ambiguous or without a number. Throws usageError.
converter openEncoding(const char *option, const std::string &text);

// One character as it stands inside a text of a code page.
struct EncodedCharacter {
  std::string bytes;
  std::size_t signatureLength = 0; // bytes that the page puts before its first character
};

// An open code page. For one thread at a time.
class CodePage {
public:
  // Throws usageError where the number does not open; `option` is who named it.
  CodePage(int32_t number, const char *option);

  int32_t number() const { return number_; }
  UConverter *converter() const { return converter_.get(); }
  nls2::converter take() { return std::move(converter_); }
  bool isSingleByte() const; // every byte is a character by itself

  // Nothing where the page does not have the character, or only a substitute for it.
  std::optional<EncodedCharacter> encoded(char16_t character) const;

private:
  std::string encode(std::u16string_view text) const;

  int32_t number_;
  nls2::converter converter_;
};

} // namespace nls2::tool
