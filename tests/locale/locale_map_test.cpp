// localeMap and NLS2_GetLocaleMapEntry.

#include "nls2.h"
#include "support/known_trace.h"

#include <cstdio>
#include <fstream>
#include <gtest/gtest.h>

namespace {

// A name field, all of its bytes.
std::string field(const char (&name)[132]) { return {name, sizeof name}; }
std::string padded(std::string name) {
  name.resize(132);
  return name;
}

// locale_map.tsv holds a row a line: locale name, short name, language id, ASCII and EBCDIC page.
TEST(LocaleMap, TableIsFrozen) {
  std::ifstream rows(LOCALE_MAP_TSV);
  std::string line;
  size_t i = 0;
  for (; std::getline(rows, line) && i < NLS2_LOCALE_MAP_RECORDS; ++i) {
    SCOPED_TRACE("row " + std::to_string(i));
    const LocaleMapEntry &entry = localeMap[i];
    const size_t second = line.find('\t') + 1;
    const size_t third = line.find('\t', second) + 1;
    EXPECT_EQ(field(entry.localeName), padded(line.substr(0, second - 1)));
    EXPECT_EQ(field(entry.shortName), padded(line.substr(second, third - second - 1)));
    char numbers[64];
    std::snprintf(numbers, sizeof numbers, "0x%08X\t%u\t%u", entry.languageId, entry.asciiCcsid,
                  entry.ebcdicCcsid);
    EXPECT_EQ(numbers, line.substr(third));
  }
  EXPECT_EQ(i, size_t{NLS2_LOCALE_MAP_RECORDS});
  EXPECT_TRUE(rows.eof());
}

TEST(LocaleMap, EveryIdIsFoundInItsFirstRow) {
  for (const LocaleMapEntry &entry : localeMap) {
    const LocaleMapEntry *first = localeMap;
    while (first->languageId != entry.languageId) {
      ++first;
    }
    EXPECT_EQ(NLS2_GetLocaleMapEntry(entry.languageId),
              entry.languageId == NLS2_LANGUAGE_ID_END ? nullptr : first)
        << entry.localeName;
  }
}

TEST(LocaleMap, TracesLookUps) {
  const struct {
    const char *section;
    uint32_t id;
    const LocaleMapEntry *entry;
  } rows[] = {
      {"look up en_US", 0x03480001, &localeMap[16]},
      {"look up a country alone", 0x03480000, nullptr},
      {"look up nothing", 0, nullptr},
      {"look up what prints as a signed number", 0xFFFFFFFF, nullptr},
  };
  for (const auto &row : rows) {
    const support::Recording recording(support::traceAll);
    EXPECT_EQ(NLS2_GetLocaleMapEntry(row.id), row.entry) << row.section;
    support::expectKnownTrace(row.section, recording, {{row.entry, "entry"}});
  }
}

} // namespace
