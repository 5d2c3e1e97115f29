// NLS2F_DescribeProblem: a problem in English.
#include "facts.h"
#include "guard.h"
#include "translate/translator.h"

#include <algorithm>
#include <string>

namespace zelfields {
namespace {

// A number in hexadecimal, with so many digits or more.
std::string hex(uint32_t number, std::size_t digits) {
  std::string text;
  for (; number != 0 || text.size() < digits; number /= 16) {
    text.insert(text.begin(), "0123456789ABCDEF"[number % 16]);
  }
  return text;
}

std::string nameOf(const UConverter *converter) {
  UErrorCode error = U_ZERO_ERROR;
  const char *name = ucnv_getName(converter, &error);
  return U_SUCCESS(error) && name != nullptr ? name : "";
}

// "the bytes 0E 41".
std::string bytes(const NLS2F_Problem &problem) {
  const int count = std::clamp(problem.byteCount, 0, static_cast<int>(sizeof problem.bytes));
  std::string text = count == 1 ? "the byte" : "the bytes";
  for (int i = 0; i < count; ++i) {
    text += " " + hex(problem.bytes[i], 2);
  }
  return text;
}

std::string describe(const NLS2F_Translator *translator, const NLS2F_Problem &problem) {
  const auto page = [&](UConverter *(Path::*which)() const, const char *unnamed) {
    return translator != nullptr ? nameOf((translator->path.*which)()) : unnamed;
  };
  switch (problem.kind) {
  case NLS2F_INVALID_BYTES:
    return bytes(problem) + (problem.byteCount == 1 ? " is" : " are") + " not valid in " +
           page(&Path::from, "the source page");
  case NLS2F_NOT_IN_PAGE:
    return "the character U+" + hex(problem.codePoint, 4) + " is not in " +
           page(&Path::to, "the destination page");
  case NLS2F_NO_ROOM:
    return problem.needed > 0 ? "the output needs " + std::to_string(problem.needed) + " bytes"
                              : "the output has no more room";
  case NLS2F_EMBEDDED_NULL:
    return "the text has a null character inside";
  case NLS2F_NO_EXACT_FILL:
    return "blanks cannot fill the field exactly; the next shorter width is " +
           std::to_string(problem.needed);
  case NLS2F_TOO_LONG:
    return "the field has more than 2,147,483,647 bytes";
  default:
    return wordsOf(problem);
  }
}

} // namespace
} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_DescribeProblem(const NLS2F_Translator *translator, const NLS2F_Problem *problem,
                              char *text, int64_t room) {
  if (!isWhole(problem) || text == nullptr || room < 1) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  text[0] = '\0';
  return guarded([&] {
    const std::string words = describe(translator, *problem);
    text[words.copy(text, static_cast<std::size_t>(room) - 1)] = '\0';
    return 0;
  });
}
