// nls2 locales: the table of locales, or its records with a given name or number.

#include "base/options.h"
#include "codepage/page_lookup.h"
#include "io/output_file.h"
#include "locale/locale_option.h"
#include "nls2/language.hpp"

#include <functional>
#include <memory>
#include <set>
#include <utility>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Language ids are decimal or 0x... A number is looked up as a language id first, then as a code page.
If several records are shown, the library's own searches use the first.
)";

struct Arguments {
  std::optional<std::string> asked;
  bool asJson = false;
};

using Records = std::vector<const LocaleMapEntry *>;

template <class IsWanted>
Records recordsThat(IsWanted isWanted) {
  Records records;
  for (const LocaleMapEntry &entry : locale_records()) {
    if (isWanted(entry)) {
      records.push_back(&entry);
    }
  }
  return records;
}

// The first kind of match that finds records, and the records. Throws Error if there is none.
std::pair<const char *, Records> lookUp(const std::string &asked) {
  const auto number = wholeNumber(asked);
  const std::pair<const char *, std::function<bool(const LocaleMapEntry &)>> ways[] = {
      {"name", [&](const auto &it) { return it.localeName == asked || it.shortName == asked; }},
      {"language id", [&](const auto &it) { return it.languageId == number; }},
      {"code page",
       [&](const auto &it) { return it.asciiCcsid == number || it.ebcdicCcsid == number; }}};
  for (const auto &[matchedBy, isWanted] : ways) {
    if (Records records = recordsThat(isWanted); !records.empty()) {
      return {matchedBy, std::move(records)};
    }
  }
  throw failure("no locale has the {} {}{}; `nls2 locales` lists them all",
                number ? "language id or code page" : "locale name or short name", printable(asked),
                number ? "" : localeNear(asked));
}

// The code pages of the records, each once.
std::set<int32_t> pagesOf(const Records &records) {
  std::set<int32_t> pages;
  for (const LocaleMapEntry *entry : records) {
    pages.insert(static_cast<int32_t>(entry->asciiCcsid));
    pages.insert(static_cast<int32_t>(entry->ebcdicCcsid));
  }
  return pages;
}

Answer describe(const Records &records) {
  std::string text =
      "row  locale   short    id                 id country language  ASCII EBCDIC\n";
  Json rows = Json::array();
  for (const LocaleMapEntry *entry : records) {
    const auto row = entry - localeMap;
    const language_id id(entry->languageId);
    const std::string hex = fmt::format("0x{:08X}", id.number());
    text += fmt::format("{:>3}  {:<8} {:<8} {} {:>10} {:>7} {:>8} {:>6} {:>6}\n", row,
                        entry->localeName, entry->shortName, hex, id.number(), id.country(),
                        id.language(), entry->asciiCcsid, entry->ebcdicCcsid);
    rows.append(Json::object({{"row", row},
                              {"locale", entry->localeName},
                              {"short_name", entry->shortName},
                              {"language_id", id.number()},
                              {"language_id_hex", hex},
                              {"country", id.country()},
                              {"language", id.language()},
                              {"ascii_ccsid", entry->asciiCcsid},
                              {"ebcdic_ccsid", entry->ebcdicCcsid}}));
  }
  return {text, rows};
}

Answer answer(const std::optional<std::string> &asked) {
  if (!asked) {
    return describe(recordsThat([](const auto &) { return true; }));
  }
  const auto [matchedBy, records] = lookUp(*asked);
  auto [text, rows] = describe(records);
  Json pages = Json::array();
  for (const int32_t number : pagesOf(records)) {
    const Answer page = describePage(number);
    text += "\n" + page.text;
    pages.append(page.json);
  }
  return {text, Json::object({{"matched_by", matchedBy}, {"records", rows}, {"codepages", pages}})};
}

} // namespace

Command localesCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {
      .operands = {{"LOCALE-OR-PAGE", "show the records with this name, language id or code page",
                    into(arguments->asked)}},
      .options = {flag("json", "write JSON", into(arguments->asJson))},
      .notes = notes,
      .run = [arguments] { return print(answer(arguments->asked).rendered(arguments->asJson)); }};
}

} // namespace nls2::tool
