// Sort keys in the order of a language, for sort and compare.
#pragma once

#include "locale/locale_option.h"
#include "text/decoder.h"
#include "text/record_reader.h"

#include <new>
#include <unicode/ucol.h>

namespace nls2::tool {

struct OrderOptions {
  LocaleOptions locale;
  bool ignoreTrailing = false;
};

// The common options, followed by the command's own.
inline std::vector<Option> orderOptions(OrderOptions &options, std::vector<Option> own = {}) {
  own.insert(own.begin(),
             flag("ignore-trailing", "ignore trailing blanks", into(options.ignoreTrailing)));
  return localeOptions(options.locale, std::move(own));
}

// Makes sort keys. Keys compare as the library's comparison orders the texts; for the locale C, by
// code point. For one thread at a time.
class TextOrder {
public:
  // Throws usageError.
  explicit TextOrder(const OrderOptions &options)
      : decoder_(options.locale.codepage), ignoreTrailing_(options.ignoreTrailing) {
    const std::string locale = orderLocale(options.locale);
    if (locale == byCodePoint) {
      return;
    }
    UErrorCode error = U_ZERO_ERROR;
    collator_.adoptInstead(ucol_open(locale.c_str(), &error));
    if (U_FAILURE(error)) {
      throw failure("cannot open the collation of {}: {}", locale, statusText(error));
    }
    ucol_setStrength(collator_.getAlias(), UCOL_TERTIARY);
  }

  // Valid until the next call. Throws TextFault. The library's comparison turns trailing blanks
  // into nulls, which the collator ignores; removing them is equivalent.
  std::string_view keyOf(std::string_view bytes) {
    std::u16string_view text = decoder_.decode(bytes);
    if (ignoreTrailing_) {
      text = withoutBlanks(withoutNulls(text));
    }
    if (collator_.isNull()) {
      return codePointKey(text);
    }
    const int32_t length = ucol_getSortKey(
        collator_.getAlias(), text.data(), static_cast<int32_t>(text.size()),
        reinterpret_cast<uint8_t *>(key_.data()), static_cast<int32_t>(key_.size()));
    if (length <= 0) { // even an empty text has a key of one byte, the terminator
      throw std::bad_alloc();
    }
    if (static_cast<std::size_t>(length) > key_.size()) {
      key_.resize(static_cast<std::size_t>(length));
      return keyOf(bytes);
    }
    return {key_.data(), static_cast<std::size_t>(length)};
  }

  std::string lineFeed() const { return lineFeedOf(decoder_.page(), true); }

private:
  std::string_view codePointKey(std::u16string_view text) {
    key_.clear();
    for (std::size_t i = 0; i < text.size();) {
      UChar32 character = 0;
      U16_NEXT(text.data(), i, text.size(), character);
      for (const int shift : {16, 8, 0}) {
        key_ += static_cast<char>(character >> shift);
      }
    }
    return key_;
  }

  Decoder decoder_;
  const bool ignoreTrailing_;
  icu::LocalUCollatorPointer collator_; // null: order by code point
  std::string key_ = std::string(256, '\0');
};

} // namespace nls2::tool
