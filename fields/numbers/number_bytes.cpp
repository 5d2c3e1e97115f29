// Packed, zoned and binary numbers, read from the bytes of a field and written there.
#include "numbers/number.h"

#include <algorithm>
#include <bit>
#include <charconv>
#include <cstring>

namespace zelfields {
namespace {

constexpr uint32_t signOptions = NLS2F_SIGN_LEADING | NLS2F_SIGN_SEPARATE;
constexpr uint8_t ebcdicZone = 0xF0;

bool has(const NLS2F_Field &field, uint32_t option) { return (field.options & option) != 0; }

NumberFault faultAt(int32_t kind, const uint8_t *bytes, int64_t offset) {
  const auto *chars = reinterpret_cast<const char *>(bytes);
  return {kind, offset, {chars + offset, 1}};
}

// Where the digits of a zoned number are, and the byte with its sign.
struct ZonedPlaces {
  explicit ZonedPlaces(const NLS2F_Field &field)
      : isSeparate(has(field, NLS2F_SIGN_SEPARATE)),
        sign(has(field, NLS2F_SIGN_LEADING) ? 0 : field.length - 1),
        first(isSeparate && has(field, NLS2F_SIGN_LEADING) ? 1 : 0),
        end(isSeparate && first == 0 ? field.length - 1 : field.length) {}

