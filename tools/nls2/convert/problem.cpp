// What keeps a record from being translated, where it is, and how it is said.

#include "convert/problem.h"

#include <fmt/core.h>

namespace nls2::tool {

namespace {

// "byte FF", "bytes D0 96"
std::string bytesText(const Problem &problem) {
  return fmt::format("{} {}", problem.byteCount == 1 ? "byte" : "bytes", problem.hex());
}

std::string tooLong(const Problem &problem) {
  const std::string takes = fmt::format("the text takes {} bytes, but ", problem.needed);
  switch (problem.limitedBy) {
  case Limit::fieldWidth:
    return fmt::format("{}the width is {}", takes, problem.limit);
  case Limit::ownLength:
    return fmt::format("{}the field has {}", takes, problem.limit);
  default:
    return fmt::format("{}--out-length is {}", takes, problem.limit);
  }
}

std::string notReversible(const Problem &problem) {
  if (problem.byteCount == 0) {
    return fmt::format("it does not come back from code page {}", problem.page);
  }
  if (problem.cameBack < 0) {
    return fmt::format("the byte {} does not come back from code page {}", problem.hex(),
                       problem.page);
  }
  return fmt::format("the byte {} comes back from code page {} as {:02X}", problem.hex(),
                     problem.page, problem.cameBack);
}

const char *widerAdvice(Limit limitedBy, const char *forOutLength) {
  switch (limitedBy) {
  case Limit::fieldWidth:
    return "; give the field another width";
  case Limit::ownLength:
    return "; give the field a width, or --out-length";
  default:
    return forOutLength;
  }
}

} // namespace

std::string Problem::hex() const {
  std::string text;
  for (std::size_t i = 0; i < byteCount; ++i) {
    text += fmt::format("{}{:02X}", i > 0 ? " " : "", static_cast<unsigned char>(bytes[i]));
  }
  return text;
}

std::string Problem::codePointText() const {
  return kind == ProblemKind::notInPage ? fmt::format("U+{:04X}", static_cast<uint32_t>(codePoint))
                                        : "";
}

std::string_view kindName(ProblemKind kind) {
  switch (kind) {
  case ProblemKind::invalidBytes:
    return "invalid bytes";
  case ProblemKind::notInPage:
    return "not in the page";
  case ProblemKind::tooLong:
    return "too long";
  case ProblemKind::nullInside:
    return "null inside";
  case ProblemKind::noExactFill:
    return "no exact fill";
  case ProblemKind::notReversible:
    return "not reversible";
  case ProblemKind::shortRecord:
    return "short record";
  default:
    return "no memory";
  }
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
  switch (problem.kind) {
  case ProblemKind::invalidBytes:
    return fmt::format("the {} {} not valid in code page {}", bytesText(problem),
                       problem.byteCount == 1 ? "is" : "are", problem.page);
  case ProblemKind::notInPage:
    return fmt::format("the character {}{} is not in code page {}", problem.codePointText(),
                       problem.byteCount > 0 ? " (" + bytesText(problem) + ")" : "", problem.page);
  case ProblemKind::tooLong:
    return tooLong(problem);
  case ProblemKind::nullInside:
    return "a null (U+0000) is inside the text, where --strip, --fill and --keep-blanks would cut "
           "it";
  case ProblemKind::noExactFill:
    return fmt::format("filled with blanks it can be {} bytes long, but not {}", problem.needed,
                       problem.limit);
  case ProblemKind::notReversible:
    return notReversible(problem);
  case ProblemKind::shortRecord:
    return fmt::format("the input ends after {} of {} bytes", problem.needed, problem.limit);
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

} // namespace nls2::tool
