// A number on its way between the bytes of a field, text and a 64-bit integer.
#pragma once

#include "nls2_fields.h"

#include <array>
#include <string_view>

namespace zelfields {

struct Number {
  static constexpr int32_t mostDigits = 31;
  static constexpr int32_t longestText = mostDigits + 3; // "-0." and the decimals

  std::array<char, mostDigits> digits; // '0' to '9', the first `count`; zeros may come first
  int32_t count = 0;                   // none: the field is empty
  bool isNegative = false;             // not of 0

  void push(uint32_t digit) { digits[static_cast<std::size_t>(count++)] = "0123456789"[digit]; }
  bool isZero() const;
};

// What is wrong with a number: kind 0 is nothing.
struct NumberFault {
  int32_t kind = 0;
  int64_t offset = 0;
  std::string_view bytes = {}; // that are to blame
};

// Whether a field is a number, with a length, a scale and options that its kind can have.
bool isNumberField(const NLS2F_Field &field);

// Of field.length bytes.
NumberFault decodeNumber(const NLS2F_Field &field, const uint8_t *bytes, Number &number);
NumberFault encodeNumber(const NLS2F_Field &field, Number &number, uint8_t *bytes);

// The length of the text, at most Number::longestText; 0 of an empty field.
int32_t formatNumber(const Number &number, int32_t scale, char *text);
NumberFault parseNumber(const NLS2F_Field &field, std::string_view text, Number &number);

// False if it is out of range.
bool toUnsigned(const Number &number, uint64_t &value);
bool toInteger(const Number &number, int64_t &value);

} // namespace zelfields
