// How the functions of numbers, layouts and records report a problem.
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

// A text of the caller's, whose pointer may be null for none.
inline std::string_view viewOf(const void *text, int64_t length) {
  return {length == 0 ? "" : static_cast<const char *>(text), static_cast<std::size_t>(length)};
}

// Whether a span lies in bytes of the caller's.
inline bool isSpan(const void *bytes, const NLS2F_Span &span) {
  return span.offset >= 0 && isRange(bytes, span.length);
}
inline std::string_view spanOf(const void *bytes, const NLS2F_Span &span) {
  return span.length == 0 ? std::string_view()
                          : viewOf(static_cast<const char *>(bytes) + span.offset, span.length);
}

// `needed` of a layout, a format or a prefix that is not valid: what is wrong with it.
// problem_words.cpp has the words, in this order.
enum class Detail : int64_t {
  none,
  noBytes,
  notBytes,
  beginsAtZero,
  emptyRange,
  tooFar,
  unknownKind,
  badScale,
  unknownOption,
  optionOfOtherKind,
  secondSign,
  badLength,
  unknownPage,
  noDigits,
  noSingleBlank,
  notUtf8,
  sameName,
  overlap,
  noField,
  unknownFormat,
  badRecordLength,
  unknownSuffix,
  onlyRead,
  onlyWritten,
  needsPage,
  noLineEnd,
  dependentLines,
  signature,
  noBlank,
  tryPrefixed, // of a prefix: the format in which the first ones hold
  tryPrefixedLittle,
  tryData,
  tryDataLittle,
  tryBlocked
};

struct ProblemFacts {
  int32_t kind = 0;
  int64_t record = 0;
  int64_t offset = 0;
  int64_t needed = 0;
  std::string_view bytes = {}; // its first 8 are kept
};

// The caller's problem, if there is one, gets the facts. The result is NLS2F_ERR_FIELD.
inline int32_t setProblem(NLS2F_Problem *problem, const ProblemFacts &facts) {
  if (problem != nullptr) {
    problem->kind = facts.kind;
    problem->record = facts.record;
    problem->offset = facts.offset;
    problem->needed = facts.needed;
    problem->codePoint = 0;
    std::memset(problem->bytes, 0, sizeof problem->bytes);
    const std::size_t count = std::min(facts.bytes.size(), sizeof problem->bytes);
    std::copy_n(facts.bytes.data(), count, problem->bytes);
    problem->byteCount = static_cast<int32_t>(count);
  }
  return NLS2F_ERR_FIELD;
}

// What is wrong, in English; empty for the kinds of texts.
std::string wordsOf(const NLS2F_Problem &problem);

} // namespace zelfields
