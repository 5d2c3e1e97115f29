// One record from one code page to another, shaped as the options say.

#include "convert/record_translator.h"

#include "errors.h"
#include "nls2.h"

#include <algorithm>
#include <cstring>
#include <fmt/core.h>
#include <limits>
#include <unicode/uchar.h>
#include <unicode/utypes.h>

namespace nls2::tool {

// A record as UTF-16, little-endian: its text, how many blanks stood behind it, and the bytes that
// the text takes in the destination page, alone and with one blank. That blank may bring a
// signature or a shift with it; every further one takes its own bytes only.
struct RecordTranslator::WideField {
  std::string text;
  std::size_t blanks = 0;
  std::size_t textBytes = 0;
  std::size_t blankedBytes = 0;
  int32_t status = U_ZERO_ERROR;
};

namespace {

constexpr std::size_t mostBytes = std::numeric_limits<int32_t>::max();
constexpr std::string_view wideBlank("\x20\x00", 2);

struct Answer {
  int32_t amount;
  int32_t status;
};

Answer translateInto(char *dest, std::size_t length, int32_t to, int32_t from,
                     std::string_view record, uint32_t option) {
  int32_t consumed = 0;
  int32_t status = U_ZERO_ERROR;
  const int32_t amount =
      NLS2_TranslateString(to, dest, static_cast<int32_t>(length), from, record.data(),
                           static_cast<int32_t>(record.size()), &consumed, option, &status);
  return {amount, status};
}

// Enough for nearly every page, four bytes a character. The library pads by UTF-16 units, of which
// a source byte makes two at most, and so never cuts a field that has this room.
std::size_t ampleLength(std::string_view record) {
  return std::min(4 * record.size() + 64, mostBytes);
}

// Where growing ends: no page takes more for a byte of source.
std::size_t greatestLength(std::string_view record) {
  return std::min(64 * record.size() + 1024, mostBytes);
}

std::optional<char> singleByteBlank(const CodePage &page) {
  const auto blank = page.isSingleByte() ? page.encoded(u' ') : std::nullopt;
  return blank ? std::optional(blank->bytes.front()) : std::nullopt;
}

UChar unitAt(std::string_view wide, std::size_t index) {
  const auto byteAt = [&](std::size_t i) { return static_cast<unsigned char>(wide[i]); };
  return static_cast<UChar>(byteAt(2 * index) | (byteAt(2 * index + 1) << 8));
}

std::string statusAdvice(int32_t status) {
  switch (status) {
  case U_FILE_ACCESS_ERROR:
    return "this ICU has no converter for the code page; `nls2 codepages` lists numbers";
  case U_BUFFER_OVERFLOW_ERROR:
    return "give a larger --out-length";
  case U_INVALID_CHAR_FOUND:
  case U_TRUNCATED_CHAR_FOUND:
  case U_ILLEGAL_CHAR_FOUND:
  case U_ILLEGAL_ESCAPE_SEQUENCE:
  case U_UNSUPPORTED_ESCAPE_SEQUENCE:
    return "the bytes are not text of the code page given with --from";
  case U_MEMORY_ALLOCATION_ERROR:
  case NLS2_ERR_NO_MEMORY:
    return "out of memory; is the record length right?";
  default:
    return "";
  }
}

std::string overflow(std::size_t needed) {
  return fmt::format("{}: the text takes {} bytes; {}", statusText(U_BUFFER_OVERFLOW_ERROR), needed,
                     statusAdvice(U_BUFFER_OVERFLOW_ERROR));
}

} // namespace

RecordTranslator::RecordTranslator(const TranslateOptions &options)
    : options_(options), outLength_(static_cast<std::size_t>(options.outLength)),
      blank_(CodePage(options.to, "--to").encoded(u' ').value_or(EncodedCharacter())),
      sourceBlank_(singleByteBlank(CodePage(options.from, "--from"))) {}

Refusal RecordTranslator::translate(std::string_view record, OutputBuffer &out) const {
  if (options_.padding == Padding::none) {
    return translateAsItIs(record, out, 0);
  }
  if (hasEmbeddedNull(record)) {
    return "a null (U+0000) stands inside the text, where --strip, --fill and --keep-blanks would "
           "cut it; leave the option out, or replace the nulls";
  }
  switch (options_.padding) {
  case Padding::fill:
    return fill(withoutBlanks(record), out);
  case Padding::keepBlanks:
    return keepBlanks(record, out);
  default:
    return translateAsItIs(withoutBlanks(record), out, NLS2_STRING_STRIP_TRAILING);
  }
}

// What the library would cut off anyway takes time to convert. One byte stays, since the library
// does nothing for an empty record.
std::string_view RecordTranslator::withoutBlanks(std::string_view record) const {
  if (sourceBlank_) {
    const std::size_t last = record.find_last_not_of(*sourceBlank_);
    record = record.substr(0, last == std::string_view::npos ? 1 : last + 1);
  }
  return record;
}

// A null is a zero byte in every page but UTF-7; what a zero byte is, only a translation tells.
bool RecordTranslator::hasEmbeddedNull(std::string_view record) const {
  if (options_.from != utf7Page && std::memchr(record.data(), 0, record.size()) == nullptr) {
    return false;
  }
  int32_t status = U_ZERO_ERROR;
  const std::string wide = translateText(utf16lePage, options_.from, record, status);
  bool textBehind = false;
  for (std::size_t i = wide.size() / 2; i > 0; --i) {
    const UChar unit = unitAt(wide, i - 1);
    if (unit == 0 && textBehind) {
      return true;
    }
    textBehind = textBehind || (unit != 0 && !u_isblank(unit));
  }
  return false;
}

// Appends the translation by options 0 or STRIP_TRAILING, both of which fail with status 15 rather
// than leave anything out. The result is the status.
int32_t RecordTranslator::translateToFit(std::string_view record, OutputBuffer &out,
                                         uint32_t option, bool unbounded) const {
  std::size_t length = unbounded ? ampleLength(record) : outLength_;
  const std::size_t greatest = unbounded ? greatestLength(record) : outLength_;
  for (;;) {
    const Answer answer =
        translateInto(out.room(length), length, options_.to, options_.from, record, option);
    if (answer.status == U_ZERO_ERROR) {
      out.commit(option == 0 ? static_cast<std::size_t>(answer.amount) : out.textLength(length));
      return U_ZERO_ERROR;
    }
    if (answer.status != U_BUFFER_OVERFLOW_ERROR || length == greatest) {
      return answer.status;
    }
    length = std::min(2 * length, greatest);
  }
}

Refusal RecordTranslator::translateAsItIs(std::string_view record, OutputBuffer &out,
                                          uint32_t option) const {
  const int32_t status = translateToFit(record, out, option, outLength_ == 0);
  return status == U_ZERO_ERROR ? Refusal() : refuse(status, record);
}

Refusal RecordTranslator::fill(std::string_view record, OutputBuffer &out) const {
  const bool done =
      blank_.bytes.size() == 1 ? fillAtOnce(record, out) : stripAndAppend(record, out);
  return done ? Refusal() : padThroughUtf16(record, out);
}

// The library counts the field in UTF-16 units. Where that made it shorter than the bytes asked
// for, ICU's zero byte stands behind its end.
bool RecordTranslator::fillAtOnce(std::string_view record, OutputBuffer &out) const {
  char *dest = out.room(outLength_);
  const Answer answer =
      translateInto(dest, outLength_, options_.to, options_.from, record, NLS2_STRING_FILL);
  if (answer.status != U_ZERO_ERROR || std::memchr(dest, 0, outLength_) != nullptr) {
    out.scrub(outLength_);
    return false;
  }
  out.commit(outLength_);
  return true;
}

// Pages with wide blanks do not shift, so a blank may be appended; but an empty text has no
// signature to stand before it.
bool RecordTranslator::stripAndAppend(std::string_view record, OutputBuffer &out) const {
  const Answer answer = translateInto(out.room(outLength_), outLength_, options_.to, options_.from,
                                      record, NLS2_STRING_STRIP_TRAILING);
  if (answer.status != U_ZERO_ERROR) {
    return false;
  }
  const std::size_t length = out.textLength(outLength_);
  const std::size_t rest = outLength_ - length;
  if (rest % blank_.bytes.size() != 0 || (length == 0 && blank_.signatureLength != 0)) {
    out.scrub(outLength_);
    return false;
  }
  out.commit(length);
  for (std::size_t i = 0; i < rest; i += blank_.bytes.size()) {
    out.append(blank_.bytes);
  }
  return true;
}

// The library drops blanks without a word where the room ends; a field whose room still ends in a
// sentinel has all of them.
Refusal RecordTranslator::keepBlanks(std::string_view record, OutputBuffer &out) const {
  if (blank_.bytes.size() != 1) {
    return padThroughUtf16(record, out);
  }
  const std::size_t length = std::max(ampleLength(record), outLength_ + 1);
  char *dest = out.room(length);
  const Answer answer =
      translateInto(dest, length, options_.to, options_.from, record, NLS2_STRING_TRAILING);
  const bool whole = answer.status == U_ZERO_ERROR && dest[length - 1] == OutputBuffer::sentinel;
  const std::size_t written = out.textLength(length);
  if (whole && (outLength_ == 0 || written <= outLength_)) {
    out.commit(written);
    return {};
  }
  out.scrub(length);
  return whole ? fill(record, out) : padThroughUtf16(record, out);
}

RecordTranslator::WideField RecordTranslator::widen(std::string_view record) const {
  WideField field;
  OutputBuffer wide;
  const std::size_t length = ampleLength(record);
  field.status = translateInto(wide.room(length), length, utf16lePage, options_.from, record,
                               NLS2_STRING_TRAILING)
                     .status;
  if (field.status != U_ZERO_ERROR) {
    return field;
  }
  field.text.assign(wide.room(0), wide.textLength(length));
  while (field.text.ends_with(wideBlank)) {
    field.text.resize(field.text.size() - wideBlank.size());
    ++field.blanks;
  }
  const auto lengthOf = [&](const std::string &text) {
    return translateText(options_.to, utf16lePage, text, field.status).size();
  };
  field.blankedBytes = lengthOf(field.text + std::string(wideBlank));
  field.textBytes = lengthOf(field.text);
  return field;
}

// How many blanks fit behind the text.
std::size_t RecordTranslator::roomForBlanks(const WideField &field) const {
  if (outLength_ < field.blankedBytes) {
    return 0;
  }
  return (outLength_ - field.blankedBytes) / blank_.bytes.size() + 1;
}

Refusal RecordTranslator::padThroughUtf16(std::string_view record, OutputBuffer &out) const {
  const WideField field = widen(record);
  if (field.status != U_ZERO_ERROR) {
    return refuse(field.status, record);
  }
  if (outLength_ == 0) {
    return narrow(field, field.blanks, out);
  }
  if (field.textBytes > outLength_) {
    return overflow(field.textBytes);
  }
  const std::size_t room = roomForBlanks(field);
  return narrow(field, options_.padding == Padding::fill ? room : std::min(field.blanks, room),
                out);
}

Refusal RecordTranslator::narrow(const WideField &field, std::size_t blanks,
                                 OutputBuffer &out) const {
  std::string wide = field.text;
  for (std::size_t i = 0; i < blanks; ++i) {
    wide += wideBlank;
  }
  int32_t status = U_ZERO_ERROR;
  const std::string bytes = translateText(options_.to, utf16lePage, wide, status);
  if (status != U_ZERO_ERROR) {
    return fmt::format("{}: {}", statusText(status), statusAdvice(status));
  }
  if (options_.padding == Padding::fill && bytes.size() != outLength_) {
    return fmt::format("with blanks of {} bytes it can be {} bytes long, but not {}; give another "
                       "--out-length",
                       blank_.bytes.size(), bytes.size(), outLength_);
  }
  out.append(bytes);
  return {};
}

Refusal RecordTranslator::refuse(int32_t status, std::string_view record) const {
  if (status == U_BUFFER_OVERFLOW_ERROR && outLength_ != 0) {
    OutputBuffer measured;
    const uint32_t option = options_.padding == Padding::none ? 0 : NLS2_STRING_STRIP_TRAILING;
    if (translateToFit(record, measured, option, true) == U_ZERO_ERROR) {
      return overflow(measured.bytes().size());
    }
  }
  const std::string advice = statusAdvice(status);
  return advice.empty() ? statusText(status) : fmt::format("{}: {}", statusText(status), advice);
}

} // namespace nls2::tool
