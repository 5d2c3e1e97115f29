// How the functions of numbers, layouts and records check their arguments and report a problem.
#pragma once

#include "guard.h"

#include <algorithm>
#include <cstring>
#include <string>
#include <string_view>

namespace zelfields {

// Null, or whole.
inline bool isProblem(const NLS2F_Problem *problem) {
  return problem == nullptr || isWhole(problem);
}

// Sets outputs to 0 or null. False if one of them is not there.
template <class... Output>
bool cleared(Output *...output) {
  ((output != nullptr ? static_cast<void>(*output = Output()) : void()), ...);
  return ((output != nullptr) && ...);
}

// A text of the caller's, whose pointer may be null for none.
inline std::string_view viewOf(const void *text, int64_t length) {
  return {length == 0 ? "" : static_cast<const char *>(text), static_cast<std::size_t>(length)};
}

// Whether a span lies in bytes of the caller's, and what it is.
inline bool isSpan(const void *bytes, const NLS2F_Span &span) {
  return span.offset >= 0 && isRange(bytes, span.length);
}
inline std::string_view spanOf(const void *bytes, const NLS2F_Span &span) {
  return viewOf(span.length == 0 ? "" : static_cast<const char *>(bytes) + span.offset,
                span.length);
}

// `needed` of a layout, a format or a prefix that is not valid, and what it means.
// clang-format off
#define ZELFIELDS_DETAILS(detail) \
  detail(none, "") \
  detail(noBytes, "bytes must follow the name: FIRST-LAST or LENGTH") \
  detail(notBytes, "bytes are FIRST-LAST or LENGTH") \
  detail(beginsAtZero, "bytes are counted from 1") \
  detail(emptyRange, "the range is empty") \
  detail(tooFar, "the field ends after byte 2147483647") \
  detail(unknownKind, "a kind is text, raw, hex, packed, zoned, binary or page:NAME") \
  detail(badScale, "the scale must be a number from 0 to 31") \
  detail(unknownOption, "the option is unknown") \
  detail(optionOfOtherKind, "the option does not belong to this kind") \
  detail(secondSign, "a field has one sign option, and unsigned has none") \
  detail(badLength, "the kind has no numbers of this length") \
  detail(unknownPage, "the code page is unknown") \
  detail(noDigits, "the code page of the records has no digits and signs for zoned numbers") \
  detail(noSingleBlank, "blank=empty needs a code page with a blank of one byte") \
  detail(notUtf8, "the name is not valid UTF-8") \
  detail(sameName, "another field has this name") \
  detail(overlap, "the field overlaps another one") \
  detail(noField, "there is no field") \
  detail(unknownFormat, "a format is fixed:N, lines, prefixed, blocked, csv or joined") \
  detail(badRecordLength, "the length must be a number from 1 to 2147483647") \
  detail(unknownSuffix, "the format does not have this suffix, or has it already") \
  detail(onlyRead, "this format is only read") \
  detail(onlyWritten, "this format is only written") \
  detail(needsPage, "the format needs a code page") \
  detail(noLineEnd, "the code page has no such line end") \
  detail(dependentLines, "the line ends of the code page depend on the text before them") \
  detail(signature, "every line would begin with a byte-order mark; use a code page without one") \
  detail(noBlank, "the code page has no blank") \
  detail(tryPrefixed, "prefixed") \
  detail(tryLittle, "prefixed:little") \
  detail(tryData, "prefixed:data") \
  detail(tryDataLittle, "prefixed:data:little") \
  detail(tryBlocked, "blocked")
// clang-format on

#define ZELFIELDS_NAME(name, words) name,
enum class Detail : int64_t { ZELFIELDS_DETAILS(ZELFIELDS_NAME) };
#undef ZELFIELDS_NAME

struct ProblemFacts {
  int32_t kind = 0;
  int64_t record = 0;
  int64_t offset = 0;
  int64_t needed = 0;
  std::string_view bytes = {}; // its first 8 are kept
};

// The caller's problem, if there is one, gets the facts. The result is NLS2F_ERR_FIELD.
int32_t setProblem(NLS2F_Problem *problem, const ProblemFacts &facts);

// What is wrong, in English, for the kinds of numbers, layouts and records.
std::string wordsOf(const NLS2F_Problem &problem);

} // namespace zelfields
