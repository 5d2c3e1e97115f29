// Text of a code page as UTF-16, through one converter that stays open.

#include "text/decoder.h"

#include "errors.h"

#include <algorithm>
#include <array>
#include <new>
#include <unicode/uchar.h>
#include <unicode/ustring.h>
#include <unicode/utf16.h>

namespace nls2::tool {

std::string describe(const std::string &place, const TextFault &fault) {
  return fault.offset ? fmt::format("{}, column {}: {}", place, *fault.offset + 1, fault.reason)
                      : fmt::format("{}: {}", place, fault.reason);
}

Decoder::Decoder(int32_t page, const char *option)
    : page_(page, option), isUtf8_(ucnv_getType(page_.converter()) == UCNV_UTF8) {
  UErrorCode error = U_ZERO_ERROR;
  ucnv_setToUCallBack(page_.converter(), UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr,
                      &error);
}

// Looks at every byte, which the compiler does for many at once.
bool isAscii(std::string_view bytes) {
  unsigned char all = 0;
  for (const char byte : bytes) {
    all |= static_cast<unsigned char>(byte);
  }
  return all < 0x80;
}

// Without the converter, which takes longer to start than a short line to decode. False where bytes
// are not valid.
bool Decoder::decodeUtf8(std::string_view bytes) {
  if (isAscii(bytes)) {
    std::copy(bytes.begin(), bytes.end(), units_.begin());
    length_ = bytes.size();
    return true;
  }
  int32_t length = 0;
  UErrorCode error = U_ZERO_ERROR;
  u_strFromUTF8(units_.data(), static_cast<int32_t>(units_.size()), &length, bytes.data(),
                static_cast<int32_t>(bytes.size()), &error);
  length_ = U_SUCCESS(error) ? static_cast<std::size_t>(length) : 0;
  return U_SUCCESS(error);
}

std::optional<TextFault> Decoder::decode(std::string_view bytes) {
  length_ = 0;
  if (bytes.size() > mostBytes) {
    return TextFault{fmt::format("{} bytes are too many; the most is {}", bytes.size(), mostBytes),
                     {}};
  }
  units_.resize(std::max(units_.size(), bytes.size() + 1));
  if (isUtf8_ && decodeUtf8(bytes)) {
    return {};
  }
  const char *source = bytes.data();
  const char *end = bytes.data() + bytes.size();
  ucnv_resetToUnicode(page_.converter());
  for (;;) {
    UErrorCode error = U_ZERO_ERROR;
    UChar *target = units_.data() + length_;
    ucnv_toUnicode(page_.converter(), &target, units_.data() + units_.size(), &source, end, nullptr,
                   true, &error);
    length_ = static_cast<std::size_t>(target - units_.data());
    if (U_SUCCESS(error)) {
      return {};
    }
    if (error == U_MEMORY_ALLOCATION_ERROR) {
      throw std::bad_alloc();
    }
    if (error != U_BUFFER_OVERFLOW_ERROR) {
      length_ = 0;
      return invalidBytes(static_cast<std::size_t>(source - bytes.data()));
    }
    units_.resize(2 * units_.size());
  }
}

// `consumed` bytes end with those that are to blame.
TextFault Decoder::invalidBytes(std::size_t consumed) const {
  std::array<char, 32> bytes = {};
  auto count = static_cast<int8_t>(bytes.size());
  UErrorCode error = U_ZERO_ERROR;
  ucnv_getInvalidChars(page_.converter(), bytes.data(), &count, &error);
  const auto length = std::min(static_cast<std::size_t>(U_FAILURE(error) ? 0 : count), consumed);
  std::string hex;
  for (const char byte : std::string_view(bytes.data(), length)) {
    hex += fmt::format(" {:02X}", static_cast<unsigned char>(byte));
  }
  return {fmt::format("the {}{} not valid in code page {}", length == 1 ? "byte" : "bytes",
                      hex + (length == 1 ? " is" : " are"), page_.number()),
          consumed - length};
}

std::string Decoder::encode(const std::string &utf8) const {
  if (isUtf8_) {
    return utf8;
  }
  std::u16string units(utf8.size() + 1, u'\0');
  int32_t length = 0;
  UErrorCode error = U_ZERO_ERROR;
  u_strFromUTF8WithSub(units.data(), static_cast<int32_t>(units.size()), &length, utf8.data(),
                       static_cast<int32_t>(utf8.size()), 0xFFFD, nullptr, &error);
  std::string bytes(static_cast<std::size_t>(UCNV_GET_MAX_BYTES_FOR_STRING(
                        length, static_cast<int32_t>(ucnv_getMaxCharSize(page_.converter())))),
                    '\0');
  length = ucnv_fromUChars(page_.converter(), bytes.data(), static_cast<int32_t>(bytes.size()),
                           units.data(), length, &error);
  if (U_FAILURE(error)) {
    throw std::bad_alloc();
  }
  bytes.resize(static_cast<std::size_t>(length));
  return bytes;
}

std::optional<TextFault> Decoder::cutNulls() {
  if (std::count(text().begin(), text().end(), u'\0') == 0) { // faster than to look for the first
    return {};
  }
  const std::size_t null = text().find(u'\0');
  if (text().find_first_not_of(u'\0', null) != std::u16string_view::npos) {
    return TextFault{"text follows a null (U+0000), where it would not be seen", {}};
  }
  length_ = null;
  return {};
}

void Decoder::cutBlanks() {
  for (auto end = static_cast<int32_t>(length_); end > 0; length_ = static_cast<std::size_t>(end)) {
    UChar32 character = 0;
    U16_PREV(units_.data(), 0, end, character);
    if (!u_isblank(character)) {
      return;
    }
  }
}

} // namespace nls2::tool
