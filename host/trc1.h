/* trc1.h - the trace facility that the library needs from its host.
 *
 * A host defines the four functions, in the program or in a library of its own; libzelhost.so
 * holds a default implementation that its definitions replace.
 *
 * Each function of the library owns one TRC1_EntryBlock, its anchor. On entry the library compares
 * the word that `sync` points at with `cachedSync`; if they are equal it uses `cachedFlags`, and
 * otherwise it calls TRC1_Sync. A host that changes its trace settings therefore changes the word
 * that `sync` points at, and the next call of each function calls TRC1_Sync again.
 *
 * Rules for a host:
 *   - Any thread may call at any time, several with the same anchor. Read and write `cachedFlags`,
 *     `cachedSync` and the sync word as atomic 32-bit words; relaxed order is enough, since flags
 *     that are out of date change only what is traced.
 *   - Do not call back into the library: some detail lines are printed while it holds a lock.
 *   - Strings and areas handed over are valid only during the call.
 *   - A pointer in 32 bits (an exit event's value, a `%X` argument) is its low 32 bits.
 */
#ifndef TRC1_H
#define TRC1_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/* TRC1_API keeps a host's definitions visible to the library in a program whose symbols are hidden
 * by default. */
#if defined(__GNUC__)
#define TRC1_API __attribute__((visibility("default")))
#define TRC1_FORMAT(text, first) __attribute__((format(printf, text, first)))
#else
#define TRC1_API
#define TRC1_FORMAT(text, first)
#endif

/* Bits of the flags word that the library tests; it tests no other. */
enum {
  TRC1_FLAG_DETAIL = 0x10, /* detail lines and dumps */
  TRC1_FLAG_EVENTS = 0x40  /* one entry and one exit event a call */
};

/* Kinds of TRC1_Event. */
enum {
  TRC1_EVENT_ENTRY = 0,
  TRC1_EVENT_EXIT_VALUE = 1, /* one uint32_t follows: a return code, a count or a pointer */
  TRC1_EVENT_EXIT = 2        /* no value */
};

/* Values of TRC1_EntryBlock::attributes. */
enum { TRC1_ENTRY_EXPORTED = 0x200, TRC1_ENTRY_PRIVATE = 0x800 };

/* One for the library. Lengths are in bytes, without the terminator. */
typedef struct TRC1_UnitBlock {
  uint32_t formatVersion;
  uint32_t attributes;
  const char *fileName;
  uint32_t fileNameLength;
  const char *buildDate;
  uint32_t buildDateLength;
  const char *buildTime;
  uint32_t buildTimeLength;
  const char *level;
  uint32_t levelLength;
  const char *mark;
  uint32_t markLength;
  uint32_t reserved[2];
  const char *(*buildStamp)(void);
} TRC1_UnitBlock;

/* One for each function: its anchor. The library writes none of it after load. */
typedef struct TRC1_EntryBlock {
  TRC1_UnitBlock *unit;
  const char *functionName;
  uint32_t functionNameLength; /* bytes, without the terminator */
  uint32_t entryLine;          /* the line that the entry event carries */
  uint32_t *sync;              /* the host may point it at a word of its own */
  uint32_t attributes;
  uint32_t cachedFlags; /* stored by TRC1_Sync */
  uint32_t cachedSync;  /* stored by TRC1_Sync: the sync word that cachedFlags belong to */
  uint32_t reserved[2]; /* the host's own */
} TRC1_EntryBlock;

/* The anchor's current flags. Stores them, with the sync word's current value, in the anchor. */
TRC1_API uint32_t TRC1_Sync(TRC1_EntryBlock *anchor);

/* An entry or exit event. A kind of 1 is followed by one uint32_t. */
TRC1_API void TRC1_Event(TRC1_EntryBlock *anchor, uint32_t line, uint32_t kind, ...);

/* One detail line; the format ends in a newline. */
TRC1_API void TRC1_Printf(TRC1_EntryBlock *anchor, uint32_t line, const char *format, ...)
    TRC1_FORMAT(3, 4);

/* A memory area of `length` bytes. `zero` is always 0. */
TRC1_API void TRC1_Dump(TRC1_EntryBlock *anchor, uint32_t line, const void *address,
                        uint32_t length, uint32_t zero);

#ifdef __cplusplus
}
#endif

#endif
