// One record from one code page to another, shaped as the options say.
#pragma once

#include "convert/problem.h"
#include "io/byte_buffer.h"
#include "nls2/translator.hpp"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace nls2::tool {

// One field of the output.
class OutputField {
public:
  // `number` counts the fields of --fields from 1; 0 is the whole record, whose spec has its code
  // page only.
  OutputField(const FieldSpec &spec, std::size_t number, const TranslateOptions &options);

  // Appends the field, and adds the number of characters replaced in it. On failure the problem has
  // the place in the record.
  std::optional<Problem> translate(std::string_view record, ByteBuffer &out, std::size_t &replaced);

private:
  Problem describe(const nls2::field_result &failed) const;
  std::optional<Problem> verify(std::string_view field, std::string_view translated);
  Problem newProblem(ProblemKind kind) const;

  FieldSpec spec_;
  std::size_t number_;
  int32_t to_;
  nls2::field_policy policy_;
  std::size_t backWidth_ = 0; // of back_'s policy
  bool verifies_;
  bool csv_;
  Limit limitedBy_ = Limit::outLength;
  std::optional<nls2::translator> forward_; // none for raw bytes
  std::optional<nls2::translator> back_;
  std::string digits_;
  std::string cameBack_;
};

// Keeps its converters open: every worker has a copy.
class RecordTranslator {
public:
  // Throws usageError for a code page that does not open, or lacks a blank or line end it needs.
  explicit RecordTranslator(const TranslateOptions &options);

  // Appends the record's translation and its line end, and counts the characters replaced in it.
  // On failure the output is as it was.
  std::optional<Problem> translate(std::string_view record, ByteBuffer &out, std::size_t &replaced);

  // The first character replaced in a record; nothing if there is none.
  std::optional<Problem> firstReplaced(std::string_view record) const;

private:
  const TranslateOptions *options_;
  std::vector<OutputField> fields_;
  std::string lineEnd_;
};

} // namespace nls2::tool
