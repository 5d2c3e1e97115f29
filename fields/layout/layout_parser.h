// Reads the text of a layout.
#pragma once

#include "layout/layout.h"
#include "pages/page.h"
#include "problem.h"

#include <map>
#include <set>

namespace zelfields {

class LayoutParser {
public:
  LayoutParser(const NLS2F_Page &page, uint32_t options, NLS2F_Layout &layout);

  // False if the text is not a layout: fault() is why then. Throws std::bad_alloc.
  bool parse(std::string_view text);
  const ProblemFacts &fault() const { return fault_; }

private:
  using Words = std::vector<std::string_view>;

  bool parseLine(std::string_view line);
  bool parseShort(std::string_view text);
  // A name, which may be empty, bytes, and perhaps a kind and options.
  bool parseField(const Words &words);
  bool parseName(std::string_view word, NLS2F_Layout::Entry &entry);
  bool parseBytes(std::string_view word, NLS2F_Field &field);
  bool parseKind(std::string_view word, NLS2F_Layout::Entry &entry);
  bool parseOption(std::string_view word, NLS2F_Field &field);
  bool check(const Words &words, const NLS2F_Field &field);
  bool claim(std::string_view word, const NLS2F_Field &field);
  bool fail(Detail detail, std::string_view word);

  // The digits, signs and the blank of the page, as a field has them.
  struct PageBytes {
    uint8_t zero = 0; // unless its digits are F0 to F9 or 30 to 39
    uint8_t plus = 0;
    uint8_t minus = 0;
    uint8_t blank = 0;
    bool hasSigns = false;
    bool hasBlank = false;
  };
  static PageBytes bytesOfPage(const NLS2F_Page &page);

  const PageBytes page_;
  const uint32_t options_;
  NLS2F_Layout &layout_;
  int64_t next_ = 0; // where a field begins that has its length alone
  const char *line_ = nullptr;
  std::set<std::string_view> names_;
  std::map<int64_t, int64_t> taken_; // the beginnings and ends of fields that are written
  ProblemFacts fault_;
};

} // namespace zelfields
