// The order of texts by the rules of a language, as sort keys.
#pragma once

#include "locale/locale_option.h"
#include "text/decoder.h"

#include <new>
#include <string>
#include <string_view>
#include <unicode/localpointer.h>
#include <unicode/ucol.h>
#include <vector>

namespace nls2::tool {

struct OrderOptions {
  LocaleOptions locale;
  bool ignoreTrailing = false;
};

// Gives every text a key; the keys' bytes compare as the library's comparison orders the texts. For
// one thread at a time.
class LineOrder {
public:
  // Throws usageError.
  explicit LineOrder(const OrderOptions &options)
      : decoder_(options.locale.codepage, "--codepage"), ignoreTrailing_(options.ignoreTrailing) {
    const std::string locale = orderLocale(options.locale);
    UErrorCode error = U_ZERO_ERROR;
    collator_.adoptInstead(ucol_open(locale.c_str(), &error));
    if (error == U_MEMORY_ALLOCATION_ERROR) {
      throw std::bad_alloc();
    }
    if (U_FAILURE(error)) {
      throw failure("cannot open the order of {}: {}", locale, statusText(error));
    }
    ucol_setStrength(collator_.getAlias(), UCOL_TERTIARY);
  }

  // Valid until the next call. Throws TextFault. The library's comparison makes nulls of trailing
  // blanks; the collator ignores nulls, so that cutting them off is the same.
  std::string_view keyOf(std::string_view bytes) {
    std::u16string_view text = decoder_.decode(bytes);
    if (ignoreTrailing_) {
      text = withoutBlanks(withoutNulls(text));
    }
    for (;;) {
      const int32_t length = ucol_getSortKey(
          collator_.getAlias(), text.data(), static_cast<int32_t>(text.size()),
          reinterpret_cast<uint8_t *>(key_.data()), static_cast<int32_t>(key_.size()));
      if (length <= 0) { // also the key of an empty text has a byte, its terminator
        throw std::bad_alloc();
      }
      const auto needed = static_cast<std::size_t>(length);
      if (needed <= key_.size()) {
        return {key_.data(), needed};
      }
      key_.resize(needed);
    }
  }

private:
  Decoder decoder_;
  const bool ignoreTrailing_;
  icu::LocalUCollatorPointer collator_;
  std::string key_ = std::string(256, '\0');
};

} // namespace nls2::tool
