// NLS2_TranslateString: whole trace sequences, with the closes of converters in their places, one
// call a way out.

#include "nls2.h"
#include "support/icu_probe.h"
#include "support/recording_host.h"

#include <gtest/gtest.h>
#include <memory>
#if defined(__SANITIZE_ADDRESS__)
#include <sanitizer/lsan_interface.h>
#endif

namespace {

using namespace std::string_literals;
using support::Recording;

// NOLINTNEXTLINE(clang-analyzer-optin.performance.Padding): in the order in which a row reads
struct Row {
  const char *reason;
  int32_t destCodePage;
  int32_t destLen;
  int32_t sourceCodePage;
  std::string source;
  int32_t sourceLen;
  uint32_t options;
  const char *failingFunction; // of ICU's, at this call, with status 7; null: none
  int failingCall;
  int32_t result;
  int32_t status;
  std::string tail; // the lines behind the common start
};

std::string checked(const Row &row) {
  char line[160];
  std::snprintf(
      line, sizeof line,
      "T> entry\nT: Input options are %X.\nT: Input parameters. destLen %d, sourceLen %d, "
      "sourceCodePage %d, destCodePage %d\n",
      row.options, row.destLen, row.sourceLen, row.sourceCodePage, row.destCodePage);
  return line;
}

std::string dump(const std::string &bytes) {
  std::string line = "T#";
  for (const char byte : bytes) {
    char digits[4];
    std::snprintf(digits, sizeof digits, " %02X", static_cast<unsigned char>(byte));
    line += digits;
  }
  return line + "\n";
}

std::string open(int32_t codepage, int status = 0) {
  const std::string number = std::to_string(codepage);
  std::string how = "Codepage " + number + " not mapped to name. Using codepage as CCSID instead.";
  if (codepage == 1200) {
    how = "Open a converter for codepage utf-16be.\n"
          "M: Codepage uses two null character as a string terminator..";
  } else if (codepage == 57363 || codepage == 1208) {
    how = "Open a converter for codepage "s + (codepage == 1208 ? "utf-8" : "scsu") + ".";
  }
  return "M> entry\nM: Open a converter for codepage number " + number + ".\nM: " + how + "\n" +
         (status > 0 ? "" : "+ucnv\n") + "M: Open converter results " + std::to_string(status) +
         (status > 0 ? ".\nM= 0\n" : ".\nM= converter\n");
}

// Checks, dump and both opens.
std::string opened(const Row &row) {
  return checked(row) + dump(row.source) + open(row.sourceCodePage) + open(row.destCodePage);
}

std::string tracedCall(const Row &row) {
  const size_t size = static_cast<size_t>(std::max(row.destLen, 0));
  const auto dest = std::make_unique<char[]>(size + 1);
  int32_t consumed = -1;
  int32_t status = -1;
  const support::FailingConversion failing(row.failingFunction != nullptr ? row.failingFunction
                                                                          : "none",
                                           row.failingCall, U_MEMORY_ALLOCATION_ERROR);
  const Recording recording(support::traceAll);
  const support::ConverterMarks marks;
  EXPECT_EQ(NLS2_TranslateString(row.destCodePage, dest.get(), row.destLen, row.sourceCodePage,
                                 row.source.c_str(), row.sourceLen, &consumed, row.options,
                                 &status),
            row.result);
  EXPECT_EQ(status, row.status);
  std::string text = recording.text(
      {{"NLS2_TranslateString", "T"}, {"NLS2_MapCodepageIdToName", "M"}, {"realloc_mem", "R"}});
  for (size_t at = text.find("M= "); at != std::string::npos; at = text.find("M= ", at + 3)) {
    if (text[at + 3] != '0') {
      text.replace(at + 3, text.find('\n', at) - at - 3, "converter");
    }
  }
  return text;
}

constexpr auto icuDirect = "ucnv_convertEx";
constexpr auto toUnicode = "ucnv_toUChars";
constexpr auto fromUnicode = "ucnv_fromUChars";

const std::string close = "-ucnv\n-ucnv\n";
const std::string directly = "T: Option specified 0.  Translate the input buffer directly\n";
const std::string finished =
    close + "T: Conversion successful\nT: Account for extra nulls, if required.\n";
const std::string allocated =
    "T: Allocate memory to hold entire utf16 string.\nR> entry\nR=\nT: Convert source to UChars.\n";

std::string trimmed(const char *options, int blanks, int length) {
  return "T: Converting with options "s + options + ".\n" + allocated + "T: There were " +
         std::to_string(blanks) + " trailing blanks in source string.\n" +
         "T: Resulting non-space filled string length is " + std::to_string(length) + ".\n";
}

const std::string stripping =
    "T: STRIP TRAILING option is specified, convert string to destination codepage.\n";
const std::string padding = "T: Option is string file and or strip trailing.\n";
const std::string afterTrailing =
    "T: NLS2_STRING_TRAILING set.\nT: maximumBufferLength is adjusted to ";
const std::string afterFill = "T: NLS2_STRING_FILL set.\nT: maximumBufferLength is adjusted to ";
const std::string ab = "\xC1\xC2\x40";

TEST(TranslateTrace, WaysOutBeforeTheConversion) {
  const Row options{"", 819, 8, 37, ab, 3, 0xABC01, nullptr, 0, 0, 37, ""};
  EXPECT_EQ(tracedCall(options), "T> entry\nT: Input options not allowed. ABC01.\nT= 0\n");

  const Row parameters{"", 0, -1, 37, ab, 3, 8, nullptr, 0, 0, 37, ""};
  EXPECT_EQ(tracedCall(parameters),
            "T> entry\nT: Input options are 8.\nT: Invalid input parameter. destLen -1, sourceLen "
            "3, sourceCodePage 37, destCodePage 0\nT= 0\n");

  const Row empty{"", 819, 0, 37, "", 0, 0, nullptr, 0, 0, 0, ""};
  EXPECT_EQ(tracedCall(empty), checked(empty) + "T: Input source length is zero.\nT= 0\n");

  const Row source{"", 819, 8, 57364, ab, -5, 0, nullptr, 0, 0, 4, ""};
  EXPECT_EQ(tracedCall(source), checked(source) + dump(ab) + open(57364, 4) +
                                    "T: Error getting a source codepage converter 4.\nT= 0\n");

  const Row dest{"", 57364, 8, 37, ab, 3, 0x100, nullptr, 0, 0, 4, ""};
  EXPECT_EQ(tracedCall(dest),
            checked(dest) + dump(ab) + open(37) + open(57364, 4) +
                "T: Error getting a destination codepage converter 4.\n-ucnv\nT= 0\n");
}

TEST(TranslateTrace, ConversionsAndTheirFailures) {
  const std::string clefs = "\xF0\x9D\x84\x80\xF0\x9D\x84\x81\xF0\x9D\x84\x82\xF0\x9D\x84\x83"s;
  const Row rows[] = {
      {"direct", 819, 9, 37, ab, 3, 0, nullptr, 0, 3, 0,
       directly + finished +
           "T: Output parameters. destLen 9,amountWritten 3\nT# 41 42 20\nT= 3\n"},
      {"direct, one null", 819, 9, 37, ab, -1, 0, nullptr, 0, 4, 0,
       directly + finished +
           "T: Amount written includes one null.  4.\n"
           "T: Output parameters. destLen 9,amountWritten 4\nT# 41 42 20 00\nT= 4\n"},
      {"direct, two nulls, the second behind destLen", 1200, 7, 37, ab, -1, 0, nullptr, 0, 8, 0,
       directly + finished +
           "T: Amount written includes utf-16 nulls 8.\nT: Output parameters. destLen "
           "7,amountWritten 8\nT# 00 41 00 42 00 20 00 00\nT= 8\n"},
      {"direct, no room for a null", 819, 3, 37, ab, -1, 0, nullptr, 0, 3, 0,
       directly + close +
           "T: Conversion successful\nT: Output parameters. destLen 3,amountWritten 3\n"
           "T# 41 42 20\nT= 3\n"},
      {"direct, too small", 819, 2, 37, ab, 3, 0, nullptr, 0, 0, 15,
       directly + "T: Error converting string 15.\n" + close + "T= 0\n"},
      {"direct, ICU fails", 819, 9, 37, ab, 3, 0, icuDirect, 1, 0, 7,
       directly + "T: Error converting string 7.\n" + close + "T= 0\n"},
      {"source preflight fails", 819, 9, 37, ab, 3, 0x100, toUnicode, 1, 0, 7,
       "T: Converting with options 100.\nT: Error pre-flighting source to UChars 7\n" + close +
           "T= 0\n"},
      {"source conversion fails", 819, 9, 37, ab, 3, 0x100, toUnicode, 2, 0, 7,
       "T: Converting with options 100.\n" + allocated +
           "T: Error converting source to UChars 7.\n" + close + "T= 0\n"},
      {"destination preflight fails", 819, 9, 37, ab, 3, 0x100, fromUnicode, 1, 0, 7,
       trimmed("100", 1, 2) + "T: Error pre-flighting temp buffer to destination cp 7.\n" + close +
           "T= 0\n"},
      {"text too long", 819, 2, 37, ab, 3, 0x4008, nullptr, 0, 0, 15,
       trimmed("4008", 1, 2) + "T: Destination buffer must be at least 2 bytes in length.\n" +
           close + "T= 0\n"},
      {"strip", 819, 9, 37, ab, 3, 0x4000, nullptr, 0, 2, 0,
       trimmed("4000", 1, 2) + stripping + close +
           "T: Output parameters. destLen 9,amountWritten 2\nT# 41 42\nT= 2\n"},
      {"strip: destLen is told without the terminator", 1200, 8, 37, ab, -3, 0x4008, nullptr, 0, 4,
       0,
       trimmed("4008", 1, 2) + stripping + close +
           "T: Output parameters. destLen 6,amountWritten 4\nT# 00 41 00 42\nT= 4\n"},
      {"strip: eight units in seven bytes, of which no eighth is read", 57363, 7, 1208, clefs, 16,
       0x4000, nullptr, 0, 8, 0,
       trimmed("4000", 0, 8) + stripping + close +
           "T: Output parameters. destLen 7,amountWritten 8\nT# 0B E1 A2 80 81 82 83\nT= 8\n"},
      {"strip fails", 819, 9, 37, ab, 3, 0x4000, fromUnicode, 2, 0, 7,
       trimmed("4000", 1, 2) + stripping + close + "T: Error converting to destination 7.\nT= 0\n"},
      {"trailing, terminated", 819, 5, 37, ab, 3, 0x208, nullptr, 0, 5, 0,
       trimmed("208", 1, 2) + padding + afterTrailing + "3.\n" + close +
           "T: Output parameters. destLen 4,amountWritten 5\nT# 41 42 20 00 00\nT= 5\n"},
      {"fill after trailing, two nulls", 1200, 2, 37, "\x40", 1, 0x308, nullptr, 0, 2, 0,
       trimmed("308", 1, 0) + padding + afterTrailing + "0.\n" + afterFill + "0.\n" + close +
           "T: Output parameters. destLen 0,amountWritten 2\nT# 00 00\nT= 2\n"},
      {"fill, tried twice", 1200, 4, 37, ab, 3, 0x100, nullptr, 0, 4, 0,
       trimmed("100", 1, 2) + padding + afterFill +
           "4.\nT: Overflowed buffer because of blanks, possible problem.\n"
           "T: Reduce amount to convert by 4.characters to fit\n" +
           close + "T: Output parameters. destLen 4,amountWritten 4\nT# 00 41 00 42\nT= 4\n"},
      {"padded conversion fails", 819, 4, 37, ab, 3, 0x100, fromUnicode, 2, 0, 7,
       trimmed("100", 1, 2) + padding + afterFill +
           "4.\nT: Error converting from UChars to destination codepage 7.\n" + close + "T= 0\n"},
      {"second attempt fails", 1200, 4, 37, ab, 3, 0x100, fromUnicode, 3, 0, 7,
       trimmed("100", 1, 2) + padding + afterFill +
           "4.\nT: Overflowed buffer because of blanks, possible problem.\n"
           "T: Reduce amount to convert by 4.characters to fit\n"
           "T: Error converting from UChars to destination codepage 7.\n" +
           close + "T= 0\n"},
  };
  for (const Row &row : rows) {
    SCOPED_TRACE(row.reason);
    const int before = support::openConverters();
    EXPECT_EQ(tracedCall(row), opened(row) + row.tail);
    EXPECT_EQ(support::openConverters(), before);
  }
}

TEST(TranslateTrace, RefusedOptionLeavesTwoConvertersOpen) {
#if defined(__SANITIZE_ADDRESS__)
  const __lsan::ScopedDisabler theLeakIsMeant;
#endif
  const Row row{"", 819, 8, 37, ab, 3, 0x9, nullptr, 0, 0, 36, ""};
  const int before = support::openConverters();
  EXPECT_EQ(tracedCall(row),
            opened(row) + trimmed("9", 1, 2) + "T: Invalid option specified.\nT= 0\n");
  EXPECT_EQ(support::openConverters(), before + 2);
}

} // namespace
