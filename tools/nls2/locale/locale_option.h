// The options --locale and --codepage, and the locale that a command follows without --locale.
#pragma once

#include "base/options.h"
#include "codepage/code_page.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace nls2::tool {

inline constexpr std::string_view byCodePoint = "en_US_POSIX"; // ICU's name of the locale C

struct LocaleOptions {
  std::optional<std::string> locale; // the name in ICU's spelling of a locale that is known
  int32_t codepage = utf8Page;
};

// " (did you mean de_DE?)" for a name that is not in the table.
std::string localeNear(const std::string &name);

// The two options, and after them a command's own.
std::vector<Option> localeOptions(LocaleOptions &options, std::vector<Option> own);

// The locale whose order of texts counts, byCodePoint for C and POSIX: of --locale, or of the
// environment (LC_ALL, LC_COLLATE, LANG), which may also be another locale of a language that
// localeMap holds. Throws usageError where localeMap does not hold the environment's language.
std::string orderLocale(const LocaleOptions &options);

// Whether i without a dot is a letter of the locale's language. The environment's language may be
// any.
bool hasDotlessI(const LocaleOptions &options);

} // namespace nls2::tool
