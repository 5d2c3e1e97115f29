// NLS2_TranslateString against bare ICU, over every size of the destination.

#include "convert/translate_oracle.h"
#include "nls2.h"
#include "support/call_cases.h"

#include <gtest/gtest.h>

namespace {

using oracle::Outcome;
using oracle::Page;
using oracle::Request;
using namespace std::string_literals;

using support::canaries;
using support::shown;

// The direct path of a two-null page may write one byte more than destLen.
size_t destSize(const Request &request) {
  const bool direct = request.options == 0 || request.options == NLS2_STRING_TERMINATE;
  const size_t second = direct && request.dest.terminator == 2 ? 1 : 0;
  return static_cast<size_t>(request.destLen) + std::max(canaries, second);
}

// Both texts in blocks of exactly their size.
Outcome call(const Request &request) {
  const size_t sourceSize =
      request.sourceLen < 0 ? std::strlen(request.bytes.c_str()) + 1 : request.bytes.size();
  const auto source = support::exact(std::string(request.bytes.c_str(), sourceSize));
  const auto dest = support::exact(std::string(destSize(request), '\xA5'));
  int32_t consumed = -9;
  int32_t status = -9;
  const int32_t result =
      NLS2_TranslateString(request.dest.number, dest.get(), request.destLen, request.source.number,
                           source.get(), request.sourceLen, &consumed, request.options, &status);
  return {result, status, consumed, std::string(dest.get(), destSize(request))};
}

std::string told(const Outcome &outcome) {
  return shown(outcome.result) + ", " + shown(outcome.consumed) + ", " + shown(outcome.status) +
         ", " + shown(outcome.dest);
}

void expectAnswer(const Request &request) {
  const int before = support::openConverters();
  const Outcome outcome = call(request);
  ASSERT_EQ(support::openConverters(), before);
  ASSERT_EQ(told(outcome), told(oracle::translate(request, std::string(destSize(request), '\xA5'))))
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
const Page utf8{1208, "utf-8", 1};
const Page utf16be{1200, "utf-16be", 2};
const Page utf16le{57359, "utf-16le", 2};
const Page utf16{57368, "utf-16", 2};
const Page hz{57362, "hz", 1};
const Page utf7{57366, "utf-7", 1};

const std::pair<Page, Page> pairs[] = {{ebcdic, utf8},
                                       {{930, "ibm-930", 1}, utf8},
                                       {utf8, {939, "ibm-939", 1}},
                                       {utf8, ebcdic},
                                       {utf8, {57360, "utf-32be", 1}},
                                       {utf8, {57363, "scsu", 1}},
                                       {hz, utf8},
                                       {latin1, {57372, "ucs-2", 1}},
                                       {latin1, utf16be},
                                       {utf8, utf16},
                                       {latin1, utf16le},
                                       {utf16le, ebcdic},
                                       {utf16le, {57365, "iscii,version=0", 1}},
                                       {utf16be, hz},
                                       {utf8, utf7},
                                       {utf7, utf16le},
                                       {utf16, latin1}};

// A text as the source page has it, or bytes as they are.
const struct {
  const char *reason;
  std::u16string text;
  std::string bytes = {};
} inputs[] = {
    {"empty", u""},
    {"no blanks", u"ABC"},
    {"trailing blanks", u"AB   "},
    {"blanks only", u"    "},
    {"blanks inside and before", u" A  B "},
    {"tabs are blanks, a line feed is none", u"A\n\t \t"},
    {"ideographic and no-break spaces", u"\u65E5\u672C\u3000\u00A0 "},
    {"null at the end", u"AB\0"s},
    {"nulls among trailing blanks", u"AB \0 \0"s},
    {"null inside cuts", u"AB \0CD  "s},
    {"nulls only", u"\0\0"s},
    {"null first", u"\0AB "s},
    {"diacritics", u"Gr\u00FC\u00DFe\u00E5 "},
    {"shifts between single and double bytes", u"a\u65E5b\u672C  "},
    {"supplementary characters", u"A\U0001D11E\U00020000 "},
    {"more units than bytes in SCSU", u"\U0001D100\U0001D101\U0001D102\U0001D103\U0001D104 "},
    {"stray bytes in most pages", u"", "A\xFF\xC3 B\x80 "},
    {"cut inside a character of UTF-8", u"", "A \xE3\x81"},
    {"half a surrogate, odd length", u"", "\xD8\x00\x41"s},
    {"shift-out with an odd byte", u"", "\x0E\x45\x41\x42"},
    {"an escape of HZ and UTF-7 that is not ended", u"", "A~{VP+AG"},
    {"a lone zero byte in a wide page", u"", "A\0\0"s},
};

TEST(Translate, AsBareIcuWithEveryCapacity) {
  for (const auto &[source, dest] : pairs) {
    for (const auto &input : inputs) {
      SCOPED_TRACE(source.icuName + " to "s + dest.icuName + ": " + input.reason);
      sweep(source, dest, input.bytes.empty() ? oracle::encode(source, input.text) : input.bytes);
    }
  }
}

} // namespace
