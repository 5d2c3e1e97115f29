// Text of a code page as UTF-16, through one converter that stays open.

#include "text/decoder.h"

#include "errors.h"

#include <algorithm>
#include <array>
#include <new>
#include <unicode/uchar.h>
#include <unicode/utf16.h>

namespace nls2::tool {

namespace {

// The bytes at the start of a text that are ASCII.
std::size_t asciiLength(std::string_view bytes) {
  return static_cast<std::size_t>(
      std::find_if(bytes.begin(), bytes.end(), [](char byte) { return (byte & 0x80) != 0; }) -
      bytes.begin());
}

} // namespace

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

// Most text begins with ASCII, which needs no converter in UTF-8.
void Decoder::widenAscii(std::string_view bytes, std::size_t count) {
  std::copy_n(bytes.begin(), count, units_.begin());
  length_ = count;
}

std::optional<TextFault> Decoder::decode(std::string_view bytes) {
  length_ = 0;
  if (bytes.size() > mostBytes) {
    return TextFault{fmt::format("{} bytes are too many; the most is {}", bytes.size(), mostBytes),
                     {}};
  }
  units_.resize(std::max(units_.size(), bytes.size() + 1));
  widenAscii(bytes, isUtf8_ ? asciiLength(bytes) : 0);
  if (length_ == bytes.size()) {
    return {};
  }
  const char *source = bytes.data() + length_;
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

std::optional<TextFault> Decoder::cutNulls() {
  const std::size_t null = text().find(u'\0');
  if (null == std::u16string_view::npos) {
    return {};
  }
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
