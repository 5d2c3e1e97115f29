/* nls2_fields.h - the interface of libzelfields: fields and records, fast and with every problem
 * in its place.
 *
 * Opens code pages by name or number, and keeps translators and collators open from call to call:
 * for programs that move much text. examples/translate_column.c shows a short use; C++ programs
 * have nls2.hpp as well. The functions of nls2.h serve single calls.
 *
 * Conventions. They hold for every function unless its comment says otherwise.
 *
 *  1. Every function returns a status: 0 for success, a positive value for a failure, a negative
 *     value for an ICU warning, which is a success. It is NLS2F_ERR_FIELD, one of NLS2_ERR_* or
 *     ICU's UErrorCode. nls2_status_name() of nls2.h names them all.
 *  2. NLS2F_ERR_FIELD means that the text is the problem: *problem then holds what, where and why.
 *     No other status changes *problem.
 *  3. Outputs follow inputs. After a failure counts and lengths are 0, handles null, and the bytes
 *     of `out` unspecified, unless "partial output" is noted. Bytes of `out` after those that were
 *     written are unspecified in any case.
 *  4. Lengths, offsets and rooms are bytes, as int64_t. Texts carry a length, and a null is a
 *     character like any other; only names are null-terminated. A length below 0 is a failure.
 *  5. A pointer may be null only where its comment says so, and where its length or room is 0; a
 *     `problem` always. Null elsewhere is NLS2_ERR_INVALID_PARAMETER; so is a struct whose `size`
 *     is too small.
 *  6. A struct that the caller fills begins with `size`, its own sizeof, so that later versions can
 *     add to its end. Set the rest to 0 first.
 *  7. Handles belong to the caller, who closes them; closing null does nothing. A page may be
 *     closed before what was opened with it.
 *  8. Threads. Pages, layouts and writers can be used by any number of threads at once; other
 *     handles by one thread at a time. Clone a translator for each thread.
 *  9. Input and output must not overlap.
 * 10. Every function may fail with NLS2_ERR_NO_MEMORY (32) unless its comment says that it does not
 *     allocate, and with NLS2_ERR_INVALID_PARAMETER (37) as above. The comments list the others.
 *     There is no global state, no environment and no tracing but that of nls2.h.
 */
#ifndef NLS2_FIELDS_H
#define NLS2_FIELDS_H

#include "nls2.h"

