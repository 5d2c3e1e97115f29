// A text file in any encoding, read through the library's streams.

#include "io/text_stream.h"

#include "errors.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fmt/core.h>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>
#include <unicode/uloc.h>
#include <unicode/ustdio.h>
#include <unicode/ustring.h>
#include <unicode/utf16.h>
#include <unistd.h>

namespace nls2::tool {

namespace {

constexpr std::size_t chunkUnits = 16384;

// A stream that opens would not tell: an empty name gets it no converter at all, and an unknown one
// looks like a file that does not open.
void requireEncoding(const std::string &encoding) {
  UErrorCode status = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(ucnv_open(encoding.c_str(), &status));
  if (encoding.empty() || U_FAILURE(status)) {
    throw usageError("--encoding '{}': {}", encoding,
                     encoding.empty() ? "a name is needed" : statusText(status));
  }
}

// Streams want a live object and do nothing with it. Objects can be made only under a default
// locale that the library knows, so the user's is left aside.
NLS2_Locale *makeLocale() {
  UErrorCode error = U_ZERO_ERROR;
  uloc_setDefault("en_US", &error);
  int32_t status = 0;
  NLS2_Locale *locale = NLS2_allocateLocale(&status);
  if (locale == nullptr) {
    throw failure("cannot make a locale object: {}", statusText(status));
  }
  return locale;
}

void countAndSubstitute(const void *counter, UConverterToUnicodeArgs *arguments,
                        const char *codeUnits, int32_t length, UConverterCallbackReason reason,
                        UErrorCode *error) {
  if (reason <= UCNV_IRREGULAR) {
    ++*static_cast<uint64_t *>(const_cast<void *>(counter));
  }
  UCNV_TO_U_CALLBACK_SUBSTITUTE(nullptr, arguments, codeUnits, length, reason, error);
}

std::string toUtf8(const UChar *units, std::size_t length) {
  std::string text(length * U8_MAX_LENGTH, '\0');
  int32_t bytes = 0;
  UErrorCode error = U_ZERO_ERROR;
  u_strToUTF8WithSub(text.data(), static_cast<int32_t>(text.size()), &bytes, units,
                     static_cast<int32_t>(length), 0xFFFD, nullptr, &error);
  if (U_FAILURE(error)) {
    throw failure("cannot convert to UTF-8: {}", statusText(error));
  }
  text.resize(static_cast<std::size_t>(bytes));
  return text;
}

} // namespace

TextStream::TextStream(const std::string &path, const std::string &encoding)
    : path_(path == "-" ? "/dev/stdin" : path), units_(chunkUnits) {
  requireEncoding(encoding);
  locale_.reset(makeLocale());
  open(encoding);
  if (path == "-") {
    // What was read of standard input before stays read.
    const off_t position = lseek(STDIN_FILENO, 0, SEEK_CUR);
    if (position > 0 && fseeko(u_fgetfile(stream_.get()), position, SEEK_SET) != 0) {
      fail();
    }
  }
}

void TextStream::open(const std::string &encoding) {
  errno = 0;
  stream_ = {NLS2_OpenStream(locale_.get(), path_.c_str(), "r", encoding.c_str()),
             Close{locale_.get()}};
  if (!stream_) {
    fail();
  }
  UErrorCode error = U_ZERO_ERROR;
  ucnv_setToUCallBack(u_fgetConverter(stream_.get()), countAndSubstitute, badSequences_.get(),
                      nullptr, nullptr, &error);
  if (U_FAILURE(error)) {
    throw failure("cannot read {}: {}", path_, statusText(error));
  }
}

void TextStream::fail() const {
  throw failure("cannot read {}: {}", path_,
                errno != 0 ? std::strerror(errno) : "it does not open");
}

std::string TextStream::read() {
  std::string text;
  std::size_t got = 0;
  do {
    got = fill();
    // The first half of a pair waits for the second, unless nothing follows.
    const std::size_t length = kept_ + got;
    kept_ = got > 0 && U16_IS_LEAD(units_[length - 1]) ? 1 : 0;
    text = toUtf8(units_.data(), length - kept_);
    if (kept_ > 0) {
      units_[0] = units_[length - 1];
    }
  } while (got > 0 && text.empty());
  return text;
}

std::size_t TextStream::fill() {
  errno = 0;
  const int32_t got = NLS2_ReadString(locale_.get(), stream_.get(), units_.data() + kept_,
                                      static_cast<int32_t>(units_.size() - kept_));
  if (std::ferror(u_fgetfile(stream_.get())) != 0) {
    fail();
  }
  return static_cast<std::size_t>(got);
}

} // namespace nls2::tool
