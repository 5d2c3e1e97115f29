// nls2 locales and nls2 codepages: the library's tables, as text or as JSON.

#include "commands.h"
#include "nls2.h"
#include "output_file.h"
#include "status.h"

#include <array>
#include <fmt/core.h>
#include <memory>
#include <nlohmann/json.hpp>
#include <string>
#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace nls2::tool {

namespace {

using Json = nlohmann::ordered_json;

void print(const std::string &text) {
  OutputFile out("-");
  out.write(text);
}

Json localesAsJson() {
  Json rows = Json::array();
  for (const LocaleMapEntry *entry = localeMap; entry->languageId != NLS2_LANGUAGE_ID_END;
       ++entry) {
    rows.push_back({{"row", entry - localeMap},
                    {"locale", entry->localeName},
                    {"shortName", entry->shortName},
                    {"languageId", entry->languageId},
                    {"languageIdHex", fmt::format("0x{:08X}", entry->languageId)},
                    {"country", entry->languageId >> 16},
                    {"language", entry->languageId & 0xFFFF},
                    {"asciiCcsid", entry->asciiCcsid},
                    {"ebcdicCcsid", entry->ebcdicCcsid}});
  }
  return rows;
}

std::string localesAsText() {
  std::string text =
      fmt::format("{:>3}  {:<8} {:<8} {:<10} {:>10} {:>7} {:>8} {:>6} {:>6}\n", "row", "locale",
                  "short", "id", "id", "country", "language", "ASCII", "EBCDIC");
  for (const Json &row : localesAsJson()) {
    text += fmt::format("{:>3}  {:<8} {:<8} {:<10} {:>10} {:>7} {:>8} {:>6} {:>6}\n",
                        row["row"].get<int>(), row["locale"].get<std::string>(),
                        row["shortName"].get<std::string>(),
                        row["languageIdHex"].get<std::string>(), row["languageId"].get<uint32_t>(),
                        row["country"].get<uint32_t>(), row["language"].get<uint32_t>(),
                        row["asciiCcsid"].get<uint32_t>(), row["ebcdicCcsid"].get<uint32_t>());
  }
  return text;
}

// The numbers that nls2.h lists as opened by name; what they open, the library is asked.
constexpr std::array namedPages{874,   932,   936,   949,   950,   1200,  1208,  57352, 57355,
                                57356, 57357, 57358, 57359, 57360, 57361, 57362, 57363, 57365,
                                57366, 57367, 57368, 57369, 57370, 57371, 57372};

// The converter is null where the number does not open, and the status then says why.
Json codepageAsJson(int32_t number) {
  int32_t twoNull = 0;
  int32_t status = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(NLS2_MapCodepageIdToName(number, &twoNull, &status));
  UErrorCode nameStatus = U_ZERO_ERROR;
  const char *name = converter.isNull() ? nullptr : ucnv_getName(converter.getAlias(), &nameStatus);
  return {{"codepage", number},
          {"opens", !converter.isNull()},
          {"converter", name != nullptr ? Json(name) : Json()},
          {"twoNullTerminator", twoNull != 0},
          {"status", status},
          {"statusName", statusName(status)}};
}

Json codepagesAsJson() {
  Json names = Json::array();
  for (const CcsidMapEntry *entry = ccsidMap; entry->ccsid != NLS2_CCSID_MAP_END; ++entry) {
    names.push_back({{"name", entry->name}, {"codepage", entry->ccsid}});
  }
  Json numbers = Json::array();
  for (const int32_t number : namedPages) {
    numbers.push_back(codepageAsJson(number));
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

// A command without arguments that shows a table, as text or as JSON.
void addTable(CLI::App &app, const char *name, const char *description, std::string (*text)(),
              Json (*json)()) {
  CLI::App &command = *app.add_subcommand(name, description);
  const auto asJson = std::make_shared<bool>(false);
  command.add_flag("--json", *asJson, "write JSON");
  command.footer("The tables' terminator records are left out.");
  command.callback([=] { print(*asJson ? json().dump(2) + "\n" : text()); });
}

} // namespace

void addLocalesCommand(CLI::App &app) {
  addTable(app, "locales", "List the locales that the library knows", localesAsText, localesAsJson);
}

void addCodepagesCommand(CLI::App &app) {
  addTable(app, "codepages", "List code pages by number and by Windows name", codepagesAsText,
           codepagesAsJson);
}

} // namespace nls2::tool
