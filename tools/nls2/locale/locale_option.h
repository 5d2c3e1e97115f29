// The options --locale and --codepage, and the locale object that they ask for.
#pragma once

#include "codepage/code_page.h"
#include "options.h"

#include <cstdint>
#include <optional>
#include <string>

struct NLS2_Locale;

namespace nls2::tool {

struct LocaleOptions {
  std::optional<std::string> locale; // a name or a language id of localeMap
  int32_t codepage = utf8Page;
};

std::vector<Option> localeOptions(LocaleOptions &options);

class LocaleObject {
public:
  // Throws Error.
  explicit LocaleObject(const LocaleOptions &options);
  ~LocaleObject();
  LocaleObject(const LocaleObject &) = delete;
  LocaleObject &operator=(const LocaleObject &) = delete;

  const NLS2_Locale *get() const { return pLocale_; }

private:
  NLS2_Locale *pLocale_ = nullptr;
};

} // namespace nls2::tool
