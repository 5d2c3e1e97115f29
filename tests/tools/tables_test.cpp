// nls2 locales, codepages and --version against the library.

#include "nls2.h"
#include "tool_runner.h"

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
  EXPECT_EQ(pages["numbers"].size(), 25U);
}

TEST(Tables, VersionIsTheLibrarysStamp) {
  const Result result = runTool("--version");
  EXPECT_EQ(result.exitCode, 0);
  EXPECT_EQ(result.out, std::string(NLS2_BuildStamp()) + "\n");
}

} // namespace

} // namespace tools
