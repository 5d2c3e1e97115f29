// Problems of records, and how they and a whole run are reported.

#include "convert/problem.h"

#include "base/json.h"
#include "base/printable.h"

namespace nls2::tool {

namespace {

std::string counted(uint64_t count, std::string_view what) {
  return fmt::format("{} {}{}", count, what, count == 1 ? "" : "s");
}

const char *wasOrWere(uint64_t count) { return count == 1 ? "was" : "were"; }

Json jsonOf(const Problem &problem, const char *action) {
  const NLS2F_Problem &found = problem.found;
  const std::string_view bytes(reinterpret_cast<const char *>(found.bytes),
                               static_cast<std::size_t>(found.byteCount));
  return Json::object({{"record", problem.record},
                       {"byte", problem.byte},
                       {"column", problem.column < 0 ? Json() : Json(problem.column + 1)},
                       {"field", problem.field == 0 ? Json() : Json(problem.field)},
                       {"name", problem.name.empty() ? Json() : Json(problem.name)},
                       {"kind", kindName(problem.kind)},
                       {"hex", bytes.empty() ? Json() : Json(hexOf(bytes))},
                       {"code_point", problem.kind == NLS2F_NOT_IN_PAGE || found.codePoint != 0
                                          ? Json(fmt::format("U+{:04X}", found.codePoint))
                                          : Json()},
                       {"action", action},
                       {"message", problem.words}});
}

} // namespace

const char *kindName(int32_t kind) {
  constexpr std::array names{"none",           "invalid_bytes", "not_in_page", "no_room",
                             "embedded_null",  "no_exact_fill", "too_long",    "invalid_number",
                             "negative",       "too_large",     "too_precise", "cut_short",
                             "invalid_prefix", "spanned",       "invalid_csv", "record_too_long",
                             "invalid_layout", "invalid_format"};
  constexpr std::array own{"not_reversible", "invalid_hex", "wrong_fields"};
  return kind >= notReversible ? own[static_cast<std::size_t>(kind - notReversible)]
                               : names[static_cast<std::size_t>(kind)];
}

void Tally::add(const Tally &later) {
  records += later.records;
  rejected += later.rejected;
  replaced += later.replaced;
  replacedRecords += later.replacedRecords;
  lines += later.lines;
  bytesIn += later.bytesIn;
  bytesOut += later.bytesOut;
  for (const auto &[kind, count] : later.kinds) {
    kinds[kind] += count;
  }
  first = first ? first : later.first;
  failure = failure ? failure : later.failure;
}

std::string messageOf(const Problem &problem, std::string_view unit) {
  std::string text = fmt::format("{} {} at byte {}", unit, problem.record, problem.byte);
  if (problem.column >= 0) {
    text += fmt::format(", column {}", problem.column + 1);
  }
  if (problem.field != 0) {
    text += fmt::format(", field {}", problem.field);
  }
  if (!problem.name.empty()) {
    text += fmt::format(" ({})", printable(problem.name));
  }
  return text + ": " + problem.words;
}

std::string adviceFor(const Problem &problem) {
  switch (problem.kind) {
  case NLS2F_INVALID_BYTES:
    return "; is this the right page? --on-error replace writes a substitution character instead";
  case NLS2F_NOT_IN_PAGE:
    return "; --on-error replace writes a substitution character instead";
  case NLS2F_EMBEDDED_NULL:
    return "; replace it, or write joined texts";
  case NLS2F_CUT_SHORT:
    return "; is the format right?";
  default:
    return "";
  }
}

std::string lineOf(const Problem &problem, const char *action) {
  return jsonOf(problem, action).line();
}

std::string summaryOf(const Tally &tally, std::string_view unit) {
  if (!tally.first) {
    return "";
  }
  const std::string first = messageOf(*tally.first, unit);
  if (tally.rejected > 0) {
    return fmt::format("{} {} rejected; the first is {}", counted(tally.rejected, unit),
                       wasOrWere(tally.rejected), first);
  }
  return fmt::format("{} in {} {} replaced; the first is in {}",
                     counted(tally.replaced, "character"), counted(tally.replacedRecords, unit),
                     wasOrWere(tally.replaced), first);
}

std::string reportOf(const Tally &tally, const Plan &plan, double seconds, bool isDone) {
  const auto &first = tally.first ? tally.first : tally.failure;
  const char *action = tally.rejected > 0 ? "rejected" : tally.first ? "replaced" : "failed";
  Json kinds = Json::object();
  for (const auto &[kind, count] : tally.kinds) {
    kinds.set(kind.c_str(), count);
  }
  return Json::object({{"outcome", isDone ? "done" : "failed"},
                       {"records", tally.records},
                       {"rejected", tally.rejected},
                       {"replaced", tally.replaced},
                       {"bytes_in", tally.bytesIn},
                       {"bytes_out", tally.bytesOut},
                       {"seconds", seconds},
                       {"from", plan.from.name()},
                       {"to", plan.to.name()},
                       {"problems", kinds},
                       {"first_problem", first ? jsonOf(*first, action) : Json()}})
      .text();
}

} // namespace nls2::tool
