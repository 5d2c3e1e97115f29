// Where the lines of a text end, in the bytes of its code page.
#pragma once

#include "codepage/code_page.h"

#include <optional>
#include <string>
#include <string_view>

namespace nls2::tool {

// One way to write a line's end, and the search for it in a text that grows at its end.
class EndPattern {
public:
  explicit EndPattern(std::string bytes) : bytes_(std::move(bytes)) {}

  std::size_t length() const { return bytes_.size(); }
  bool isIn(std::string_view text, std::size_t at) const {
    return text.substr(at, bytes_.size()) == bytes_;
  }
  // The first place from `from` on, a whole number of units from the text's beginning; npos where
  // there is none yet. `from` never goes back.
  std::size_t next(std::string_view text, std::size_t from);
  void restart();

private:
  std::string bytes_; // one unit; none where the page does not have the character
  std::size_t found_ = std::string_view::npos;
  std::size_t searched_ = 0; // no place before this one
};

struct LineBounds {
  std::size_t text = 0; // bytes without the end
  std::size_t end = 0;  // bytes with it
};

// LF, CR LF and NEL (U+0085).
class LineEnds {
public:
  // Throws usageError for a page that has no line feed, or in which a line cannot be read without
  // the text before it.
  explicit LineEnds(const CodePage &page);

  // A new text, which begins at a line's beginning.
  void restart();
  // The line at `start`; nothing where its end is not in the text.
  std::optional<LineBounds> lineAt(std::string_view text, std::size_t start);

private:
  EndPattern lineFeed_;
  EndPattern nextLine_;
  std::string carriageReturn_;
};

} // namespace nls2::tool
