/* A host with its own trace and lock services: the library must call these, not libzelhost's. */

#include "host_services.h"

#include <nls2.h>

#include <stdio.h>

int main(void) {
  int32_t status = -1;
  NLS2_Locale *locale = NLS2_GetLocale(0, 0, 0, &status);
  const int32_t released = NLS2_ReleaseLocale(locale);
  const struct HostCalls calls = hostCalls();
  if (status != 0 || released != 0 || calls.synced == 0 || calls.entries != 1 || calls.exits != 1 ||
      calls.locked != 2 || calls.unlocked != 2) {
    fprintf(stderr, "status %d, %d; synced %d, entries %d, exits %d, locked %d, unlocked %d\n",
            (int)status, (int)released, calls.synced, calls.entries, calls.exits, calls.locked,
            calls.unlocked);
    return 1;
  }
  return 0;
}
