// nls2 locales, codepages, --version and --help.

#include "nls2.h"
#include "tool_runner.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace tools {

namespace {

using Json = nlohmann::json;

Json jsonOf(const std::string &arguments) {
  const Result result = runTool(arguments);
  EXPECT_EQ(result.exitCode, 0) << result.err;
  return Json::parse(result.out);
}

TEST(Tables, LocalesAsJsonAreTheTableWithoutTerminator) {
  const Json rows = jsonOf("locales --json");
  ASSERT_EQ(rows.size(), NLS2_LOCALE_MAP_RECORDS - 1U);
  for (std::size_t i = 0; i < rows.size(); ++i) {
    const LocaleMapEntry &entry = localeMap[i];
    const Json &row = rows[i];
    EXPECT_EQ(row["row"], i);
    EXPECT_EQ(row["locale"], entry.localeName);
    EXPECT_EQ(row["shortName"], entry.shortName);
    EXPECT_EQ(row["languageId"], entry.languageId);
    EXPECT_EQ(std::stoul(row["languageIdHex"].get<std::string>(), nullptr, 16), entry.languageId);
    EXPECT_EQ(row["country"].get<uint32_t>() << 16 | row["language"].get<uint32_t>(),
              entry.languageId);
    EXPECT_EQ(row["asciiCcsid"], entry.asciiCcsid);
    EXPECT_EQ(row["ebcdicCcsid"], entry.ebcdicCcsid);
  }
}

TEST(Tables, CodepagesAsJson) {
  const Json pages = jsonOf("codepages --json");
  const Json &names = pages["windowsNames"];
  ASSERT_EQ(names.size(), NLS2_CCSID_MAP_RECORDS - 1U);
  for (std::size_t i = 0; i < names.size(); ++i) {
    EXPECT_EQ(names[i]["name"], ccsidMap[i].name);
    EXPECT_EQ(names[i]["codepage"], ccsidMap[i].ccsid);
  }
  const Json &numbers = pages["numbers"];
  EXPECT_EQ(numbers.size(), 25U);
  const auto find = [&](int number) {
    return *std::find_if(numbers.begin(), numbers.end(),
                         [&](const Json &row) { return row["codepage"] == number; });
  };
  EXPECT_EQ(find(57359)["converter"], "UTF-16LE");
  EXPECT_EQ(find(57359)["twoNullTerminator"], true);
  EXPECT_EQ(find(1208)["twoNullTerminator"], false);
  EXPECT_EQ(find(57355)["opens"], false);
  EXPECT_EQ(find(57355)["converter"], nullptr);
  EXPECT_EQ(find(57355)["statusName"], "U_FILE_ACCESS_ERROR (4)");
}

TEST(Tables, AsText) {
  const struct {
    const char *arguments;
    std::ptrdiff_t lines;
    const char *text;
  } cases[] = {
      {"locales", NLS2_LOCALE_MAP_RECORDS, " 64  ja       ja       0x0188000B   25690123     392"},
      {"codepages", 25 + 11 + 3, "57366  UTF-7\n"},
      {"codepages", 25 + 11 + 3, "57356  does not open: U_FILE_ACCESS_ERROR (4)\n"},
      {"codepages", 25 + 11 + 3, "  1200  UTF-16BE, two-null terminator\n"},
      {"codepages", 25 + 11 + 3, " 57371  windows-54936\n"},
  };
  for (const auto &c : cases) {
    const Result result = runTool(std::string(c.arguments));
    EXPECT_EQ(result.exitCode, 0);
    EXPECT_EQ(std::count(result.out.begin(), result.out.end(), '\n'), c.lines) << c.arguments;
    EXPECT_NE(result.out.find(c.text), std::string::npos) << c.text << "\n" << result.out;
  }
}

TEST(Tables, VersionIsTheLibrarysStamp) {
  const Result result = runTool("--version");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.out, std::string(NLS2_BuildStamp()) + "\n");
}

TEST(Tables, HelpSaysWhatIsSurprising) {
  const Result result = runTool("translate --help");
  EXPECT_EQ(result.exitCode, 0);
  for (const char *text : {"nulls, which count as blanks", "substitution character", "--newline"}) {
    EXPECT_NE(result.out.find(text), std::string::npos) << text;
  }
}

} // namespace

} // namespace tools
