// Writes the demo's records: country names in several languages, from ICU's locale data and encoded
// by ICU's converters, as lines of UTF-8 and as fixed-length EBCDIC records.
//
// usage: make_demo_data DIRECTORY

#include <array>
#include <cstdint>
#include <cstdio>
#include <fstream>
#include <iostream>
#include <string>
#include <unicode/locid.h>
#include <unicode/region.h>
#include <unicode/ucnv.h>
#include <unicode/unistr.h>
#include <vector>

namespace {

constexpr std::size_t recordLength = 80;

struct DemoFile {
  const char *converter;
  std::vector<const char *> languages;
};

const std::array<DemoFile, 2> demoFiles = {{
    {"ibm-1141", {"de", "fr", "es", "nl", "sv"}},
    {"ibm-930", {"ja", "ru"}},
}};

// Numbers that ISO 3166 gives out; those from 900 up are for private use.
bool isAssigned(int32_t number) { return number > 0 && number < 900; }

int32_t numberOf(const char *country) {
  UErrorCode status = U_ZERO_ERROR;
  const icu::Region *region = icu::Region::getInstance(country, status);
  return U_SUCCESS(status) ? region->getNumericCode() : 0;
}

// "AT 040 de Österreich": alpha-2 code, numeric code, language and name.
icu::UnicodeString lineOf(const char *country, const char *language) {
  icu::UnicodeString name;
  icu::Locale("", country).getDisplayCountry(icu::Locale(language), name);
  // No EBCDIC page has the typographic apostrophe.
  name.findAndReplace(icu::UnicodeString(u'\u2019'), icu::UnicodeString(u'\''));
  char codes[16];
  std::snprintf(codes, sizeof codes, "%s %03d %s ", country, static_cast<int>(numberOf(country)),
                language);
  return icu::UnicodeString(codes, -1, US_INV) + name;
}

// The line in the converter's page, or nothing where the page lacks a character.
std::string encoded(const icu::UnicodeString &line, UConverter *converter) {
  std::string bytes(static_cast<std::size_t>(line.length()) * 6, '\0');
  UErrorCode status = U_ZERO_ERROR;
  bytes.resize(static_cast<std::size_t>(
      line.extract(bytes.data(), static_cast<int32_t>(bytes.size()), converter, status)));
  return U_SUCCESS(status) ? bytes : std::string();
}

bool writeFile(const DemoFile &file, const std::string &directory) {
  UErrorCode status = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(ucnv_open(file.converter, &status));
  ucnv_setFromUCallBack(converter.getAlias(), UCNV_FROM_U_CALLBACK_STOP, nullptr, nullptr, nullptr,
                        &status);
  if (U_FAILURE(status)) {
    return false;
  }
  const std::string path = directory + "/countries." + file.converter;
  std::ofstream records(path + ".dat", std::ios::binary);
  std::ofstream lines(path + ".txt", std::ios::binary);
  for (const char *const *country = icu::Locale::getISOCountries(); *country != nullptr;
       ++country) {
    if (!isAssigned(numberOf(*country))) {
      continue;
    }
    for (const char *language : file.languages) {
      const icu::UnicodeString line = lineOf(*country, language);
      std::string record = encoded(line, converter.getAlias());
      if (record.empty() || record.size() > recordLength) {
        continue; // a name that the page cannot carry, or that is too long
      }
      record.resize(recordLength, '\x40');
      std::string utf8;
      records << record;
      lines << line.toUTF8String(utf8) << '\n';
    }
  }
  return records.good() && lines.good();
}

} // namespace

int main(int argc, char **argv) {
  if (argc != 2) {
    std::cerr << "usage: make_demo_data DIRECTORY\n";
    return 2;
  }
  for (const DemoFile &file : demoFiles) {
    if (!writeFile(file, argv[1])) {
      std::cerr << "make_demo_data: cannot write the records of " << file.converter << "\n";
      return 1;
    }
  }
  return 0;
}
