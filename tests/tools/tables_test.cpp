// nls2 locales, codepages and --version against the library's own tables.

#include "nls2.h"
#include "tool_runner.h"

#include <cstdarg>
#include <gtest/gtest.h>

namespace tools {

namespace {

[[gnu::format(printf, 1, 2)]] std::string line(const char *format, ...) {
  char text[512];
  va_list arguments;
  va_start(arguments, format);
  vsnprintf(text, sizeof text, format, arguments);
  va_end(arguments);
  return text;
}

std::string answer(const std::string &arguments) {
  const Result result = runTool(arguments);
  EXPECT_EQ(result.exitCode, 0) << result.err;
  return result.out;
}

TEST(Tables, LocalesAreTheTableWithoutTerminator) {
  std::string text =
      "row  locale   short    id                 id country language  ASCII EBCDIC\n";
  std::string json = "[\n";
  for (int i = 0; i < NLS2_LOCALE_MAP_RECORDS - 1; ++i) {
    const LocaleMapEntry &e = localeMap[i];
    text += line("%3d  %-8s %-8s 0x%08X %10u %7u %8u %6u %6u\n", i, e.localeName, e.shortName,
                 e.languageId, e.languageId, e.languageId >> 16, e.languageId & 0xFFFF,
                 e.asciiCcsid, e.ebcdicCcsid);
    json += line("  {\n    \"row\": %d,\n    \"locale\": \"%s\",\n    \"shortName\": \"%s\",\n"
                 "    \"languageId\": %u,\n    \"languageIdHex\": \"0x%08X\",\n"
                 "    \"country\": %u,\n    \"language\": %u,\n    \"asciiCcsid\": %u,\n"
                 "    \"ebcdicCcsid\": %u\n  }%s\n",
                 i, e.localeName, e.shortName, e.languageId, e.languageId, e.languageId >> 16,
                 e.languageId & 0xFFFF, e.asciiCcsid, e.ebcdicCcsid,
                 i + 2 < NLS2_LOCALE_MAP_RECORDS ? "," : "");
  }
  EXPECT_EQ(answer("locales"), text);
  EXPECT_EQ(answer("locales --json"), json + "]\n");
}

TEST(Tables, VersionIsTheLibrarysStamp) {
  for (const char *line : {"--version", "sort --version", "sort a --version"}) {
    EXPECT_EQ(answer(line), std::string(NLS2_BuildStamp()) + "\n");
  }
}

} // namespace

} // namespace tools
