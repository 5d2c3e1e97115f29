// Code pages as the commands see them.

#include "codepage/code_page.h"

#include "codepage/page_names.h"
#include "errors.h"
#include "memory.h"
#include "near_names.h"
#include "options.h"

#include <limits>

namespace nls2::tool {

namespace {

// Enough for some characters of any page, with its signature and its shifts.
constexpr int32_t fewBytes = 64;

// The number that the text is; nothing where it is a name. Throws usageError.
std::optional<int32_t> givenNumber(const char *option, const std::string &text) {
  const bool isDecimal = text.find_first_of("0123456789") == (text.starts_with("-") ? 1 : 0) &&
                         text.find_first_not_of("0123456789", 1) == std::string::npos;
  if (isDecimal) {
    return parseNumber(option, text, std::numeric_limits<int32_t>::min(),
                       std::numeric_limits<int32_t>::max());
  }
  const auto number = wholeNumber(text); // 0x...
  return number && *number <= std::numeric_limits<int32_t>::max()
             ? std::optional(static_cast<int32_t>(*number))
             : std::nullopt;
}

Error unknownPage(const char *option, const std::string &text) {
  return usageError("{}: unknown code page {}{}", option, text.empty() ? "\"\"" : printable(text),
                    nearPages(text));
}

} // namespace

int32_t parsePage(const char *option, const std::string &text) {
  if (const auto number = givenNumber(option, text)) {
    return *number;
  }
  if (const auto number = numberOf(text)) {
    return *number;
  }
  if (const auto meanings = meaningsOf(text); !meanings.empty()) {
    throw usageError("{}: {} means several tables{}", option, printable(text),
                     didYouMean(meanings));
  }
  if (converterOf(text)) {
    throw usageError("{}: code page {} has no number in the library; `nls2 codepages` lists "
                     "numbers",
                     option, printable(text));
  }
  throw unknownPage(option, text);
}

converter openEncoding(const char *option, const std::string &text) {
  if (const auto number = givenNumber(option, text)) {
    return CodePage(*number, option).take();
  }
  UErrorCode error = U_ZERO_ERROR;
  nls2::converter opened(text.empty() ? nullptr : ucnv_open(text.c_str(), &error));
  if (!opened) {
    throw unknownPage(option, text);
  }
  return opened;
}

CodePage::CodePage(int32_t number, const char *option) : number_(number) {
  std::error_code error;
  converter_ = open_converter(nls2::code_page(number), error);
  if (!converter_) {
    throw usageError("{}: code page {} does not open: {}{}; `nls2 codepages` lists numbers", option,
                     number, error.message(), nearPages(std::to_string(number)));
  }
}

bool CodePage::isSingleByte() const { return ucnv_getMaxCharSize(converter()) == 1; }

std::string CodePage::encode(std::u16string_view text) const {
  std::string bytes(fewBytes, '\0');
  UErrorCode error = U_ZERO_ERROR;
  const int32_t length = ucnv_fromUChars(converter(), bytes.data(), fewBytes, text.data(),
                                         static_cast<int32_t>(text.size()), &error);
  bytes.resize(U_FAILURE(error) ? 0 : static_cast<std::size_t>(length));
  return bytes;
}

// The second of two equal characters carries no signature, and what is left is the first one's.
std::optional<EncodedCharacter> CodePage::encoded(char16_t character) const {
  const std::string one = encode(std::u16string(1, character));
  const std::string two = encode(std::u16string(2, character));
  char16_t back[fewBytes] = {};
  UErrorCode error = U_ZERO_ERROR;
  const int32_t units = ucnv_toUChars(converter(), back, fewBytes, one.data(),
                                      static_cast<int32_t>(one.size()), &error);
  requireMemory();
  if (U_FAILURE(error) || units != 1 || back[0] != character) {
    return {};
  }
  return EncodedCharacter{two.substr(one.size()), 2 * one.size() - two.size()};
}

} // namespace nls2::tool
