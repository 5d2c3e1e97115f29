/* Calls every function from C, and pins the layout of the records that a host shares. */

#include "nls2.h"
#include "sys1.h"
#include "trc1.h"

#include <stddef.h>
#include <stdio.h>
#include <string.h>
#include <unicode/ucnv.h>
#include <unicode/uloc.h>

/* C99 has no static assertion: an array of negative size stops the compiler. */
#define JOIN_(a, b) a##b
#define JOIN(a, b) JOIN_(a, b)
#define HOLDS(condition) typedef char JOIN(holds_, __LINE__)[(condition) ? 1 : -1]
/* Layouts, by the size of a pointer. */
#define W sizeof(void *)
#define AT(record, field, offset) (offsetof(record, field) == (offset))

HOLDS(sizeof(TRC1_UnitBlock) == (W == 8 ? 104 : 60) && AT(TRC1_UnitBlock, attributes, 4) &&
      AT(TRC1_UnitBlock, fileName, 8) && AT(TRC1_UnitBlock, fileNameLength, 8 + W) &&
      AT(TRC1_UnitBlock, buildDate, 8 + 2 * W) && AT(TRC1_UnitBlock, buildDateLength, 8 + 3 * W) &&
      AT(TRC1_UnitBlock, buildTime, 8 + 4 * W) && AT(TRC1_UnitBlock, buildTimeLength, 8 + 5 * W) &&
      AT(TRC1_UnitBlock, level, 8 + 6 * W) && AT(TRC1_UnitBlock, levelLength, 8 + 7 * W) &&
      AT(TRC1_UnitBlock, mark, 8 + 8 * W) && AT(TRC1_UnitBlock, markLength, 8 + 9 * W) &&
      AT(TRC1_UnitBlock, reserved, 12 + 9 * W) && AT(TRC1_UnitBlock, buildStamp, W == 8 ? 96 : 56));
HOLDS(sizeof(TRC1_EntryBlock) == (W == 8 ? 56 : 40) && AT(TRC1_EntryBlock, functionName, W) &&
      AT(TRC1_EntryBlock, functionNameLength, 2 * W) && AT(TRC1_EntryBlock, entryLine, 4 + 2 * W) &&
      AT(TRC1_EntryBlock, sync, 8 + 2 * W) && AT(TRC1_EntryBlock, attributes, 8 + 3 * W) &&
      AT(TRC1_EntryBlock, cachedFlags, 12 + 3 * W) && AT(TRC1_EntryBlock, cachedSync, 16 + 3 * W) &&
      AT(TRC1_EntryBlock, reserved, 20 + 3 * W));

static int failures;

static void check(int holds, const char *what) {
  if (!holds) {
    fprintf(stderr, "FAILED: %s\n", what);
    ++failures;
  }
}
#define CHECK(condition) check((condition) ? 1 : 0, #condition)

/* One call of every function, each with an answer that shows its arguments in their places. */
static void callLocales(uint32_t germany) {
  char name[132];
  int32_t status = -1;
  CHECK(NLS2_GetLocaleMapEntry(germany) == &localeMap[21]);
  CHECK(strcmp(nls2_status_name(NLS2_ERR_INVALID_OPTION), "NLS2_ERR_INVALID_OPTION") == 0);
  CHECK(strcmp(nls2_status_name(-128), "U_USING_FALLBACK_WARNING") == 0);
  CHECK(strcmp(nls2_status_name(INT32_MIN), nls2_status_name(INT32_MAX)) == 0);
  CHECK(localeMap[NLS2_LOCALE_MAP_RECORDS - 1].languageId == NLS2_LANGUAGE_ID_END);
  CHECK(NLS2_LanguageIDFromShortPosixName("de_DE", &status) == germany && status == 0);
  CHECK(NLS2_GetLanguageName(germany, name, sizeof name) == 0 && strcmp(name, "de") == 0);
  CHECK(NLS2_GetShortPosixName(germany, name, 0) == 0 && strcmp(name, "de_DE") == 0);
  NLS2_Locale *made[] = {NLS2_allocateLocale(&status), NLS2_GetThreadLocale(),
                         NLS2_ConvertNativeLocale(NULL, NLS2_LOCALE_DEFAULT, &status)};
  CHECK(pLocaleObjectList == made[0] && LocaleObjectList_Lock[0] == 0);
  CHECK(NLS2_SetLocaleNumInfo(made[0], NLS2_ATTRIBUTE_CODEPAGE, 1141, 0) == 0);
  CHECK(NLS2_GetLocaleNumInfo(made[0], NLS2_ATTRIBUTE_CODEPAGE, &status) == 1141);
  CHECK(NLS2_GetLocaleCodepageId(made[0], &status) == 1141 && status == 0);
  for (int i = 0; i < 3; ++i) {
    CHECK(NLS2_ValidateLocale(made[i]) == 0 && NLS2_ReleaseLocale(made[i]) == 0);
  }
  NLS2_Locale own = {0, 0, "", NULL};
  CHECK(NLS2_initLocaleObject(&own) == 0 && strcmp(own.icuLocale, "en_US") == 0);
  CHECK(NLS2_SetLocaleFromNative("tlh", 0) == NLS2_ERR_INVALID_LOCALE);
}

