/* One field of five records, from code page 37 to UTF-8: bytes and offsets as columnar formats keep
 * them. A row with a problem is empty, and its bit is 0. */
#include <nls2_fields.h>
#include <stdio.h>

static const char records[5][12] = {
    "001\xD2\xCC\x93\x95\x40\x40\x40\x40", "002\xC2\x85\x99\x93\x89\x95\x40\x40",
    "003\xD4\0\xD4\x40\x40\x40\x40\x40", "004\x40\x40\x40\x40\x40\x40\x40\x40",
    "005\xE9\xDC\x99\x89\x83\x88\x40\x40"};

int main(void) {
  NLS2F_Policy policy = {sizeof policy, NLS2F_STRIP, NLS2F_STOP, 0, 0};
  NLS2F_Problem problem = {.size = sizeof problem};
  NLS2F_Page *from, *to;
  NLS2F_Translator *translator;
  if (NLS2F_OpenPageByNumber(37, &from) > 0 || NLS2F_OpenPageByName("utf-8", &to) > 0 ||
      NLS2F_OpenTranslator(from, to, &policy, &translator) > 0) {
    return 1;
  }
  char out[100], words[256] = "";
  int32_t offsets[6];
  uint8_t good[1];
  NLS2F_Column column = {.size = sizeof column,
                         .offsetBits = 32,
                         .fields = records[0] + 3,
                         .length = 8,
                         .stride = sizeof records[0],
                         .rows = 5,
                         .out = out,
                         .room = sizeof out,
                         .offsets = offsets,
                         .good = good};
  if (NLS2F_TranslateColumn(translator, &column, &problem) != 0) {
    return 1;
  }
  for (int row = 0; row < 5; ++row) {
    printf("%s%.*s\n", good[0] >> row & 1 ? "" : "(bad)", (int)(offsets[row + 1] - offsets[row]),
           out + offsets[row]);
  }
  NLS2F_DescribeProblem(translator, &problem, words, sizeof words);
  printf("record %d: %s\n", (int)problem.record, words);
  NLS2F_CloseTranslator(translator);
  NLS2F_ClosePage(to);
  NLS2F_ClosePage(from);
  return 0;
}
