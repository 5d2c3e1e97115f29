// NLS2_GetLanguageName, NLS2_GetShortPosixName and NLS2_LanguageIDFromShortPosixName.

#include "locale/scenario.h"

#include <cstdio>
#include <gtest/gtest.h>

namespace {

using support::plain;
using support::said;
using support::traced;

// The status, and the bytes of a buffer of dots with 0 for NUL. What ICU leaves in a buffer that is
// too small depends on its version.
std::string language(uint32_t languageId, int32_t length) {
  std::string buffer = "....";
  const int32_t status = NLS2_GetLanguageName(languageId, buffer.data(), length);
  for (char &byte : buffer) {
    byte = byte == '\0' ? '0' : byte;
  }
  return status == U_BUFFER_OVERFLOW_ERROR ? said(status) : said(status, buffer);
}

std::string posix(uint32_t languageId) {
  char name[16] = "untouched";
  const int32_t status = NLS2_GetShortPosixName(languageId, name, -7);
  return said(status, name);
}

std::string idOf(const char *name) {
  int32_t status = -1;
  const uint32_t languageId = NLS2_LanguageIDFromShortPosixName(name, &status);
  char digits[9];
  std::snprintf(digits, sizeof digits, "%X", languageId);
  return said(status, digits);
}

TEST(LanguageNames, AreFoundInTheTable) {
  const support::Scenario rows[] = {
      {"language", traced, [] { return language(0x03480001, 3); }, "0 en0."},
      {"language, no room for the end", plain, [] { return language(0x03480001, 2); }, "0 en.."},
      {"language, too small", traced, [] { return language(0x03480001, 1); }, "15"},
      {"language, negative length", traced, [] { return language(0x03480001, -1); }, "1 ...."},
      {"language, unknown", traced, [] { return language(0x03480002, 4); }, "39 ...."},
      {"language of the terminator", plain, [] { return language(0xFF, 4); }, "39 ...."},
      {"posix name, the first of two records", traced, [] { return posix(0x01140002); }, "0 de_DE"},
      {"posix name, not the posix record", plain, [] { return posix(0x03480001); }, "0 en_US"},
      {"posix name, unknown", traced, [] { return posix(1); }, "39 untouched"},
      {"posix name of the terminator", plain, [] { return posix(0xFF); }, "39 untouched"},
      {"language id", traced, [] { return idOf("en_US"); }, "0 3480001"},
      {"language id, the last record", plain, [] { return idOf("posix"); }, "0 3480001"},
      {"language id, a language alone", plain, [] { return idOf("de"); }, "0 1140002"},
      {"language id, letter case counts", traced, [] { return idOf("en_us"); }, "37 0"},
      {"language id, only a beginning", plain, [] { return idOf("en_U"); }, "37 0"},
      {"language id, empty, as the terminator's", plain, [] { return idOf(""); }, "37 0"},
  };
  for (const auto &row : rows) {
    support::expectScenario(row);
  }
}

} // namespace
