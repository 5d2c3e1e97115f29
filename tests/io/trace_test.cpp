// Whole trace sequences of streams and bundles, and the calls of ICU between them.

#include "io/io_fixture.h"
#include "support/heap_probe.h"
#include "support/recording_host.h"

#include <algorithm>
#include <cstring>
#include <functional>
#include <unicode/ustdio.h>
#include <vector>

namespace {

using io_test::deadLocale;
using support::exitValue;
using support::hex;
using support::Recording;
using Lines = std::vector<std::string>;

// Units that consist of these bytes, whatever the machine's order.
std::u16string unitsOf(const std::string &bytes) {
  std::u16string units(bytes.size() / 2, u'\0');
  std::memcpy(units.data(), bytes.data(), units.size() * 2);
  return units;
}

class IoTrace : public testing::Test {
protected:
  const io_test::LocalePointer locale_ = io_test::makeLocale("de_AT");
  const io_test::TempFile file_;
};

struct Member {
  const char *function;
  const char *icuFunction;
  std::string detail; // behind pLocale's value; empty: the function prints no arguments
  std::string refused;
  std::function<std::string(const NLS2_Locale *)> call; // the exit event's value
};

Lines sequence(const Member &member, const NLS2_Locale *locale, bool live,
               const std::string &result) {
  const std::string name = member.function;
  Lines lines{name + "> entry"};
  if (!member.detail.empty()) {
    lines.push_back(name + ": Input parameters: pLocale " + hex(locale) + ", " + member.detail);
  }
  lines.insert(lines.end(), {"NLS2_ValidateLocale> entry",
                             live ? "NLS2_ValidateLocale: Locale successfully found on linked-list."
                                  : "NLS2_ValidateLocale: Could not find locale on linked-list.",
                             live ? "NLS2_ValidateLocale= 0" : "NLS2_ValidateLocale= 38"});
  if (live && member.icuFunction != nullptr) {
    lines.emplace_back(member.icuFunction);
  }
  lines.push_back(name + "= " + result);
  return lines;
}

TEST_F(IoTrace, MembersWithALocaleAskIcuOnlyForALiveOne) {
  const NLS2_Locale *const live = locale_.get();
  UFILE *stream = nullptr;
  UFILE *unlocated = u_fopen(file_.path(), "w+", nullptr, "UTF-8");
  UChar buffer[8];
  std::memcpy(buffer, "old\0", 4);
  const std::u16string text = unitsOf("ABCD");
  const std::string path = file_.path();
  int32_t status = 0;
  UResourceBundle *bundle = nullptr;
  const std::string handle = hex(unlocated);
  const Member members[] = {
      {"NLS2_OpenStream", "u_fopen", "filename " + path + ", permissions w+, encoding UTF-8 ", "0",
       [&](const NLS2_Locale *l) {
         stream = NLS2_OpenStream(l, path.c_str(), "w+", "UTF-8");
         return exitValue(stream);
       }},
      {"NLS2_OpenStream", "u_fopen", "filename /, permissions w, encoding (null) ", "0",
       [&](const NLS2_Locale *l) { return exitValue(NLS2_OpenStream(l, "/", "w", nullptr)); }},
      {"NLS2_WriteString", "u_file_write", "pSource ABCD, len 2, fileHandle " + handle + ".", "0",
       [&](const NLS2_Locale *l) {
         return std::to_string(NLS2_WriteString(l, text.data(), 2, unlocated));
       }},
      {"NLS2_Fputs", "u_fputs", "pString ABCD, fileHandle " + handle + ".", "0",
       [&](const NLS2_Locale *l) {
         return std::to_string(NLS2_Fputs(l, text.c_str(), unlocated));
       }},
      {"NLS2_ReadString", "u_file_read", "", "0",
       [&](const NLS2_Locale *l) {
         UChar unit = 0;
         return std::to_string(NLS2_ReadString(l, unlocated, &unit, 1));
       }},
      {"NLS2_Fgets", "u_fgets", "fileHandle " + handle + ", pDest old, len 8.", "0",
       [&](const NLS2_Locale *l) {
         u_frewind(unlocated);
         std::memcpy(buffer, "old\0", 4);
         return exitValue(NLS2_Fgets(l, unlocated, buffer, 8));
       }},
      {"NLS2_CloseStream", "u_fclose", "file " + handle + ".", "38",
       [&](const NLS2_Locale *l) { return std::to_string(NLS2_CloseStream(l, unlocated)); }},
      {"NLS2_CloseStream", nullptr, "file 0.", "38",
       [&](const NLS2_Locale *l) { return std::to_string(NLS2_CloseStream(l, nullptr)); }},
      {"NLS2_ResourceOpen", "ures_open", "", "0",
       [&](const NLS2_Locale *l) {
         bundle = NLS2_ResourceOpen(MESSAGES_DIR, l, &status);
         return exitValue(bundle);
       }},
  };
  for (const Member &member : members) {
    for (const NLS2_Locale *locale : {deadLocale(), live}) {
      const Recording recording(support::traceAll);
      const std::string result = member.call(locale);
      Lines lines = recording.lines();
      // The test's own rewinding.
      lines.erase(std::remove(lines.begin(), lines.end(), "u_frewind"), lines.end());
      EXPECT_EQ(lines, sequence(member, locale, locale == live, result)) << member.function;
      EXPECT_TRUE(locale == live || result == member.refused) << member.function << " " << result;
    }
  }
  NLS2_CloseStream(locale_.get(), stream);
  NLS2_ResourceClose(bundle);
}

TEST_F(IoTrace, MembersWithoutALocale) {
  UFILE *stream = u_fopen(file_.path(), "w", nullptr, "UTF-8");
  int32_t status = 0;
  int32_t length = 0;
  UResourceBundle *bundle = NLS2_ResourceOpen(MESSAGES_DIR, locale_.get(), &status);
  const Recording recording(support::traceAll);
  NLS2_Fflush(stream);
  NLS2_Frewind(stream);
  const char *name = NLS2_detectUnicodeSignature("\xFE\xFF", 2, &length, &status);
  NLS2_detectUnicodeSignature(nullptr, 2, &length, &status);
  const UChar *string = NLS2_GetStringByKey(bundle, "farewell", &length, &status);
  NLS2_GetStringByKey(bundle, "no_such_key", &length, &status);
  NLS2_ResourceClose(bundle);
  const Lines expected{
      "NLS2_Fflush> entry",
      "u_fflush",
      "NLS2_Fflush=",
      "NLS2_Frewind> entry",
      "u_frewind",
      "NLS2_Frewind=",
      "NLS2_detectUnicodeSignature> entry",
      "ucnv_detectUnicodeSignature",
      "NLS2_detectUnicodeSignature: Detected unicode signature. 0",
      "NLS2_detectUnicodeSignature= " + exitValue(name),
      "NLS2_detectUnicodeSignature> entry",
      "ucnv_detectUnicodeSignature",
      "NLS2_detectUnicodeSignature: Detected unicode signature. 1",
      "NLS2_detectUnicodeSignature= 0",
      "NLS2_GetStringByKey> entry",
      "ures_getStringByKey",
      "NLS2_GetStringByKey: Get String by Key results -128",
      "NLS2_GetStringByKey= " + exitValue(string),
      "NLS2_GetStringByKey> entry",
      "ures_getStringByKey",
      "NLS2_GetStringByKey: Get String by Key results 2",
      "NLS2_GetStringByKey= 0",
      "NLS2_ResourceClose> entry",
      "ures_close",
      "NLS2_ResourceClose=",
  };
  Lines lines = recording.lines();
  // Rewinding flushes; ICU's inner calls are its own affair.
  lines.erase(std::remove(lines.begin() + 3, lines.end(), "u_fflush"), lines.end());
  EXPECT_EQ(lines, expected);
  u_fclose(stream);
}

// The text that NLS2_WriteString prints of a source; no ICU call follows.
std::string printed(const UChar *source, int32_t length) {
  const Recording recording(support::traceDetail);
  NLS2_WriteString(deadLocale(), source, length, nullptr);
  const std::string line = recording.details("NLS2_WriteString").at(0);
  const std::size_t start = line.find("pSource ") + 8;
  return line.substr(start, line.rfind(", len") - start);
}

TEST_F(IoTrace, TextsEndAtTheirLengthOrFirstZeroByte) {
  const std::string longText(100000, 'x');
  const struct {
    const char *reason;
    std::string bytes; // what the source consists of, and no byte more
    int32_t length;
    std::string text;
  } cases[] = {
      {"no null: all of it", "ABCD", 2, "ABCD"},
      {"a length within the text", "ABCD", 1, "AB"},
      {"a length of nothing", "ABCD", 0, ""},
      {"a zero byte within a unit", std::string("A\0CD", 4), 2, "A"},
      {"a zero byte first", std::string("\0A", 2), 1, ""},
      {"null-terminated", std::string("ABCDEF\0\0", 8), -1, "ABCDEF"},
      {"longest short one", longText.substr(0, 62), 31, longText.substr(0, 62)},
      {"shortest long one", longText.substr(0, 64), 32, longText.substr(0, 64)},
      {"no length is too long", longText, 50000, longText},
  };
  for (const auto &c : cases) {
    const std::u16string units = unitsOf(c.bytes);
    const std::vector<UChar> exact(units.begin(), units.end());
    EXPECT_EQ(printed(exact.data(), c.length), c.text) << c.reason;
  }
  EXPECT_EQ(printed(nullptr, 3), "(null)");
}

TEST_F(IoTrace, AnOutputBufferIsPrintedUpToItsCapacity) {
  const std::u16string units = unitsOf("ABCD");
  std::vector<UChar> buffer(units.begin(), units.end());
  for (const auto &[length, text] : {std::pair{2, "ABCD"}, {1, "AB"}, {0, ""}, {-1, ""}}) {
    const Recording recording(support::traceDetail);
    NLS2_Fgets(nullptr, nullptr, buffer.data(), length);
    EXPECT_EQ(recording.details("NLS2_Fgets"),
              Lines{"Input parameters: pLocale 0, fileHandle 0, pDest " + std::string(text) +
                    ", len " + std::to_string(length) + "."});
  }
}

TEST_F(IoTrace, WithoutMemoryATextPrintsItsBeginning) {
  if (!support::heapCanRefuse) {
    GTEST_SKIP() << "the sanitizer's heap cannot be made to refuse";
  }
  const std::u16string units = unitsOf(std::string(4444, 'y'));
  const support::FailingMallocs failing(4444 + 1);
  EXPECT_EQ(printed(units.data(), 2222), std::string(63, 'y'));
}

} // namespace
