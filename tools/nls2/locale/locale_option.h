// The options --locale and --codepage, and the locale that applies without --locale.
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
  std::optional<std::string> locale; // of localeMap, in ICU's spelling
  CodePage codepage = CodePage::utf8();
};

// " (did you mean de_DE?)": the locale of the same language; empty if there is none.
std::string localeNear(const std::string &name);

// The two options, followed by the command's own.
std::vector<Option> localeOptions(LocaleOptions &options, std::vector<Option> own);

// The locale that determines the order, byCodePoint for C and POSIX: from --locale or from the
// environment (LC_ALL, LC_COLLATE, LANG). For the environment it may be another locale of the
// language. Throws usageError if localeMap has no locale of that language.
std::string orderLocale(const LocaleOptions &options);

// ICU's name of the locale whose rules of case apply. The environment's may be any.
std::string caseLocale(const LocaleOptions &options);

} // namespace nls2::tool
