// The calls of this room's case files.

#include "support/dispatch.h"

#include <gtest/gtest.h>
#include <unicode/unistr.h>
#include <unicode/ures.h>
#include <unicode/ustdio.h>

namespace support {

// A new stream. One called "!" is for the library to close; null is none.
template <>
struct Slot<UFILE *> {
  explicit Slot(Cursor &at)
      : word(at.words[at.next++]),
        value(word == "null" ? nullptr : u_fopen("/dev/null", "w", nullptr, "UTF-8")) {
    at.words.name(value, "file");
  }
  UFILE *get() const { return value; }
  std::string answer() const {
    word == "file" ? u_fclose(value) : void();
    return "";
  }
  std::string word;
  UFILE *value;
};

// The example bundle of a language; with "!", for the library to close.
template <>
struct Slot<UResourceBundle *> {
  explicit Slot(Cursor &at) : word(at.words[at.next++]) {
    UErrorCode error = U_ZERO_ERROR;
    value = ures_open(MESSAGES_DIR, word.c_str() + (word[0] == '!' ? 1 : 0), &error);
  }
  UResourceBundle *get() const { return value; }
  std::string answer() const {
    word[0] != '!' ? ures_close(value) : void();
    return "";
  }
  std::string word;
  UResourceBundle *value;
};

} // namespace support

namespace {

using support::shown;
using support::Words;

std::string openStream(const Words &w) {
  UFILE *file = NLS2_OpenStream(w.object(0), w.text(1), w.text(2), w.text(3));
  w.name(file, "file");
  file == nullptr ? void() : u_fclose(file);
  return shown(file);
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
  std::string text = "none";
  if (string != nullptr) {
    EXPECT_EQ(string[length], 0);
    text.clear();
    icu::UnicodeString(string, length).toUTF8String(text);
  }
  return shown(string) + ", " + shown(status) + ", " + text + bundle.answer();
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
