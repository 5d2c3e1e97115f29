/* A host with trace and lock services of its own: the library must call these, not libzelhost's. */

#include <nls2.h>
#include <sys1.h>
#include <trc1.h>

#include <stdio.h>
#include <string.h>

static int synced;
static int entries;
static int exits;

uint32_t TRC1_Sync(TRC1_EntryBlock *anchor) {
  ++synced;
  anchor->cachedSync = *anchor->sync;
  anchor->cachedFlags = TRC1_FLAG_EVENTS;
  return TRC1_FLAG_EVENTS;
}

void TRC1_Event(TRC1_EntryBlock *anchor, uint32_t line, uint32_t kind, ...) {
  (void)line;
  if (strcmp(anchor->functionName, "NLS2_GetLocaleMapEntry") == 0) {
    *(kind == TRC1_EVENT_ENTRY ? &entries : &exits) += 1;
  }
}

void TRC1_Printf(TRC1_EntryBlock *anchor, uint32_t line, const char *format, ...) {
  (void)anchor, (void)line, (void)format;
}

void TRC1_Dump(TRC1_EntryBlock *anchor, uint32_t line, const void *address, uint32_t length,
               uint32_t zero) {
  (void)anchor, (void)line, (void)address, (void)length, (void)zero;
}

void SYS1_GetLock(void *lock) { (void)lock; }
void SYS1_ReleaseLock(void *lock) { (void)lock; }

int main(void) {
  if (NLS2_GetLocaleMapEntry(NLS2_LANGUAGE_ID_END) != NULL || synced == 0 || entries != 1 ||
      exits != 1) {
    fprintf(stderr, "synced %d, entries %d, exits %d\n", synced, entries, exits);
    return 1;
  }
  return 0;
}
