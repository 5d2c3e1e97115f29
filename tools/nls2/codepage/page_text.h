// What bytes mean in a code page, one character at a time.
#pragma once

#include "codepage/code_page.h"

namespace nls2::tool {

enum class Meaning { character, shift, leadByte, none };

// For one thread at a time.
class PageText {
public:
  explicit PageText(const CodePage &page)
      : page_(page), translator_(openTranslator(page, CodePage::utf8(), NLS2F_AS_IS)) {}

  struct Piece {
    Meaning meaning = Meaning::none;
    std::size_t length = 1; // bytes
    std::string text;       // of a character, in UTF-8
  };

  static constexpr std::size_t longest = 8; // bytes of a character

  // The first character, shift or invalid sequence of some bytes, in the state of those before.
  Piece next(std::string_view bytes);
  // What a byte is at the beginning of a text.
  Piece meaningOf(char byte);
  // Begins a new text.
  void reset() { state_.clear(); }

private:
  bool decode(std::string_view bytes, std::string &text, NLS2F_Problem &problem);

  const CodePage page_;
  Translator translator_;
  std::string state_; // the shifts and marks that apply
};

} // namespace nls2::tool
