// What keeps a record from being translated, and how that and a whole run are reported.

#include "convert/problem.h"

#include "json.h"

#include <array>
#include <fmt/format.h>

namespace nls2::tool {

namespace {

// "D0 96"
std::string hexOf(const Problem &problem) {
  const auto bytes = problem.found.source_bytes();
  const std::vector<unsigned char> numbers(bytes.begin(), bytes.end());
  return fmt::format("{:02X}", fmt::join(numbers, " "));
}

// "byte FF", "bytes D0 96"
std::string bytesText(const Problem &problem) {
  return (problem.found.byte_count == 1 ? "byte " : "bytes ") + hexOf(problem);
}

std::string codePointText(const Problem &problem) {
  return fmt::format("U+{:04X}", static_cast<uint32_t>(problem.found.code_point));
}

std::string notReversible(const Problem &problem) {
  const std::string what = problem.found.byte_count == 0 ? "it" : "the " + bytesText(problem);
  if (problem.cameBack < 0) {
    return fmt::format("not reversible: {} does not come back from code page {}", what,
                       problem.page);
  }
  return fmt::format("not reversible: {} comes back from code page {} as {:02X}", what,
                     problem.page, problem.cameBack);
}

std::string widerAdvice(Limit limitedBy, const char *forOutLength) {
  return std::array{
      forOutLength, "; give the field another width",
      "; give the field a width, or --out-length"}[static_cast<std::size_t>(limitedBy)];
}

std::string counted(uint64_t count, std::string_view what) {
  return fmt::format("{} {}{}", count, what, count == 1 ? "" : "s");
}

const char *wasOrWere(uint64_t count) { return count == 1 ? "was" : "were"; }

Json jsonOf(const Problem &problem) {
  constexpr std::array kinds{"invalid bytes", "not in the page", "too long",     "null inside",
                             "no exact fill", "not reversible",  "short record", "no memory"};
  Json object = Json::object();
  object.set("record", problem.record + 1);
  object.set("byte", problem.byte);
  object.set("column", problem.column + 1);
  object.set("hex", problem.found.byte_count == 0 ? Json() : Json(hexOf(problem)));
  object.set("kind", kinds[static_cast<std::size_t>(problem.kind)]);
  object.set("code_point",
             problem.kind == ProblemKind::notInPage ? Json(codePointText(problem)) : Json());
  return object;
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
  std::string text = fmt::format("{} {} at byte {}", unit, problem.record + 1, problem.byte);
  if (problem.kind != ProblemKind::shortRecord) {
    text += fmt::format(", column {}", problem.column + 1);
  }
  if (problem.field != 0) {
    text += fmt::format(", field {}", problem.field);
  }
  return text;
}

std::string reasonOf(const Problem &problem) {
  constexpr std::array limits{"--out-length is", "the width is", "the field has"};
  const nls2::field_result &found = problem.found;
  switch (problem.kind) {
  case ProblemKind::invalidBytes:
    return fmt::format("the {} {} not valid in code page {}", bytesText(problem),
                       found.byte_count == 1 ? "is" : "are", problem.page);
  case ProblemKind::notInPage:
    return fmt::format("the character {}{} is not in code page {}", codePointText(problem),
                       found.byte_count > 0 ? " (" + bytesText(problem) + ")" : "", problem.page);
  case ProblemKind::tooLong:
    return fmt::format("the text takes {} bytes, but {} {}", found.needed,
                       limits[static_cast<std::size_t>(problem.limitedBy)], problem.limit);
  case ProblemKind::nullInside:
    return "a null (U+0000) is inside the text, where --strip, --fill and --keep-blanks would cut "
           "it";
  case ProblemKind::noExactFill:
    return fmt::format("filled with blanks it can be {} bytes long, but not {}", found.needed,
                       problem.limit);
  case ProblemKind::notReversible:
    return notReversible(problem);
  case ProblemKind::shortRecord:
    return fmt::format("the input ends after {} of {} bytes", found.needed, problem.limit);
  default:
    return "out of memory";
  }
}

std::string adviceOn(const Problem &problem) {
  switch (problem.kind) {
  case ProblemKind::invalidBytes:
    return "; is --from right? --on-error replace puts a substitution character";
  case ProblemKind::notInPage:
    return "; --on-error replace puts its substitution character";
  case ProblemKind::tooLong:
    return widerAdvice(problem.limitedBy, "; give a larger --out-length");
  case ProblemKind::nullInside:
    return "; leave the option out, or replace the nulls";
  case ProblemKind::noExactFill:
    return widerAdvice(problem.limitedBy, "; give another --out-length");
  case ProblemKind::shortRecord:
    return fmt::format("; is --record-length {} right?", problem.limit);
  case ProblemKind::noMemory:
    return "; is the record length right?";
  default:
    return "";
  }
}

std::string summaryOf(const Tally &tally, std::string_view unit) {
  if (!tally.first) {
    return "";
  }
  const std::string first = placeOf(*tally.first, unit) + ": " + reasonOf(*tally.first);
  if (tally.rejected > 0) {
    return fmt::format("{} {} rejected, the first is {}", counted(tally.rejected, unit),
                       wasOrWere(tally.rejected), first);
  }
  return fmt::format("{} in {} {} replaced, the first in {}", counted(tally.replaced, "character"),
                     counted(tally.replacedRecords, unit), wasOrWere(tally.replaced), first);
}

std::string reportOf(const Tally &tally, const TranslateOptions &options, double seconds) {
  Json object = Json::object();
  object.set("records", tally.records);
  object.set("rejected", tally.rejected);
  object.set("replaced", tally.replaced);
  object.set("bytes_in", tally.bytesIn);
  object.set("bytes_out", tally.bytesOut);
  object.set("seconds", seconds);
  object.set("from", options.from);
  object.set("to", options.to);
  const auto &first = tally.first ? tally.first : tally.failure;
  object.set("first_problem", first ? jsonOf(*first) : Json());
  return object.text();
}

} // namespace nls2::tool
