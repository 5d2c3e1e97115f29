// Records of the library's table of locales: which ones are meant.

#include "locale/locale_lookup.h"

#include "locale/locale_option.h"
#include "options.h"

#include <set>

namespace nls2::tool {

namespace {

template <class IsWanted>
LocaleRecords recordsThat(IsWanted isWanted) {
  LocaleRecords records;
  for (const LocaleMapEntry *entry = localeMap; entry->languageId != NLS2_LANGUAGE_ID_END;
       ++entry) {
    if (isWanted(*entry)) {
      records.push_back(entry);
    }
  }
  return records;
}

FoundLocales recordsWith(uint32_t number) {
  LocaleRecords records =
      recordsThat([=](const auto &entry) { return entry.languageId == number; });
  if (!records.empty()) {
    return {"language id", std::move(records), {}};
  }
  return {"code page",
          recordsThat([=](const auto &entry) {
            return entry.asciiCcsid == number || entry.ebcdicCcsid == number;
          }),
          {}};
}

FoundLocales recordsWith(const std::string &name) {
  return {"name",
          recordsThat([&](const auto &entry) {
            return entry.localeName == name || entry.shortName == name;
          }),
          {}};
}

} // namespace

LocaleRecords allLocales() {
  return recordsThat([](const auto &) { return true; });
}

FoundLocales lookUpLocale(const std::string &asked) {
  const auto number = wholeNumber(asked);
  FoundLocales found = number ? recordsWith(*number) : recordsWith(asked);
  if (found.records.empty()) {
    throw failure("no locale has the {} {}{}; `nls2 locales` lists them all",
                  number ? "language id or code page" : "locale name or short name",
                  printable(asked), number ? "" : localesNear(asked));
  }
  std::set<int32_t> pages;
  for (const LocaleMapEntry *entry : found.records) {
    pages.insert(static_cast<int32_t>(entry->asciiCcsid));
    pages.insert(static_cast<int32_t>(entry->ebcdicCcsid));
  }
  for (const int32_t page : pages) {
    found.pages.push_back(describePage(page));
  }
  return found;
}

} // namespace nls2::tool
