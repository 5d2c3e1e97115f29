// Whole traces of streams and bundles, with the calls of ICU in them.

#include "support/heap_probe.h"
#include "support/known_trace.h"
#include "support/live_locale.h"

#include <cstring>
#include <gtest/gtest.h>
#include <unicode/ures.h>
#include <unicode/ustdio.h>

namespace {

using namespace std::string_literals;
using support::Recording;

const NLS2_Locale unlisted{};
// A heap whose first block of a size has an address that ends in 32 zero bits, as the thread
// sanitizer's has, gives it away here: in a trace it would look like 0. The tests do the same with
// streams and bundles.
[[maybe_unused]] const auto firstObject = std::make_unique<NLS2_Locale>();

// Units that consist of these bytes, whatever the machine's order.
std::u16string unitsOf(const std::string &bytes) {
  std::u16string units(bytes.size() / 2, u'\0');
  std::memcpy(units.data(), bytes.data(), units.size() * 2);
  return units;
}

void answer(int32_t value) { support::mark("returned " + std::to_string(value)); }
// The status by its address: it is read after the call that sets it.
void answer(const void *pointer, const int32_t *status = nullptr) {
  support::mark("returned " + support::exitValue(pointer) +
                (status == nullptr ? "" : ", status " + std::to_string(*status)));
}

TEST(IoTraces, StreamsAskIcuOnlyForALiveLocale) {
  const support::LiveLocale live(1208);
  const std::u16string text = unitsOf("ABCD");
  UFILE *first = u_fopen("/dev/null", "r", nullptr, nullptr);
  for (const NLS2_Locale *locale : {live.get(), &unlisted}) {
    UFILE *file = u_fopen("/dev/null", "w", nullptr, "UTF-8");
    std::u16string buffer = unitsOf("old\0\0\0\0\0"s);
    const Recording recording(support::traceAll);
    UFILE *opened = NLS2_OpenStream(locale, "/dev/null", "r", nullptr);
    answer(opened);
    answer(NLS2_OpenStream(locale, "/", "w", "UTF-8"));
    answer(NLS2_WriteString(locale, text.data(), 2, file));
    answer(NLS2_Fputs(locale, text.c_str(), file));
    NLS2_Fflush(file);
    NLS2_Frewind(file);
    answer(NLS2_Fgets(locale, file, buffer.data(), 4));
    answer(NLS2_ReadString(locale, file, buffer.data(), 4));
    answer(NLS2_CloseStream(locale, nullptr));
    answer(NLS2_CloseStream(locale, file));
    support::expectKnownTrace(
        locale == &unlisted ? "streams, locale not live" : "streams", recording,
        {{locale, "locale"}, {file, "file"}, {opened, "opened"}, {buffer.data(), "buffer"}});
    NLS2_CloseStream(live.get(), locale == &unlisted ? file : opened);
  }
  u_fclose(first);
}

TEST(IoTraces, Signatures) {
  const std::pair<std::string, int32_t> cases[] = {
      {"\xFE\xFF", 2},         {"\xFF\xFE\0\0"s, 4}, {"\xFF\xFE\0\0"s, 3}, {"\xEF\xBB\xBF", -1},
      {"\xDD\x73\x66\x73", 4}, {"\xEF\xBB", 2},      {"\xFF\xFE", -2}};
  support::Names names;
  const Recording recording(support::traceAll);
  for (const auto &[bytes, given] : cases) {
    int32_t length = -9;
    int32_t status = -9;
    const char *name = NLS2_detectUnicodeSignature(bytes.c_str(), given, &length, &status);
    support::mark("length " + std::to_string(length));
    answer(name, &status);
    names.emplace_back(name, name != nullptr ? name : "");
  }
  support::expectKnownTrace("signatures", recording, names);
}

TEST(IoTraces, Bundles) {
  const support::LiveLocale live(1208, "de_AT");
  UErrorCode error = U_ZERO_ERROR;
  UResourceBundle *first = ures_open(MESSAGES_DIR, "de_AT", &error);
  int32_t status = -9;
  int32_t length = -9;
  const Recording recording(support::traceAll);
  for (const NLS2_Locale *locale : {static_cast<const NLS2_Locale *>(nullptr), &unlisted}) {
    answer(NLS2_ResourceOpen(MESSAGES_DIR, locale, &status), &status);
  }
  answer(NLS2_ResourceOpen(MESSAGES_DIR "/no_such_name", live.get(), &status), &status);
  answer(NLS2_GetStringByKey(nullptr, "greeting", &length, &status), &status);
  UResourceBundle *bundle = NLS2_ResourceOpen(MESSAGES_DIR, live.get(), &status);
  answer(bundle, &status);
  const UChar *string = NLS2_GetStringByKey(bundle, "farewell", &length, &status);
  answer(string, &status);
  NLS2_ResourceClose(bundle);
  support::expectKnownTrace("bundles", recording, {{bundle, "bundle"}, {string, "string"}});
  ures_close(first);
}

// What a call, which reaches no ICU, prints of the text named so.
template <class Call>
std::string printed(const std::string &name, const Call &call) {
  const Recording recording(support::traceDetail);
  call();
  const std::string line = recording.lines().at(0);
  const std::size_t start = line.find(name) + name.size() + 1;
  return line.substr(start, line.rfind(", len") - start);
}

std::string printedSource(const UChar *source, int32_t length) {
  return printed("pSource", [&] { NLS2_WriteString(&unlisted, source, length, nullptr); });
}

std::string printedDest(UChar *dest, int32_t length) {
  return printed("pDest", [&] { NLS2_Fgets(&unlisted, nullptr, dest, length); });
}

TEST(IoTraces, TextsEndAtTheirLengthOrFirstZeroByte) {
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
      {"a zero byte within a unit", "A\0CD"s, 2, "A"},
      {"a zero byte first", "\0A"s, 1, ""},
      {"null-terminated", "ABCDEF\0\0"s, -1, "ABCDEF"},
      {"longest short one", longText.substr(0, 62), 31, longText.substr(0, 62)},
      {"shortest long one", longText.substr(0, 64), 32, longText.substr(0, 64)},
      {"no length is too long", longText, 50000, longText},
  };
  for (const auto &c : cases) {
    const auto units = support::exact(unitsOf(c.bytes));
    EXPECT_EQ(printedSource(units.get(), c.length), c.text) << c.reason;
    // A buffer for output need not have a null: without a capacity, nothing of it is read.
    EXPECT_EQ(printedDest(units.get(), c.length), c.length < 0 ? "" : c.text) << c.reason;
  }
  EXPECT_EQ(printedSource(nullptr, 3), "(null)");
  if (support::heapCanRefuse) {
    const std::u16string units = unitsOf(std::string(4444, 'y'));
    const support::FailingMallocs failing(4444 + 1);
    EXPECT_EQ(printedSource(units.data(), 2222), std::string(63, 'y'))
        << "without memory, the beginning";
  }
}

} // namespace