#ifdef __cplusplus
extern "C" {
#endif

enum { NLS2F_ERR_FIELD = 40 /* the text is the problem: see NLS2F_Problem */ };

/* ---- Problems -------------------------------------------------------------------------------- */

/* Kinds of problems. */
enum {
  NLS2F_INVALID_BYTES = 1,  /* bytes that are not valid in the source page */
  NLS2F_NOT_IN_PAGE = 2,    /* a character that the destination page lacks */
  NLS2F_NO_ROOM = 3,        /* the output takes more than its room, or its text more than `width` */
  NLS2F_EMBEDDED_NULL = 4,  /* U+0000 inside the text of a padded field */
  NLS2F_NO_EXACT_FILL = 5,  /* no number of blanks makes the field `width` bytes long */
  NLS2F_TOO_LONG = 6,       /* the field has more than 2,147,483,647 bytes */
  NLS2F_INVALID_NUMBER = 7, /* bytes or text that are not a number of this kind */
  NLS2F_NEGATIVE = 8,       /* a negative number in a field without a sign */
  NLS2F_TOO_LARGE = 9,      /* a number with more digits than its place has */
  NLS2F_TOO_PRECISE = 10,   /* a number with more decimals than its field has */
  NLS2F_CUT_SHORT = 11,     /* the input ends inside a record */
  NLS2F_INVALID_PREFIX = 12,  /* a length that cannot be, or bytes 3 and 4 are not zero */
  NLS2F_SPANNED = 13,         /* the prefix of a part of a spanned record */
  NLS2F_INVALID_CSV = 14,     /* a quote, or what follows one, in the wrong place */
  NLS2F_RECORD_TOO_LONG = 15, /* a record is longer than its format can hold */
  NLS2F_INVALID_LAYOUT = 16,
  NLS2F_INVALID_FORMAT = 17
};

/* What is wrong, and where. */
typedef struct NLS2F_Problem {
  uint32_t size;
  int32_t kind;
  int64_t record; /* of a column the row, of a layout the line, else the record; from 0 */
  int64_t offset; /* in the field: the first byte of the character, or of the invalid sequence as
                         ICU delimits it, after a shift before it. Of the first character that does
                         not fit; the field's length if only blanks or a last shift do not fit */
  int64_t needed; /* see below */
  uint32_t codePoint; /* of NLS2F_NOT_IN_PAGE and of a character that does not fit; else 0. A lone
                         surrogate is its own code point */
  int32_t byteCount;  /* how many of `bytes` are set */
  uint8_t bytes[8];   /* the source's bytes at `offset`: one character or sequence, without shifts,
                         at most its first 8 bytes */
} NLS2F_Problem;

/* `needed`:
 *   NLS2F_NO_ROOM        the smallest room with which the same call succeeds under the same policy.
 *                        If it is more than the policy's width, the text alone takes that many
 *                        bytes, and more room does not help
 *   NLS2F_NO_EXACT_FILL  the next shorter width that blanks can fill exactly
 *   NLS2F_CUT_SHORT, NLS2F_RECORD_TOO_LONG  the record's length, 0 if unknown; the format's limit
 *   NLS2F_INVALID_PREFIX, NLS2F_INVALID_LAYOUT, NLS2F_INVALID_FORMAT  a code for the words
 *   other kinds          0
 *
 * A field with several problems reports one. Under NLS2F_STOP invalid bytes come first, or a
 * character before them that the page lacks; then a null inside the text; then the first character
 * that the page lacks; then the room. */

/* ---- Pages ----------------------------------------------------------------------------------- */

typedef struct NLS2F_Page NLS2F_Page;

/* Opens a code page by one of ICU's names, with ICU's options and variants ("ibm-37", "cp1047",
 * "windows-1252", "shift_jis", "ibm-37,swaplfnl", "ibm-1047-s390"): exactly what ucnv_open() opens
 * for it. Digits alone are a number: NLS2F_OpenPageByNumber().
 *
 * Status:
 *   0     done
 *   -122  U_AMBIGUOUS_ALIAS_WARNING: the name means several tables; ICU's choice is open. Other
 *         warnings of ICU's also come unchanged
 *   4     U_FILE_ACCESS_ERROR: ICU does not know the name. NLS2F_NearPageNames() has similar ones
 *   or ICU's other failures */
NLS2_API int32_t NLS2F_OpenPageByName(const char *name, NLS2F_Page **page);

/* Opens a code page by number: exactly what NLS2_MapCodepageIdToName opens for it. Status: 0, or
 * that function's; 4 (U_FILE_ACCESS_ERROR) for a number that this ICU has no converter for. */
NLS2_API int32_t NLS2F_OpenPageByNumber(int32_t number, NLS2F_Page **page);

/* Up to three of ICU's names that look like one that does not open, most similar first, separated
 * by ", ", null-terminated; empty if there are none. As many names as fit in `room`; 192 bytes hold
 * three. */
NLS2_API int32_t NLS2F_NearPageNames(const char *name, char *names, int64_t room);

/* Closes a page. */
NLS2_API void NLS2F_ClosePage(NLS2F_Page *page);

/* Kinds of pages. */
enum {
  NLS2F_PAGE_SINGLE_BYTE = 1, /* every byte is a character */
  NLS2F_PAGE_MIXED = 2,       /* characters of one, two or more bytes, with or without shifts */
  NLS2F_PAGE_UNICODE = 3,     /* UTF-8, UTF-16, UTF-32, CESU-8, UTF-7, SCSU, BOCU-1 ... */
  NLS2F_PAGE_OTHER = 4        /* ISO-2022, HZ, ISCII, LMBCS ... */
};

typedef struct NLS2F_PageFacts {
  uint32_t size;
  int32_t number;       /* a number that opens the same table: ICU's CCSID if it does, else the
                           least that does; 0 if none does */
  int32_t kind;         /* NLS2F_PAGE_... */
  int32_t hasStates;    /* 1: what a byte means depends on those before it (shifts, modes) */
  int32_t hasSignature; /* 1: a text begins with a byte-order mark */
  char name[84];        /* ICU's canonical name, null-terminated: "ibm-37_P100-1995,swaplfnl" */
} NLS2F_PageFacts;

/* What a page is like. Does not allocate, except to look for the number at the first call. */
NLS2_API int32_t NLS2F_PageInfo(const NLS2F_Page *page, NLS2F_PageFacts *facts);

/* How many pages ICU has, and the name of each, for lists: 0 <= index < count.
 * NLS2F_OpenPageByName() opens it. `name` is ICU's and static. */
NLS2_API int32_t NLS2F_PageCount(int64_t *count);
NLS2_API int32_t NLS2F_PageAt(int64_t index, const char **name);

/* ---- Translators ----------------------------------------------------------------------------- */

/* What becomes of the blanks at a field's end. Blanks are the characters of ICU's u_isblank (tab
 * and all space separators). Except with AS_IS, the blanks and nulls (U+0000) at the end are cut
 * off first; what remains is the text, and a null inside it is NLS2F_EMBEDDED_NULL. */
enum {
  NLS2F_AS_IS = 0,      /* the field as it is, blanks and nulls too */
  NLS2F_STRIP = 1,      /* the text alone */
  NLS2F_FILL = 2,       /* the text and U+0020 up to exactly `width` bytes */
  NLS2F_KEEP_BLANKS = 3 /* the text and one U+0020 for each blank cut off, as many as fit in
                           `width` */
};

/* What to do with bytes that are not valid in the source page, and with characters that the
 * destination page lacks. */
enum {
  NLS2F_STOP = 0,           /* the field fails */
  NLS2F_REPLACE = 1,        /* as ICU does: U+FFFD or the page's substitution character takes their
                               place, and characters that are ignorable by default (U+00AD, U+200B
                               ...) disappear. All are counted. The bytes are those that
                               NLS2_TranslateString writes, and ISO-2022-KR has its header */
  NLS2F_REPLACE_VISIBLY = 2 /* as REPLACE, but ignorable characters are substituted, too */
};

typedef struct NLS2F_Policy {
  uint32_t size;
  int32_t padding; /* NLS2F_AS_IS ... */
  int32_t onBad;   /* NLS2F_STOP ... */
  int32_t zero;    /* 0 */
  int64_t width;   /* with FILL: the exact size of the output; else the most that the output takes,
                      0 for no limit. At most 2,147,483,647 */
} NLS2F_Policy;

typedef struct NLS2F_Translator NLS2F_Translator;

/* Opens a translator from one page to another. A null policy is AS_IS, STOP, no width.
 *
 * Status:
 *   36  NLS2_ERR_INVALID_OPTION: an unknown padding or onBad; FILL without a width; a width out of
 *       range; FILL into a page that lacks U+0020
 *   or ICU's failure to open a converter */
NLS2_API int32_t NLS2F_OpenTranslator(const NLS2F_Page *from, const NLS2F_Page *to,
                                      const NLS2F_Policy *policy, NLS2F_Translator **translator);

/* Another translator with the same pages and policy, at the beginning of a text; it has what the
 * first one has learned, so that this costs little. */
NLS2_API int32_t NLS2F_CloneTranslator(const NLS2F_Translator *translator,
                                       NLS2F_Translator **clone);

/* Closes a translator. */
NLS2_API void NLS2F_CloseTranslator(NLS2F_Translator *translator);

/* A room that is enough for any field of `length` bytes. Does not allocate. */
NLS2_API int32_t NLS2F_MaxSize(const NLS2F_Translator *translator, int64_t length, int64_t *size);

/* Translates one field, whole: a shift state is closed, and a page with a signature writes one a
 * field; an empty text becomes an empty output, with blanks after it under FILL.
 *
 *   written   the bytes of the output
 *   replaced  each invalid sequence and each character that the page lacks, once; or null. A
 *             U+001A of the source does not count unless the page lacks it
 *
 * Does not allocate for fields of up to 2,048 bytes, nor for longer ones once it has met one as
 * long. Status: NLS2F_ERR_FIELD. */
NLS2_API int32_t NLS2F_Translate(NLS2F_Translator *translator, const void *field, int64_t length,
                                 void *out, int64_t room, int64_t *written, int64_t *replaced,
                                 NLS2F_Problem *problem);

/* The problem in English, such as "the character U+20AC is not in ibm-37_P100-1995",
 * null-terminated and cut to `room` bytes, terminator included. A room of 256 holds every text.
 *
 *   translator  the one that found the problem, whose pages are then named; or null */
NLS2_API int32_t NLS2F_DescribeProblem(const NLS2F_Translator *translator,
                                       const NLS2F_Problem *problem, char *text, int64_t room);

/* One field of many records, into bytes and offsets as columnar formats keep them. */
typedef struct NLS2F_Column {
  uint32_t size;
  int32_t offsetBits; /* 32 or 64: int32_t or int64_t offsets */
  const void *fields; /* the first field */
  int64_t length;     /* bytes of each field */
  int64_t stride;     /* bytes from one field to the next, not negative */
  int64_t rows;
  void *out; /* the rows' bytes, one after another */
  int64_t room;
  void *offsets; /* rows + 1: row i is the bytes from offsets[i] to before offsets[i + 1]; the first
                    is 0 */
  uint8_t *good; /* (rows + 7) / 8 bytes, or null. Bit i % 8 of byte i / 8, least bit first: 1 if
                    row i is good; bits of its byte after the last row done are 0 */

  /* Results, set by every call that returns 0 or NLS2F_ERR_FIELD. */
  int64_t done;     /* rows whose bytes, offsets and bits are final */
  int64_t failed;   /* of these, rows with a problem: empty, their bit 0 */
  int64_t replaced; /* as for NLS2F_Translate, in all rows done */
} NLS2F_Column;

/* Translates one field of many records. With `good` a row with a problem becomes empty, and
 * *problem describes the first of them; the status is 0. Without it the first such row stops the
 * call.
 *
 * A row that does not fit in `room`, or whose end does not fit in a 32-bit offset, stops the call
 * in either case: the problem is NLS2F_NO_ROOM, `record` the row, `needed` the room with which the
 * same call gets past it, and the rows before it are done (partial output). Go on there with new buffers: fields + done *
 * stride, rows - done. Does not allocate where NLS2F_Translate does not.
 *
 * Status: 0, NLS2F_ERR_FIELD, or NLS2_ERR_INVALID_PARAMETER also for other offsetBits. */
NLS2_API int32_t NLS2F_TranslateColumn(NLS2F_Translator *translator, NLS2F_Column *column,
                                       NLS2F_Problem *problem);

/* Translates a text piece by piece, with padding AS_IS and no width: wherever it is cut, the
 * pieces' outputs together are that of NLS2F_Translate for the whole text. NLS2F_Translate and
 * NLS2F_TranslateColumn abandon a text that is under way.
 *
 *   last      1: the text ends here; shift states are closed, and the next piece begins a new text
 *   read      the bytes of the piece that were used: all on success
 *   written   the bytes of the output
 *   replaced  in this call; or null
 *   problem   `offset` counts from the beginning of the text, `needed` is 0
 *
 * Status:
 *   0   done; the end of the piece may be kept back until more is known
 *   36  NLS2_ERR_INVALID_OPTION: a translator with another padding or with a width
 *   or NLS2F_ERR_FIELD. NLS2F_NO_ROOM is not an end: *read and *written are right (partial output),
 *   so call again with the rest of the piece, also if it is empty; 32 bytes of room always get on.
 *   After any other problem they are right up to the bad bytes or character, and the next piece
 *   begins a new text */
NLS2_API int32_t NLS2F_TranslateChunk(NLS2F_Translator *translator, const void *piece,
                                      int64_t length, int32_t last, void *out, int64_t room,
                                      int64_t *read, int64_t *written, int64_t *replaced,
                                      NLS2F_Problem *problem);

/* ---- Collators ------------------------------------------------------------------------------- */

typedef struct NLS2F_Collator NLS2F_Collator;

/* Opens a collator for texts in one page: the order of NLS2_Strcoll for a locale object with this
 * name and page, without its limit of 32,767 bytes.
 *
 *   locale   ICU's name of a locale ("sv_SE"), whether or not localeMap has it
 *   options  0, SORT_IGNORETRAILING, IGNORECASE; IGNORECASE counts for NLS2F_Find alone
 *
 * Status: 0; ICU's warnings (-128, -127: the rules are a parent's or the root's); 36
 * (NLS2_ERR_INVALID_OPTION) for other options; ICU's failures. */
NLS2_API int32_t NLS2F_OpenCollator(const char *locale, const NLS2F_Page *page, uint32_t options,
                                    NLS2F_Collator **collator);

/* Closes a collator. */
NLS2_API void NLS2F_CloseCollator(NLS2F_Collator *collator);

/* *order: -1 if text 1 sorts first, 1 if text 2 does, 0 if they are equal. Bytes that are not valid
 * sort as U+FFFD. Status: 0, or ICU's. */
NLS2_API int32_t NLS2F_Compare(NLS2F_Collator *collator, const void *text1, int64_t length1,
                               const void *text2, int64_t length2, int32_t *order);

/* A key whose bytes, compared by memcmp(), have the order of NLS2F_Compare. It ends in a zero byte,
 * so that no key begins another. Status: 0, or 15 (U_BUFFER_OVERFLOW_ERROR) if `room` is too small;
 * *keyLength is then the size of the whole key. */
NLS2_API int32_t NLS2F_SortKey(NLS2F_Collator *collator, const void *text, int64_t length,
                               void *key, int64_t room, int64_t *keyLength);

/* Where a pattern first occurs in a text, unit for unit in UTF-16 as for NLS2_Findstr, but nulls
 * are characters, and a text may grow in lower case. An empty pattern occurs at 0. *found is the
 * length of the occurrence in bytes, with shifts inside it; -1 and 0 if there is none. */
NLS2_API int32_t NLS2F_Find(NLS2F_Collator *collator, const void *text, int64_t length,
                            const void *pattern, int64_t patternLength, int64_t *position,
                            int64_t *found);

/* ---- Layouts and numbers --------------------------------------------------------------------- */

enum {
  NLS2F_TEXT = 0,
  NLS2F_RAW = 1,
  NLS2F_HEX = 2,
  NLS2F_PACKED = 3, /* 1 to 16 bytes: digits of four bits, then a sign: C, A, E, F are positive, D,
                       B negative; written C, D */
  NLS2F_ZONED = 4,  /* 1 to 31 digits, a byte each. The last one's upper four bits are the sign, as
                      above; in ASCII 3 is positive, 7 negative */
  NLS2F_BINARY = 5  /* 1, 2, 4 or 8 bytes, two's complement, big-endian */
};
enum {                         /* options of numbers */
       NLS2F_UNSIGNED = 1,     /* no sign: written F, in ASCII 3; BINARY begins at 0 */
       NLS2F_BLANK_EMPTY = 2,  /* only blanks, or only nulls except in BINARY, are an empty text */
       NLS2F_SIGN_LEADING = 4, /* ZONED: the sign is at the first digit, or before it */
       NLS2F_SIGN_SEPARATE = 8 /* ZONED: the sign is one more byte, + or - */
};

/* One field of a record: from a layout, or filled by the caller. */
typedef struct NLS2F_Field {
  uint32_t size;
  int32_t kind;                     /* NLS2F_TEXT ... */
  int32_t scale;                    /* of a number: digits after the point, 0 to 31 */
  uint32_t options;                 /* of a number: NLS2F_UNSIGNED ... */
  int64_t first, length;            /* bytes; the record's first is 0 */
  uint8_t zero, plus, minus, blank; /* as the record's page has them */
  const char *name;                 /* the layout's, as is `page`; empty if it has none */
  const char *page;                 /* name of a page of the text's own, or null */
} NLS2F_Field;

typedef struct NLS2F_Layout NLS2F_Layout;
enum { NLS2F_LAYOUT_SHORT = 1, NLS2F_LAYOUT_WRITES = 2 }; /* options */
/* Opens a layout: UTF-8, a line a field, # begins a comment. Bytes count from 1; a length alone
 * begins after the field before. KIND: text (if none), raw, hex, packed, zoned, binary, page:NAME.
 * OPTION: unsigned, blank=empty, sign=trailing|leading[-separate].
 *
 *   NAME FIRST-LAST|LENGTH [KIND[.SCALE]] [OPTION]...      balance 13-17 packed.2 blank=empty
 *   with NLS2F_LAYOUT_SHORT                                1-12;13-17=packed.2:blank=empty
 *
 * With NLS2F_LAYOUT_WRITES fields must not overlap. `page` is that of the records; zoned numbers
 * need digits F0 to F9 or 30 to 39. Of a problem `record` is the line and `offset` the byte in it,
 * both from 0. Status: NLS2F_ERR_FIELD; NLS2_ERR_INVALID_OPTION (36). */
NLS2_API int32_t NLS2F_OpenLayout(const char *text, int64_t length, const NLS2F_Page *page,
                                  uint32_t options, NLS2F_Layout **layout, NLS2F_Problem *problem);
NLS2_API void NLS2F_CloseLayout(NLS2F_Layout *layout);

/* The number of fields, and the length of a record that holds them. A field, from 0. */
NLS2_API int32_t NLS2F_LayoutSize(const NLS2F_Layout *layout, int64_t *fields, int64_t *length);
NLS2_API int32_t NLS2F_LayoutField(const NLS2F_Layout *layout, int64_t index, NLS2F_Field *field);

/* The number in the field's `bytes` as text, "-123.45": ASCII, `scale` decimals, at least one digit
 * before the point, no plus; -0 is 0. 34 bytes hold every number. And back: blanks and tabs around
 * it, a plus and fewer decimals are allowed; nothing is rounded or cut. Do not allocate. Status:
 * NLS2F_ERR_FIELD; 36 for a field that is no number, or whose kind has no such length, options. */
NLS2_API int32_t NLS2F_NumberToText(const NLS2F_Field *field, const void *bytes, char *text,
                                    int64_t room, int64_t *written, NLS2F_Problem *problem);
NLS2_API int32_t NLS2F_TextToNumber(const NLS2F_Field *field, const char *text, int64_t length,
                                    void *bytes, NLS2F_Problem *problem);

/* A column of numbers, as NLS2F_TranslateColumn makes one of texts; its `length` is not used. With
 * offsetBits 0 it is int64_t values in `out`, without the point (12.30 is 1230), and no offsets. An
 * empty text is then 0 and its bit 0, not in `failed`; without `good` it is an invalid number. */
NLS2_API int32_t NLS2F_NumberColumn(const NLS2F_Field *field, NLS2F_Column *column,
                                    NLS2F_Problem *problem);

/* ---- Records --------------------------------------------------------------------------------- */

typedef struct NLS2F_Span {
  int64_t offset, length;
} NLS2F_Span;
typedef struct NLS2F_Reader NLS2F_Reader;
typedef struct NLS2F_Writer NLS2F_Writer;

/* Opens a reader, or a writer. Formats:
 *
 *   fixed:N                   N bytes each; shorter ones are filled with the page's blank
 *   lines[:lf|:crlf|:nel]     read: to LF, CR LF or NEL, or the input's end, after a byte-order
 *                             mark; written: with LF; with a suffix with that end alone
 *   prefixed[:data][:little]  two bytes of length, two zero bytes, the record; the length counts
 *                             all, with `data` the record alone; big-endian, or `little`
 *   blocked                   only read: blocks, with a prefix too, of prefixed records
 *   csv, csv:crlf             UTF-8, RFC 4180; reads both ends, and a mark, either way
 *   joined                    only written: one record after another
 *
 * Lines and the writer of fixed:N need a page, else it may be null. Status: NLS2F_ERR_FIELD, also
 * for lines in a page in which their ends depend on the text before them, and for lines written in
 * a page with a signature; the problem's `offset` is that in the format. */
NLS2_API int32_t NLS2F_OpenReader(const char *format, const NLS2F_Page *page, NLS2F_Reader **reader,
                                  NLS2F_Problem *problem);
NLS2_API int32_t NLS2F_OpenWriter(const char *format, const NLS2F_Page *page, NLS2F_Writer **writer,
                                  NLS2F_Problem *problem);
NLS2_API void NLS2F_CloseReader(NLS2F_Reader *reader);
NLS2_API void NLS2F_CloseWriter(NLS2F_Writer *writer);

/* Finds the records in a piece of the input: places without line ends and prefixes, the same ones
 * for all pieces. `read` is the end of the last one. The next piece begins with what was not read,
 * and is longer if nothing was. `last` is 1 for the last piece: call until no record is found. Does
 * not allocate. Status: NLS2F_ERR_FIELD for a problem with no record before it; its `record`
 * and `offset` count from the beginning of the input. */
NLS2_API int32_t NLS2F_ReadRecords(NLS2F_Reader *reader, const void *piece, int64_t length,
                                   int32_t last, int64_t *read, NLS2F_Span *records,
                                   int64_t capacity, int64_t *count, NLS2F_Problem *problem);

/* ICU's name of the text's page, after the first record: for lines in UTF-16 and UTF-32 the mark's,
 * such as "UTF-16LE"; for csv UTF-8; empty without a page. */
NLS2_API int32_t NLS2F_ReaderPage(const NLS2F_Reader *reader, const char **name);

/* Copies a field of records to fields + i * field->length, for a column. Bytes that a record lacks
 * become field->blank. Does not allocate. */
NLS2_API int32_t NLS2F_GatherFields(const NLS2F_Field *field, const void *bytes,
                                    const NLS2F_Span *records, int64_t count, void *fields);

/* Writes records. Also after a problem *written bytes are right, of *done records (partial output);
 * its `record` is the index of the span. Does not allocate. Status: NLS2F_ERR_FIELD. */
NLS2_API int32_t NLS2F_WriteRecords(const NLS2F_Writer *writer, const void *bytes,
                                    const NLS2F_Span *records, int64_t count, void *out,
                                    int64_t room, int64_t *written, int64_t *done,
                                    NLS2F_Problem *problem);

/* A record of csv, without its end, to its fields and back. SplitCsv takes quotes off: the fields
 * are places in `out`, which has `length` bytes. With more than `capacity` the status is 15
 * (U_BUFFER_OVERFLOW_ERROR), and *count right. JoinCsv puts quotes where they are needed; one empty
 * field is "". Status: NLS2F_ERR_FIELD. Neither allocates. */
NLS2_API int32_t NLS2F_SplitCsv(const void *record, int64_t length, void *out, NLS2F_Span *fields,
                                int64_t capacity, int64_t *count, NLS2F_Problem *problem);
NLS2_API int32_t NLS2F_JoinCsv(const void *bytes, const NLS2F_Span *fields, int64_t count,
                               void *out, int64_t room, int64_t *written, NLS2F_Problem *problem);

#ifdef __cplusplus
}
#endif

#endif
