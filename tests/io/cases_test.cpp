// The calls of this room's case files.

#include "support/dispatch.h"

#include <gtest/gtest.h>
#include <unicode/unistr.h>
#include <unicode/ures.h>
#include <unicode/ustdio.h>

namespace support {

// A new stream. One called "!" is for the library to close; null is none.
template <>
struct Slot<UFILE *> : Given<UFILE *> {
  explicit Slot(Cursor &at)
      : Given{at.words[at.next] == "null" ? nullptr : u_fopen("/dev/null", "w", nullptr, "UTF-8")},
        owned(at.words[at.next++] == "file" ? value : nullptr) {
    at.words.name(value, "file");
  }
  icu::LocalUFILEPointer owned;
};

// The example bundle of a language; with "!", for the library to close.
template <>
struct Slot<UResourceBundle *> : Given<UResourceBundle *> {
  explicit Slot(Cursor &at) : Given{nullptr} {
    const std::string &word = at.words[at.next++];
    UErrorCode error = U_ZERO_ERROR;
    value = ures_open(MESSAGES_DIR, word.c_str() + (word[0] == '!' ? 1 : 0), &error);
    owned.adoptInstead(word[0] == '!' ? nullptr : value);
  }
  icu::LocalUResourceBundlePointer owned;
};

} // namespace support

namespace {

using support::shown;
using support::Words;

std::string openStream(const Words &w) {
  const icu::LocalUFILEPointer file(NLS2_OpenStream(w.object(0), w.text(1), w.text(2), w.text(3)));
  w.name(file.getAlias(), "file");
  return shown(file.getAlias());
}

std::string detect(const Words &w) {
  int32_t length = -9;
  int32_t status = 99;
  const char *name = NLS2_detectUnicodeSignature(w.text(0), w.number(1), &length, &status);
  w.name(name, name != nullptr ? name : "");
  return shown(name) + ", " + shown(length) + ", " + shown(status);
}

std::string openBundle(const Words &w) {
  int32_t status = 99;
  UResourceBundle *bundle = NLS2_ResourceOpen((MESSAGES_DIR + w[0]).c_str(), w.object(1), &status);
  w.name(bundle, "bundle");
  ures_close(bundle);
  return shown(bundle) + ", " + shown(status);
}

std::string stringByKey(const Words &w) {
  support::Cursor at{w};
  const support::Slot<UResourceBundle *> bundle(at);
  int32_t length = -9;
  int32_t status = 99;
  const UChar *string = NLS2_GetStringByKey(bundle.get(), w.text(1), &length, &status);
  w.name(string, "string");
  std::string text;
  icu::UnicodeString(string, string == nullptr ? 0 : length).toUTF8String(text);
  EXPECT_TRUE(string == nullptr || string[length] == 0);
  return shown(string) + ", " + shown(status) + ", " + (string == nullptr ? "none" : text);
}

TEST(Io, Cases) {
  UFILE *const first = u_fopen("/dev/null", "r", nullptr, nullptr); // as firstObject in support
  support::expectCases(CASES_FOLDER, {{"NLS2_OpenStream", openStream},
                                      CALL(NLS2_CloseStream),
                                      CALL(NLS2_WriteString),
                                      CALL(NLS2_Fputs),
                                      CALL(NLS2_Fgets),
                                      CALL(NLS2_ReadString),
                                      CALL(NLS2_Fflush),
                                      CALL(NLS2_Frewind),
                                      {"NLS2_detectUnicodeSignature", detect},
                                      {"NLS2_ResourceOpen", openBundle},
                                      {"NLS2_GetStringByKey", stringByKey},
                                      CALL(NLS2_ResourceClose)});
  u_fclose(first);
}

} // namespace
