// nls2 locales and nls2 codepages: the library's tables, or what they say of one name or number, as
// text or as JSON.

#include "codepage/codepage_lookup.h"
#include "commands.h"
#include "io/output_file.h"
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

void print(const std::string &text) {
  OutputFile out("-");
  out.write(text);
}

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

// A command that shows a table, or what is known of one argument.
CLI::App &addTable(CLI::App &app, const char *name, const char *description, const char *argument,
                   const char *argumentDescription, const Table &table) {
  CLI::App &command = *app.add_subcommand(name, description);
  const auto asJson = std::make_shared<bool>(false);
  const auto asked = std::make_shared<std::string>();
  const CLI::Option *option =
      command.add_option(argument, *asked, argumentDescription)->type_name("");
  command.add_flag("--json", *asJson, "write JSON");
  command.callback(
      [=] { print(shown(table, option->count() != 0 ? asked.get() : nullptr, *asJson)); });
  return command;
}

} // namespace

void addLocalesCommand(CLI::App &app) {
  addTable(app, "locales", "List the locales that the library knows", "NAME-OR-ID",
           "show the records with this name, language id (decimal or 0x...) or code page, and what "
           "ICU makes of their code pages",
           {localesAsText, localesAsJson, lookUpLocale, foundLocaleAsText})
      .footer("The table's terminator record is left out. Where several records are shown, the "
              "library's own searches take the first.");
}

void addCodepagesCommand(CLI::App &app) {
  addTable(app, "codepages", "List code pages by number and by Windows name", "NAME-OR-NUMBER",
           "show what the library and ICU make of this code page",
           {codepagesAsText, codepagesAsJson, lookUpCodepage, foundCodepageAsText})
      .footer("A number is the library's; everything else is a name as ICU spells them: cp037, "
              "latin1, windows-1252. The table's terminator record is left out.");
}

} // namespace nls2::tool
