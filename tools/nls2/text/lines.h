// The lines of a file, or its records of one length, and their text as UTF-16.
#pragma once

#include "codepage/code_page.h"
#include "errors.h"
#include "io/input_file.h"

#include <algorithm>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <unicode/uchar.h>
#include <unicode/unistr.h>
#include <unicode/ustring.h>
#include <unicode/utf16.h>
#include <vector>

namespace nls2::tool {

// A text that cannot be used. The message goes after the text's place: ", column 3: ..." or ": ...".
class TextFault : public Error {
public:
  explicit TextFault(const std::string &text) : Error(exitFailed, text) {}
};

// Whether all bytes are below 0x80. Looks at every one, which the compiler does for many at once.
inline bool isAscii(std::string_view bytes) {
  unsigned char all = 0;
  for (const char byte : bytes) {
    all |= static_cast<unsigned char>(byte);
  }
  return all < 0x80;
}

// A text without the nulls at its end. Throws TextFault where text follows a null.
inline std::u16string_view withoutNulls(std::u16string_view text) {
  if (std::count(text.begin(), text.end(), u'\0') == 0) { // faster than to look for the first
    return text;
  }
  const std::size_t null = text.find(u'\0');
  if (text.find_first_not_of(u'\0', null) != text.npos) {
    throw TextFault(": text follows a null (U+0000), where it would not be seen");
  }
  return text.substr(0, null);
}

// A text without the tabs and space characters at its end.
inline std::u16string_view withoutBlanks(std::u16string_view text) {
  for (std::size_t end = text.size(); end > 0; text = text.substr(0, end)) {
    UChar32 character = 0;
    U16_PREV(text.data(), 0, end, character);
    if (!u_isblank(character)) {
      break;
    }
  }
  return text;
}

// Decodes through one converter that stays open. For one thread at a time.
class Decoder {
public:
  static constexpr std::size_t mostBytes = std::size_t{1} << 30;

  // Of the option --codepage. Throws usageError where the page does not open.
  explicit Decoder(int32_t page)
      : page_(page, "--codepage"), isUtf8_(ucnv_getType(page_.converter()) == UCNV_UTF8) {
    UErrorCode error = U_ZERO_ERROR;
    ucnv_setToUCallBack(page_.converter(), UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr,
                        &error);
  }

  // A text, valid until the next call. Throws TextFault where there are more than mostBytes, and
  // where some are not valid in the page. UTF-8 goes without the converter, which takes longer to
  // start than a short line to decode.
  std::u16string_view decode(std::string_view bytes) {
    if (bytes.size() > mostBytes) {
      throw TextFault(
          fmt::format(": {} bytes are too many; the most is {}", bytes.size(), mostBytes));
    }
    units_.resize(std::max(units_.size(), bytes.size() + 1));
    if (isUtf8_ && isAscii(bytes)) {
      std::copy(bytes.begin(), bytes.end(), units_.begin());
      return {units_.data(), bytes.size()};
    }
    UErrorCode error = isUtf8_ ? U_ZERO_ERROR : U_UNSUPPORTED_ERROR; // which makes it do nothing
    int32_t length = 0;
    u_strFromUTF8(units_.data(), static_cast<int32_t>(units_.size()), &length, bytes.data(),
                  static_cast<int32_t>(bytes.size()), &error);
    return U_SUCCESS(error) ? std::u16string_view(units_.data(), static_cast<std::size_t>(length))
                            : convert(bytes);
  }

  // A text in the page; characters that the page lacks become its substitution character.
  std::string encode(const icu::UnicodeString &text) const {
    const int32_t most =
        UCNV_GET_MAX_BYTES_FOR_STRING(text.length(), ucnv_getMaxCharSize(page_.converter()));
    std::string bytes(static_cast<std::size_t>(most), '\0');
    UErrorCode error = U_ZERO_ERROR;
    const int32_t length = text.extract(bytes.data(), most, page_.converter(), error);
    bytes.resize(U_FAILURE(error) ? 0 : static_cast<std::size_t>(length));
    return bytes;
  }

  bool isUtf8() const { return isUtf8_; }
  const CodePage &page() const { return page_; }

private:
  std::u16string_view convert(std::string_view bytes) {
    const char *source = bytes.data();
    std::size_t length = 0;
    ucnv_resetToUnicode(page_.converter());
    for (;; units_.resize(2 * units_.size())) {
      UErrorCode error = U_ZERO_ERROR;
      UChar *target = units_.data() + length;
      ucnv_toUnicode(page_.converter(), &target, units_.data() + units_.size(), &source,
                     bytes.data() + bytes.size(), nullptr, true, &error);
      length = static_cast<std::size_t>(target - units_.data());
      if (U_SUCCESS(error)) {
        return {units_.data(), length};
      }
      if (error != U_BUFFER_OVERFLOW_ERROR) {
        throw invalidBytes(static_cast<std::size_t>(source - bytes.data()));
      }
    }
  }

