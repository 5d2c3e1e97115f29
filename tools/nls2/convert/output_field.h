// One field of the output: how it is made of its bytes in a record.
#pragma once

#include "convert/byte_buffer.h"
#include "convert/problem.h"
#include "convert/translate_options.h"
#include "nls2/field_translator.hpp"

#include <optional>
#include <string>
#include <string_view>

namespace nls2::tool {

// Copied for each worker.
class OutputField {
public:
  // `number` counts the fields of --fields from 1; 0 is the whole record, whose spec has its code
  // page only.
  OutputField(const FieldSpec &spec, std::size_t number, const TranslateOptions &options);

  // Appends the field, and to `replaced` the characters that it lost. On failure the problem says
  // where in the record.
  std::optional<Problem> translate(std::string_view record, ByteBuffer &out, std::size_t &replaced);

private:
  std::optional<Problem> translateText(std::string_view field, ByteBuffer &out,
                                       std::size_t &replaced);
  Problem describe(const nls2::field_result &failed) const;
  std::optional<Problem> verify(std::string_view field, std::string_view translated);
  void prepareToVerify(std::size_t length);
  Problem newProblem(ProblemKind kind) const;

  FieldSpec spec_;
  std::size_t number_;
  bool verifies_;
  bool csv_;
  Limit limitedBy_ = Limit::outLength;
  std::optional<nls2::field_translator> forward_; // none for raw bytes
  std::optional<nls2::field_translator> back_;
  std::string digits_;
  std::string cameBack_;
};

} // namespace nls2::tool
