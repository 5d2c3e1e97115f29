// Records of the library's table of locales as text and as JSON.

#include "codepage/codepage_render.h"
#include "locale/locale_lookup.h"

#include <fmt/core.h>

namespace nls2::tool {

std::string localesAsText(const LocaleRecords &records) {
  std::string text =
      fmt::format("{:>3}  {:<8} {:<8} {:<10} {:>10} {:>7} {:>8} {:>6} {:>6}\n", "row", "locale",
                  "short", "id", "id", "country", "language", "ASCII", "EBCDIC");
  for (const LocaleMapEntry *entry : records) {
    text += fmt::format("{:>3}  {:<8} {:<8} 0x{:08X} {:>10} {:>7} {:>8} {:>6} {:>6}\n",
                        entry - localeMap, entry->localeName, entry->shortName, entry->languageId,
                        entry->languageId, entry->languageId >> 16, entry->languageId & 0xFFFF,
                        entry->asciiCcsid, entry->ebcdicCcsid);
  }
  return text;
}

std::string foundLocalesAsText(const FoundLocales &found) {
  std::string text = localesAsText(found.records);
  for (const PageFacts &facts : found.pages) {
    text += "\n" + pageAsText(facts);
  }
  return text;
}

Json localesAsJson(const LocaleRecords &records) {
  Json rows = Json::array();
  for (const LocaleMapEntry *entry : records) {
    Json row = Json::object();
    row.set("row", entry - localeMap);
    row.set("locale", entry->localeName);
    row.set("shortName", entry->shortName);
    row.set("languageId", entry->languageId);
    row.set("languageIdHex", fmt::format("0x{:08X}", entry->languageId));
    row.set("country", entry->languageId >> 16);
    row.set("language", entry->languageId & 0xFFFF);
    row.set("asciiCcsid", entry->asciiCcsid);
    row.set("ebcdicCcsid", entry->ebcdicCcsid);
    rows.append(std::move(row));
  }
  return rows;
}

Json foundLocalesAsJson(const FoundLocales &found) {
  Json pages = Json::array();
  for (const PageFacts &facts : found.pages) {
    pages.append(pageAsJson(facts));
  }
  Json result = Json::object();
  result.set("matchedBy", found.matchedBy).set("records", localesAsJson(found.records));
  result.set("codepages", std::move(pages));
  return result;
}

} // namespace nls2::tool
