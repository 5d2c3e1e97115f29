// Code pages as the commands see them: the numbers and names that stand for them, and a page that is
// opened once and answers how it writes characters.
#pragma once

#include "base/options.h"
#include "nls2/code_page.hpp"

#include <array>
#include <cstdint>
#include <optional>
#include <set>
#include <string>
#include <utility>

namespace nls2::tool {

constexpr int32_t utf8Page = 1208;

// The numbers that nls2.h lists as opened by name; what they open, the library is asked.
inline constexpr std::array<int32_t, 25> pagesWithNames{
    874,   932,   936,   949,   950,   1200,  1208,  57352, 57355, 57356, 57357, 57358, 57359,
    57360, 57361, 57362, 57363, 57365, 57366, 57367, 57368, 57369, 57370, 57371, 57372};

// ICU's canonical name of what the library opens for a number, or ICU for a name; nothing where it
// does not open, or has no name.
std::optional<std::string> converterOf(int32_t number);
std::optional<std::string> converterOf(const std::string &name);

// The number of a name as code_page::from_name() has it.
std::optional<int32_t> ccsidOf(const std::string &name);

// The number of exactly this Windows name of the library's.
std::optional<int32_t> windowsPage(const std::string &name);

// The names that parsePage() finds a number for.
std::set<std::string> namesWithNumbers();

// " (did you mean cp037?)" for a name that is unknown, or a number that has a Windows name.
std::string nearPages(const std::string &asked);

// The number of a code page that an option gives by number or by name. Whether the number opens is
// seen when the page is. Throws usageError.
int32_t parsePage(const char *option, const std::string &text);

template <typename Page>
Option pageValue(const char *name, const char *help, Page &page) {
  return value(name, "PAGE", help, [=, &page](const std::string &text) {
    page = parsePage(fmt::format("--{}", name).c_str(), text);
  });
}

// The converter of a page that an option gives by number, or by any name that ICU knows, be it
// ambiguous or without a number. Throws usageError.
converter openEncoding(const char *option, const std::string &text);

// One character as it stands inside a text of a code page.
struct EncodedCharacter {
  std::string bytes;
  std::size_t signatureLength = 0; // bytes that the page puts before its first character
};

// An open code page. For one thread at a time.
class CodePage {
public:
  // Throws usageError where the number does not open; `option` is who named it.
  CodePage(int32_t number, const char *option);

  int32_t number() const { return number_; }
  UConverter *converter() const { return converter_.get(); }
  nls2::converter take() { return std::move(converter_); }

  // Nothing where the page does not have the character, or only a substitute for it.
  std::optional<EncodedCharacter> encoded(char16_t character) const;

private:
  int32_t number_;
  nls2::converter converter_;
};

} // namespace nls2::tool
