// How records are framed, as the texts of formats say.
#pragma once

#include "facts.h"
#include "pages/page.h"

#include <string>

namespace zelfields {

struct RecordFormat {
  enum class Kind { fixed, lines, prefixed, blocked, csv, joined };
  enum class End { any, lf, crlf, nel };

  Kind kind = Kind::fixed;
  int64_t length = 0;    // fixed
  End end = End::any;    // lines, csv
  bool dataOnly = false; // prefixed: the length does not count the prefix
  bool little = false;
};

// False with the fault if the text is not a format.
bool parseFormat(std::string_view text, RecordFormat &format, ProblemFacts &fault);

inline bool failFormat(ProblemFacts &fault, Detail detail, int64_t offset = 0) {
  fault = {.kind = NLS2F_INVALID_FORMAT, .offset = offset, .needed = static_cast<int64_t>(detail)};
  return false;
}

// The bytes that end lines in a page.
struct LineEnds {
  std::string main;  // ends every line
  std::string strip; // may come before it, and belongs to it
  std::string other; // ends lines, too
  std::size_t unit = 1;
};

// False with the fault if lines in the page do not have such ends, or ends that cannot be searched.
bool findLineEnds(const NLS2F_Page &page, RecordFormat::End end, LineEnds &ends,
                  ProblemFacts &fault);

} // namespace zelfields
