// What converters do with bytes and characters that do not convert: stop, or replace and count.
#pragma once

#include "nls2_fields.h"

#include <algorithm>
#include <unicode/ucnv.h>

namespace zelfields {

// What was replaced. Bytes that are not valid become U+FFFD, or U+001A in some pages, which the
// destination may lack in its turn: such a pair counts once.
struct Replacements {
  struct Count {
    int64_t invalid = 0; // sequences that became this character
    int64_t lacking = 0; // times that the destination lacked it

    int64_t once() const { return std::max(invalid, lacking); }
  };
  Count fffd;
  Count sub;
  int64_t others = 0;

  int64_t total() const { return fffd.once() + sub.once() + others; }
};

// Puts ICU's replacement in the place of bytes that are not valid, for callbacks. The result is that
// character: U+FFFD, or U+001A for a single byte in some pages.
char16_t replaceBytes(UConverterToUnicodeArgs *arguments, UErrorCode *error);

// Sets the callbacks of a policy. Those that replace count in `replaced`, which must outlive the
// converters. ICU's own drop characters that are ignorable by default (U+00AD, U+200B ...) without a
// word if the page lacks them; these report them like any other.
void setCallbacks(UConverter *from, UConverter *to, int32_t onBad, Replacements *replaced,
                  UErrorCode &error);

} // namespace zelfields
