// Code pages by number or name, and how an open page writes characters.
#pragma once

#include "base/options.h"
#include "nls2/code_page.hpp"

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <unicode/ucnv.h>
#include <utility>

namespace nls2::tool {

constexpr int32_t utf8Page = 1208;

struct CloseConverter {
  void operator()(UConverter *owned) const { ucnv_close(owned); }
};
using Converter = std::unique_ptr<UConverter, CloseConverter>;

// The numbers that nls2.h lists. What they open is found by asking the library.
inline constexpr std::array<int32_t, 25> pagesWithNames{
    874,   932,   936,   949,   950,   1200,  1208,  57352, 57355, 57356, 57357, 57358, 57359,
    57360, 57361, 57362, 57363, 57365, 57366, 57367, 57368, 57369, 57370, 57371, 57372};

// ICU's canonical name of what the library opens for a number, or ICU for a name. Nothing if it
// does not open or has no name.
std::optional<std::string> converterOf(int32_t number);
std::optional<std::string> converterOf(const std::string &name);

// ICU's CCSID for a name, or else the number of the Windows name in it.
std::optional<int32_t> ccsidOf(const std::string &name);

// The number of a Windows name of the library, spelled exactly so.
std::optional<int32_t> windowsPage(const std::string &name);

// All names that parsePage() accepts.
std::set<std::string> namesWithNumbers();

// " (did you mean cp037?)" for an unknown name, or for a number that occurs in a Windows name.
std::string nearPages(const std::string &asked);

// The code page number that an option gives as a number or name. Opening the page shows whether the
// number is supported. Throws usageError.
int32_t parsePage(const char *option, const std::string &text);

template <typename Page>
Option pageValue(const char *name, const char *help, Page &page) {
  return value(name, "PAGE", help, [=, &page](const std::string &text) {
    page = parsePage(fmt::format("--{}", name).c_str(), text);
  });
}

// Opens a page that an option gives by number or by any name that ICU opens, even an ambiguous name
// or one without a number. Throws usageError.
Converter openEncoding(const char *option, const std::string &text);

// The bytes of a character inside a text.
struct EncodedCharacter {
  std::string bytes;
  std::size_t signatureLength = 0; // of what the page writes before the first character
};

// An open code page, for one thread at a time.
class CodePage {
public:
  // Throws usageError if the number does not open. `option` is for the message.
  CodePage(int32_t number, const char *option);

  int32_t number() const { return number_; }
  UConverter *converter() const { return converter_.get(); }
  Converter take() { return std::move(converter_); }

  // Nothing if the page lacks the character.
  std::optional<EncodedCharacter> encoded(char16_t character) const;

private:
  int32_t number_;
  Converter converter_;
};

} // namespace nls2::tool
