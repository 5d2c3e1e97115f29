// Records of the library's table of locales: which ones are meant, as text and as JSON.
#pragma once

#include "codepage/codepage_lookup.h"
#include "json.h"
#include "nls2.h"

#include <string>
#include <vector>

namespace nls2::tool {

using LocaleRecords = std::vector<const LocaleMapEntry *>;

LocaleRecords allLocales();

struct FoundLocales {
  const char *matchedBy = "";
  LocaleRecords records;
  std::vector<PageFacts> pages; // the records' code pages, each once
};

// The records with a language id, a locale name or short POSIX name, or a code page. Throws Error
// where there is none.
FoundLocales lookUpLocale(const std::string &asked);

std::string localesAsText(const LocaleRecords &records); // a heading and one line a record
std::string foundLocalesAsText(const FoundLocales &found);

Json localesAsJson(const LocaleRecords &records);
Json foundLocalesAsJson(const FoundLocales &found);

} // namespace nls2::tool
