// Where the lines of a text end, in the bytes of its code page.

#include "convert/line_ends.h"

#include "errors.h"

#include <algorithm>
#include <array>

namespace nls2::tool {

namespace {

constexpr std::size_t npos = std::string_view::npos;

bool isOneOf(const CodePage &page, std::initializer_list<UConverterType> types) {
  return std::find(types.begin(), types.end(), ucnv_getType(page.converter())) != types.end();
}

std::string bytesOf(const CodePage &page, char16_t character) {
  const auto encoded = page.encoded(character);
  return encoded ? encoded->bytes : "";
}

// Searching bytes finds characters only where no character's bytes can hold another's. That is so
// for single bytes below 0x40 in every page, and for the encodings of Unicode that are searched.
std::string bytesOfNel(const CodePage &page) {
  std::string bytes = bytesOf(page, u'\u0085');
  const bool canBeSearched =
      bytes.size() == 1 ||
      isOneOf(page, {UCNV_UTF8, UCNV_CESU8, UCNV_UTF16_BigEndian, UCNV_UTF16_LittleEndian,
                     UCNV_UTF32_BigEndian, UCNV_UTF32_LittleEndian});
  return canBeSearched ? bytes : "";
}

std::string bytesOfLineFeed(const CodePage &page) {
  std::string bytes = bytesOf(page, u'\n');
  if (bytes.empty()) {
    throw usageError("--lines: code page {} has no line feed", page.number());
  }
  if (isOneOf(page, {UCNV_UTF16, UCNV_UTF32, UCNV_SCSU, UCNV_COMPOUND_TEXT})) {
    throw usageError("--lines: a line of code page {} depends on the text before it; of UTF-16 "
                     "and UTF-32 give the page without a signature, such as 1200",
                     page.number());
  }
  return bytes;
}

} // namespace

// UTF-8 has a byte as its unit, and an end of two bytes that cannot begin inside a character.
std::size_t EndPattern::next(std::string_view text, std::size_t from) {
  if (bytes_.empty() || (found_ != npos && found_ >= from)) {
    return found_;
  }
  const std::size_t unit = bytes_.front() == '\xC2' ? 1 : bytes_.size();
  found_ = text.find(bytes_, std::max(from, searched_));
  while (found_ != npos && found_ % unit != 0) {
    found_ = text.find(bytes_, found_ + 1);
  }
  searched_ = found_ != npos ? found_ : text.size() - std::min(text.size(), bytes_.size() - 1);
  return found_;
}

void EndPattern::restart() {
  found_ = npos;
  searched_ = 0;
}

LineEnds::LineEnds(const CodePage &page)
    : lineFeed_(bytesOfLineFeed(page)), nextLine_(bytesOfNel(page)),
      carriageReturn_(bytesOf(page, u'\r')) {}

void LineEnds::restart() {
  lineFeed_.restart();
  nextLine_.restart();
}

std::optional<LineBounds> LineEnds::lineAt(std::string_view text, std::size_t start) {
  const std::size_t lf = lineFeed_.next(text, start);
  const std::size_t nel = nextLine_.next(text, start);
  if (lf == npos && nel == npos) {
    return {};
  }
  if (nel < lf) {
    return LineBounds{nel - start, nel - start + nextLine_.length()};
  }
  const std::string_view line = text.substr(start, lf - start);
  const std::size_t cr =
      !carriageReturn_.empty() && line.ends_with(carriageReturn_) ? carriageReturn_.size() : 0;
  return LineBounds{line.size() - cr, line.size() + lineFeed_.length()};
}

} // namespace nls2::tool
