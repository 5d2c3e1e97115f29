// Problems of records, and how they and a whole run are reported.

#include "convert/problem.h"

#include "base/json.h"
#include "base/printable.h"

#include <array>
#include <fmt/core.h>

namespace nls2::tool {

namespace {

std::string codePointText(const Problem &problem) {
  return fmt::format("U+{:04X}", static_cast<uint32_t>(problem.found.code_point()));
}

// Of a text that does not fit, by what limits it.
std::string widthAdvice(Limit limitedBy, const char *ofOutLength) {
  return limitedBy == Limit::outLength    ? ofOutLength
         : limitedBy == Limit::fieldWidth ? "; use another width for the field"
                                          : "; use a width for the field, or --out-length";
}

std::string counted(uint64_t count, std::string_view what) {
  return fmt::format("{} {}{}", count, what, count == 1 ? "" : "s");
}

const char *wasOrWere(uint64_t count) { return count == 1 ? "was" : "were"; }

Json jsonOf(const Problem &problem) {
  constexpr std::array kinds{"none",           "invalid bytes", "not in the page", "too long",
                             "null inside",    "no exact fill", "too long",        "no memory",
                             "not reversible", "short record"};
  const bool hasCharacter =
      problem.kind == ProblemKind::notInPage || problem.kind == ProblemKind::nullInside;
  return Json::object(
      {{"record", problem.record},
       {"byte", problem.byte},
       {"column", problem.column + 1},
       {"hex", problem.found.bytes().empty() ? Json() : Json(hexOf(problem.found.bytes(), " "))},
       {"kind", kinds[static_cast<std::size_t>(problem.kind)]},
       {"code_point", hasCharacter ? Json(codePointText(problem)) : Json()}});
}

} // namespace

void Tally::add(const Tally &later) {
  records += later.records;
  rejected += later.rejected;
  replaced += later.replaced;
  replacedRecords += later.replacedRecords;
  bytesIn += later.bytesIn;
  bytesOut += later.bytesOut;
  first = first ? first : later.first;
  failure = failure ? failure : later.failure;
}

std::string placeOf(const Problem &problem, std::string_view unit) {
  std::string text = fmt::format("{} {} at byte {}", unit, problem.record, problem.byte);
  if (problem.kind != ProblemKind::shortRecord) {
    text += fmt::format(", column {}", problem.column + 1);
  }
  if (problem.field != 0) {
    text += fmt::format(", field {}", problem.field);
  }
  return text;
}

Explanation explain(const Problem &problem) {
  constexpr std::array limits{"--out-length is", "the width is", "the field has"};
  const nls2::problem &found = problem.found;
  const std::string bytes = bytesText(found.bytes());
  const std::string in = fmt::format("code page {}", problem.page);
  switch (problem.kind) {
  case ProblemKind::invalidBytes:
    return {notValidText(found.bytes(), problem.page),
            "; is this the right page? --on-error replace writes a substitution character instead"};
  case ProblemKind::notInPage:
    return {fmt::format("the character {}{} is not in {}", codePointText(problem),
                        !found.bytes().empty() ? " (" + bytes + ")" : "", in),
            "; --on-error replace writes a substitution character instead"};
  case ProblemKind::tooLong:
    return {fmt::format("the text needs {} bytes, but {} {}{}", found.needed(),
                        limits[static_cast<std::size_t>(problem.limitedBy)], problem.limit,
                        !found.bytes().empty() ? "; no room for the " + bytes : ""),
            widthAdvice(problem.limitedBy, "; use a larger --out-length")};
  case ProblemKind::nullInside:
    return {fmt::format("a null (U+0000, {}) is inside the text and would end it", bytes),
            "; replace it, or do not use --strip, --fill, --keep-blanks, --csv or widths"};
  case ProblemKind::noExactFill:
    return {fmt::format("filled with blanks the text can be {} bytes long, but not {}",
                        found.needed(), problem.limit),
            widthAdvice(problem.limitedBy, "; use another --out-length")};
  case ProblemKind::notReversible:
    if (problem.cameBack >= 0) {
      return {fmt::format("not reversible: the {} comes back from {} as {:02X}", bytes, in,
                          problem.cameBack),
              ""};
    }
    return {"not reversible: " + (found.needed() == 0
                                      ? "it does not come back from " + in
                                      : fmt::format("its {} bytes come back from {} as {}",
                                                    problem.limit, in, found.needed())),
            ""};
  case ProblemKind::shortRecord:
    return {fmt::format("the input ends after {} of {} bytes", found.needed(), problem.limit),
            fmt::format("; is --record-length {} right?", problem.limit)};
  case ProblemKind::beyondLimit:
    return {"the field is longer than 1 GiB", ""};
  default:
    return {"out of memory", "; is the record length right?"};
  }
}

std::string summaryOf(const Tally &tally, std::string_view unit) {
  if (!tally.first) {
    return "";
  }
  const std::string first = placeOf(*tally.first, unit) + ": " + explain(*tally.first).reason;
  if (tally.rejected > 0) {
    return fmt::format("{} {} rejected; the first is {}", counted(tally.rejected, unit),
                       wasOrWere(tally.rejected), first);
  }
  return fmt::format("{} in {} {} replaced; the first is in {}",
                     counted(tally.replaced, "character"), counted(tally.replacedRecords, unit),
                     wasOrWere(tally.replaced), first);
}

std::string reportOf(const Tally &tally, const TranslateOptions &options, double seconds) {
  const auto &first = tally.first ? tally.first : tally.failure;
  return Json::object({{"records", tally.records},
                       {"rejected", tally.rejected},
                       {"replaced", tally.replaced},
                       {"bytes_in", tally.bytesIn},
                       {"bytes_out", tally.bytesOut},
                       {"seconds", seconds},
                       {"from", options.from},
                       {"to", options.to},
                       {"first_problem", first ? jsonOf(*first) : Json()}})
      .text();
}

} // namespace nls2::tool
