// NLS2F_NumberToText and NLS2F_TextToNumber: numbers as "-123.45".
#include "facts.h"
#include "numbers/number.h"

#include <algorithm>
#include <cstring>

namespace zelfields {
namespace {

bool isDigit(char c) { return c >= '0' && c <= '9'; }

// The text in its parts, without blanks around it.
struct Parts {
  bool isNegative = false;
  std::string_view integer = {};
  std::string_view decimals = {};
};

// Cuts the digits off the beginning of a text.
std::string_view takeDigits(std::string_view &text) {
  const auto end = std::find_if_not(text.begin(), text.end(), isDigit);
  const std::string_view digits = text.substr(0, static_cast<std::size_t>(end - text.begin()));
  text.remove_prefix(digits.size());
  return digits;
}

// False with `text` at what is wrong; nothing is left of it if more is missing.
bool split(std::string_view &text, Parts &parts) {
  if (!text.empty() && (text[0] == '-' || text[0] == '+')) {
    parts.isNegative = text[0] == '-';
    text.remove_prefix(1);
  }
  parts.integer = takeDigits(text);
  if (parts.integer.empty()) {
    return false;
  }
  if (!text.empty() && text[0] == '.') {
    text.remove_prefix(1);
    parts.decimals = takeDigits(text);
    return !parts.decimals.empty() && text.empty();
  }
  return text.empty();
}

// The first character, with what follows it in UTF-8.
std::string_view firstCharacter(std::string_view text) {
  std::size_t length = text.empty() ? 0 : 1;
  while (length != 0 && length < std::min<std::size_t>(text.size(), 4) &&
         (text[length] & 0xC0) == 0x80) {
    ++length;
  }
  return text.substr(0, length);
}

// Zeros at the beginning do not count. False if there are too many digits.
bool collect(const Parts &parts, int32_t scale, Number &number) {
  const std::size_t size = parts.integer.size() + static_cast<std::size_t>(scale);
  for (std::size_t i = 0; i < size; ++i) {
    const std::size_t place = i - parts.integer.size();
    const char digit = i < parts.integer.size()        ? parts.integer[i]
                       : place < parts.decimals.size() ? parts.decimals[place]
                                                       : '0';
    if (number.count == Number::mostDigits) {
      return false;
    }
    if (number.count != 0 || digit != '0') {
      number.push(static_cast<uint32_t>(digit - '0'));
    }
  }
  if (number.count == 0) {
    number.push(0);
  }
  number.isNegative = parts.isNegative && !number.isZero();
  return true;
}

int32_t report(const NumberFault &fault, NLS2F_Problem *problem) {
  return setProblem(problem, {.kind = fault.kind, .offset = fault.offset, .bytes = fault.bytes});
}

} // namespace

bool toUnsigned(const Number &number, uint64_t &value) {
  value = 0;
  for (int32_t i = 0; i < number.count; ++i) {
    const auto digit = static_cast<uint64_t>(number.digits[static_cast<std::size_t>(i)] - '0');
    if (value > (UINT64_MAX - digit) / 10) {
      return false;
    }
    value = 10 * value + digit;
  }
  return true;
}

bool toInteger(const Number &number, int64_t &value) {
  uint64_t size = 0;
  const bool fits = toUnsigned(number, size);
  const uint64_t limit = uint64_t{INT64_MAX} + (number.isNegative ? 1 : 0);
  value = static_cast<int64_t>(number.isNegative ? 0 - size : size);
  return fits && size <= limit;
}

int32_t formatNumber(const Number &number, int32_t scale, char *text) {
  if (number.count == 0) {
    return 0;
  }
  char *to = text;
  if (number.isNegative) {
    *to++ = '-';
  }
  int32_t i = 0;
  while (i < number.count - scale - 1 && number.digits[static_cast<std::size_t>(i)] == '0') {
    ++i;
  }
  const int32_t missing = std::max(0, scale + 1 - number.count); // zeros before the digits
  const int32_t integers = missing > 0 ? 0 : number.count - scale - i;
  const char *from = number.digits.data() + i;
  to = missing > 0 ? std::fill_n(to, 1, '0') : std::copy_n(from, integers, to);
  if (scale > 0) {
    *to++ = '.';
    to = std::fill_n(to, std::max(0, missing - 1), '0');
    to = std::copy(from + integers, static_cast<const char *>(number.digits.data()) + number.count,
                   to);
  }
  return static_cast<int32_t>(to - text);
}

NumberFault parseNumber(const NLS2F_Field &field, std::string_view text, Number &number) {
  constexpr std::string_view blanks = " \t";
  const char *const begin = text.data();
  number.count = 0;
  number.isNegative = false;
  text = text.substr(std::min(text.find_first_not_of(blanks), text.size()));
  text = text.substr(0, text.find_last_not_of(blanks) + 1);
  if (text.empty() && (field.options & NLS2F_BLANK_EMPTY) != 0) {
    return {};
  }
  const auto offsetOf = [&](std::string_view part) { return part.data() - begin; };
  std::string_view rest = text;
  Parts parts;
  if (!split(rest, parts)) {
    return {NLS2F_INVALID_NUMBER, offsetOf(rest), firstCharacter(rest)};
  }
  if (parts.decimals.size() > static_cast<std::size_t>(field.scale)) {
    const auto surplus = parts.decimals.substr(static_cast<std::size_t>(field.scale));
    return {NLS2F_TOO_PRECISE, offsetOf(surplus), surplus.substr(0, 1)};
  }
  if (!collect(parts, field.scale, number)) {
    return {NLS2F_TOO_LARGE, offsetOf(text)};
  }
  return {0, offsetOf(text)};
}

} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_NumberToText(const NLS2F_Field *field, const void *bytes, char *text, int64_t room,
                           int64_t *written, NLS2F_Problem *problem) {
  if (!cleared(written) || !isWhole(field) || bytes == nullptr || !isRange(text, room) ||
      !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  if (!isNumberField(*field)) {
    return NLS2_ERR_INVALID_OPTION;
  }
  Number number;
  if (const auto fault = decodeNumber(*field, static_cast<const uint8_t *>(bytes), number);
      fault.kind != 0) {
    return report(fault, problem);
  }
  char whole[Number::longestText];
  const int32_t length = formatNumber(number, field->scale, whole);
  if (length > room) {
    return setProblem(problem, {.kind = NLS2F_NO_ROOM, .needed = length});
  }
  *written = length;
  std::copy_n(whole, length, text);
  return 0;
}

int32_t NLS2F_TextToNumber(const NLS2F_Field *field, const char *text, int64_t length, void *bytes,
                           NLS2F_Problem *problem) {
  if (!isWhole(field) || !isRange(text, length) || bytes == nullptr || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  if (!isNumberField(*field)) {
    return NLS2_ERR_INVALID_OPTION;
  }
  Number number;
  NumberFault fault = parseNumber(*field, viewOf(text, length), number);
  if (fault.kind == 0) {
    const int64_t begin = fault.offset;
    fault = encodeNumber(*field, number, static_cast<uint8_t *>(bytes));
    fault.offset = begin;
  }
  return fault.kind == 0 ? 0 : report(fault, problem);
}
