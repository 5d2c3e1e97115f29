// nls2 locales: the library's table of locales, or its records of one name or number.

#include "codepage/page_facts.h"
#include "io/output_file.h"
#include "locale/locale_option.h"
#include "nls2/language.hpp"
#include "options.h"

#include <memory>
#include <set>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(Language ids are decimal or 0x... A number is looked for among the language ids first. Where several
records are shown, the library's own searches take the first.
)";

struct Arguments {
  std::optional<std::string> asked;
  bool asJson = false;
};

using Records = std::vector<const LocaleMapEntry *>;

struct FoundLocales {
  const char *matchedBy;
  Records records;
};

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

FoundLocales recordsWith(uint32_t number) {
  Records records = recordsThat([=](const auto &entry) { return entry.languageId == number; });
  if (!records.empty()) {
    return {"language id", std::move(records)};
  }
  return {"code page", recordsThat([=](const auto &entry) {
            return entry.asciiCcsid == number || entry.ebcdicCcsid == number;
          })};
}

FoundLocales recordsWith(const std::string &name) {
  return {"name", recordsThat([&](const auto &entry) {
            return entry.localeName == name || entry.shortName == name;
          })};
}

// Throws Error where there is none.
FoundLocales lookUp(const std::string &asked) {
  const auto number = wholeNumber(asked);
  FoundLocales found = number ? recordsWith(*number) : recordsWith(asked);
  if (found.records.empty()) {
    throw failure("no locale has the {} {}{}; `nls2 locales` lists them all",
                  number ? "language id or code page" : "locale name or short name",
                  printable(asked), number ? "" : localesNear(asked));
  }
  return found;
}

// The records' code pages, each once.
std::set<int32_t> pagesOf(const Records &records) {
  std::set<int32_t> pages;
  for (const LocaleMapEntry *entry : records) {
    pages.insert(static_cast<int32_t>(entry->asciiCcsid));
    pages.insert(static_cast<int32_t>(entry->ebcdicCcsid));
  }
  return pages;
}

std::string asText(const Records &records) {
  std::string text =
      "row  locale   short    id                 id country language  ASCII EBCDIC\n";
  for (const LocaleMapEntry *entry : records) {
    text += fmt::format("{:>3}  {:<8} {:<8} 0x{:08X} {:>10} {:>7} {:>8} {:>6} {:>6}\n",
                        entry - localeMap, entry->localeName, entry->shortName, entry->languageId,
                        entry->languageId, entry->languageId >> 16, entry->languageId & 0xFFFF,
                        entry->asciiCcsid, entry->ebcdicCcsid);
  }
  return text;
}

Json asJson(const Records &records) {
  return Json::array(records, [](const LocaleMapEntry *entry) {
    return Json::object({{"row", entry - localeMap},
                         {"locale", entry->localeName},
                         {"shortName", entry->shortName},
                         {"languageId", entry->languageId},
                         {"languageIdHex", fmt::format("0x{:08X}", entry->languageId)},
                         {"country", entry->languageId >> 16},
                         {"language", entry->languageId & 0xFFFF},
                         {"asciiCcsid", entry->asciiCcsid},
                         {"ebcdicCcsid", entry->ebcdicCcsid}});
  });
}

std::string answer(const Arguments &arguments) {
  if (!arguments.asked) {
    const Records all = recordsThat([](const auto &) { return true; });
    return arguments.asJson ? asJson(all).text() : asText(all);
  }
  const FoundLocales found = lookUp(*arguments.asked);
  const std::set<int32_t> pages = pagesOf(found.records);
  if (arguments.asJson) {
    const auto pageAsJson = [](int32_t page) { return asJson(describePage(page)); };
    return Json::object({{"matchedBy", found.matchedBy},
                         {"records", asJson(found.records)},
                         {"codepages", Json::array(pages, pageAsJson)}})
        .text();
  }
  std::string text = asText(found.records);
  for (const int32_t page : pages) {
    text.append(1, '\n').append(asText(describePage(page)));
  }
  return text;
}

} // namespace

Command localesCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {
      .operands = {{"LOCALE-OR-PAGE", "show the records with this name, language id or code page",
                    into(arguments->asked)}},
      .options = {flag("json", "write JSON", into(arguments->asJson))},
      .notes = notes,
      .run = [arguments] { return print(answer(*arguments)), exitDone; }};
}

} // namespace nls2::tool
