// The order of strings by the rules of a language, as the library's comparison has it.
#pragma once

#include "locale/locale_option.h"
#include "text/text_check.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace nls2::tool {

class StringOrder {
public:
  static constexpr int32_t mostBytes = INT16_MAX; // of a string; the library's lengths have 16 bits

  // Throws Error.
  StringOrder(const LocaleOptions &locale, bool ignoreTrailing);

  // Why a string cannot be compared; nothing where it can.
  std::optional<std::string> refusal(std::string_view text) { return check_.refusal(text); }

  // -1, 0 or 1. The strings must have passed refusal(). For any number of threads at a time. Throws
  // Failure.
  int32_t compare(std::string_view a, std::string_view b) const;

private:
  const LocaleObject locale_;
  const uint32_t options_;
  TextCheck check_;
};

} // namespace nls2::tool
