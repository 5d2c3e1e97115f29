// One record from one code page to another, shaped as the options say.
#pragma once

#include "convert/output_field.h"

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace nls2::tool {

// Keeps its converters open: every worker has a copy.
class RecordTranslator {
public:
  // Throws usageError for a code page that does not open, or lacks a blank or line end it needs.
  explicit RecordTranslator(const TranslateOptions &options);

  // Appends the record's translation and its line end, and counts the characters replaced in it.
  // On failure the output is as it was.
  std::optional<Problem> translate(std::string_view record, ByteBuffer &out, std::size_t &replaced);

  // The first character that is replaced in a record; nothing where none is.
  std::optional<Problem> firstReplaced(std::string_view record) const;

private:
  const TranslateOptions *options_;
  std::vector<OutputField> fields_;
  std::string separator_;
  std::string lineEnd_;
};

} // namespace nls2::tool
