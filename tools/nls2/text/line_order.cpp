// The order of texts by the rules of a language, as sort keys.

#include "text/line_order.h"

#include "errors.h"

#include <new>

namespace nls2::tool {

namespace {

constexpr std::size_t usualKeyLength = 256;

UCollator *openCollator(const std::string &locale) {
  UErrorCode error = U_ZERO_ERROR;
  icu::LocalUCollatorPointer collator(ucol_open(locale.c_str(), &error));
  if (error == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc();
  }
  if (U_FAILURE(error)) {
    throw failure("cannot open the order of {}: {}", locale, statusText(error));
  }
  ucol_setStrength(collator.getAlias(), UCOL_TERTIARY);
  return collator.orphan();
}

} // namespace

LineOrder::LineOrder(const LocaleOptions &locale, bool ignoreTrailing)
    : decoder_(locale.codepage, "--codepage"), ignoreTrailing_(ignoreTrailing),
      collator_(openCollator(orderLocale(locale))), key_(usualKeyLength, '\0') {}

// The library's comparison makes nulls of trailing blanks. The collator ignores nulls, so that
// cutting them off is the same.
std::optional<TextFault> LineOrder::makeKey(std::string_view bytes) {
  std::optional<TextFault> fault = decoder_.decode(bytes);
  if (!fault && ignoreTrailing_) {
    fault = decoder_.cutNulls();
    decoder_.cutBlanks();
  }
  if (fault) {
    return fault;
  }
  const std::u16string_view text = decoder_.text();
  for (;;) {
    const int32_t length = ucol_getSortKey(
        collator_.getAlias(), text.data(), static_cast<int32_t>(text.size()),
        reinterpret_cast<uint8_t *>(key_.data()), static_cast<int32_t>(key_.size()));
    if (length <= 0) { // also the key of an empty text has a byte, its terminator
      throw std::bad_alloc();
    }
    length_ = static_cast<std::size_t>(length);
    if (length_ <= key_.size()) {
      return {};
    }
    key_.resize(length_);
  }
}

} // namespace nls2::tool
