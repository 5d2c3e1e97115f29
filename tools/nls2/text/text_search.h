// The search for a text in lines of a code page.
#pragma once

#include "locale/locale_option.h"
#include "text/decoder.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace nls2::tool {

// For one thread at a time.
class TextSearch {
public:
  // The pattern is UTF-8. Throws usageError where it is not, or where the code page lacks one of
  // its characters.
  TextSearch(const LocaleOptions &locale, const std::string &pattern, bool ignoreCase);

  // Whether the pattern occurs in a line; why it cannot be searched where its bytes are at fault.
  std::optional<TextFault> search(std::string_view line, bool &found);

  const Decoder &decoder() const { return decoder_; }

private:
  std::u16string_view folded(std::u16string_view text);

  Decoder decoder_;
  const bool ignoreCase_;
  uint32_t folding_ = 0; // U_FOLD_CASE_*
  std::u16string pattern_;
  std::string utf8Pattern_; // where lines of ASCII may be searched as bytes; else empty
  std::u16string folded_;   // the last line
};

} // namespace nls2::tool
