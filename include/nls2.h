/* nls2.h - the interface of libzelnls2: text in many languages and code pages.
 *
 * Translates fields between numbered code pages, and compares, searches and reads text by the rules
 * of a language, with ICU. examples/translate_field.c is the shortest use; for C++ there is
 * nls2.hpp as well.
 *
 * Conventions. They hold for every function unless its comment says otherwise.
 *
 *  1. Lengths. Byte strings are measured in bytes, UTF-16 text in 16-bit units; each comment names
 *     the unit. Lengths are signed 32-bit unless typed otherwise. A terminator is not counted.
 *  2. A length of -1 means that the text is null-terminated. The end of a byte string is then its
 *     first zero byte, whatever the code page.
 *  3. Code pages are numbers: CCSIDs (37, 819, 930, 1208 ...), and the private numbers from 57352
 *     up that NLS2_MapCodepageIdToName lists. They are not checked before ICU sees them.
 *  4. Language ids are numbers: a country number in the upper 16 bits (ISO 3166 numeric, with
 *     exceptions) and the library's language number in the lower 16. localeMap holds them all.
 *  5. A status is a signed 32-bit word: 0 is success, a positive value a failure, a negative value
 *     an ICU warning and therefore a success. Values 32 and 36 to 39 are this library's
 *     (NLS2_ERR_*), all others are ICU's UErrorCode, passed on unchanged. nls2_status_name() names
 *     them all.
 *  6. A status comes back in one of two ways: stored through a last argument pStatus, with a result
 *     of 0 or null on failure; or as the result itself. Some functions have no status; their
 *     comments describe what the result then means.
 *  7. Outputs on failure are as they were, except where "partial output" is noted.
 *  8. No pointer argument is tested for null. Passing null is undefined behaviour unless noted.
 *  9. Buffers without a length argument, or with one that is not used or only traced, are written
 *     without a bound: the comment states how much room is needed.
 * 10. Handles that a function returns belong to the caller, who closes them as the function's
 *     comment describes.
 * 11. Threads. Every function may be called from any thread at any time, but not from a signal
 *     handler: a release there can wait for ever for a validation that it interrupted. One object
 *     or handle must not be used by two threads while one of them changes or closes it.
 * 12. Make a locale object once and keep it. Making one opens a converter, and after each release
 *     every thread has to search the list of objects again.
 * 13. The library reads no environment variables and no configuration. Its only state is the list
 *     of live locale objects, and what each thread remembers of it. Every call but NLS2_BuildStamp
 *     is traced through the host's facility (trc1.h); tracing changes no result unless noted.
 */
#ifndef NLS2_H
#define NLS2_H

#include <stdint.h>

#include <unicode/utypes.h>

#define NLS2_VERSION_MAJOR 0
#define NLS2_VERSION_MINOR 1
#define NLS2_VERSION_PATCH 0
#define NLS2_VERSION_STRING "0.1.0"

