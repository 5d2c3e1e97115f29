/* The interface in C: layouts of records, all names, and some calls. */

#include "nls2.h"
#include "sys1.h"
#include "trc1.h"

#include <stddef.h>
#include <stdio.h>
#include <string.h>
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

/* All functions: the program links only if each has C linkage. */
typedef void (*Function)(void);
#define F(name) (Function) name
extern const Function functions[];
/* clang-format off */
const Function functions[] = {
   F(NLS2_BuildStamp), F(NLS2_ByteLength), F(NLS2_CloseStream), F(NLS2_ConversionRatio),
   F(NLS2_ConvertNativeLocale), F(NLS2_Fflush), F(NLS2_Fgets), F(NLS2_Findstr), F(NLS2_Fputs),
   F(NLS2_Frewind), F(NLS2_GetCodepageId), F(NLS2_GetCodepageName), F(NLS2_GetLanguageName),
   F(NLS2_GetLocale), F(NLS2_GetLocaleCodepageId), F(NLS2_GetLocaleMapEntry),
   F(NLS2_GetLocaleNumInfo), F(NLS2_GetShortPosixName), F(NLS2_GetStringByKey),
   F(NLS2_GetThreadLocale), F(NLS2_Init), F(NLS2_LanguageIDFromShortPosixName),
   F(NLS2_MapCodepageIdToName), F(NLS2_MapString), F(NLS2_MapWindowsNameToCCSID),
   F(NLS2_OpenStream), F(NLS2_ReadString), F(NLS2_ReleaseLocale), F(NLS2_ResourceClose),
   F(NLS2_ResourceOpen), F(NLS2_SetLocaleFromNative), F(NLS2_SetLocaleNumInfo), F(NLS2_Strcoll),
   F(NLS2_StringToDouble), F(NLS2_StringToUnicode), F(NLS2_Strlen), F(NLS2_TranslateString),
   F(NLS2_UnicodeToString), F(NLS2_ValidateLocale), F(NLS2_WriteString), F(NLS2_allocateLocale),
   F(NLS2_detectUnicodeSignature), F(NLS2_fromUTF16), F(NLS2_fromUTF8), F(NLS2_initLocaleObject),
   F(NLS2_toUTF16), F(NLS2_toUTF8), F(SYS1_GetLock), F(SYS1_ReleaseLock), F(TRC1_Dump),
   F(TRC1_Event), F(TRC1_Printf), F(TRC1_Sync),
};
/* clang-format on */

static int failures;

static void check(int holds, const char *what) {
  if (!holds) {
    fprintf(stderr, "FAILED: %s\n", what);
    ++failures;
  }
}
#define CHECK(condition) check((condition) ? 1 : 0, #condition)

static void callTables(void) {
  CHECK(localeMap[NLS2_LOCALE_MAP_RECORDS - 1].languageId == NLS2_LANGUAGE_ID_END);
  CHECK(ccsidMap[NLS2_CCSID_MAP_RECORDS - 1].ccsid == NLS2_CCSID_MAP_END);
  CHECK(pLocaleObjectList == NULL && LocaleObjectList_Lock[0] == 0);
  CHECK(strncmp(NLS2_BuildStamp(), "zelnls2 ", 8) == 0);
  CHECK(strcmp(nls2_status_name(NLS2_ERR_INVALID_OPTION), "NLS2_ERR_INVALID_OPTION") == 0);
  CHECK(strcmp(nls2_status_name(-128), "U_USING_FALLBACK_WARNING") == 0);
  CHECK(strcmp(nls2_status_name(INT32_MIN), nls2_status_name(INT32_MAX)) == 0);
}

static void callTranslation(void) {
  char text[] = "....";
  int32_t consumed = -1;
  int32_t status = -1;
  CHECK(NLS2_TranslateString(1208, text, 4, 37, "\xC1\xC2", 2, &consumed, NLS2_STRING_FILL,
                             &status) == 4);
  CHECK(status == 0 && strcmp(text, "AB  ") == 0);
}

static void callLocale(void) {
  int32_t status = -1;
  NLS2_Locale *german = NLS2_GetLocale(0x01140002, 1208, 0, &status);
  CHECK(pLocaleObjectList == german && strcmp(german->icuLocale, "de_DE") == 0);
  CHECK(NLS2_Strcoll(german, "a", 1, "B ", 2, CHARBASED | SORT_IGNORETRAILING, &status) == -1);
  CHECK(status == 0 && NLS2_ReleaseLocale(german) == 0);
}

int main(void) {
  UErrorCode error = U_ZERO_ERROR;
  uloc_setDefault("en_US", &error);
  callTables();
  callTranslation();
  callLocale();
  return failures == 0 ? 0 : 1;
}
