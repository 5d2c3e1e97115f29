// NLS2_Strcoll's order against bare ICU's at tertiary strength.

#include "support/call_cases.h"

#include <gtest/gtest.h>
#include <unicode/localpointer.h>
#include <unicode/ucol.h>
#include <unicode/unistr.h>

namespace {

const char *words[] = {"",     "cote",   "coté",  "côte",  "Cote",  "chat",   "cizí",   "čas",
                       "hora", "llama",  "lzb",   "ñandú", "nz",    "Ärger",  "Arger",  "zebra",
                       "öl",   "øre",    "aa",    "ırmak", "irmak", "straße", "co-op",  "coop",
                       "Ёлка", "Москва", "αθήνα", "日本",  "ﾆﾎﾝ",   "にほん", "ニホン", "😀"};

TEST(Strcoll, OrdersAsBareIcuAtTertiaryStrength) {
  for (const char *name :
       {"en_US", "de_DE", "sv_SE", "da_DK", "es_ES", "cs_CZ", "tr_TR", "ja_JP"}) {
    const support::LiveLocale locale(1208, name);
    UErrorCode error = U_ZERO_ERROR;
    const icu::LocalUCollatorPointer collator(ucol_open(name, &error));
    ucol_setStrength(collator.getAlias(), UCOL_TERTIARY);
    for (const char *one : words) {
      for (const char *two : words) {
        int32_t status = 99;
        EXPECT_EQ(NLS2_Strcoll(locale.get(), one, -1, two, -1, 0, &status),
                  ucol_strcollUTF8(collator.getAlias(), one, -1, two, -1, &error))
            << name << ": " << one << ", " << two;
        EXPECT_EQ(status, 0);
      }
    }
  }
}

} // namespace
