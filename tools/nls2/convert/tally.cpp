// What a run of translate has done so far, and its report.

#include "convert/tally.h"

#include "json.h"

#include <fmt/core.h>

namespace nls2::tool {

namespace {

std::string counted(uint64_t count, std::string_view what) {
  return fmt::format("{} {}{}", count, what, count == 1 ? "" : "s");
}

const char *wasOrWere(uint64_t count) { return count == 1 ? "was" : "were"; }

Json textOrNull(const std::string &text) { return text.empty() ? Json() : Json(text); }

Json jsonOf(const Problem &problem) {
  Json object = Json::object();
  object.set("record", problem.record + 1);
  object.set("byte", problem.byte);
  object.set("column", problem.column + 1);
  object.set("hex", textOrNull(problem.hex()));
  object.set("kind", kindName(problem.kind));
  object.set("code_point", textOrNull(problem.codePointText()));
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
  const auto first = tally.firstProblem();
  object.set("first_problem", first ? jsonOf(*first) : Json());
  return object.text();
}

} // namespace nls2::tool
