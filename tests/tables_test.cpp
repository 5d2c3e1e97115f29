// The tables: two are public and frozen; the third maps numbers to ICU names.

#include "nls2.h"
#include "support/pages.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>

namespace {

// FNV-1a over bytes, and over numbers as four bytes, the lowest first.
struct Digest {
  uint64_t value = 0xCBF29CE484222325;

  template <std::size_t size>
  Digest &bytes(const char (&bytes)[size]) {
    for (const char byte : bytes) {
      value = (value ^ static_cast<unsigned char>(byte)) * 0x100000001B3;
    }
    return *this;
  }
  Digest &number(uint32_t number) {
    const auto byte = [=](int i) { return static_cast<char>(number >> (8 * i)); };
    return bytes({byte(0), byte(1), byte(2), byte(3)});
  }
};

TEST(Tables, AreFrozen) {
  Digest windows;
  for (const CcsidMapEntry &entry : ccsidMap) {
    windows.bytes(entry.name).number(entry.ccsid);
  }
  EXPECT_EQ(windows.value, 15296640311129246981U);
  Digest locales;
  for (const LocaleMapEntry &entry : localeMap) {
    locales.number(entry.languageId).number(entry.asciiCcsid).number(entry.ebcdicCcsid);
    locales.bytes(entry.localeName).bytes(entry.shortName);
  }
  EXPECT_EQ(locales.value, 14162261733260850383U);
}

std::string nameOf(const icu::LocalUConverterPointer &converter) {
  UErrorCode error = U_ZERO_ERROR;
  return converter.isNull() ? "none" : ucnv_getName(converter.getAlias(), &error);
}

TEST(NamedPages, AreWhatIcuOpensByThatName) {
  for (const support::Page &page : support::pages) {
    SCOPED_TRACE(page.number);
    int32_t twoNulls = 99;
    int32_t status = 99;
    const support::Recording recording(support::traceDetail);
    const icu::LocalUConverterPointer converter(
        NLS2_MapCodepageIdToName(page.number, &twoNulls, &status));
    UErrorCode error = U_ZERO_ERROR;
    const icu::LocalUConverterPointer bare(ucnv_open(page.icuName, &error));
    EXPECT_EQ(nameOf(converter), nameOf(bare));
    EXPECT_EQ(twoNulls, page.terminator - 1);
    EXPECT_EQ(status, error);
    const std::string opened = std::string("Open a converter for codepage ") + page.icuName + ".";
    EXPECT_EQ(recording.lines().at(1) == "NLS2_MapCodepageIdToName: " + opened, page.isNamed);
  }
}

} // namespace