static void callCodePages(void) {
  char text[UCNV_MAX_CONVERTER_NAME_LENGTH] = "....";
  int32_t number = -1;
  int32_t status = -1;
  UConverter *converter = NLS2_MapCodepageIdToName(1200, &number, &status);
  CHECK(converter != NULL && number == 1 && status <= 0);
  ucnv_close(converter);
  CHECK(NLS2_MapWindowsNameToCCSID("windows-936", &status) == 936 && status == 0);
  CHECK(ccsidMap[NLS2_CCSID_MAP_RECORDS - 1].ccsid == NLS2_CCSID_MAP_END);
  CHECK(NLS2_GetCodepageId("utf8", &status) == 1208 && status == 0);
  CHECK(NLS2_TranslateString(1208, text, 4, 37, "\xC1\xC2", 2, &number, NLS2_STRING_FILL,
                             &status) == 4);
  CHECK(status == 0 && strcmp(text, "AB  ") == 0);
  CHECK(NLS2_GetCodepageName(1208, text, sizeof text) == 0 && strcmp(text, "UTF-8") == 0);
}

/* One German letter in EBCDIC, UTF-8 and UTF-16, each way. */
static void callText(const NLS2_Locale *german, const NLS2_Locale *utf8) {
  char bytes[8] = "";
  UChar units[8] = {0};
  int32_t status = 0;
  CHECK(NLS2_toUTF8(german, "\xC0", 1, bytes, 8, &status) == 2 && bytes[1] == '\xA4');
  CHECK(NLS2_fromUTF8(german, bytes, 8, "\xC3\xA4", 2, &status) == 1 && bytes[0] == '\xC0');
  CHECK(NLS2_toUTF16(german, "\xC0", 1, units, 8, &status) == 1 && units[0] == 0xE4);
  CHECK(NLS2_fromUTF16(german, units, 8, bytes, 1, &status) == 1 && bytes[0] == '\xC0');
  memcpy(bytes, "\xC1\xC2", 2);
  NLS2_StringToUnicode(german, bytes, 2, bytes, 2, &status);
  CHECK(status <= 0 && memcmp(bytes, "AB", 2) == 0);
  NLS2_UnicodeToString(german, bytes, 2, bytes, 2, &status);
  CHECK(status <= 0 && memcmp(bytes, "\xC1\xC2", 2) == 0);
  CHECK(NLS2_ConversionRatio(utf8, german, &status) == 3);
  CHECK(NLS2_Strlen(german, "\xC1\xC2", 0, &status) == 2);
  CHECK(NLS2_ByteLength(utf8, "\xE6\x97\xA5", &status) == 3 && status == 0);
  CHECK(NLS2_StringToDouble(NULL, NULL) == 0.0);
  CHECK(NLS2_Strcoll(utf8, "a", 1, "B ", 2, CHARBASED | SORT_IGNORETRAILING, &status) == -1);
  CHECK(NLS2_Findstr(utf8, "Haystack", 8, "STACK", 5, IGNORECASE) == 1);
  CHECK(NLS2_MapString(utf8, NULL, 0, "a", -1, NLS2_MAP_UPPERCASE) == U_BUFFER_OVERFLOW_ERROR);
}

static void callStreamsAndBundles(const NLS2_Locale *german) {
  static const UChar letters[] = {0x41, 0x42, 0};
  UChar units[8];
  int32_t length = 0;
  int32_t status = -1;
  struct UFILE *stream = NLS2_OpenStream(german, "/dev/null", "r+", "UTF-8");
  CHECK(NLS2_WriteString(german, letters, 1, stream) == 1);
  CHECK(NLS2_Fputs(german, letters, stream) == 3);
  NLS2_Fflush(stream);
  NLS2_Frewind(stream);
  CHECK(NLS2_ReadString(german, stream, units, 8) == 0);
  CHECK(NLS2_Fgets(german, stream, units, 8) == NULL);
  CHECK(NLS2_CloseStream(german, stream) == 0);
  CHECK(strcmp(NLS2_detectUnicodeSignature("\xFE\xFF", 2, &length, &status), "UTF-16BE") == 0);
  struct UResourceBundle *bundle = NLS2_ResourceOpen(NULL, german, &status);
  const UChar *version = NLS2_GetStringByKey(bundle, "Version", &length, &status);
  CHECK(status <= 0 && version != NULL && version[length] == 0);
  NLS2_ResourceClose(bundle);
}

static void callHost(void) {
  static uint32_t syncWord = 5;
  static TRC1_UnitBlock unit;
  uint32_t lock[SYS1_LOCK_SIZE / sizeof(uint32_t)] = {0};
  TRC1_EntryBlock anchor = {&unit, "callHost", 8, 1, &syncWord, TRC1_ENTRY_PRIVATE, 9, 0, {0, 0}};
  CHECK(TRC1_Sync(&anchor) == 0 && anchor.cachedFlags == 0 && anchor.cachedSync == syncWord);
  SYS1_GetLock(lock);
  CHECK(lock[0] != 0);
  SYS1_ReleaseLock(lock);
  CHECK(lock[0] == 0);
}

int main(void) {
  const uint32_t germany = 0x01140002;
  UErrorCode error = U_ZERO_ERROR;
  int32_t status = -1;
  uloc_setDefault("en_US", &error);
  CHECK(NLS2_Init() == 0);
  callLocales(germany);
  callCodePages();
  NLS2_Locale *german = NLS2_GetLocale(germany, 1141, 0, &status);
  NLS2_Locale *utf8 = NLS2_GetLocale(germany, 1208, 0, &status);
  callText(german, utf8);
  callStreamsAndBundles(german);
  CHECK(NLS2_ReleaseLocale(german) == 0 && NLS2_ReleaseLocale(utf8) == 0);
  callHost();
  CHECK(strncmp(NLS2_BuildStamp(), "zelnls2 ", 8) == 0);
  return failures == 0 ? 0 : 1;
}
