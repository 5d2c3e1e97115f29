// localeMap and NLS2_GetLocaleMapEntry.

#include "nls2.h"
#include "support/recording_host.h"

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

TEST(LocaleMap, LookUps) {
  const struct {
    const char *reason;
    uint32_t id;
    int row; // -1: not found
  } rows[] = {
      {"first row", 0x00240001, 0},
      {"en_US, never posix", 0x03480001, 16},
      {"es_ES of Spain, never es", 0x02D40004, 47},
      {"sv_FI carries Finnish's id and stands first", 0x00F6000A, 59},
      {"the last row but posix", 0x033A0049, 159},
      {"nothing", 0, -1},
      {"the terminator is no locale", 0xFF, -1},
      {"a country alone", 0x03480000, -1},
      {"prints as a signed number", 0xFFFFFFFF, -1},
  };
  for (const auto &row : rows) {
    SCOPED_TRACE(row.reason);
    const bool found = row.row >= 0;
    const LocaleMapEntry *expected = found ? &localeMap[row.row] : nullptr;
    const support::Recording recording(support::traceAll);
    EXPECT_EQ(NLS2_GetLocaleMapEntry(row.id), expected);
    EXPECT_EQ(recording.text({{"NLS2_GetLocaleMapEntry", "L"}}),
              "L> entry\nL: Locate the language id in the table.\nL: Language ID " +
                  std::to_string(static_cast<int32_t>(row.id)) +
                  (found ? " found in table.\nL= " + support::exitValue(expected) + "\n"
                         : " not found in table.\nL=\n"));
  }
}

} // namespace
