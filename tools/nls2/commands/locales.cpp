// nls2 locales and nls2 codepages: the library's tables, or what they say of one name or number, as
// text or as JSON.

#include "codepage/codepage_lookup.h"
#include "commands.h"
#include "io/print.h"
#include "locale/locale_lookup.h"
#include "nls2.h"

#include <array>
#include <fmt/core.h>
#include <memory>
#include <nlohmann/json.hpp>
#include <string>

namespace nls2::tool {

namespace {

using Json = nlohmann::ordered_json;

Json localesAsJson() {
  return describeRecords([](const LocaleMapEntry &) { return true; });
}

std::string localesAsText() { return recordsAsText(localesAsJson()); }

Json codepagesAsJson() {
  Json names = Json::array();
  for (const CcsidMapEntry *entry = ccsidMap; entry->ccsid != NLS2_CCSID_MAP_END; ++entry) {
    names.push_back({{"name", entry->name}, {"codepage", entry->ccsid}});
  }
  Json numbers = Json::array();
  for (const int32_t number : pagesWithNames) {
    numbers.push_back(describeCodepage(number));
  }
  return {{"windowsNames", names}, {"numbers", numbers}};
}

std::string codepagesAsText() {
  const Json pages = codepagesAsJson();
  std::string text = "Numbers opened by name (any other number is opened as a CCSID of ICU's):\n";
  for (const Json &row : pages["numbers"]) {
    text += fmt::format("{:>6}  {}{}\n", row["codepage"].get<int32_t>(),
                        row["opens"].get<bool>()
                            ? row["converter"].get<std::string>()
                            : "does not open: " + row["statusName"].get<std::string>(),
                        row["twoNullTerminator"].get<bool>() ? ", two-null terminator" : "");
  }
  text += "\nWindows names:\n";
  for (const Json &row : pages["windowsNames"]) {
    text +=
        fmt::format("{:>6}  {}\n", row["codepage"].get<uint32_t>(), row["name"].get<std::string>());
  }
  return text;
}

struct Table {
  std::string (*text)();
  Json (*json)();
  Json (*lookUp)(const std::string &); // throws Failure
  std::string (*foundAsText)(const Json &);
};

std::string shown(const Table &table, const std::string *asked, bool asJson) {
  if (asked == nullptr) {
    return asJson ? table.json().dump(2) + "\n" : table.text();
  }
  const Json found = table.lookUp(*asked);
  return asJson ? found.dump(2) + "\n" : table.foundAsText(found);
}

int show(const Table &table, const std::string *asked, bool asJson) {
  print(shown(table, asked, asJson));
  return exitDone;
}

// A command that shows a table, or what is known of one argument.
Command tableCommand(const char *metavar, const char *help, const char *notes, const Table &table) {
  struct Arguments {
    std::optional<std::string> asked;
    bool asJson = false;
  };
  const auto arguments = std::make_shared<Arguments>();
  Command command;
  command.operands = {
      {metavar, help, [arguments](const std::string &text) { arguments->asked = text; }}};
  command.options = {{.name = "json", .help = "write JSON", .take = into(arguments->asJson)}};
  command.notes = notes;
  command.run = [=] {
    return show(table, arguments->asked ? &*arguments->asked : nullptr, arguments->asJson);
  };
  return command;
}

} // namespace

Command localesCommand() {
  return tableCommand(
      "NAME-OR-ID", "show the records with this name, language id or code page",
      "Language ids are decimal or 0x... Where several records are shown, the library's own\n"
      "searches take the first.\n",
      {localesAsText, localesAsJson, lookUpLocale, foundLocaleAsText});
}

Command codepagesCommand() {
  return tableCommand(
      "NAME-OR-NUMBER", "show what the library and ICU make of this code page",
      "A number is the library's; everything else is a name as ICU spells them: cp037, latin1,\n"
      "windows-1252.\n",
      {codepagesAsText, codepagesAsJson, lookUpCodepage, foundCodepageAsText});
}

} // namespace nls2::tool
