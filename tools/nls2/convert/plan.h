// What a run of `nls2 translate` does, after all options have been checked.
#pragma once

#include "convert/translate_options.h"
#include "text/record_source.h"

#include <vector>

namespace nls2::tool {

// A field, or the whole record.
struct FieldPlan {
  FieldPlan(CodePage source, CodePage target) : from(std::move(source)), to(std::move(target)) {}

  NLS2F_Field field = sized<NLS2F_Field>(); // `name` and `page` belong to the layout
  std::size_t number = 0;                   // from 1; 0 is the whole record
  CodePage from;                            // of a text
  CodePage to;
  int32_t padding = NLS2F_AS_IS;
  int64_t width = 0;       // of a filled text
  std::string blank;       // of the source page
  bool fillsLater = false; // with blanks of one byte, when the record is put together

  bool isNumber() const { return field.kind >= NLS2F_PACKED; }
};

struct Plan {
  // Throws Error.
  explicit Plan(const TranslateOptions &options);

  // The page that the input's byte-order mark chose.
  void setFrom(const CodePage &page);

  CodePage from;
  CodePage to;
  bool readsCsv;
  bool writesCsv;
  bool joins;
  int64_t readLength;  // of fixed records; else 0
  int64_t writeLength; // likewise
  Layout layout;       // null: the record is one field
  bool hasHeader;      // the CSV has the fields' names
  int64_t layoutLength = 0;
  std::vector<FieldPlan> fields;

  bool fillsLayout() const { return layout && !writesCsv && !joins; }
  const char *unit(const TranslateOptions &options) const {
    return options.read.starts_with("lines") ? "line" : "record";
  }

private:
  void addFields(const TranslateOptions &options);
  void check(const TranslateOptions &options) const;
};

// U+0020 inside a text of the page; empty if the page has none.
std::string blankOf(const CodePage &page);

// A record without fields, of the page's blanks; empty if no layout is filled. Throws usageError.
std::string emptyRecord(const Plan &plan);

} // namespace nls2::tool
