// Opens and closes collators; NLS2F_Compare and NLS2F_SortKey.
#include "collate/collator.h"

#include "guard.h"

#include <memory>
#include <unicode/uchar.h>

namespace zelfields {
namespace {

constexpr uint32_t knownOptions = uint32_t{SORT_IGNORETRAILING} | uint32_t{IGNORECASE};

int32_t sizeOf(const std::u16string &text) { return static_cast<int32_t>(text.size()); }

// The text to be compared. Blanks at its end, or before its first null, become nulls, which the
// collator ignores; none of them is a pair of surrogates.
UErrorCode decodeToSort(NLS2F_Collator &it, const void *bytes, int64_t length,
                        std::u16string &text) {
  const UErrorCode error = it.decode(bytes, length, text);
  if ((it.options & SORT_IGNORETRAILING) != 0) {
    std::size_t end = std::min(text.find(u'\0'), text.size());
    while (end > 0 && u_isblank(text[end - 1])) {
      text[--end] = u'\0';
    }
  }
  return error;
}

} // namespace
} // namespace zelfields

using namespace zelfields;

UErrorCode NLS2F_Collator::decode(const void *bytes, int64_t length, std::u16string &text) {
  if (length >= INT32_MAX) {
    return static_cast<UErrorCode>(31); // U_INPUT_TOO_LONG_ERROR, new in ICU 68
  }
  const char *source = length != 0 ? static_cast<const char *>(bytes) : "";
  return fill(text, static_cast<std::size_t>(length) + 1, // most texts have at most a unit a byte
              [&](char16_t *units, int32_t room, UErrorCode &error) {
                return ucnv_toUChars(restart(converter), units, room, source,
                                     static_cast<int32_t>(length), &error);
              });
}

int32_t NLS2F_OpenCollator(const char *locale, const NLS2F_Page *page, uint32_t options,
                           NLS2F_Collator **collator) {
  if (collator != nullptr) {
    *collator = nullptr;
  }
  if (locale == nullptr || page == nullptr || collator == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return guarded([&]() -> int32_t {
    if ((options & ~knownOptions) != 0) {
      return NLS2_ERR_INVALID_OPTION;
    }
    auto made = std::make_unique<NLS2F_Collator>();
    made->locale = locale;
    made->options = options;
    UErrorCode error = U_ZERO_ERROR;
    made->converter = cloneOf(page->converter.getAlias(), error);
    error = U_FAILURE(error) ? error : U_ZERO_ERROR;
    made->collator.adoptInstead(ucol_open(locale, &error));
    if (U_SUCCESS(error)) {
      ucol_setStrength(made->collator.getAlias(), UCOL_TERTIARY);
      *collator = made.release();
    }
    return statusOf(error);
  });
}

void NLS2F_CloseCollator(NLS2F_Collator *collator) { delete collator; }

int32_t NLS2F_Compare(NLS2F_Collator *collator, const void *text1, int64_t length1,
                      const void *text2, int64_t length2, int32_t *order) {
  if (order == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  *order = 0;
  if (collator == nullptr || !isRange(text1, length1) || !isRange(text2, length2)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return guarded([&]() -> int32_t {
    NLS2F_Collator &it = *collator;
    UErrorCode error = decodeToSort(it, text1, length1, it.text1);
    error = U_FAILURE(error) ? error : decodeToSort(it, text2, length2, it.text2);
    if (U_FAILURE(error)) {
      return statusOf(error);
    }
    *order = ucol_strcoll(it.collator.getAlias(), it.text1.data(), sizeOf(it.text1),
                          it.text2.data(), sizeOf(it.text2));
    return 0;
  });
}

int32_t NLS2F_SortKey(NLS2F_Collator *collator, const void *text, int64_t length, void *key,
                      int64_t room, int64_t *keyLength) {
  if (keyLength == nullptr) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  *keyLength = 0;
  if (collator == nullptr || !isRange(text, length) || !isRange(key, room)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  return guarded([&]() -> int32_t {
    NLS2F_Collator &it = *collator;
    if (const UErrorCode error = decodeToSort(it, text, length, it.text1); U_FAILURE(error)) {
      return statusOf(error);
    }
    const auto most = static_cast<int32_t>(std::min<int64_t>(room, INT32_MAX));
    *keyLength = ucol_getSortKey(it.collator.getAlias(), it.text1.data(), sizeOf(it.text1),
                                 static_cast<uint8_t *>(key), most);
    return *keyLength == 0     ? int32_t{NLS2_ERR_NO_MEMORY} // the key of an empty text has a byte
           : *keyLength > most ? int32_t{U_BUFFER_OVERFLOW_ERROR}
                               : 0;
  });
}
