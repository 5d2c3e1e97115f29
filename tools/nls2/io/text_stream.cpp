// A text file in any encoding, read as UTF-8.

#include "io/text_stream.h"

#include "errors.h"

#include <array>
#include <new>
#include <unicode/ustring.h>
#include <unicode/utf16.h>

namespace nls2::tool {

namespace {

constexpr std::size_t chunkBytes = std::size_t{64} * 1024;
constexpr std::size_t chunkUnits = std::size_t{16} * 1024;

void require(UErrorCode error) {
  if (error == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc();
  }
  if (U_FAILURE(error)) {
    throw failure("cannot convert to UTF-8: {}", statusText(error));
  }
}

void countAndSubstitute(const void *counter, UConverterToUnicodeArgs *arguments,
                        const char *codeUnits, int32_t length, UConverterCallbackReason reason,
                        UErrorCode *error) {
  if (reason <= UCNV_IRREGULAR) {
    ++*static_cast<uint64_t *>(const_cast<void *>(counter));
  }
  UCNV_TO_U_CALLBACK_SUBSTITUTE(nullptr, arguments, codeUnits, length, reason, error);
}

} // namespace

TextStream::TextStream(const std::string &path, UConverter *converter)
    : input_(path), converter_(converter) {
  UErrorCode error = U_ZERO_ERROR;
  ucnv_reset(converter);
  ucnv_setToUCallBack(converter, countAndSubstitute, &replaced_, nullptr, nullptr, &error);
  require(error);
}

std::string TextStream::read() {
  std::array<char, chunkBytes> bytes;
  std::string text;
  while (text.empty() && !ended_) {
    const std::size_t length = input_.read(bytes.data(), bytes.size());
    ended_ = length == 0;
    decode(bytes.data(), length);
    text = takeText();
  }
  return text;
}

void TextStream::decode(const char *bytes, std::size_t length) {
  const char *end = bytes + length;
  UErrorCode error = U_BUFFER_OVERFLOW_ERROR;
  while (error == U_BUFFER_OVERFLOW_ERROR) {
    error = U_ZERO_ERROR;
    std::array<UChar, chunkUnits> units;
    UChar *target = units.data();
    ucnv_toUnicode(converter_, &target, units.data() + units.size(), &bytes, end, nullptr,
                   static_cast<UBool>(ended_), &error);
    units_.append(units.data(), target);
  }
  require(error);
}

// The first half of a pair waits for the second, unless nothing follows.
std::string TextStream::takeText() {
  const std::size_t kept = !ended_ && !units_.empty() && U16_IS_LEAD(units_.back()) ? 1 : 0;
  const std::size_t length = units_.size() - kept;
  std::string text(length * U8_MAX_LENGTH, '\0');
  int32_t bytes = 0;
  int32_t loneSurrogates = 0;
  UErrorCode error = U_ZERO_ERROR;
  u_strToUTF8WithSub(text.data(), static_cast<int32_t>(text.size()), &bytes, units_.data(),
                     static_cast<int32_t>(length), 0xFFFD, &loneSurrogates, &error);
  require(error);
  units_.erase(0, length);
  replaced_ += static_cast<uint64_t>(loneSurrogates);
  text.resize(static_cast<std::size_t>(bytes));
  return text;
}

} // namespace nls2::tool