  // `consumed` bytes end with those that are to blame.
  TextFault invalidBytes(std::size_t consumed) const {
    char bytes[32];
    int8_t count = sizeof bytes;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_getInvalidChars(page_.converter(), bytes, &count, &error);
    const auto length = std::min(static_cast<std::size_t>(U_FAILURE(error) ? 0 : count), consumed);
    std::string hex;
    for (const char byte : std::string_view(bytes, length)) {
      hex += fmt::format(" {:02X}", static_cast<unsigned char>(byte));
    }
    return TextFault(fmt::format(", column {}: the byte{}{} {} not valid in code page {}",
                                 consumed - length + 1, length == 1 ? "" : "s", hex,
                                 length == 1 ? "is" : "are", page_.number()));
  }

  const CodePage page_;
  const bool isUtf8_;
  std::u16string units_;
};

// The line feed of a code page. Throws Error where the page cannot be cut into lines that mean the
// same by themselves.
inline std::string lineTerminator(int32_t page) {
  const CodePage opened(page, "--codepage");
  const auto lineFeed = opened.encoded(u'\n');
  if (!lineFeed) {
    throw usageError("code page {} has no line feed to end lines", page);
  }
  switch (ucnv_getType(opened.converter())) {
  case UCNV_UTF16: // the byte order is at the start of the text, as states are
  case UCNV_UTF32:
  case UCNV_HZ:
  case UCNV_ISO_2022:
  case UCNV_SCSU:
  case UCNV_COMPOUND_TEXT:
    throw usageError("lines of code page {} depend on the text before them; translate "
                     "it first, UTF-16 or UTF-32 with a signature to a page without",
                     page);
  default:
    return lineFeed->bytes;
  }
}

// The paths of a command that reads standard input where it is given none.
inline std::vector<std::string> inputsOf(const std::vector<std::string> &given) {
  return given.empty() ? std::vector<std::string>{"-"} : given;
}

class LineReader {
public:
  // The terminator is after every line, at a multiple of its length from the line's start; empty
  // for records of one length. Throws Error.
  LineReader(const std::string &path, const std::string &terminator, std::size_t recordLength = 0)
      : input_(path), terminator_(terminator), recordLength_(recordLength) {}

  // The next line without its terminator, valid until the next call; nothing at the end. A last
  // line need not have its terminator, a last record must be whole. Throws Error.
  std::optional<std::string_view> next() {
    std::size_t scanned = 0;
    std::size_t end = findEnd(scanned);
    while (end == std::string::npos && !ended_ && buffer_.size() - start_ <= Decoder::mostBytes) {
      fill();
      end = findEnd(scanned);
    }
    const bool isWhole = end != std::string::npos;
    const std::string_view line = std::string_view(buffer_).substr(start_, end);
    if (!isWhole && line.empty()) {
      return {};
    }
    ++number_;
    offset_ = dropped_ + start_;
    start_ += line.size() + (isWhole ? terminator_.size() : 0);
    if (line.size() > Decoder::mostBytes) {
      fail(fmt::format(": it has more than {} bytes", Decoder::mostBytes));
    }
    if (!isWhole && terminator_.empty()) {
      fail(fmt::format(": the input ends after {} of {} bytes; is --record-length {} right?",
                       line.size(), recordLength_, recordLength_));
    }
    return line;
  }

  // Throws Error: what is wrong with the last line, after the file's name, the line's number and
  // its first byte's offset.
  [[noreturn]] void fail(const std::string &what) const {
    throw failure("{}: {} {} at byte {}{}", input_.name(), terminator_.empty() ? "record" : "line",
                  number_, offset_, what);
  }

  uint64_t number() const { return number_; } // of the last line, from 1

private:
  // The length of the next line, or npos where it does not end in the buffer. Its first `scanned`
  // bytes hold no terminator.
  std::size_t findEnd(std::size_t &scanned) const {
    const std::string_view rest = std::string_view(buffer_).substr(start_);
    if (terminator_.empty()) {
      return recordLength_ <= rest.size() ? recordLength_ : rest.npos;
    }
    std::size_t end = rest.find(terminator_, scanned);
    while (end != rest.npos && end % terminator_.size() != 0) {
      end = rest.find(terminator_, end + 1);
    }
    scanned = rest.size() - rest.size() % terminator_.size();
    return end;
  }

  void fill() {
    constexpr std::size_t chunk = std::size_t{128} * 1024;
    dropped_ += start_;
    buffer_.erase(0, start_);
    start_ = 0;
    const std::size_t have = buffer_.size();
    buffer_.resize(have + chunk);
    const std::size_t got = input_.read(buffer_.data() + have, chunk);
    buffer_.resize(have + got);
    ended_ = got == 0;
  }

  InputFile input_;
  const std::string terminator_;
  const std::size_t recordLength_;
  std::string buffer_;
  std::size_t start_ = 0; // of the next line
  uint64_t dropped_ = 0;  // bytes that were before the buffer
  uint64_t offset_ = 0;   // of the last line
  uint64_t number_ = 0;
  bool ended_ = false;
};

} // namespace nls2::tool
