// The search for a text in lines of a code page.

#include "text/text_search.h"

#include "errors.h"

#include <algorithm>
#include <new>
#include <unicode/uchar.h>
#include <unicode/ustring.h>
#include <unicode/utf16.h>

namespace nls2::tool {

namespace {

// Most lines are ASCII, whose folding is a loop over many units at once. False for other text, of
// which the output has nothing of use.
bool foldAscii(std::u16string_view text, char16_t *folded) {
  char16_t all = 0;
  for (const char16_t unit : text) {
    all |= unit;
    *folded++ = static_cast<char16_t>(unit + (unit >= u'A' && unit <= u'Z' ? 0x20 : 0));
  }
  return all < 0x80;
}

// Whether the page has all of these characters, and not only substitutes for them.
bool hasAll(const CodePage &page, std::u16string_view text) {
  UErrorCode error = U_ZERO_ERROR;
  std::string bytes(
      UCNV_GET_MAX_BYTES_FOR_STRING(text.size(), ucnv_getMaxCharSize(page.converter())), '\0');
  const int32_t length =
      ucnv_fromUChars(page.converter(), bytes.data(), static_cast<int32_t>(bytes.size()),
                      text.data(), static_cast<int32_t>(text.size()), &error);
  std::u16string back(2 * bytes.size(), u'\0');
  back.resize(static_cast<std::size_t>(
      std::max(0, ucnv_toUChars(page.converter(), back.data(), static_cast<int32_t>(back.size()),
                                bytes.data(), length, &error))));
  if (error == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc();
  }
  return U_SUCCESS(error) && back == text;
}

// The page may have a pair of characters that it does not have alone, so the whole is tried first.
void requireCharacters(const CodePage &page, std::u16string_view pattern) {
  if (hasAll(page, pattern)) {
    return;
  }
  for (std::size_t start = 0; start < pattern.size();) {
    std::size_t end = start;
    UChar32 character = 0;
    U16_NEXT(pattern.data(), end, pattern.size(), character);
    if (!hasAll(page, pattern.substr(start, end - start))) {
      throw usageError("PATTERN: the character U+{:04X} is not in code page {}",
                       static_cast<uint32_t>(character), page.number());
    }
    start = end;
  }
  throw usageError("PATTERN: code page {} does not have all of its characters", page.number());
}

std::u16string decodedPattern(const std::string &pattern) {
  Decoder utf8(utf8Page, "PATTERN");
  if (const auto fault = utf8.decode(pattern)) {
    throw usageError("{}", describe("PATTERN", *fault));
  }
  return std::u16string(utf8.text());
}

} // namespace

TextSearch::TextSearch(const LocaleOptions &locale, const std::string &pattern, bool ignoreCase)
    : decoder_(locale.codepage, "--codepage"), ignoreCase_(ignoreCase),
      pattern_(decodedPattern(pattern)) {
  requireCharacters(decoder_.page(), pattern_);
  if (ignoreCase) {
    folding_ = hasDotlessI(locale) ? U_FOLD_CASE_EXCLUDE_SPECIAL_I : U_FOLD_CASE_DEFAULT;
    pattern_ = folded(pattern_);
  } else if (decoder_.isUtf8()) {
    utf8Pattern_ = pattern;
  }
}

std::u16string_view TextSearch::folded(std::u16string_view text) {
  folded_.resize(std::max(folded_.size(), text.size() + 1));
  if (folding_ == U_FOLD_CASE_DEFAULT && foldAscii(text, folded_.data())) {
    return {folded_.data(), text.size()};
  }
  for (;;) {
    UErrorCode error = U_ZERO_ERROR;
    const auto length = static_cast<std::size_t>(
        u_strFoldCase(folded_.data(), static_cast<int32_t>(folded_.size()), text.data(),
                      static_cast<int32_t>(text.size()), folding_, &error));
    if (U_SUCCESS(error)) {
      return {folded_.data(), length};
    }
    if (error != U_BUFFER_OVERFLOW_ERROR) {
      throw std::bad_alloc();
    }
    folded_.resize(length + 1);
  }
}

std::optional<TextFault> TextSearch::search(std::string_view line, bool &found) {
  if (!utf8Pattern_.empty() && isAscii(line) && line.find('\0') == line.npos) {
    found = line.find(utf8Pattern_) != line.npos;
    return {};
  }
  std::optional<TextFault> fault = decoder_.decode(line);
  if (!fault) {
    fault = decoder_.cutNulls();
  }
  if (fault) {
    return fault;
  }
  const std::u16string_view text = ignoreCase_ ? folded(decoder_.text()) : decoder_.text();
  found = u_strFindFirst(text.data(), static_cast<int32_t>(text.size()), pattern_.data(),
                         static_cast<int32_t>(pattern_.size())) != nullptr;
  return {};
}

} // namespace nls2::tool