  bool isSeparate;
  int64_t sign;
  int64_t first;
  int64_t end;
};

enum class Sign { none, positive, negative };

// Of the four bits 0 to F, as packed and EBCDIC numbers have them.
Sign signOf(uint32_t bits) {
  return bits == 0xD || bits == 0xB ? Sign::negative : bits > 9 ? Sign::positive : Sign::none;
}

Sign zonedSign(const NLS2F_Field &field, uint8_t byte) {
  if (field.zero == ebcdicZone) {
    return signOf(byte >> 4);
  }
  const int zone = byte >> 4;
  return zone == 3 ? Sign::positive : zone == 7 ? Sign::negative : Sign::none;
}

NumberFault applySign(const NLS2F_Field &field, Sign sign, const uint8_t *bytes, int64_t offset,
                      Number &number) {
  if (sign == Sign::none) {
    return faultAt(NLS2F_INVALID_NUMBER, bytes, offset);
  }
  if (sign == Sign::negative && has(field, NLS2F_UNSIGNED)) {
    return faultAt(NLS2F_NEGATIVE, bytes, offset);
  }
  number.isNegative = sign == Sign::negative && !number.isZero();
  return {};
}

NumberFault decodePacked(const NLS2F_Field &field, const uint8_t *bytes, Number &number) {
  const int64_t last = field.length - 1;
  for (int64_t i = 0; i <= last; ++i) {
    const uint32_t upper = bytes[i] >> 4;
    const uint32_t lower = bytes[i] & 0x0F;
    if (upper > 9 || (lower > 9 && i != last)) {
      return faultAt(NLS2F_INVALID_NUMBER, bytes, i);
    }
    number.push(upper);
    if (i != last) {
      number.push(lower);
    }
  }
  return applySign(field, signOf(bytes[last] & 0x0F), bytes, last, number);
}

NumberFault decodeZoned(const NLS2F_Field &field, const uint8_t *bytes, Number &number) {
  const ZonedPlaces places(field);
  for (int64_t i = places.first; i < places.end; ++i) {
    const bool hasSign = i == places.sign && !places.isSeparate;
    if ((bytes[i] & 0x0F) > 9 || (!hasSign && (bytes[i] & 0xF0) != field.zero)) {
      return faultAt(NLS2F_INVALID_NUMBER, bytes, i);
    }
    number.push(bytes[i] & 0x0F);
  }
  const uint8_t byte = bytes[places.sign];
  const Sign separate = byte == field.minus  ? Sign::negative
                        : byte == field.plus ? Sign::positive
                                             : Sign::none;
  return applySign(field, places.isSeparate ? separate : zonedSign(field, byte), bytes, places.sign,
                   number);
}

void decodeBinary(const NLS2F_Field &field, const uint8_t *bytes, Number &number) {
  uint64_t value = 0;
  for (int64_t i = 0; i < field.length; ++i) {
    value = value << 8 | bytes[i];
  }
  number.isNegative = !has(field, NLS2F_UNSIGNED) && bytes[0] >= 0x80;
  if (number.isNegative) {
    const auto bits = static_cast<unsigned>(8 * field.length);
    value = bits == 64 ? 0 - value : (uint64_t{1} << bits) - value;
  }
  char *const begin = number.digits.data();
  number.count =
      static_cast<int32_t>(std::to_chars(begin, begin + number.digits.size(), value).ptr - begin);
}

// Nulls are a binary 0.
bool isBlank(const NLS2F_Field &field, const uint8_t *bytes) {
  const uint8_t first = bytes[0];
  return has(field, NLS2F_BLANK_EMPTY) &&
         (first == field.blank || (first == 0 && field.kind != NLS2F_BINARY)) &&
         std::all_of(bytes, bytes + field.length, [&](uint8_t byte) { return byte == first; });
}

int64_t capacityOf(const NLS2F_Field &field) {
  return field.kind == NLS2F_PACKED ? 2 * field.length - 1
                                    : field.length - (has(field, NLS2F_SIGN_SEPARATE) ? 1 : 0);
}

// The digit at a place of `capacity`, counted from the first, with zeros before the number.
uint8_t digitAt(const Number &number, int64_t capacity, int64_t place) {
  const int64_t i = place - (capacity - number.count);
  return i < 0 ? 0 : static_cast<uint8_t>(number.digits[static_cast<std::size_t>(i)] - '0');
}

void encodePacked(const NLS2F_Field &field, const Number &number, uint8_t *bytes) {
  const int64_t capacity = capacityOf(field);
  const uint8_t sign = has(field, NLS2F_UNSIGNED) ? 0xF : number.isNegative ? 0xD : 0xC;
  for (int64_t i = 0; i < field.length; ++i) {
    const uint8_t lower = i == field.length - 1 ? sign : digitAt(number, capacity, 2 * i + 1);
    bytes[i] = static_cast<uint8_t>(digitAt(number, capacity, 2 * i) << 4 | lower);
  }
}

void encodeZoned(const NLS2F_Field &field, const Number &number, uint8_t *bytes) {
  const ZonedPlaces places(field);
  const int64_t capacity = capacityOf(field);
  for (int64_t i = places.first; i < places.end; ++i) {
    bytes[i] = static_cast<uint8_t>(field.zero | digitAt(number, capacity, i - places.first));
  }
  uint8_t &sign = bytes[places.sign];
  if (places.isSeparate) {
    sign = number.isNegative ? field.minus : field.plus;
  } else if (!has(field, NLS2F_UNSIGNED)) {
    const bool isEbcdic = field.zero == ebcdicZone;
    const int zone = isEbcdic ? (number.isNegative ? 0xD0 : 0xC0) : number.isNegative ? 0x70 : 0x30;
    sign = static_cast<uint8_t>(zone | (sign & 0x0F));
  }
}

bool encodeBinary(const NLS2F_Field &field, const Number &number, uint8_t *bytes) {
  uint64_t value = 0;
  const auto bits = static_cast<unsigned>(8 * field.length);
  const uint64_t most = ~uint64_t{0} >> (64 - bits);
  const uint64_t limit = has(field, NLS2F_UNSIGNED) ? most : most / 2 + (number.isNegative ? 1 : 0);
  if (!toUnsigned(number, value) || value > limit) {
    return false;
  }
  value = number.isNegative ? 0 - value : value;
  for (int64_t i = field.length; i > 0; --i, value >>= 8) {
    bytes[i - 1] = static_cast<uint8_t>(value);
  }
  return true;
}

} // namespace

bool Number::isZero() const {
  return std::all_of(digits.begin(), digits.begin() + count, [](char c) { return c == '0'; });
}

bool isNumberField(const NLS2F_Field &field) {
  constexpr uint32_t all = NLS2F_UNSIGNED | NLS2F_BLANK_EMPTY | signOptions;
  const uint32_t sign = field.options & signOptions;
  if (field.scale < 0 || field.scale > Number::mostDigits || (field.options & ~all) != 0 ||
      (sign != 0 && (field.kind != NLS2F_ZONED || has(field, NLS2F_UNSIGNED)))) {
    return false;
  }
  switch (field.kind) {
  case NLS2F_PACKED:
    return field.length >= 1 && field.length <= 16;
  case NLS2F_ZONED:
    return field.length <= 32 && capacityOf(field) >= 1 && capacityOf(field) <= 31 &&
           (field.zero == ebcdicZone || field.zero == '0');
  case NLS2F_BINARY:
    return field.length >= 1 && field.length <= 8 &&
           std::has_single_bit(static_cast<uint64_t>(field.length));
  default:
    return false;
  }
}

NumberFault decodeNumber(const NLS2F_Field &field, const uint8_t *bytes, Number &number) {
  number.count = 0;
  number.isNegative = false;
  if (isBlank(field, bytes)) {
    return {};
  }
  switch (field.kind) {
  case NLS2F_PACKED:
    return decodePacked(field, bytes, number);
  case NLS2F_ZONED:
    return decodeZoned(field, bytes, number);
  default:
    decodeBinary(field, bytes, number);
    return {};
  }
}

NumberFault encodeNumber(const NLS2F_Field &field, Number &number, uint8_t *bytes) {
  if (number.count == 0) {
    std::memset(bytes, field.blank, static_cast<std::size_t>(field.length));
    return {};
  }
  if (number.isNegative && has(field, NLS2F_UNSIGNED)) {
    return {NLS2F_NEGATIVE};
  }
  if (field.kind == NLS2F_BINARY) {
    if (!encodeBinary(field, number, bytes)) {
      return {NLS2F_TOO_LARGE};
    }
    return {isBlank(field, bytes) ? NLS2F_INVALID_NUMBER : 0}; // it would come back empty
  }
  if (number.count > capacityOf(field)) {
    return {NLS2F_TOO_LARGE};
  }
  field.kind == NLS2F_PACKED ? encodePacked(field, number, bytes)
                             : encodeZoned(field, number, bytes);
  return {};
}

} // namespace zelfields
