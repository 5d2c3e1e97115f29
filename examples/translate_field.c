/* Translates one field of a German EBCDIC record to UTF-8, without its trailing blanks. */

#include <nls2.h>

#include <stdio.h>

int main(void) {
  const char field[20] = "\xC7\x99\xD0\xA1\x85\x40\x81\xA4\xA2\x40\xD2\x6A\x93\x95" /* text */
                         "\x40\x40\x40\x40\x40\x40";                                /* blanks */
  char text[64] = "";
  int32_t consumed = 0;
  int32_t status = 0;
  NLS2_TranslateString(1208, text, sizeof text - 1, 1141, field, sizeof field, &consumed,
                       NLS2_STRING_STRIP_TRAILING, &status);
  if (status != 0) {
    fprintf(stderr, "%s\n", nls2_status_name(status));
    return 1;
  }
  puts(text);
  return 0;
}
