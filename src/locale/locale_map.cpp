// localeMap, the table of known locales, and NLS2_GetLocaleMapEntry.

#include "locale/locale_map.h"

#include "nls2.h"
#include "trace/frame.h"

#include <cstddef>
#include <cstring>

static_assert(sizeof(LocaleMapEntry) == 276);
static_assert(offsetof(LocaleMapEntry, asciiCcsid) == 4);
static_assert(offsetof(LocaleMapEntry, ebcdicCcsid) == 8);
static_assert(offsetof(LocaleMapEntry, localeName) == 12);
static_assert(offsetof(LocaleMapEntry, shortName) == 144);

// A row: language id (country number, language number), ASCII and EBCDIC code page, locale name,
// short name. The order is contractual, since every search walks from row 0 and takes the first
// match, and so are the rows that look like slips; callers store these ids and index this table:
//   - Some names occur twice: es_ES (countries 222 and 724), nn_NO (languages 7 and 63). A search
//     by name finds the first row, a search by id each.
//   - Some ids occur twice: "de", "fr", "it", "pt", "ja" and "es" repeat their main country's,
//     posix repeats en_US's, sv_FI has fi_FI's, zh_Hant has zh_HK's and zh_Hans has zh_CN's. A
//     search by id finds the first row.
//   - Countries that are not ISO 3166's: en_HK has Taiwan's, en_GB 86 (en_UK has 826), and fr_CH
//     and it_CH count up from de_CH's 756, which is.
//   - hr_HR has one code page in both columns, which lets a search by code page (912) find it.
// clang-format off
constexpr LocaleMapEntry localeMap[NLS2_LOCALE_MAP_RECORDS] = {
    {0x00240001,  367,   37, "en_AU",   "en_AU"},
    {0x00380001,  367,   37, "en_BE",   "en_BE"},
    {0x00480001,  367,   37, "en_BW",   "en_BW"},
    {0x007C0001,  367,   37, "en_CA",   "en_CA"},
    {0x009E0001,  367,   37, "en_HK",   "en_HK"},
    {0x009C0001,  367,   37, "en_CN",   "en_CN"},
    {0x01640001,  367,   37, "en_IN",   "en_IN"},
    {0x01740001,  367,   37, "en_IE",   "en_IE"},
    {0x01D60001,  367,   37, "en_MT",   "en_MT"},
    {0x022A0001,  367,   37, "en_NZ",   "en_NZ"},
    {0x024A0001,  367,   37, "en_PK",   "en_PK"},
    {0x02600001,  367,   37, "en_PH",   "en_PH"},
    {0x02BE0001,  367,   37, "en_SG",   "en_SG"},
    {0x02C60001,  367,   37, "en_ZA",   "en_ZA"},
    {0x03520001,  367,   37, "en_VI",   "en_VI"},
    {0x033A0001,  367,  285, "en_UK",   "en_UK"},
    {0x03480001,  367,   37, "en_US",   "en_US"},
    {0x00560001,  367,   37, "en_GB",   "en_GB"},
    {0x02CC0001,  367,   37, "en_ZW",   "en_ZW"},
    {0x00280002,  819, 1141, "de_AT",   "de_AT"},
    {0x00380002,  819, 1141, "de_BE",   "de_BE"},
    {0x01140002,  819, 1141, "de_DE",   "de_DE"},
    {0x01BA0002,  819, 1141, "de_LU",   "de_LU"},
    {0x02F40002,  819, 1141, "de_CH",   "de_CH"},
    {0x01140002,  819, 1141, "de",      "de"},
    {0x00380003,  819, 1147, "fr_BE",   "fr_BE"},
    {0x007C0003,  819,  276, "fr_CA",   "fr_CA"},
    {0x00FA0003,  819, 1147, "fr_FR",   "fr_FR"},
    {0x01BA0003,  819, 1147, "fr_LU",   "fr_LU"},
    {0x02F50003,  819, 1147, "fr_CH",   "fr_CH"},
    {0x00FA0003,  819, 1147, "fr",      "fr"},
    {0x00200004,  819,  284, "es_AR",   "es_AR"},
    {0x00440004,  819,  284, "es_BO",   "es_BO"},
    {0x00980004,  819,  284, "es_CL",   "es_CL"},
    {0x00AA0004,  819,  284, "es_CO",   "es_CO"},
    {0x00BC0004,  819,  284, "es_CR",   "es_CR"},
    {0x00D60004,  819,  284, "es_DO",   "es_DO"},
    {0x00DA0004,  819,  284, "es_EC",   "es_EC"},
    {0x00DE0004,  819,  284, "es_ES",   "es_ES"},
    {0x01400004,  819,  284, "es_GT",   "es_GT"},
    {0x01540004,  819,  284, "es_HN",   "es_HN"},
    {0x01E40004,  819,  284, "es_MX",   "es_MX"},
    {0x022E0004,  819,  284, "es_NI",   "es_NI"},
    {0x024F0004,  819,  284, "es_PA",   "es_PA"},
    {0x02580004,  819,  284, "es_PY",   "es_PY"},
    {0x025C0004,  819,  284, "es_PE",   "es_PE"},
    {0x02760004,  819,  284, "es_PR",   "es_PR"},
    {0x02D40004,  819, 1145, "es_ES",   "es_ES"},
    {0x03480004,  819,  284, "es_US",   "es_US"},
    {0x035A0004,  819,  284, "es_UY",   "es_UY"},
    {0x035E0004,  819,  284, "es_VE",   "es_VE"},
    {0x02D40004,  819,  284, "es",      "es"},
    {0x017C0005,  819,  280, "it_IT",   "it_IT"},
    {0x02F60005,  819,  280, "it_CH",   "it_CH"},
    {0x017C0005,  819,  280, "it",      "it"},
    {0x004C0006,  819,  275, "pt_BR",   "pt_BR"},
    {0x026C0006,  819,  275, "pt_PT",   "pt_PT"},
    {0x026C0006,  819,  275, "pt",      "pt"},
    {0x02420007,  819, 1142, "nn_NO",   "nn_NO"},
    {0x00F6000A,  819,  278, "sv_FI",   "sv_FI"},
    {0x02F00008,  819,  278, "sv_SE",   "sv_SE"},
    {0x00D00009,  819,  277, "da_DK",   "da_DK"},
    {0x00F6000A,  819,  278, "fi_FI",   "fi_FI"},
    {0x0188000B,  954,  930, "ja_JP",   "ja_JP"},
    {0x0188000B,  954,  930, "ja",      "ja"},
    {0x0158000D,  964,  937, "zh_Hant", "zh_HK"},
    {0x0158000D,  964,  937, "zh_HK",   "zh_HK"},
    {0x01BE000D,  964,  937, "zh_MO",   "zh_MO"},
    {0x009E000D,  964,  937, "zh_TW",   "zh_TW"},
    {0x009C000E, 1383,  935, "zh_Hans", "zh_CN"},
    {0x009C000E, 1383,  935, "zh_CN",   "zh_CN"},
    {0x02BE000E, 1383,  935, "zh_SG",   "zh_SG"},
    {0x0008000F,  912,  500, "sq_AL",   "sq_AL"},
    {0x000C0010, 1089,  420, "ar_DZ",   "ar_DZ"},
    {0x03830010, 1089,  420, "ar_AA",   "ar_AA"},
    {0x00300010, 1089,  420, "ar_BH",   "ar_BH"},
    {0x03320010, 1089,  420, "ar_EG",   "ar_EG"},
    {0x01640010, 1089,  420, "ar_IN",   "ar_IN"},
    {0x01700010, 1089,  420, "ar_IQ",   "ar_IQ"},
    {0x01900010, 1089,  420, "ar_JO",   "ar_JO"},
    {0x019E0010, 1089,  420, "ar_KW",   "ar_KW"},
    {0x01A60010, 1089,  420, "ar_LB",   "ar_LB"},
    {0x01B20010, 1089,  420, "ar_LI",   "ar_LI"},
    {0x01F80010, 1089,  420, "ar_MA",   "ar_MA"},
    {0x02000010, 1089,  420, "ar_OM",   "ar_OM"},
    {0x027A0010, 1089,  420, "ar_QA",   "ar_QA"},
    {0x02AA0010, 1089,  420, "ar_SA",   "ar_SA"},
    {0x02E00010, 1089,  420, "ar_SD",   "ar_SD"},
    {0x02F80010, 1089,  420, "ar_SY",   "ar_SY"},
    {0x03140010, 1089,  420, "ar_TN",   "ar_TN"},
    {0x03100010, 1089,  420, "ar_AE",   "ar_AE"},
    {0x03770010, 1089,  420, "ar_YE",   "ar_YE"},
    {0x00640011,  915, 1025, "bg_BG",   "bg_BG"},
    {0x00700012,  915, 1025, "be_BY",   "be_BY"},
    {0x02D40013,  819, 1145, "ca_ES",   "ca_ES"},
    {0x00BF0014,  912,  912, "hr_HR",   "hr_HR"},
    {0x00CB0015,  912,  870, "cs_CZ",   "cs_CZ"},
    {0x00380016,  819,  256, "nl_BE",   "nl_BE"},
    {0x02100016,  819,  256, "nl_NL",   "nl_NL"},
    {0x00E90017,  813, 1122, "et_EE",   "et_EE"},
    {0x00040018, 1089, 1097, "fa_AF",   "fa_AF"},
    {0x016C0018, 1089, 1097, "fa_IR",   "fa_IR"},
    {0x012C0019,  813,  423, "el_GR",   "el_GR"},
    {0x0178001A,  916,  875, "he_IL",   "he_IL"},
    {0x015C001B,  912, 1141, "hu_HU",   "hu_HU"},
    {0x019A001C,  949,  933, "ko_KR",   "ko_KR"},
    {0x01AC001D,  914, 1112, "lv_LV",   "lv_LV"},
    {0x01B8001E,  914, 1112, "li_LI",   "li_LI"},
    {0x0327001F,  915,  870, "mk_MK",   "mk_MK"},
    {0x02820020,  912, 1025, "ro_RO",   "ro_RO"},
    {0x02830021,  915, 1025, "ru_RU",   "ru_RU"},
    {0x03240021,  915, 1025, "ru_UA",   "ru_UA"},
    {0x037B0023,  915, 1025, "sr_Cyrl", "sr_CY"},
    {0x037B004A,  915, 1025, "sr_Latn", "sr_LA"},
    {0x037B0022,  915,  870, "sr_YU",   "sr_YU"},
    {0x02BF0024,  912,  870, "sk_SK",   "sk_SK"},
    {0x02C10025,  912,  838, "sl_SI",   "sl_SI"},
    {0x02FC0026,  874, 1160, "ti_TI",   "ti_TI"},
    {0x03180027,  920, 1155, "tr_TR",   "tr_TR"},
    {0x03240028,  915, 1158, "uk_UA",   "uk_UA"},
    {0x02C00029, 1258, 1164, "vi_VN",   "vi_VN"},
    {0x0164002A, 1208, 1137, "pa_IN",   "pa_IN"},
    {0x02C6002B,  367,   37, "af_ZA",   "af_ZA"},
    {0x00E7002C,  367,   37, "am_ET",   "am_ET"},
    {0x0033002D,  367,   37, "hy_AM",   "hy_AM"},
    {0x0164002E, 1208,   37, "bn_IN",   "bn_IN"},
    {0x033A002E,  367,  285, "kw_GB",   "kw_GB"},
    {0x02D40030,  819, 1145, "gl_ES",   "gl_ES"},
    {0x01640031, 1208,   37, "gu_IN",   "gu_IN"},
    {0x01640032, 1208,   37, "hi_IN",   "hi_IN"},
    {0x01600033,  367,  871, "is_IS",   "is_IS"},
    {0x01680034,  367,   37, "id_ID",   "id_ID"},
    {0x01740035,  367,  285, "ga_IE",   "ga_IE"},
    {0x01300036,  367,   37, "kl_GL",   "kl_GL"},
    {0x01640037, 1208, 1137, "kn_IN",   "kn_IN"},
    {0x018E0038,  367,   37, "kk_KZ",   "kk_KZ"},
    {0x01640039, 1208, 1137, "kok_IN",  "kn_IN"},
    {0x0060003A,  367,   37, "ms_BN",   "ms_BN"},
    {0x01CA003A,  367,   37, "ms_MY",   "ms_MY"},
    {0x0164003B, 1208, 1137, "ml_IN",   "ml_IN"},
    {0x01D6003C, 1208,  285, "mt_MT",   "mt_MT"},
    {0x033A003D,  367,  285, "gv_GB",   "gv_GB"},
    {0x0164003E, 1208, 1137, "mr_IN",   "mr_IN"},
    {0x0242003F,  819,  277, "nn_NO",   "nn_NO"},
    {0x01640040, 1208, 1137, "or_IN",   "or_IN"},
    {0x00E70041,  367,   37, "om_ET",   "om_ET"},
    {0x01940041,  367,   37, "om_KE",   "om_KE"},
    {0x00040042,  367,   37, "ps_AF",   "ps_AF"},
    {0x02680043,  912,   37, "pl_PL",   "pl_PL"},
    {0x01060044,  367,   37, "so_DJ",   "so_DJ"},
    {0x00E70044,  367,   37, "so_ET",   "so_ET"},
    {0x01940044,  367,   37, "so_KE",   "so_KE"},
    {0x02C20044,  367,   37, "so_SO",   "so_SO"},
    {0x01940045,  367,   37, "sw_KE",   "sw_KE"},
    {0x03420045,  367,   37, "sw_TZ",   "sw_TZ"},
    {0x01640046, 1208, 1137, "ta_IN",   "ta_IN"},
    {0x01640047, 1208, 1137, "te_IN",   "te_IN"},
    {0x00E80048,  367,   37, "ti_ER",   "ti_ER"},
    {0x00E70048,  367,   37, "ti_ET",   "ti_ET"},
    {0x033A0049,  367,  285, "cy_GB",   "cy_GB"},
    {0x03480001,  367,   37, "posix",   "posix"},
    {0x000000FF,  255,  255, "",        ""},
};
// clang-format on

const LocaleMapEntry *nls2::locale::findNameInside(const char *text) {
  return findEntry(
      [=](const LocaleMapEntry &entry) { return std::strstr(text, entry.localeName) != nullptr; });
}

const LocaleMapEntry *NLS2_GetLocaleMapEntry(uint32_t languageId) {
  static constinit TRC1_EntryBlock anchor = nls2::trace::anchorOf("NLS2_GetLocaleMapEntry");
  nls2::trace::Frame frame(anchor);
  NLS2_TRACE(frame, "Locate the language id in the table.");
  const LocaleMapEntry *entry = nls2::locale::findLanguage(languageId);
  if (entry == nullptr) {
    NLS2_TRACE(frame, "Language ID %d not found in table.", languageId);
    return nullptr;
  }
  NLS2_TRACE(frame, "Language ID %d found in table.", languageId);
  return frame.result(entry);
}
