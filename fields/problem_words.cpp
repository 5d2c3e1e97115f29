// The words for problems of numbers, layouts and records.
#include "problem.h"

#include <iterator>

namespace zelfields {
namespace {

// One for each Detail, in its order.
constexpr const char *details[] = {
    "",
    "bytes must follow the name: FIRST-LAST or LENGTH",
    "bytes are FIRST-LAST or LENGTH",
    "bytes are counted from 1",
    "the range is empty",
    "the field ends after byte 2147483647",
    "a kind is text, raw, hex, packed, zoned, binary or page:NAME",
    "the scale must be a number from 0 to 31",
    "the option is unknown",
    "the option does not belong to this kind",
    "a field has one sign option, and unsigned has none",
    "the kind has no numbers of this length",
    "the code page is unknown",
    "the code page of the records has no digits and signs for zoned numbers",
    "blank=empty needs a code page with a blank of one byte",
    "the name is not valid UTF-8",
    "another field has this name",
    "the field overlaps another one",
    "there is no field",
    "a format is fixed:N, lines, prefixed, blocked, csv or joined",
    "the length must be a number from 1 to 2147483647",
    "the format does not have this suffix, or has it already",
    "this format is only read",
    "this format is only written",
    "the format needs a code page",
    "the code page has no such line end",
    "the line ends of the code page depend on the text before them",
    "every line would begin with a byte-order mark; use a code page without one",
    "the code page has no blank",
    "prefixed",
    "prefixed:little",
    "prefixed:data",
    "prefixed:data:little",
    "blocked"};
static_assert(std::size(details) == static_cast<std::size_t>(Detail::tryBlocked) + 1);

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

std::string wordsOf(const NLS2F_Problem &problem) {
  switch (problem.kind) {
  case NLS2F_INVALID_NUMBER:
    return problem.byteCount > 0 ? "the " + hexOf(problem) + " is not valid in a number"
                                 : "a number must be here";
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
    return "";
  }
}

} // namespace zelfields
