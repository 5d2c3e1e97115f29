// NLS2_TranslateString over every size of the destination, against bare ICU.

#include "convert/translate_oracle.h"
#include "nls2.h"
#include "support/icu_probe.h"

#include <gtest/gtest.h>
#include <memory>

namespace {

using oracle::Outcome;
using oracle::Page;
using oracle::Request;

#if defined(__SANITIZE_ADDRESS__)
constexpr size_t canaries = 0; // the sanitizer watches the block's end
#else
constexpr size_t canaries = 8;
#endif

// Both texts in blocks of exactly their size; the direct path of a two-null page may write one byte
// more.
Outcome call(const Request &request, size_t destSize) {
  const size_t sourceSize =
      request.sourceLen < 0 ? std::strlen(request.bytes.c_str()) + 1 : request.bytes.size();
  const auto source = std::make_unique<char[]>(sourceSize);
  std::memcpy(source.get(), request.bytes.c_str(), sourceSize);
  const auto dest = std::make_unique<char[]>(destSize);
  std::memset(dest.get(), '\xA5', destSize);
  int32_t consumed = -9;
  int32_t status = -9;
  const int32_t result =
      NLS2_TranslateString(request.dest.number, dest.get(), request.destLen, request.source.number,
                           source.get(), request.sourceLen, &consumed, request.options, &status);
  return {result, status, consumed, std::string(dest.get(), destSize)};
}

std::string shown(const Outcome &outcome) {
  std::string text = "result " + std::to_string(outcome.result) + ", status " +
                     std::to_string(outcome.status) + ", consumed " +
                     std::to_string(outcome.consumed) + ",";
  for (const char byte : outcome.dest) {
    char digits[4];
    std::snprintf(digits, sizeof digits, " %02X", static_cast<unsigned char>(byte));
    text += digits;
  }
  return text;
}

void expectAnswer(const Request &request) {
  const bool direct = request.options == 0 || request.options == NLS2_STRING_TERMINATE;
  const size_t second = direct && request.dest.terminator == 2 ? 1 : 0;
  const size_t destSize = static_cast<size_t>(request.destLen) + std::max(canaries, second);
  const Outcome expected = oracle::translate(request, std::string(destSize, '\xA5'));
  const int before = support::openConverters();
  const Outcome outcome = call(request, destSize);
  ASSERT_EQ(support::openConverters(), before);
  ASSERT_EQ(shown(outcome), shown(expected))
      << std::hex << "options " << request.options << std::dec << ", sourceLen "
      << request.sourceLen << ", destLen " << request.destLen;
}

constexpr uint32_t everyOption[] = {0,      8,      0x100,  0x108,  0x200,  0x208,   0x300, 0x308,
                                    0x4000, 0x4008, 0x4100, 0x4308, 0x1201, 0x40001, 1};

// Every option, length form and size of the destination, up to four bytes more than the whole text
// takes.
void sweep(const Page &source, const Page &dest, const std::string &bytes) {
  const auto whole =
      static_cast<int32_t>(oracle::encode(dest, oracle::decode(source, bytes)).size());
  for (const int32_t sourceLen : {static_cast<int32_t>(bytes.size()), -1, -2}) {
    for (const uint32_t options : everyOption) {
      for (int32_t destLen = 0; destLen <= whole + 4; ++destLen) {
        expectAnswer({source, dest, bytes, sourceLen, destLen, options});
        if (testing::Test::HasFatalFailure()) {
          return;
        }
      }
    }
  }
}

const Page latin1{819, "iso-8859-1", 1};
const Page ebcdic{37, "ibm-37", 1};
const Page katakana{930, "ibm-930", 1};
const Page japanese{939, "ibm-939", 1};
const Page utf8{1208, "utf-8", 1};
const Page utf16be{1200, "utf-16be", 2};
const Page utf16le{57359, "utf-16le", 2};
const Page utf16{57368, "utf-16", 2};
const Page utf32be{57360, "utf-32be", 1};
const Page hz{57362, "hz", 1};
const Page scsu{57363, "scsu", 1};
const Page utf7{57366, "utf-7", 1};

const std::pair<const Page &, const Page &> pairs[] = {
    {ebcdic, utf8},    {utf8, ebcdic},    {katakana, utf8}, {utf8, japanese}, {latin1, utf16be},
    {latin1, utf16le}, {utf16le, ebcdic}, {utf8, utf16},    {utf8, utf32be},  {utf16be, hz},
    {hz, utf8},        {utf8, scsu},      {utf8, utf7},     {utf7, utf16le},  {utf16, latin1}};

std::string nameOf(const Page &source, const Page &dest) {
  return std::to_string(source.number) + " to " + std::to_string(dest.number);
}

TEST(TranslateSweep, Texts) {
  using namespace std::string_literals;
  const struct {
    const char *reason;
    std::u16string text;
  } inputs[] = {
      {"empty", u""s},
      {"no blanks", u"ABC"s},
      {"trailing blanks", u"AB   "s},
      {"blanks only", u"    "s},
      {"blanks inside and before", u" A  B "s},
      {"tabs are blanks, a line feed is none", u"A\n\t \t"s},
      {"ideographic and no-break spaces", u"\u65E5\u672C\u3000\u00A0 "s},
      {"null at the end", u"AB\0"s},
      {"nulls among trailing blanks", u"AB \0 \0"s},
      {"null inside cuts", u"AB \0CD  "s},
      {"nulls only", u"\0\0"s},
      {"null first", u"\0AB "s},
      {"diacritics", u"Gr\u00FC\u00DFe\u00E5 "s},
      {"shifts between single and double bytes", u"a\u65E5b\u672C  "s},
      {"supplementary characters", u"A\U0001D11E\U00020000 "s},
      {"more units than bytes in SCSU", u"\U0001D100\U0001D101\U0001D102\U0001D103\U0001D104 "s},
  };
  for (const auto &[source, dest] : pairs) {
    for (const auto &input : inputs) {
      SCOPED_TRACE(nameOf(source, dest) + ": " + input.reason);
      sweep(source, dest, oracle::encode(source, input.text));
    }
  }
}

TEST(TranslateSweep, BytesThatDoNotConvert) {
  using namespace std::string_literals;
  const struct {
    const char *reason;
    std::string bytes;
  } inputs[] = {
      {"stray bytes in most pages", "A\xFF\xC3 B\x80 "s},
      {"cut inside a character of UTF-8", "A \xE3\x81"s},
      {"half a surrogate, odd length", "\xD8\x00\x41"s},
      {"shift-out with an odd byte", "\x0E\x45\x41\x42"s},
      {"an escape of HZ and UTF-7 that is not ended", "A~{VP+AG"s},
      {"a lone zero byte in a wide page", "A\0\0"s},
  };
  for (const auto &[source, dest] : pairs) {
    for (const auto &input : inputs) {
      SCOPED_TRACE(nameOf(source, dest) + ": " + input.reason);
      sweep(source, dest, input.bytes);
    }
  }
}

} // namespace
