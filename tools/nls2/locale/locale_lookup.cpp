// Records of the library's table of locales.

#include "locale/locale_lookup.h"

#include "codepage/codepage_lookup.h"
#include "errors.h"
#include "options.h"

#include <fmt/core.h>
#include <set>

namespace nls2::tool {

namespace {

using Json = nlohmann::ordered_json;

struct Match {
  const char *by;
  Json records;
};

Match recordsWith(uint32_t number) {
  Json records = describeRecords([=](const auto &entry) { return entry.languageId == number; });
  if (!records.empty()) {
    return {"language id", std::move(records)};
  }
  return {"code page", describeRecords([=](const auto &entry) {
            return entry.asciiCcsid == number || entry.ebcdicCcsid == number;
          })};
}

Match recordsWith(const std::string &name) {
  return {"name", describeRecords([&](const auto &entry) {
            return entry.localeName == name || entry.shortName == name;
          })};
}

} // namespace

Json describeRecord(const LocaleMapEntry &entry) {
  return {{"row", &entry - localeMap},
          {"locale", entry.localeName},
          {"shortName", entry.shortName},
          {"languageId", entry.languageId},
          {"languageIdHex", fmt::format("0x{:08X}", entry.languageId)},
          {"country", entry.languageId >> 16},
          {"language", entry.languageId & 0xFFFF},
          {"asciiCcsid", entry.asciiCcsid},
          {"ebcdicCcsid", entry.ebcdicCcsid}};
}

std::string recordsAsText(const Json &rows) {
  std::string text =
      fmt::format("{:>3}  {:<8} {:<8} {:<10} {:>10} {:>7} {:>8} {:>6} {:>6}\n", "row", "locale",
                  "short", "id", "id", "country", "language", "ASCII", "EBCDIC");
  for (const Json &row : rows) {
    text += fmt::format("{:>3}  {:<8} {:<8} {:<10} {:>10} {:>7} {:>8} {:>6} {:>6}\n",
                        row["row"].get<int>(), row["locale"].get<std::string>(),
                        row["shortName"].get<std::string>(),
                        row["languageIdHex"].get<std::string>(), row["languageId"].get<uint32_t>(),
                        row["country"].get<uint32_t>(), row["language"].get<uint32_t>(),
                        row["asciiCcsid"].get<uint32_t>(), row["ebcdicCcsid"].get<uint32_t>());
  }
  return text;
}

Json lookUpLocale(const std::string &asked) {
  const auto number = wholeNumber(asked);
  const Match match = number ? recordsWith(*number) : recordsWith(asked);
  if (match.records.empty()) {
    throw failure("no locale has the {} {}; `nls2 locales` lists them all",
                  number ? "language id or code page" : "locale name or short name", asked);
  }
  std::set<int32_t> pages;
  for (const Json &record : match.records) {
    pages.insert(record["asciiCcsid"].get<int32_t>());
    pages.insert(record["ebcdicCcsid"].get<int32_t>());
  }
  Json codepages = Json::array();
  for (const int32_t page : pages) {
    codepages.push_back(describeCodepage(page));
  }
  return {{"matchedBy", match.by}, {"records", match.records}, {"codepages", codepages}};
}

std::string foundLocaleAsText(const Json &found) {
  std::string text = recordsAsText(found["records"]);
  for (const Json &description : found["codepages"]) {
    text += "\n" + descriptionAsText(description);
  }
  return text;
}

} // namespace nls2::tool
