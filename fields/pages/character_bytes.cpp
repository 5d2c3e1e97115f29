// The bytes of single characters in a page.
#include "pages/character_bytes.h"

#include <new>
#include <unicode/unistr.h>

namespace zelfields {

// The second of two equal characters has no signature, and what is left is the first one's.
std::string bytesOf(const NLS2F_Page &page, char16_t character) {
  UErrorCode error = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter = cloneOf(page.converter.getAlias(), error);
  if (U_FAILURE(error)) {
    throw std::bad_alloc();
  }
  const auto encode = [&](const icu::UnicodeString &text) {
    char bytes[64];
    UErrorCode status = U_ZERO_ERROR;
    const int32_t length = text.extract(bytes, sizeof bytes, converter.getAlias(), status);
    return std::string(bytes, U_FAILURE(status) ? 0 : static_cast<std::size_t>(length));
  };
  const icu::UnicodeString text(character);
  const std::string one = encode(text);
  const std::string two = encode(text + text);
  const icu::UnicodeString back(one.data(), static_cast<int32_t>(one.size()), converter.getAlias(),
                                error);
  if (error == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc();
  }
  return U_FAILURE(error) || back != text || two.size() < one.size() ? "" : two.substr(one.size());
}

} // namespace zelfields
