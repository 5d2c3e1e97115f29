// Whether a text may be handed to the library.

#include "text/text_check.h"

#include "errors.h"

#include <fmt/core.h>

namespace nls2::tool {

TextCheck::TextCheck(int32_t page, std::size_t mostBytes, Nulls nulls)
    : page_(page, "--codepage"), mostBytes_(mostBytes), nulls_(nulls) {
  UErrorCode error = U_ZERO_ERROR;
  ucnv_setToUCallBack(page_.converter(), UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr,
                      &error);
}

UErrorCode TextCheck::convert(std::string_view text) {
  for (;;) {
    UErrorCode error = U_ZERO_ERROR;
    length_ = static_cast<std::size_t>(
        ucnv_toUChars(page_.converter(), buffer_.data(), static_cast<int32_t>(buffer_.size()),
                      text.data(), static_cast<int32_t>(text.size()), &error));
    if (error != U_BUFFER_OVERFLOW_ERROR) {
      return error;
    }
    buffer_.resize(length_);
  }
}

bool TextCheck::hasTextBehindNull() const {
  const std::u16string_view units = std::u16string_view(buffer_).substr(0, length_);
  const std::size_t null = units.find(u'\0');
  return null != units.npos && units.find_first_not_of(u'\0', null) != units.npos;
}

std::optional<std::string> TextCheck::refusal(std::string_view text) {
  if (text.size() > mostBytes_) {
    return fmt::format("{} bytes are too long; the most is {}", text.size(), mostBytes_);
  }
  const UErrorCode error = convert(text);
  if (U_FAILURE(error)) {
    return fmt::format("the bytes are not text of code page {}: {}", page_.number(),
                       statusText(error));
  }
  if (nulls_ == Nulls::endText && hasTextBehindNull()) {
    return "text stands behind a null (U+0000), where it would not be seen";
  }
  return {};
}

} // namespace nls2::tool
