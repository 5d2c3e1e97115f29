// Records of the library's table of locales.
#pragma once

#include "nls2.h"

#include <nlohmann/json.hpp>
#include <string>

namespace nls2::tool {

nlohmann::ordered_json describeRecord(const LocaleMapEntry &entry);

template <class Wanted>
nlohmann::ordered_json describeRecords(Wanted wanted) {
  nlohmann::ordered_json rows = nlohmann::ordered_json::array();
  for (const LocaleMapEntry *entry = localeMap; entry->languageId != NLS2_LANGUAGE_ID_END;
       ++entry) {
    if (wanted(*entry)) {
      rows.push_back(describeRecord(*entry));
    }
  }
  return rows;
}

// A heading and one line a record.
std::string recordsAsText(const nlohmann::ordered_json &rows);

// The records with a language id, a locale name or short POSIX name, or a code page, and their code
// pages. Throws Error where there is none.
nlohmann::ordered_json lookUpLocale(const std::string &asked);
std::string foundLocaleAsText(const nlohmann::ordered_json &found);

} // namespace nls2::tool
