// One record from one code page to another, shaped as the options say.
#pragma once

#include "codepage/code_page.h"
#include "convert/output_buffer.h"
#include "errors.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace nls2::tool {

enum class Padding { none, strip, fill, keepBlanks };

struct TranslateOptions {
  int32_t from = 0;
  int32_t to = 0;
  int32_t recordLength = 0;
  int32_t outLength = 0; // 0: as much as it takes
  Padding padding = Padding::none;
  bool newline = false;
};

// Holds no state of a record: one translator serves all threads.
class RecordTranslator {
public:
  explicit RecordTranslator(const TranslateOptions &options);

  // Appends the record's translation to the output. On failure the output is as it was.
  Refusal translate(std::string_view record, OutputBuffer &out) const;

private:
  struct WideField;

  std::string_view withoutBlanks(std::string_view record) const;
  bool hasEmbeddedNull(std::string_view record) const;
  int32_t translateToFit(std::string_view record, OutputBuffer &out, uint32_t option,
                         bool unbounded) const;
  Refusal translateAsItIs(std::string_view record, OutputBuffer &out, uint32_t option) const;

  Refusal fill(std::string_view record, OutputBuffer &out) const;
  bool fillAtOnce(std::string_view record, OutputBuffer &out) const;
  bool stripAndAppend(std::string_view record, OutputBuffer &out) const;
  Refusal keepBlanks(std::string_view record, OutputBuffer &out) const;

  // The slow way, by UTF-16 and with the blanks counted here. It is right for every page: for those
  // whose blanks are wider than a byte, that shift, that put a signature before the text.
  Refusal padThroughUtf16(std::string_view record, OutputBuffer &out) const;
  std::size_t roomForBlanks(const WideField &field) const;
  WideField widen(std::string_view record) const;
  Refusal narrow(const WideField &field, std::size_t blanks, OutputBuffer &out) const;

  Refusal refuse(int32_t status, std::string_view record) const;

  const TranslateOptions options_;
  const std::size_t outLength_;
  const EncodedCharacter blank_; // of the destination
  const std::optional<char> sourceBlank_;
};

} // namespace nls2::tool
