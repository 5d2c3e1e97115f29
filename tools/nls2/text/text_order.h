// Sort keys in the order of a language, for sort and compare.
#pragma once

#include "locale/locale_option.h"

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

// Throws Error.
inline Collator openCollator(const std::string &locale, const CodePage &page, uint32_t options) {
  NLS2F_Collator *collator = nullptr;
  const int32_t status = NLS2F_OpenCollator(locale.c_str(), page.get(), options, &collator);
  if (status > 0) {
    isDone(status);
  }
  return Collator(collator);
}

// Texts of a page that must be valid, and their form in UTF-8.
class ValidText {
public:
  explicit ValidText(const CodePage &page, int32_t padding = NLS2F_AS_IS)
      : translator_(openTranslator(page, CodePage::utf8(), padding)) {}

  // Valid until the next call. Throws TextFault.
  std::string_view utf8(std::string_view text) {
    auto problem = sized<NLS2F_Problem>();
    if (!translateText(translator_.get(), text, utf8_, problem)) {
      throw TextFault(
          fmt::format(", column {}: {}", problem.offset + 1, wordsOf(problem, translator_.get())));
    }
    return utf8_;
  }

private:
  Translator translator_;
  std::string utf8_;
};

// Makes sort keys. Keys compare as the library's comparison orders the texts; for the locale C, by
// code point. For one thread at a time.
class TextOrder {
public:
  // Throws usageError.
  TextOrder(const OrderOptions &options, const CodePage &page)
      : text_(page, options.ignoreTrailing ? NLS2F_STRIP : NLS2F_AS_IS) {
    const std::string locale = orderLocale(options.locale);
    if (locale != byCodePoint) {
      collator_ = openCollator(locale, page, options.ignoreTrailing ? SORT_IGNORETRAILING : 0);
    }
  }

  // Valid until the next call. Throws TextFault. UTF-8 has the order of code points.
  std::string_view keyOf(std::string_view bytes) {
    const std::string_view text = text_.utf8(bytes);
    int64_t length = 0;
    while (collator_) {
      const int32_t status = NLS2F_SortKey(collator_.get(), bytes.data(), sizeOf(bytes),
                                           key_.data(), sizeOf(key_), &length);
      if (status != U_BUFFER_OVERFLOW_ERROR) {
        isDone(status);
        return std::string_view(key_).substr(0, static_cast<std::size_t>(length));
      }
      key_.resize(static_cast<std::size_t>(length));
    }
    return text;
  }

private:
  ValidText text_;
  Collator collator_; // null: order by code point
  std::string key_ = std::string(256, '\0');
};

} // namespace nls2::tool
