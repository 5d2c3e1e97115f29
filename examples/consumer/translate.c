/* Translates a field from EBCDIC to UTF-8. */

#include <nls2.h>

#include <stdio.h>
#include <string.h>

int main(void) {
  const char ebcdic[] = "\xC7\xC0\x40"; /* G and a-umlaut in German EBCDIC, and a blank */
  char utf8[16] = "";
  int32_t consumed = 0;
  int32_t status = -1;
  const int32_t length = NLS2_TranslateString(1208, utf8, (int32_t)sizeof utf8, 1141, ebcdic, 3,
                                              &consumed, 0, &status);
  if (status != 0 || length != 4 || consumed != 3 || memcmp(utf8, "G\xC3\xA4 ", 4) != 0) {
    fprintf(stderr, "status %d, length %d, consumed %d\n", status, length, consumed);
    return 1;
  }
  return 0;
}
