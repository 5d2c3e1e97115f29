// nls2 locales NAME-OR-ID and nls2 codepages NAME-OR-NUMBER.

#include "tool_runner.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace tools {

namespace {

using Json = nlohmann::json;

Json found(const std::string &arguments) {
  const Result result = runTool(arguments + " --json");
  EXPECT_EQ(result.exitCode, 0) << result.err;
  return result.exitCode == 0 ? Json::parse(result.out) : Json();
}

// One field of every element.
std::vector<Json> column(const Json &rows, const char *field) {
  std::vector<Json> values;
  for (const Json &row : rows) {
    values.push_back(row[field]);
  }
  return values;
}

TEST(Lookup, CodepagesByTheSpellingsThatPeopleUse) {
  const struct {
    const char *reason;
    const char *asked;
    std::vector<Json> numbers;
    std::vector<Json> converters;
    bool tablesDiffer;
  } rows[] = {
      {"a number", "37", {37}, {"ibm-37_P100-1995"}, false},
      {"leading zeros are not octal", "037", {37}, {"ibm-37_P100-1995"}, false},
      {"hexadecimal", "0xE00F", {57359}, {"UTF-16LE"}, false},
      {"an alias of ICU's", "cp037", {37}, {"ibm-37_P100-1995"}, false},
      {"a name without digits", "latin1", {819}, {"ISO-8859-1"}, false},
      {"a converter without a CCSID", "utf-7", {57366}, {"UTF-7"}, false},
      {"the number in the name has another table",
       "windows-1252",
       {5348, 1252},
       {"ibm-5348_P100-1997", "ibm-1252_P100-2000"},
       true},
      {"ICU's number of the name has another table",
       "windows-932",
       {943, 932},
       {"ibm-943_P130-1999", "ibm-943_P15A-2003"},
       true},
      {"names of a number have another table", "932", {932}, {"ibm-943_P15A-2003"}, true},
      {"a number of the library's that does not open", "57355", {57355}, {nullptr}, false},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    const Json answer = found(std::string("codepages ") + row.asked);
    EXPECT_EQ(column(answer["numbers"], "codepage"), row.numbers);
    EXPECT_EQ(column(answer["numbers"], "converter"), row.converters);
    EXPECT_EQ(answer["tablesDiffer"], row.tablesDiffer);
    const Result text = runTool(std::string("codepages ") + row.asked);
    EXPECT_EQ(text.out.find("Beware") != std::string::npos, row.tablesDiffer) << text.out;
  }
}

TEST(Lookup, CodepageIsDescribedWhole) {
  EXPECT_EQ(found("codepages 57359")["numbers"],
            Json::parse(R"json([{"codepage": 57359, "opens": true, "converter": "UTF-16LE",
              "ccsid": 1202, "twoNullTerminator": true, "maxCharSize": 2, "windowsNames": [],
              "status": 0, "statusName": "U_ZERO_ERROR (0)"}])json"));
  EXPECT_EQ(found("codepages windows-65000")["numbers"],
            Json::parse(R"json([{"codepage": 57366, "opens": true, "converter": "UTF-7",
              "ccsid": null, "twoNullTerminator": false, "maxCharSize": 4,
              "windowsNames": ["windows-65000"], "status": 0, "statusName": "U_ZERO_ERROR (0)"
}])json"));
  EXPECT_EQ(runTool("codepages cp037").out, "Code page 37\n"
                                            "  opens                yes\n"
                                            "  converter            ibm-37_P100-1995\n"
                                            "  CCSID                37\n"
                                            "  largest character    1 byte(s) a UTF-16 unit\n"
                                            "  two-null terminator  no\n"
                                            "The name cp037 opens ibm-37_P100-1995\n");
}

TEST(Lookup, LocalesByIdNameAndCodepage) {
  const struct {
    const char *reason;
    const char *asked;
    const char *by;
    std::vector<Json> locales;
    std::vector<Json> pages;
  } rows[] = {
      {"hexadecimal id", "0x00380003", "language id", {"fr_BE"}, {819, 1147}},
      {"decimal id", "3670019", "language id", {"fr_BE"}, {819, 1147}},
      {"an id of two records", "0x01140002", "language id", {"de_DE", "de"}, {819, 1141}},
      {"a name", "fr_BE", "name", {"fr_BE"}, {819, 1147}},
      {"a name of two records", "es_ES", "name", {"es_ES", "es_ES"}, {819, 284}},
      {"a short name that is no locale name", "sr_LA", "name", {"sr_Latn"}, {915, 1025}},
      {"a code page", "912", "code page", {}, {912}},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    const Json answer = found(std::string("locales ") + row.asked);
    EXPECT_EQ(answer["matchedBy"], row.by);
    const std::vector<Json> locales = column(answer["records"], "locale");
    if (row.locales.empty()) {
      EXPECT_NE(std::find(locales.begin(), locales.end(), "hr_HR"), locales.end());
    } else {
      EXPECT_EQ(locales, row.locales);
    }
    const std::vector<Json> pages = column(answer["codepages"], "codepage");
    for (const Json &page : row.pages) {
      EXPECT_EQ(std::count(pages.begin(), pages.end(), page), 1) << page;
    }
    const Result text = runTool(std::string("locales ") + row.asked);
    EXPECT_NE(text.out.find("Code page " + row.pages[0].dump()), std::string::npos) << text.out;
  }
}

TEST(Lookup, UnknownIsAFailureWithAMessage) {
  const struct {
    const char *arguments;
    const char *message;
  } rows[] = {
      {"codepages 99999", "code page 99999 is unknown"},
      {"codepages 4294967259", "code page 4294967259 is unknown"}, // -37 as a signed number
      {"codepages no-such", "code page \"no-such\" is unknown"},
      {"codepages windows-99999", "code page \"windows-99999\" is unknown"},
      {"codepages 57364", "code page 57364 is unknown"},
      {"locales 255", "no locale has the language id or code page 255"},
      {"locales en_us", "no locale has the locale name or short name en_us"},
  };
  for (const auto &row : rows) {
    const Result result = runTool(std::string(row.arguments));
    EXPECT_EQ(result.exitCode, 1) << row.arguments;
    EXPECT_EQ(result.out, "") << row.arguments;
    EXPECT_NE(result.err.find(row.message), std::string::npos) << result.err;
  }
}

TEST(Lookup, EmptyArgumentIsNotTheWholeTable) {
  for (const char *command : {"codepages", "locales"}) {
    const Result result = runTool(std::vector<std::string>{command, ""});
    EXPECT_EQ(result.exitCode, 1) << command;
    EXPECT_EQ(result.out, "") << command;
  }
}

} // namespace

} // namespace tools
