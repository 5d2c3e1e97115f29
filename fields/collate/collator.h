// An open collator: ICU's collator and a converter of its own.
#pragma once

#include "pages/page.h"

#include <algorithm>
#include <string>
#include <unicode/ucol.h>

struct NLS2F_Collator {
  // Calls `write`, which returns the length of its output, with more room until that fits.
  template <class Write>
  static UErrorCode fill(std::u16string &text, std::size_t length, Write write) {
    for (;;) {
      UErrorCode error = U_ZERO_ERROR;
      text.resize(std::max<std::size_t>(length, 1));
      length =
          static_cast<std::size_t>(write(text.data(), static_cast<int32_t>(text.size()), error));
      if (error != U_BUFFER_OVERFLOW_ERROR) {
        text.resize(U_FAILURE(error) ? 0 : length);
        return error;
      }
    }
  }

  // The bytes of a text in UTF-16.
  UErrorCode decode(const void *bytes, int64_t length, std::u16string &text);

  std::string locale;
  uint32_t options = 0;
  icu::LocalUConverterPointer converter;
  icu::LocalUCollatorPointer collator;
  std::u16string text1, text2, lower1, lower2;
};
