// Problems of numbers, layouts and records, and their words.
#include "facts.h"

#include <iterator>

namespace zelfields {
namespace {

#define ZELFIELDS_WORDS(name, words) words,
constexpr const char *details[] = {ZELFIELDS_DETAILS(ZELFIELDS_WORDS)};
#undef ZELFIELDS_WORDS

std::string detailOf(const NLS2F_Problem &problem) {
  const bool isKnown = problem.needed > 0 && problem.needed < std::ssize(details);
  return details[isKnown ? problem.needed : 0];
}

// The first bytes of the problem, such as "00 12".
std::string hexOf(const NLS2F_Problem &problem) {
  constexpr char digits[] = "0123456789ABCDEF";
  std::string text;
  for (int32_t i = 0; i < std::min<int32_t>(problem.byteCount, sizeof problem.bytes); ++i) {
    text += i == 0 ? "" : " ";
    text += digits[problem.bytes[i] >> 4];
    text += digits[problem.bytes[i] & 0x0F];
  }
  return text;
}

std::string prefixWords(const NLS2F_Problem &problem) {
  const std::string hint = detailOf(problem);
  return "the prefix " + hexOf(problem) +
         (problem.kind == NLS2F_SPANNED ? " belongs to a part of a spanned record"
                                        : " is not that of a record") +
         (hint.empty() ? "" : "; the first prefixes hold in the format " + hint);
}

std::string cutWords(const NLS2F_Problem &problem) {
  return problem.needed == 0
             ? "the input ends inside a record"
             : "the input ends inside a record of " + std::to_string(problem.needed) + " bytes";
}

} // namespace

int32_t setProblem(NLS2F_Problem *problem, const ProblemFacts &facts) {
  if (problem != nullptr) {
    const uint32_t size = problem->size;
    *problem = {size, facts.kind, facts.record, facts.offset, facts.needed, 0, 0, {}};
    const std::size_t count = std::min(facts.bytes.size(), sizeof problem->bytes);
    std::copy_n(facts.bytes.data(), count, problem->bytes);
    problem->byteCount = static_cast<int32_t>(count);
  }
  return NLS2F_ERR_FIELD;
}

std::string wordsOf(const NLS2F_Problem &problem) {
  switch (problem.kind) {
  case NLS2F_INVALID_NUMBER:
    return problem.byteCount == 0
               ? "a number must be here"
               : (problem.byteCount == 1 ? "the byte " : "the bytes ") + hexOf(problem) +
                     (problem.byteCount == 1 ? " is" : " are") + " not valid in a number";
  case NLS2F_NEGATIVE:
    return "the number is negative, but the field has no sign";
  case NLS2F_TOO_LARGE:
    return "the number is too large";
  case NLS2F_TOO_PRECISE:
    return "the number has more decimals than the field";
  case NLS2F_CUT_SHORT:
    return cutWords(problem);
  case NLS2F_INVALID_PREFIX:
  case NLS2F_SPANNED:
    return prefixWords(problem);
  case NLS2F_INVALID_CSV:
    return problem.bytes[0] == '"' ? "a quote must be at the beginning of its field, and be closed"
                                   : "a comma must follow the closing quote";
  case NLS2F_RECORD_TOO_LONG:
    return "the record is longer than " + std::to_string(problem.needed) + " bytes";
  case NLS2F_INVALID_LAYOUT:
  case NLS2F_INVALID_FORMAT:
    return detailOf(problem);
  default:
    return "no problem";
  }
}

} // namespace zelfields
