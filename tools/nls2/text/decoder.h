// Decodes texts of a code page to UTF-16.
#pragma once

#include "base/errors.h"
#include "base/printable.h"
#include "codepage/code_page.h"

#include <algorithm>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <unicode/uchar.h>
#include <unicode/unistr.h>
#include <unicode/ustring.h>
#include <unicode/utf16.h>
#include <vector>

namespace nls2::tool {

// Whether all bytes are below 0x80. Without an early exit, so that the compiler can vectorize it.
inline bool isAscii(std::string_view bytes) {
  unsigned char all = 0;
  for (const char byte : bytes) {
    all |= static_cast<unsigned char>(byte);
  }
  return all < 0x80;
}

// The text without trailing nulls. Throws TextFault if text follows a null.
inline std::u16string_view withoutNulls(std::u16string_view text) {
  if (std::count(text.begin(), text.end(), u'\0') == 0) { // faster than find()
    return text;
  }
  const std::size_t null = text.find(u'\0');
  if (text.find_first_not_of(u'\0', null) != text.npos) {
    throw TextFault(": text after a null (U+0000) would be ignored");
  }
  return text.substr(0, null);
}

// The text without trailing tabs and space characters.
inline std::u16string_view withoutBlanks(std::u16string_view text) {
  for (std::size_t end = text.size(); end > 0; text = text.substr(0, end)) {
    UChar32 character = 0;
    U16_PREV(text.data(), 0, end, character);
    if (!u_isblank(character)) {
      break;
    }
  }
  return text;
}

// Keeps one converter open. For one thread at a time.
class Decoder {
public:
  // The page of --codepage. Throws usageError if it does not open.
  explicit Decoder(int32_t page)
      : page_(page, "--codepage"), isUtf8_(ucnv_getType(page_.converter()) == UCNV_UTF8) {
    UErrorCode error = U_ZERO_ERROR;
    ucnv_setToUCallBack(page_.converter(), UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr,
                        &error);
  }

  // Decodes up to 1 GiB; the result is valid until the next call. Throws TextFault for invalid
  // bytes. UTF-8 bypasses the converter, which takes longer to start than a short line takes to
  // decode.
  std::u16string_view decode(std::string_view bytes) {
    units_.resize(std::max(units_.size(), bytes.size() + 1));
    if (isUtf8_ && isAscii(bytes)) {
      std::copy(bytes.begin(), bytes.end(), units_.begin());
      return {units_.data(), bytes.size()};
    }
    if (isUtf8_) {
      UErrorCode error = U_ZERO_ERROR;
      int32_t length = 0;
      u_strFromUTF8(units_.data(), static_cast<int32_t>(units_.size()), &length, bytes.data(),
                    static_cast<int32_t>(bytes.size()), &error);
      if (U_SUCCESS(error)) {
        return {units_.data(), static_cast<std::size_t>(length)};
      }
    }
    return convert(bytes);
  }

  bool isUtf8() const { return isUtf8_; }
  const CodePage &page() const { return page_; }

private:
  std::u16string_view convert(std::string_view bytes) {
    const char *source = bytes.data();
    std::size_t length = 0;
    ucnv_resetToUnicode(page_.converter());
    for (;; units_.resize(2 * units_.size())) {
      UErrorCode error = U_ZERO_ERROR;
      UChar *target = units_.data() + length;
      ucnv_toUnicode(page_.converter(), &target, units_.data() + units_.size(), &source,
                     bytes.data() + bytes.size(), nullptr, true, &error);
      length = static_cast<std::size_t>(target - units_.data());
      if (U_SUCCESS(error)) {
        return {units_.data(), length};
      }
      if (error != U_BUFFER_OVERFLOW_ERROR) {
        throw invalidBytes(static_cast<std::size_t>(source - bytes.data()));
      }
    }
  }

  // The last of the `consumed` bytes are the invalid ones.
  TextFault invalidBytes(std::size_t consumed) const {
    char bytes[32];
    int8_t count = sizeof bytes;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_getInvalidChars(page_.converter(), bytes, &count, &error);
    const auto length = std::min(static_cast<std::size_t>(U_FAILURE(error) ? 0 : count), consumed);
    return TextFault(fmt::format(", column {}: {}", consumed - length + 1,
                                 notValidText({bytes, length}, page_.number())));
  }

  const CodePage page_;
  const bool isUtf8_;
  std::u16string units_;
};

} // namespace nls2::tool
