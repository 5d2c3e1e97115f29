/* A customer's name out of an EBCDIC record, greeted in the customer's language.
 *
 * usage: greet_in_c DIRECTORY (of the resource bundles) */

#include <nls2.h>

#include <stdio.h>

/* Reports what failed, if it did. */
static int failed(const char *what, int32_t status) {
  if (status > 0) {
    fprintf(stderr, "%s: %s (%d)\n", what, nls2_status_name(status), (int)status);
  }
  return status > 0;
}

/* A field without its trailing blanks, from German EBCDIC to UTF-8. */
static int translate(char *text, int32_t capacity, const char *field, int32_t length) {
  int32_t consumed = 0;
  int32_t status = 0;
  NLS2_TranslateString(1208, text, capacity - 1, 1141, field, length, &consumed,
                       NLS2_STRING_STRIP_TRAILING, &status);
  text[capacity - 1] = '\0';
  return !failed("translate", status);
}

/* The greeting of the locale's language, in UTF-8. */
static int greeting(const NLS2_Locale *locale, const char *directory, char *text,
                    int32_t capacity) {
  int32_t status = 0;
  struct UResourceBundle *bundle = NLS2_ResourceOpen(directory, locale, &status);
  if (failed("open the bundle", status)) {
    return 0;
  }
  int32_t length = 0;
  const UChar *string = NLS2_GetStringByKey(bundle, "greeting", &length, &status);
  if (!failed("read the greeting", status)) {
    NLS2_fromUTF16(locale, string, capacity, text, length, &status);
    failed("convert the greeting", status);
  }
  NLS2_ResourceClose(bundle);
  return status <= 0;
}

static int greet(const NLS2_Locale *locale, const char *directory) {
  static const char fields[2][10] = {"\xE9\x89\xA3\x81\x40\x40\x40\x40\x40\x40",  /* Zita */
                                     "\xE0\xA9\x93\x85\x94\x40\x40\x40\x40\x40"}; /* Özlem */
  char first[32] = "";
  char second[32] = "";
  char hello[64] = "";
  int32_t status = 0;
  if (!translate(first, sizeof first, fields[0], sizeof fields[0]) ||
      !translate(second, sizeof second, fields[1], sizeof fields[1]) ||
      !greeting(locale, directory, hello, sizeof hello)) {
    return 1;
  }
  const int32_t order = NLS2_Strcoll(locale, first, -1, second, -1, 0, &status);
  if (failed("compare", status)) {
    return 1;
  }
  printf("%s, %s! %s, %s!\n", hello, order <= 0 ? first : second, hello,
         order <= 0 ? second : first);
  return 0;
}

int main(int argc, char **argv) {
  if (argc != 2) {
    fputs("usage: greet_in_c DIRECTORY\n", stderr);
    return 2;
  }
  int32_t status = 0;
  const uint32_t language = NLS2_LanguageIDFromShortPosixName("de_AT", &status);
  NLS2_Locale *locale = NLS2_GetLocale(language, 1208, 0, &status);
  if (failed("make a locale", status)) {
    return 1;
  }
  int result = greet(locale, argv[1]);
  if (failed("release the locale", NLS2_ReleaseLocale(locale))) {
    result = 1;
  }
  return result;
}