#ifdef __cplusplus
extern "C" {
#endif

#if defined(__GNUC__)
#define NLS2_API __attribute__((visibility("default")))
#else
#define NLS2_API
#endif

struct UConverter;      /* <unicode/ucnv.h> */
struct UFILE;           /* <unicode/ustdio.h> */
struct UResourceBundle; /* <unicode/ures.h> */

/* ---- Status codes ---------------------------------------------------------------------------- */

enum {
  NLS2_ERR_NO_MEMORY = 32,         /* a heap allocation failed */
  NLS2_ERR_INVALID_OPTION = 36,    /* an option set that names no action */
  NLS2_ERR_INVALID_PARAMETER = 37, /* a bad argument, or a name or record not found */
  NLS2_ERR_INVALID_LOCALE = 38,    /* no live locale object, or no locale record matches */
  NLS2_ERR_LANGUAGE_NOT_FOUND = 39 /* a language id that localeMap does not hold */
};

/* The name of a status: "NLS2_ERR_NO_MEMORY", or what ICU calls it (u_errorName): "U_ZERO_ERROR"
 * for 0, "[BOGUS UErrorCode]" for a number that ICU does not know. */
static inline const char *nls2_status_name(int32_t status) {
  switch (status) {
  case NLS2_ERR_NO_MEMORY:
    return "NLS2_ERR_NO_MEMORY";
  case NLS2_ERR_INVALID_OPTION:
    return "NLS2_ERR_INVALID_OPTION";
  case NLS2_ERR_INVALID_PARAMETER:
    return "NLS2_ERR_INVALID_PARAMETER";
  case NLS2_ERR_INVALID_LOCALE:
    return "NLS2_ERR_INVALID_LOCALE";
  case NLS2_ERR_LANGUAGE_NOT_FOUND:
    return "NLS2_ERR_LANGUAGE_NOT_FOUND";
  default:
    break;
  }
  if (status < U_ERROR_WARNING_START || status > 0x1FFFF) { /* more than a UErrorCode can hold */
    return "[BOGUS UErrorCode]";
  }
#ifdef __cplusplus
  return u_errorName(static_cast<UErrorCode>(status));
#else
  return u_errorName((UErrorCode)status);
#endif
}

/* ---- Locales --------------------------------------------------------------------------------- */

/* One record of localeMap, 276 bytes. Names are null-terminated and padded with zero bytes. */
typedef struct LocaleMapEntry {
  uint32_t languageId;
  uint32_t asciiCcsid;  /* default code page of the ASCII family */
  uint32_t ebcdicCcsid; /* default EBCDIC code page */
  char localeName[132]; /* as ICU spells it: "en_US", "zh_Hant" */
  char shortName[132];  /* short POSIX name; equal to localeName in all but five records */
} LocaleMapEntry;

enum {
  NLS2_LOCALE_MAP_RECORDS = 162, /* 161 locales and the terminator */
  NLS2_LANGUAGE_ID_END = 0xFF    /* language id of the terminator, never a locale's */
};

/* The locales that the library knows. The order is part of the interface: every search starts at
 * record 0 and takes the first match, and some ids and names are in two records. */
extern NLS2_API const LocaleMapEntry localeMap[NLS2_LOCALE_MAP_RECORDS];

/* The first record of localeMap with this language id; null if there is none, also for 0xFF. */
NLS2_API const LocaleMapEntry *NLS2_GetLocaleMapEntry(uint32_t languageId);

/* A locale object: a language and a code page. An object is valid ("live") from its creation until
 * NLS2_ReleaseLocale; all live objects are on a list. Every function that takes an object refuses a
 * pointer that is not on the list, without reading what it points to.
 *
 * Warning: the heap may give a released object's address to a new object. An old pointer is then
 * live again, and releasing it twice takes the new object from its owner. Set a pointer to null
 * when you release its object. */
typedef struct NLS2_Locale {
  uint32_t languageId;       /* of a record of localeMap */
  uint32_t codepage;         /* as given, not checked against anything */
  char icuLocale[136];       /* null-terminated, at most 131 characters */
  struct NLS2_Locale *pNext; /* the library's */
} NLS2_Locale;

/* The live objects in order of creation, linked by pNext; null if there is none. For debuggers: the
 * list changes under LocaleObjectList_Lock, 28 bytes that belong to the host's lock service. A
 * program may set the head aside and put it back, but must not change the other links. */
extern NLS2_API NLS2_Locale *pLocaleObjectList;
extern NLS2_API uint32_t LocaleObjectList_Lock[7];

/* A new object for the process's default locale and code page, as ICU reports them
 * (uloc_getDefault, ucnv_getDefaultName). Null on failure.
 *
 * Status:
 *   0   done
 *   32  NLS2_ERR_NO_MEMORY
 *   or that of NLS2_initLocaleObject */
NLS2_API NLS2_Locale *NLS2_allocateLocale(int32_t *pStatus);

/* Fills a zeroed object from the process's defaults, as NLS2_allocateLocale does; the object need
 * not be on the list. An empty default locale counts as "en_US"; the language id is that of the
 * first record of localeMap whose name occurs anywhere in the default's base name
 * (uloc_getBaseName). If there is no default code page, it is US EBCDIC (37).
 *
 * Status, as the result:
 *   0   done
 *   37  NLS2_ERR_INVALID_PARAMETER: no record matches, or the base name has more than 132
 *       characters; the object is as it was
 *   or that of NLS2_GetCodepageId for the default code page's name, which can also be 37; the
 *   object then has its language, and 0 for its code page
 *
 * Surprises: a default locale that the table does not hold, such as "en" or "nb_NO", makes every
 * creation of an object fail with NLS2_ERR_INVALID_PARAMETER. Set one that it holds, with ICU's
 * uloc_setDefault(). Short names match inside longer ones: the default locale "ses_ML" (Koyraboro
 * Senni) is found as "es". Pass NLS2_GetLocale the language id that you want. */
NLS2_API int32_t NLS2_initLocaleObject(NLS2_Locale *pLocale);

/* Whether an object is live. Status, as the result: 0 if it is, NLS2_ERR_INVALID_LOCALE otherwise,
 * also for null. Any pointer will do; it is compared, not followed. Takes no lock. A thread that
 * has just validated an object a few times does it in a few nanoseconds, until the next release. */
NLS2_API int32_t NLS2_ValidateLocale(const NLS2_Locale *pLocale);

/* Releases an object. Status, as the result: 0, or NLS2_ERR_INVALID_PARAMETER (not INVALID_LOCALE
 * as elsewhere) if it is not live. If two threads release one object at once, one gets 0 and the
 * other 0 or the failure.
 *
 * Waits for validations in progress on other threads, until those threads are scheduled again;
 * meanwhile, threads that make or release other objects wait as well. */
NLS2_API int32_t NLS2_ReleaseLocale(NLS2_Locale *pNLS2_Locale);

/* Starts ICU (u_init). The other functions do not need it. Status, as the result: ICU's. */
NLS2_API int32_t NLS2_Init(void);

/* Options. */
enum {
  NLS2_LOCALE_DEFAULT = 0x4, /* of NLS2_GetLocale and NLS2_ConvertNativeLocale */
  NLS2_THREAD_LOCALE = 0x1   /* of NLS2_SetLocaleFromNative */
};

/* A new object for a language and a code page; for the process's defaults if both are 0. Null on
 * failure.
 *
 *   languageId  of a record of localeMap, or 0
 *   codepage    stored as it is, unchecked; 0: the process's default
 *   options     0, or NLS2_LOCALE_DEFAULT (bit 0x2 has the same effect): the object keeps the
 *               defaults, but the table search must still succeed. Ignored if both numbers are 0
 *
 * The first record with this id, or with this code page in both its columns, is used.
 *
 * Status:
 *   0   done
 *   37  NLS2_ERR_INVALID_PARAMETER: there is no such record
 *   or that of NLS2_allocateLocale
 *
 * Surprises: hr_HR is the only record with one code page in both columns, so code page 912 makes an
 * hr_HR object for every language whose record comes after hr_HR's, such as pl_PL, and for ids that
 * no record has. Pass code page 0, and then set 912 with NLS2_SetLocaleNumInfo. Since every object
 * starts from the defaults, whatever makes NLS2_initLocaleObject fail makes this fail. */
NLS2_API NLS2_Locale *NLS2_GetLocale(uint32_t languageId, uint32_t codepage, uint32_t options,
                                     int32_t *pStatus);

/* NLS2_GetLocale(0, 0, 0) without a status: null on failure. A thread has no locale of its own;
 * each call makes a new object. */
NLS2_API NLS2_Locale *NLS2_GetThreadLocale(void);

/* Selectors of NLS2_GetLocaleNumInfo and NLS2_SetLocaleNumInfo. */
enum { NLS2_ATTRIBUTE_LANGUAGE_ID = 1, NLS2_ATTRIBUTE_CODEPAGE = 9 };

/* A number of an object; 0 on failure.
 *
 * Status:
 *   0   done
 *   37  NLS2_ERR_INVALID_PARAMETER: the type is not a selector
 *   38  NLS2_ERR_INVALID_LOCALE: the object is not live */
NLS2_API uint32_t NLS2_GetLocaleNumInfo(const NLS2_Locale *pLocale, uint32_t type,
                                        int32_t *pStatus);

/* Changes a number of an object. A new language id sets its record's locale name as well and leaves
 * the code page; a new code page is not checked. For either attribute a value of 255 changes
 * nothing and is a success. `options` is only traced.
 *
 * Status, as the result: 0, or NLS2_ERR_INVALID_LOCALE: the object is not live, localeMap does not
 * hold the language id, or the attribute is not a selector. For the last, NLS2_GetLocaleNumInfo
 * reports INVALID_PARAMETER. */
NLS2_API int32_t NLS2_SetLocaleNumInfo(NLS2_Locale *pLocaleToChange, uint32_t attribute,
                                       uint32_t value, uint32_t options);

/* An object's code page; 0 on failure. Status: 0 or NLS2_ERR_INVALID_LOCALE. */
NLS2_API uint32_t NLS2_GetLocaleCodepageId(const NLS2_Locale *pLocale, int32_t *pStatus);

/* Checks whether a POSIX locale name, such as "en_US.UTF-8", is known: whether the name of a record
 * of localeMap occurs anywhere in its first 131 characters. "C" means ICU's default locale.
 *
 * Status, as the result:
 *   0   the name is known
 *   38  NLS2_ERR_INVALID_LOCALE: no record's name occurs; with NLS2_THREAD_LOCALE also: no object
 *       can be made, because the process's default locale or code page is not known
 *   or, with NLS2_THREAD_LOCALE, that of NLS2_GetCodepageId, if the default code page changes
 *   during the call
 *
 * Surprise: NLS2_THREAD_LOCALE applies the record and the default code page to a new object that
 * the caller never receives. It is leaked: it stays on the list. Use NLS2_GetLocale instead. */
NLS2_API int32_t NLS2_SetLocaleFromNative(const char *pPosixID, uint32_t options);

/* NLS2_allocateLocale under another name. `pNativeLocale` is not read; `options` must have
 * NLS2_LOCALE_DEFAULT. Null on failure. Status: 0, or NLS2_ERR_INVALID_PARAMETER without that
 * option.
 *
 * Surprise: if the object cannot be made, the result is null and the status 0. Check the result. */
NLS2_API NLS2_Locale *NLS2_ConvertNativeLocale(const void *pNativeLocale, uint32_t options,
                                               int32_t *pStatus);

/* ---- Names of languages ---------------------------------------------------------------------- */

/* The ISO 639 code of a language id ("en"), as uloc_getLanguage writes it: cut and terminated by
 * ICU's rules. bufferLength is in bytes.
 *
 * Status, as the result:
 *   0   done, also if only the terminator did not fit
 *   39  NLS2_ERR_LANGUAGE_NOT_FOUND
 *   or ICU's, 15 for a buffer that is too small */
NLS2_API int32_t NLS2_GetLanguageName(uint32_t languageId, char *nameBuffer, int32_t bufferLength);

/* The short POSIX name of a language id ("en_US"), from the first record that has it. bufferLength
 * is only traced: 8 bytes hold every name. Status, as the result: 0 or NLS2_ERR_LANGUAGE_NOT_FOUND.
 * */
NLS2_API int32_t NLS2_GetShortPosixName(uint32_t languageId, char *nameBuffer,
                                        int32_t bufferLength);

/* The language id of the first record with exactly this short POSIX name; 0 if there is none.
 * Status: 0, or NLS2_ERR_INVALID_PARAMETER if there is none. */
NLS2_API uint32_t NLS2_LanguageIDFromShortPosixName(const char *pShortPosixName, int32_t *status);

/* ---- Code pages ------------------------------------------------------------------------------ */

/* One record of ccsidMap, 136 bytes. The name is null-terminated and padded with zero bytes. */
typedef struct CcsidMapEntry {
  char name[132];
  uint32_t ccsid;
} CcsidMapEntry;

enum {
  NLS2_CCSID_MAP_RECORDS = 12, /* 11 names and the terminator */
  NLS2_CCSID_MAP_END = 255     /* ccsid of the terminator */
};

/* Windows code-page names and their code pages, in the order in which they are searched. */
extern NLS2_API const CcsidMapEntry ccsidMap[NLS2_CCSID_MAP_RECORDS];

/* Opens ICU's converter for a code page. The caller closes it with ucnv_close().
 *
 * These numbers are opened by name (ucnv_open), every other as a CCSID (ucnv_openCCSID); T marks
 * those for which *twoNullTerminator becomes 1, because their strings end in two zero bytes:
 *
 *     874 windows-874    57352 utf-8         57362 hz                57368 utf-16 T
 *     932 shift-jis      57355 sbcs          57363 scsu              57369 utf-32
 *     936 windows-936    57356 dbcs          57365 iscii,version=0   57370 cesu-8
 *     949 windows-949    57357 mbcs          57366 utf-7             57371 gb18030
 *     950 windows-950    57358 utf-16be T    57367 bocu1             57372 ucs-2
 *    1200 utf-16be T     57359 utf-16le T
 *    1208 utf-8          57360 utf-32be      57361 utf-32le
 *
 * Result: the converter, or null. *twoNullTerminator: 0 or 1, always stored, from the number alone.
 *
 * Status, always stored:
 *   0     done
 *   -122  U_AMBIGUOUS_ALIAS_WARNING: a name means several tables; other ICU warnings also come
 *         unchanged
 *   4     U_FILE_ACCESS_ERROR: this ICU has no converter for the number or name (57355 to 57357
 *         with ICU's standard data, and 57364)
 *   or ICU's other failures
 *
 * Surprises: ICU reads -37 as 37. 57372 opens ICU's UTF-16 with a signature. 57360, 57361, 57369
 * and 57372 leave the flag at 0 although their strings end in two or four zero bytes: store those
 * yourself. */
NLS2_API struct UConverter *NLS2_MapCodepageIdToName(int32_t codepage, int32_t *twoNullTerminator,
                                                     int32_t *status);

/* The code page of a Windows code-page name: the ccsid of the first record of ccsidMap whose name
 * occurs anywhere in `name`, byte for byte; 0 if there is none. Status: 0, or
 * NLS2_ERR_INVALID_PARAMETER if there is none.
 *
 * Surprises: "windows-9501" is found as windows-950; "big5" and "Windows-936" are not found. For
 * other names use NLS2_GetCodepageId. */
NLS2_API uint32_t NLS2_MapWindowsNameToCCSID(const char *name, int32_t *status);

/* ICU's canonical name of a code page's converter: "UTF-8" for 1208. bufferLength is not used:
 * UCNV_MAX_CONVERTER_NAME_LENGTH (60) bytes hold every name.
 *
 * Status, as the result:
 *   0  done
 *   2  U_MISSING_RESOURCE_ERROR: ICU has no name for the converter
 *   or ICU's failure to name it, or that of NLS2_MapCodepageIdToName
 *
 * Surprise: with detail tracing on, ICU is also asked for the converter's CCSID, and if that fails,
 * its status is the result. */
NLS2_API int32_t NLS2_GetCodepageName(int32_t codepageId, char *nameBuffer, uint32_t bufferLength);

/* The CCSID of a converter name, by ICU's rules for names (aliases, any case, null for the
 * process's default); 0 on failure. If ICU has the converter but no CCSID for it, the name is
 * looked up by NLS2_MapWindowsNameToCCSID.
 *
 * Status:
 *   0   done
 *   4   U_FILE_ACCESS_ERROR: ICU does not know the name
 *   37  NLS2_ERR_INVALID_PARAMETER: the converter has no number. This failure leaks a converter
 *   or ICU's other failures to open the converter */
NLS2_API uint32_t NLS2_GetCodepageId(const char *codepageName, int32_t *status);

/* ---- Conversion ------------------------------------------------------------------------------ */

/* Options of NLS2_TranslateString. */
enum {
  NLS2_STRING_TERMINATE = 0x0008,     /* end the output in a null, and count it */
  NLS2_STRING_FILL = 0x0100,          /* pad with blanks to destLen */
  NLS2_STRING_TRAILING = 0x0200,      /* restore the source's trailing blanks as far as they fit */
  NLS2_STRING_STRIP_TRAILING = 0x4000 /* drop them; wins over the two above */
};

/* Translates a field from one code page to another and, on request, shapes the output as a field.
 *
 *   destCodePage, sourceCodePage  not 0
 *   dest, destLen      output buffer and its size in bytes; 0 only with an empty source
 *   source, sourceLen  input in bytes; negative: null-terminated
 *   pSourceConsumed    receives the bytes consumed with options 0 or TERMINATE alone, else 0
 *   options            0, or at least one of the bits above. Other bits are ignored together
 *                      with a padding, but not with TERMINATE alone (see 36)
 *
 * Options 0 and TERMINATE alone translate the source as it is. The result is the number of bytes
 * written, plus the terminator's (1; 2 for a page with a two-null terminator) if one was requested
 * by TERMINATE or by a sourceLen of exactly -1, and fitted. An output that fills dest to the last
 * byte is a success without a terminator. The terminator's second zero byte is stored without a
 * check of destLen: a two-null page needs a buffer of destLen + 1 bytes.
 *
 * With any other option the trailing blanks (u_isblank: tabs and all space separators) and nulls
 * are cut off, and so is everything from the first remaining null on; the rest, the text, must fit
 * in destLen less the terminator's 1 or 2 bytes. Then, by the option:
 *   STRIP_TRAILING  The text alone. The result is its length in UTF-16 units, not bytes, plus 1 or
 *                   2 with TERMINATE, which however stores no null itself: ICU stores one zero byte
 *                   after the text if destLen has room for it besides the reserved 1 or 2. For the
 *                   length in bytes, leave that room and look for the zero byte; in UTF-16 it is
 *                   twice the units.
 *   TRAILING        The text and as many U+0020 as the source had trailing blanks, as fit.
 *   FILL            The text and U+0020 up to destLen; wins over TRAILING.
 * TRAILING and FILL return destLen, whatever was written, and store the terminator at its end;
 * bytes between a shorter output and that end are as they were.
 *
 * Surprise: TRAILING and FILL compare destLen with counts of UTF-16 units, which is right only if
 * each unit of the field becomes one byte. They lose letters with status 0 in pages whose blank
 * takes more than a byte, and if a character beyond U+FFFF, which is two units, becomes one byte:
 * "zz" at the end of "\U0001F600\U0001F600zz" from 1208 to 819 with FILL and destLen 4. In UTF-16
 * without a signature (1200, 1202, 13488, 57358, 57359 and other such CCSIDs) the first byte of the
 * field, or of a later unit, becomes zero as soon as blanks have to be dropped to fit; FILL always
 * drops some. Into 57359 from 819:
 *   "AB", FILL, destLen 10                     00 00 42 00 20 00 20 00 20 00
 *   "ABCD" and 4 blanks, TRAILING, destLen 8   00 00 42 00 43 00 44 00
 *   "AB" and 3 blanks, TRAILING, destLen 6     41 00 00 00 20 00
 * Into UTF-32 and pages with a signature (57360, 57361, 57368, 57369, 57372, and CCSIDs such as
 * 1204 and 1232) FILL fails with status 1 for any text. Use STRIP_TRAILING for all of these, and
 * append the blanks yourself.
 *
 * Result: the count described above; 0 on failure and for an empty source.
 *
 * Status:
 *   0   done, or sourceLen 0 (nothing is written); ICU's warnings count as 0
 *   15  U_BUFFER_OVERFLOW_ERROR: dest is too small for the text; partial output with options 0 or
 *       TERMINATE alone, and if blanks could not be made to fit
 *   32  NLS2_ERR_NO_MEMORY: no work buffer of 2 * max(destLen, UTF-16 units of the source) + 2
 *       bytes
 *   36  NLS2_ERR_INVALID_OPTION: TERMINATE with other bits, but none of the three paddings. This
 *       failure leaks the work buffer and two converters
 *   37  NLS2_ERR_INVALID_PARAMETER: options without an accepted bit, destLen negative, destLen 0
 *       with a source, or a code page 0
 *   or ICU's failure to open a converter (4: unknown page) or to convert; partial output
 * Bytes that do not convert are not a failure: ICU's default callbacks replace them with the target
 * page's substitution character, without a report. To find them, use a translator of nls2_fields.h
 * or nls2.hpp, or open the converters with NLS2_MapCodepageIdToName and set ICU's callbacks. */
NLS2_API int32_t NLS2_TranslateString(int32_t destCodePage, char *dest, int32_t destLen,
                                      int32_t sourceCodePage, const char *source, int32_t sourceLen,
                                      int32_t *pSourceConsumed, uint32_t options, int32_t *pStatus);

/* Common to the six functions below. pLocale is a live object, whose code page is the other end of
 * the conversion. A length of -1 means null-terminated input. The result is the output's length,
 * without the terminator that ICU adds if there is room; 0 on failure. Bytes or characters that do
 * not convert are replaced by ICU's substitutes and are not a failure (see NLS2_TranslateString).
 *
 * Status:
 *   0   done
 *   1   U_ILLEGAL_ARGUMENT_ERROR: a bad length
 *   4   U_FILE_ACCESS_ERROR: the code page does not open
 *   15  U_BUFFER_OVERFLOW_ERROR: the output is too small; partial output. The required length is
 *       not reported
 *   38  NLS2_ERR_INVALID_LOCALE
 *   or ICU's other failures */

/* Code page to UTF-8. sourceLength and targetLength in bytes. */
NLS2_API int32_t NLS2_toUTF8(const NLS2_Locale *pLocale, const char *pSource, int32_t sourceLength,
                             char *pTarget, int32_t targetLength, int32_t *status);

/* UTF-8 to code page. Lengths in bytes.
 *
 * Surprises: the output comes before the input; the status is stored on failure only, so preset it
 * to 0. */
NLS2_API int32_t NLS2_fromUTF8(const NLS2_Locale *pLocale, char *pTarget, int32_t targetLength,
                               const char *pSource, int32_t sourceLength, int32_t *status);

/* Code page to UTF-16 in the machine's byte order. sourceLength in bytes, targetLength and the
 * result in units. */
NLS2_API int32_t NLS2_toUTF16(const NLS2_Locale *pLocale, const char *pSource, int32_t sourceLength,
                              UChar *pTarget, int32_t targetLength, int32_t *status);

/* UTF-16 in the machine's byte order to code page. sourceLength in units, targetLength and the
 * result in bytes.
 *
 * Surprise: the output's capacity is the third argument and the input's length the fifth. */
NLS2_API int32_t NLS2_fromUTF16(const NLS2_Locale *pLocale, const UChar *pSource,
                                int32_t targetLength, char *pTarget, int32_t sourceLength,
                                int32_t *status);

/* Code page to UTF-8, in place. The number of the code page goes to ICU as a CCSID: the private
 * numbers and 936 fail (4), and 874, 932, 949 and 950 are other tables than
 * NLS2_MapCodepageIdToName opens. dlen and slen are in bytes; slen may not be -1.
 *
 * Surprises: the output is written from src on, over the input. Only dest + dlen is used, as the
 * output's limit; it must lie in src's buffer, at or after src. The layout to use is dest == src
 * and dlen the buffer's size. The return value is not a length but the output's end minus the
 * input's end: -2 if two bytes fewer were written. Status 1 (U_ILLEGAL_ARGUMENT_ERROR) also if dest
 * + dlen lies before src.
 *
 * The output can overtake input that ICU has not read yet. It is then garbled at status 0, or the
 * status is 15 although there is room. That happens to texts of more than 1,000 UTF-16 units, to
 * invalid text under 1208 (34 bytes are enough), and with some pages, such as 5478, to short texts.
 * Use NLS2_toUTF8, which takes two buffers. */
NLS2_API int32_t NLS2_StringToUnicode(const NLS2_Locale *pLocale, char *dest, int32_t dlen,
                                      const char *src, int32_t slen, int32_t *status);

/* UTF-8 to code page, in place. Like NLS2_StringToUnicode, but the other way, with all its
 * surprises. Use NLS2_fromUTF8. */
NLS2_API int32_t NLS2_UnicodeToString(const NLS2_Locale *pLocale, char *dest, int32_t dlen,
                                      const char *src, int32_t slen, int32_t *status);

/* ---- Lengths --------------------------------------------------------------------------------- */

/* How many bytes of the destination's code page to reserve for a byte of the source's, from ICU's
 * largest character sizes D and S (ucnv_getMaxCharSize): 1 if both objects have the same number, D
 * if S divides D, else the least multiple of S above D. Usually too large, but it counts neither
 * signatures nor shifts back to the initial state: reserve 8 bytes more for those. U+00D7 from 819
 * to 930 takes 4 bytes, and the ratio is 3.
 *
 * Status:
 *   0   done
 *   38  NLS2_ERR_INVALID_LOCALE; the result is 0
 *   or ICU's for a code page that does not open; the result is 1, not 0 */
NLS2_API int32_t NLS2_ConversionRatio(const NLS2_Locale *pDestinationLocale,
                                      const NLS2_Locale *pSourceLocale, int32_t *pStatus);

/* The UTF-16 units of a null-terminated string in the object's code page, up to its first null
 * character; 0 on failure. `ignored` is not read. The code page goes to ICU as a CCSID, as with
 * NLS2_StringToUnicode: the private numbers and 936 fail, and 874, 932, 949 and 950 are other
 * tables.
 *
 * Status, stored on failure only, so preset it to 0:
 *   32  NLS2_ERR_NO_MEMORY
 *   38  NLS2_ERR_INVALID_LOCALE
 *   or ICU's */
NLS2_API int32_t NLS2_Strlen(const NLS2_Locale *pLocale, const char *pString, int32_t ignored,
                             int32_t *pStatus);

/* The bytes of a UTF-8 character, 1 to 4, determined by its first byte alone, whatever the object's
 * code page. Any byte that is not a lead byte counts as 1, C0 and C1 as 2; what follows is neither
 * read nor checked. Status: 0, or NLS2_ERR_INVALID_LOCALE (result 0). */
NLS2_API int32_t NLS2_ByteLength(const NLS2_Locale *pLocale, const char *pCharacter,
                                 int32_t *pStatus);

/* Reserved: the result is always 0, and nothing is read. */
NLS2_API double NLS2_StringToDouble(const void *ignored1, const void *ignored2);

/* ---- Comparison, search and case ------------------------------------------------------------- */

/* Options of NLS2_Strcoll; they combine. */
enum {
  CHARBASED = 0x80,             /* count each string's bytes by its UTF-8 characters first */
  SORT_IGNORETRAILING = 0x20000 /* ignore trailing blanks (u_isblank), but not after a null */
};

/* Compares two strings in the object's code page by the rules of its language, at tertiary strength
 * (case and accents count, punctuation too). Lengths are in bytes, signed 16-bit; -1 means
 * null-terminated.
 *
 * Result: -1 if string 1 sorts first, 1 if string 2 does, 0 if they are equal, and 0 on every
 * failure.
 *
 * Status:
 *   0   done
 *   1   U_ILLEGAL_ARGUMENT_ERROR: a length below -1
 *   32  NLS2_ERR_NO_MEMORY
 *   38  NLS2_ERR_INVALID_LOCALE
 *   or ICU's other failures
 *
 * With CHARBASED a negative length means null-terminated, and a character that starts before the
 * given length is counted in full. Warning: lead bytes are trusted, whatever the code page. One
 * just before the end of a string leads past the terminator or the given length, so the bytes there
 * must be readable. A counted length wraps at 16 bits: 32,768 to 65,534 bytes fail with status 1,
 * 65,535 compare in full, 65,536 as an empty string, and so on. */
NLS2_API int32_t NLS2_Strcoll(const NLS2_Locale *pLoc, const char *pString1, int16_t String1Length,
                              const char *pString2, int16_t String2Length, uint32_t options,
                              int32_t *pStatus);

/* Option of NLS2_Findstr. */
enum { IGNORECASE = 0x40 /* lower-case both strings by the language's rules first */ };

/* Whether string 2 occurs in string 1, both in the object's code page, unit for unit in UTF-16
 * (u_strstr), except that half of a surrogate pair is not found in a whole one. Lengths in bytes.
 * Both end at their first null character; an empty string 2 occurs everywhere.
 *
 * Result: 1 if it does, 0 if not, -1 on any failure: no live object, a code page that does not
 * open, bad lengths, no memory.
 *
 * Surprises: with IGNORECASE a string that grows in lower case ("\u0130" outside Turkish) is a
 * failure. A failure to measure or to store string 2 leaks a buffer. To search many texts, use
 * ICU's usearch_open(). */
NLS2_API int32_t NLS2_Findstr(const NLS2_Locale *pLocale, const char *pString1, int32_t len1,
                              const char *pString2, int32_t len2, uint32_t options);

/* Options of NLS2_MapString; exactly one. */
enum { NLS2_MAP_FOLDCASE = 0x10, NLS2_MAP_UPPERCASE = 0x400, NLS2_MAP_LOWERCASE = 0x800 };

/* Meant for case mapping, but unusable: every text of one character or more fails with 15
 * (U_BUFFER_OVERFLOW_ERROR) and leaves dest as it was, whatever the options. Use NLS2_toUTF16 and
 * ICU's u_strToUpper(), u_strToLower() or u_strFoldCase(). Only a src without a character is
 * mapped: an empty one, or one of shifts alone ("\x0E" in 930). It must be null-terminated; slen is
 * only traced. It becomes two null characters of the code page, after a signature if the page
 * writes one. ICU adds a zero byte if dest has room.
 *
 * Result: the bytes written without that one (2 for 819, 4 for 1200, 6 for 1204), or a status.
 * Lengths and statuses share the numbers:
 *   4   U_FILE_ACCESS_ERROR: the code page does not open as a CCSID
 *   15  U_BUFFER_OVERFLOW_ERROR: as above, or dlen is too small (partial output)
 *   32  NLS2_ERR_NO_MEMORY
 *   38  NLS2_ERR_INVALID_LOCALE
 *   or ICU's other failures
 * On a big-endian 16-bit page any ASCII text is empty, since its first byte is zero. */
NLS2_API int32_t NLS2_MapString(const NLS2_Locale *pLocale, char *dest, int32_t dlen,
                                const char *src, int32_t slen, uint32_t options);

/* ---- Streams --------------------------------------------------------------------------------- */

/* ICU's file streams (<unicode/ustdio.h>). Callers write and read UTF-16, in units; the file is in
 * the encoding that NLS2_OpenStream names. pLocale must be live and has no other effect: no stream
 * uses its code page or its name. A stream belongs to one thread at a time.
 *
 * Surprises. None of these functions reports read or write errors: check
 * ferror(u_fgetfile(stream)). A write to a full disk returns its full count, and a directory opens
 * for reading and reads as empty. Bytes that do not convert become U+FFFD or U+001A, and characters
 * that the file's encoding lacks become its substitution character. A null stream crashes in every
 * function but NLS2_CloseStream. */

/* Opens a file.
 *
 *   filename     a path, passed to the system as it is
 *   permissions  as for fopen: "r", "w", "a", with "+" to write and read
 *   encoding     one of ICU's converter names; null for the process's default code page
 *
 * Result: the stream, which NLS2_CloseStream closes; null for a locale that is not live (the file
 * is not touched), a file or mode that does not open, and an encoding that ICU does not know.
 *
 * Surprises: the file is opened before the encoding is looked up, so a "w" with a misspelt encoding
 * returns null and leaves an empty file, whatever was in it. "UTF-16" writes a byte-order mark, a
 * second one in the middle of the file with mode "a", and reads with or without one (then
 * big-endian); "UTF-16LE", "UTF-16BE" and "UTF-8" write none, and read one as the unit U+FEFF. With
 * an empty encoding there is no converter: a character outside ICU's invariant set, such as
 * @ # $ [ ~ ! |, the line feed and all beyond ASCII, is written as a zero byte, and a byte is read
 * as the character with its number (E4 as U+00E4). Name an encoding. */
NLS2_API struct UFILE *NLS2_OpenStream(const NLS2_Locale *pLocale, const char *filename,
                                       const char *permissions, const char *encoding);

/* Writes what is buffered and closes the stream; does nothing for null. Status, as the result: 0,
 * or NLS2_ERR_INVALID_LOCALE, which leaves the stream open. */
NLS2_API int32_t NLS2_CloseStream(const NLS2_Locale *pLocale, struct UFILE *file);

/* Writes `len` units (negative: a null-terminated text). Result: the units written; 0 for a locale
 * that is not live. */
NLS2_API int32_t NLS2_WriteString(const NLS2_Locale *pLocale, const UChar *pSource, int32_t len,
                                  struct UFILE *fileHandle);

/* Reads up to `len` units, 0 or more; no terminator is stored. Result: the units read; 0 at the end
 * of the file and for a locale that is not live. A surrogate pair may be cut between two reads.
 *
 * Surprise: the result can be 0, or less than `len`, in the middle of a file, if a kilobyte of it
 * has no character (shifts, or changes of a window in SCSU). Only feof(u_fgetfile(stream)) is
 * certain.
 *
 * Warning: the stream is the second argument here and in NLS2_Fgets, the last in the two functions
 * that write. A negative len is undefined behaviour. */
NLS2_API int32_t NLS2_ReadString(const NLS2_Locale *pLocale, struct UFILE *fileHandle, UChar *pDest,
                                 int32_t len);

/* Writes a null-terminated text and a line feed (U+000A). Result: the units written, line feed
 * included; 0 for a locale that is not live. */
NLS2_API int32_t NLS2_Fputs(const NLS2_Locale *pLocale, const UChar *pString,
                            struct UFILE *fileHandle);

/* Reads one line with its end, at most len - 1 units, and stores a terminator after it.
 *
 * A line ends in U+000A, U+000B, U+000C, U+000D (with a U+000A that follows), U+0085, U+2028 or
 * U+2029. pDest needs room for `len` units, and is traced as it is before the call.
 *
 * Result: pDest; null at the end of the file, with a len below 1, and for a locale that is not
 * live; null also in the middle of a file, as NLS2_ReadString returns 0 there. A len of 1 returns
 * an empty text until the end of the file. A null inside a line looks like the terminator: use
 * NLS2_ReadString, which counts. */
NLS2_API UChar *NLS2_Fgets(const NLS2_Locale *pLocale, struct UFILE *fileHandle, UChar *pDest,
                           int32_t len);

/* Writes what is buffered to the file, and ends a shift sequence that the encoding has open. */
NLS2_API void NLS2_Fflush(struct UFILE *fileHandle);

/* Flushes, and returns to the beginning of the file. */
NLS2_API void NLS2_Frewind(struct UFILE *fileHandle);

/* The Unicode encoding whose signature (byte-order mark) a text begins with.
 *
 *   source, sourceLength  the text's first bytes, of which five are enough; -1: null-terminated
 *   pSignatureLength      receives the signature's length in bytes; 0 if there is none
 *
 * Result: ICU's name of the encoding ("UTF-8", "UTF-16LE", "UTF-32BE", "SCSU" ...), a static text;
 * null if there is none. Status: 0; or ICU's, 1 (U_ILLEGAL_ARGUMENT_ERROR) for a null source or a
 * length below -1.
 *
 * Surprise: FF FE 00 00 is UTF-32LE, even if it begins a text in UTF-16LE. */
NLS2_API const char *NLS2_detectUnicodeSignature(const char *source, int32_t sourceLength,
                                                 int32_t *pSignatureLength, int32_t *pStatus);

/* ---- Resource bundles ------------------------------------------------------------------------ */

/* Opens ICU's resource bundle (<unicode/ures.h>) for an object's locale name.
 *
 *   packageName  as for ures_open: a directory of .res files, or a .dat file with its path and
 *                without ".dat"; null for ICU's own data
 *
 * Result: the bundle, which NLS2_ResourceClose closes; null on failure.
 *
 * Status:
 *   0     done
 *   -128  U_USING_FALLBACK_WARNING: the bundle is that of a parent of the locale, which for some
 *         languages (zh_Hant, sr_Latn) is the root bundle
 *   -127  U_USING_DEFAULT_WARNING: it is that of the process's default locale, or the root bundle
 *   2     U_MISSING_RESOURCE_ERROR: there is no bundle at all
 *   38    NLS2_ERR_INVALID_LOCALE
 *   or ICU's other failures
 *
 * Surprise: for a language without a bundle the process's default locale comes before the root. Ask
 * ICU's ures_getLocaleByType() which bundle it is. */
NLS2_API struct UResourceBundle *NLS2_ResourceOpen(const char *packageName,
                                                   const NLS2_Locale *pLocale, int32_t *pStatus);

/* Closes a bundle. The strings that came from it are no longer valid. */
NLS2_API void NLS2_ResourceClose(struct UResourceBundle *bundle);

/* The string that a bundle, or a parent of it, holds under a key.
 *
 * Result: the string in UTF-16, whatever the code page of the locale object; it is null-terminated,
 * belongs to the bundle and is valid until the bundle is closed. Null on failure. *pLength: its
 * length in units.
 *
 * Status:
 *   0           done
 *   -128, -127  a parent or the root bundle had it, as above
 *   1           U_ILLEGAL_ARGUMENT_ERROR: the bundle is null
 *   2           U_MISSING_RESOURCE_ERROR: none of them has the key
 *   17          U_RESOURCE_TYPE_MISMATCH: the key's value is not a string
 *   or ICU's other failures */
NLS2_API const UChar *NLS2_GetStringByKey(const struct UResourceBundle *bundle, const char *key,
                                          int32_t *pLength, int32_t *pStatus);

/* ---- Build stamp ----------------------------------------------------------------------------- */

/* How the library was built: its version, compiler, options, build host and date, in one static
 * line. A reproducible build (SOURCE_DATE_EPOCH set) names no host. */
NLS2_API const char *NLS2_BuildStamp(void);

#ifdef __cplusplus
}
#endif

#endif
