// Code pages as the commands see them, asked of the library.

#include "codepage/code_page.h"

#include "errors.h"
#include "nls2.h"
#include "status.h"

#include <algorithm>
#include <fmt/core.h>
#include <limits>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace nls2::tool {

void requireCodePage(int32_t page, const char *option) {
  int32_t twoNull = 0;
  int32_t status = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(NLS2_MapCodepageIdToName(page, &twoNull, &status));
  if (status > U_ZERO_ERROR) {
    throw UsageError(
        fmt::format("{}: code page {} does not open: {}; `nls2 codepages` lists numbers", option,
                    page, statusName(status)));
  }
}

std::string translateText(int32_t to, int32_t from, std::string_view text, int32_t &status) {
  constexpr std::size_t most = std::numeric_limits<int32_t>::max();
  std::string out(std::min(4 * text.size() + 16, most), '\0');
  for (;;) {
    int32_t consumed = 0;
    const int32_t written =
        NLS2_TranslateString(to, out.data(), static_cast<int32_t>(out.size()), from, text.data(),
                             static_cast<int32_t>(text.size()), &consumed, 0, &status);
    if (status != U_BUFFER_OVERFLOW_ERROR || out.size() == most) {
      out.resize(static_cast<std::size_t>(written));
      return out;
    }
    out.resize(std::min(2 * out.size(), most));
  }
}

// The second of two equal characters carries no signature, and what is left is the first one's.
EncodedCharacter encodedCharacter(int32_t page, char ascii) {
  int32_t status = U_ZERO_ERROR;
  const std::string one = translateText(page, utf8Page, std::string(1, ascii), status);
  const std::string two = translateText(page, utf8Page, std::string(2, ascii), status);
  return {two.substr(one.size()), 2 * one.size() - two.size()};
}

std::optional<char> singleByteBlank(int32_t page) {
  int32_t twoNull = 0;
  int32_t status = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(NLS2_MapCodepageIdToName(page, &twoNull, &status));
  if (converter.isNull() || ucnv_getMaxCharSize(converter.getAlias()) != 1 ||
      !hasCharacter(page, ' ')) {
    return {};
  }
  return encodedCharacter(page, ' ').bytes.front();
}

bool hasCharacter(int32_t page, char ascii) {
  int32_t status = U_ZERO_ERROR;
  const std::string text(1, ascii);
  const std::string there = translateText(page, utf8Page, text, status);
  return translateText(utf8Page, page, there, status) == text;
}

} // namespace nls2::tool
