// Text of a code page as UTF-16: conversion in two passes, and the walk over trailing characters.
#pragma once

#include "trace/memory.h"

#include <algorithm>
#include <cstdint>
#include <unicode/ucnv.h>
#include <unicode/utf16.h>

namespace nls2::codepage {

struct Utf16Text {
  trace::Block<UChar> units;
  int32_t length = 0; // in units, without the terminator

  // The units before the first null. There may be no null: if a UTF-32 text ends within its
  // signature, ICU writes a unit more than it measured, and no terminator.
  int32_t lengthToNull() const {
    const UChar *begin = units.get();
    return static_cast<int32_t>(std::find(begin, begin + length + 1, u'\0') - begin);
  }

  // The block that `length` calls for: the units and a terminator.
  uint64_t size() const { return (static_cast<uint64_t>(length) + 1) * sizeof(UChar); }
};

// The first pass: sets the length. An overflow is expected here and is not a failure.
inline UErrorCode measure(Utf16Text &text, UConverter *converter, const char *source,
                          int32_t sourceLength) {
  UErrorCode error = U_ZERO_ERROR;
  text.length = ucnv_toUChars(converter, nullptr, 0, source, sourceLength, &error);
  return error == U_BUFFER_OVERFLOW_ERROR ? U_ZERO_ERROR : error;
}

// Call between the passes. False when out of memory. The block is not cleared.
inline bool allocate(Utf16Text &text, trace::Trace trace, uint32_t line = __builtin_LINE()) {
  text.units = trace::allocate<UChar>(trace, text.size(), line);
  return text.units != nullptr;
}

// The second pass: fills the block, and terminates it.
inline UErrorCode convert(const Utf16Text &text, UConverter *converter, const char *source,
                          int32_t sourceLength) {
  UErrorCode error = U_ZERO_ERROR;
  ucnv_toUChars(converter, text.units.get(), text.length + 1, source, sourceLength, &error);
  return error;
}

// Walks back from `end` while `isTrailing` holds for the code point there, and clears the first
// unit of each: in a surrogate pair, the lead.
template <class IsTrailing>
void clearTrailing(UChar *units, int32_t end, IsTrailing isTrailing) {
  while (end > 0) {
    UChar32 character = 0;
    U16_PREV(units, 0, end, character);
    if (!isTrailing(character)) {
      return;
    }
    units[end] = 0;
  }
}

} // namespace nls2::codepage
