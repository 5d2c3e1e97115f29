// The table of all functions.

#include "support/dispatch.h"

namespace support {

namespace {

// Input and output share a buffer: the input, its length, where dest begins, and dest's size.
template <auto function>
std::string inPlace(const Words &w) {
  int32_t status = 99;
  aroundCall(true);
  const int32_t result =
      function(w.object(0), w.text(1) + w.number(3), w.number(4), w.text(1), w.number(2), &status);
  aroundCall(false);
  const std::string text = w.text(1) ? std::string(w.text(1), w[1].size()) : "null";
  return shown(result) + ", " + shown(status) + ", " + shown(text);
}

// The length for each first byte that differs from the length for the byte before.
std::string byteLengths(const Words &w) {
  std::string lengths;
  int32_t before = 0;
  for (int byte = 0; byte <= 0xFF; ++byte) {
    const char alone[] = {static_cast<char>(byte)};
    int32_t status = 99;
    if (const int32_t length = NLS2_ByteLength(w.object(0), alone, &status); length != before) {
      lengths += shown(std::string(alone, 1)) + " " + shown(length) + ", ";
      before = length;
    }
  }
  return lengths;
}

#define CALL(function)                                                                             \
  { #function, call < function> }

} // namespace

const Functions &functions() {
  // clang-format off
  static const Functions table = {
      {"GetThreadLocale", call<NLS2_GetThreadLocale>}, {"lengths-by-byte", byteLengths},
      {"NLS2_StringToUnicode", inPlace<NLS2_StringToUnicode>},
      {"NLS2_UnicodeToString", inPlace<NLS2_UnicodeToString>},
      CALL(NLS2_ByteLength), CALL(NLS2_CloseStream), CALL(NLS2_ConversionRatio),
      CALL(NLS2_ConvertNativeLocale), CALL(NLS2_Fflush), CALL(NLS2_Fgets), CALL(NLS2_Findstr),
      CALL(NLS2_Fputs), CALL(NLS2_Frewind), CALL(NLS2_GetCodepageId), CALL(NLS2_GetCodepageName),
      CALL(NLS2_GetLanguageName), CALL(NLS2_GetLocale), CALL(NLS2_GetLocaleCodepageId),
      CALL(NLS2_GetLocaleMapEntry), CALL(NLS2_GetLocaleNumInfo), CALL(NLS2_GetShortPosixName),
      CALL(NLS2_GetStringByKey), CALL(NLS2_Init), CALL(NLS2_LanguageIDFromShortPosixName),
      CALL(NLS2_MapCodepageIdToName), CALL(NLS2_MapString), CALL(NLS2_MapWindowsNameToCCSID),
      CALL(NLS2_OpenStream), CALL(NLS2_ReadString), CALL(NLS2_ReleaseLocale),
      CALL(NLS2_ResourceClose), CALL(NLS2_ResourceOpen), CALL(NLS2_SetLocaleFromNative),
      CALL(NLS2_SetLocaleNumInfo), CALL(NLS2_Strcoll), CALL(NLS2_StringToDouble),
      CALL(NLS2_Strlen), CALL(NLS2_TranslateString), CALL(NLS2_ValidateLocale),
      CALL(NLS2_WriteString), CALL(NLS2_allocateLocale), CALL(NLS2_detectUnicodeSignature),
      CALL(NLS2_fromUTF16), CALL(NLS2_fromUTF8), CALL(NLS2_initLocaleObject), CALL(NLS2_toUTF16),
      CALL(NLS2_toUTF8),
  };
  // clang-format on
  return table;
}

} // namespace support
