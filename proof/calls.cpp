// One call of each exported function.

#include "calls.h"

#include <cstdio>
#include <cstring>
#include <nls2/field_translator.hpp>
#include <unicode/ucnv.h>
#include <unistd.h>

namespace proof {

namespace {

constexpr uint32_t deDe = 0x01140002;
constexpr UChar umlauts[] = u"Gr\u00FC\u00DFe";
constexpr char word[] = "Gr\xC3\xBC\xC3\x9F";
thread_local char filePath[64];

struct Room {
  char bytes[256] = {};
  UChar units[128] = {};
  std::string text(int64_t count) const {
    return std::string(bytes, count > 0 ? static_cast<size_t>(count) : 0);
  }
  std::string wide(int64_t count) const {
    return std::string(reinterpret_cast<const char *>(units),
                       count > 0 ? static_cast<size_t>(count) * 2 : 0);
  }
};

Outcome status(int32_t value, std::string bytes = {}) { return {value, 0, std::move(bytes)}; }

template <auto options>
Outcome translate(const NLS2_Locale * /*in*/) {
  Room room;
  int32_t consumed = 0;
  int32_t result = 0;
  const int32_t length =
      NLS2_TranslateString(1208, room.bytes, 60, 930, "\xC1\x42\x0E\x43\x81\x0F\x40\x40", 8,
                           &consumed, options, &result);
  return {result, length, result > 0 ? "" : room.text(length)};
}

template <auto function>
Outcome toBytes(const NLS2_Locale *in) {
  Room room;
  int32_t result = 0;
  const int32_t length = function(in, word, 6, room.bytes, 200, &result);
  return {result, length, room.text(length)};
}

Outcome fromUtf8(const NLS2_Locale *in) {
  Room room;
  int32_t result = 0;
  const int32_t length = NLS2_fromUTF8(in, room.bytes, 200, word, 6, &result);
  return {result, length, room.text(length)};
}

Outcome toUtf16(const NLS2_Locale *in) {
  Room room;
  int32_t result = 0;
  const int32_t length = NLS2_toUTF16(in, word, 6, room.units, 100, &result);
  return {result, length, room.wide(length)};
}

Outcome fromUtf16(const NLS2_Locale *in) {
  Room room;
  int32_t result = 0;
  const int32_t length = NLS2_fromUTF16(in, umlauts, 200, room.bytes, 5, &result);
  return {result, length, room.text(length)};
}

template <auto function>
Outcome inPlace(const NLS2_Locale *in) {
  Room room;
  std::strcpy(room.bytes, "Wien");
  int32_t result = 0;
  const int32_t change = function(in, room.bytes, 200, room.bytes, 4, &result);
  return {result, result > 0 ? 0 : change, result > 0 ? "" : room.text(4 + change)};
}

template <auto options>
Outcome collate(const NLS2_Locale *in) {
  int32_t result = 0;
  const int32_t order = NLS2_Strcoll(in, "Zebra  ", 7, "zebra", 5, options, &result);
  return {result, order, {}};
}

template <auto options>
Outcome find(const NLS2_Locale *in) {
  const int32_t found = NLS2_Findstr(in, "Straight on", 11, "ON", 2, options);
  return {found < 0 ? 1 : 0, found, {}};
}

Outcome mapString(const NLS2_Locale *in) {
  Room room;
  const int32_t result = NLS2_MapString(in, room.bytes, 200, "", 0, NLS2_MAP_LOWERCASE);
  const bool done = result == 2; // the length for 819; 4 is a status
  return {done ? 0 : result, 0, done ? room.text(result) : ""};
}

Outcome strlen16(const NLS2_Locale *in) {
  int32_t result = 0;
  const int32_t length = NLS2_Strlen(in, "Wien", 0, &result);
  return {result, length, {}};
}

Outcome ratio(const NLS2_Locale *in) {
  int32_t result = 0;
  const int32_t answer = NLS2_ConversionRatio(in, in, &result);
  return {result, answer, {}};
}

Outcome byteLength(const NLS2_Locale *in) {
  int32_t result = 0;
  const int32_t length = NLS2_ByteLength(in, word + 2, &result);
  return {result, length, {}};
}

Outcome openConverter(const NLS2_Locale * /*in*/) {
  int32_t twoNulls = 0;
  int32_t result = 0;
  UConverter *converter = NLS2_MapCodepageIdToName(943, &twoNulls, &result);
  const Outcome outcome{result, converter != nullptr ? 1 : 0, {}};
  ucnv_close(converter);
  return outcome;
}

Outcome codepageName(const NLS2_Locale * /*in*/) {
  Room room;
  const int32_t result = NLS2_GetCodepageName(1141, room.bytes, 200);
  return status(result, result > 0 ? "" : room.bytes);
}

Outcome codepageId(const NLS2_Locale * /*in*/) {
  int32_t result = 0;
  const uint32_t page = NLS2_GetCodepageId("ibm-37", &result);
  return {result, page, {}};
}

// Tests what a maker of a locale object gives back, and gives it back.
Outcome made(NLS2_Locale *object, int32_t result) {
  const bool live = object != nullptr;
  Outcome outcome{live ? result : (result > 0 ? result : 1), live ? 1 : 0, {}};
  if (live) {
    outcome.bytes = object->icuLocale;
    outcome.answer += NLS2_ReleaseLocale(object);
  }
  return outcome;
}

Outcome allocate(const NLS2_Locale * /*in*/) {
  int32_t result = 0;
  NLS2_Locale *object = NLS2_allocateLocale(&result);
  return made(object, result);
}

Outcome getLocale(const NLS2_Locale * /*in*/) {
  int32_t result = 0;
  NLS2_Locale *object = NLS2_GetLocale(deDe, 1141, 0, &result);
  return made(object, result);
}

Outcome threadLocale(const NLS2_Locale * /*in*/) { return made(NLS2_GetThreadLocale(), 0); }

Outcome convertNative(const NLS2_Locale * /*in*/) {
  int32_t result = 0;
  NLS2_Locale *object = NLS2_ConvertNativeLocale(nullptr, NLS2_LOCALE_DEFAULT, &result);
  return made(object, result);
}

Outcome initObject(const NLS2_Locale * /*in*/) {
  NLS2_Locale object = {};
  const int32_t result = NLS2_initLocaleObject(&object);
  return status(result, result > 0 ? "" : object.icuLocale);
}

Outcome fromNative(const NLS2_Locale * /*in*/) {
  return status(NLS2_SetLocaleFromNative("de_DE.UTF-8", 0));
}

Outcome numbers(const NLS2_Locale *in) {
  int32_t result = 0;
  const uint32_t language = NLS2_GetLocaleNumInfo(in, NLS2_ATTRIBUTE_LANGUAGE_ID, &result);
  const uint32_t page = NLS2_GetLocaleCodepageId(in, &result);
  return {result, language + page, {}};
}

Outcome setNumber(const NLS2_Locale * /*in*/) {
  int32_t result = 0;
  NLS2_Locale *own = NLS2_GetLocale(deDe, 819, 0, &result);
  Outcome outcome;
  if (own != nullptr) {
    outcome.answer = NLS2_SetLocaleNumInfo(own, NLS2_ATTRIBUTE_CODEPAGE, 37, 0);
  }
  const Outcome maker = made(own, result);
  return maker.status > 0 ? maker : outcome;
}

Outcome names(const NLS2_Locale * /*in*/) {
  Room room;
  int32_t result = NLS2_GetLanguageName(deDe, room.bytes, 100);
  result = result > 0 ? result : NLS2_GetShortPosixName(deDe, room.bytes + 8, 100);
  if (result > 0) {
    return status(result);
  }
  const int64_t sum = NLS2_LanguageIDFromShortPosixName("de_DE", &result) +
                      NLS2_MapWindowsNameToCCSID("windows-949", &result);
  return {result, sum + NLS2_GetLocaleMapEntry(deDe)->ebcdicCcsid, room.text(16)};
}

Outcome signature(const NLS2_Locale * /*in*/) {
  int32_t length = 0;
  int32_t result = 0;
  const char *name = NLS2_detectUnicodeSignature("\xEF\xBB\xBFx", 4, &length, &result);
  return {result, length, name != nullptr ? name : ""};
}

// Writes a file, and reads it again.
Outcome streams(const NLS2_Locale *in) {
  UFILE *file = NLS2_OpenStream(in, filePath, "w+", "UTF-8");
  if (file == nullptr) {
    return status(1);
  }
  int64_t count = NLS2_WriteString(in, umlauts, 5, file);
  count = count * 100 + NLS2_Fputs(in, umlauts, file);
  NLS2_Fflush(file);
  NLS2_Frewind(file);
  Room room;
  count = count * 100 + NLS2_ReadString(in, file, room.units, 3);
  NLS2_Fgets(in, file, room.units + 10, 50);
  count = count * 100 + NLS2_CloseStream(in, file);
  return {0, count, room.wide(40)};
}

Outcome bundle(const NLS2_Locale *in) {
  int32_t result = 0;
  UResourceBundle *opened = NLS2_ResourceOpen(nullptr, in, &result);
  if (opened == nullptr) {
    return status(result > 0 ? result : 1);
  }
  int32_t length = 0;
  const UChar *version = NLS2_GetStringByKey(opened, "Version", &length, &result);
  NLS2_ResourceClose(opened);
  return {result, version != nullptr ? length : 0, {}};
}

Outcome constants(const NLS2_Locale *in) {
  return {NLS2_Init(),
          NLS2_ValidateLocale(in) + static_cast<int64_t>(NLS2_StringToDouble("1", "2")),
          NLS2_BuildStamp()};
}

// A short field, and one longer than the buffer that a translator begins with.
template <auto padding, auto bad, int32_t sourcePage>
Outcome field(const NLS2_Locale * /*in*/) {
  std::error_code error;
  nls2::field_translator translator(nls2::code_page{sourcePage}, nls2::code_page{1208},
                                    {.padding = padding, .width = 8000, .bad = bad}, error);
  if (error) {
    return status(error.value());
  }
  std::string text(3000, '\xC1'); // A in EBCDIC
  text.resize(3100, '\x40');
  std::string out(8000, '\0');
  Outcome outcome;
  for (const size_t length : {size_t{5}, text.size(), size_t{5}}) {
    const nls2::field_result result =
        translator.translate(std::span(text).last(length), std::span(out));
    if (!result) {
      return status(result.problem == nls2::field_problem::no_memory ? NLS2_ERR_NO_MEMORY : -1);
    }
    outcome.answer += static_cast<int64_t>(result.written);
    outcome.bytes.append(out, 0, result.written);
  }
  return outcome;
}

constexpr Call table[] = {
    {"NLS2_TranslateString, direct", translate<0>, 0},
    {"NLS2_TranslateString, terminated", translate<NLS2_STRING_TERMINATE>, 0},
    {"NLS2_TranslateString, filled", translate<NLS2_STRING_FILL>, 0},
    {"NLS2_TranslateString, trailing", translate<NLS2_STRING_TRAILING>, 0},
    {"NLS2_TranslateString, stripped", translate<NLS2_STRING_STRIP_TRAILING>, 0},
    {"NLS2_toUTF8", toBytes<NLS2_toUTF8>, 0},
    {"NLS2_fromUTF8", fromUtf8, 0},
    {"NLS2_toUTF16", toUtf16, 0},
    {"NLS2_fromUTF16", fromUtf16, 0},
    {"NLS2_StringToUnicode", inPlace<NLS2_StringToUnicode>, 0},
    {"NLS2_UnicodeToString", inPlace<NLS2_UnicodeToString>, 0},
    {"NLS2_Strcoll", collate<0>, 0},
    {"NLS2_Strcoll, blanks ignored", collate<CHARBASED | SORT_IGNORETRAILING>, 0},
    {"NLS2_Findstr", find<0>, -1},
    {"NLS2_Findstr, case ignored", find<IGNORECASE>, -1},
    {"NLS2_MapString", mapString, 0},
    {"NLS2_Strlen", strlen16, 0},
    {"NLS2_ConversionRatio", ratio, 1},
    {"NLS2_ByteLength", byteLength, 0},
    {"NLS2_MapCodepageIdToName", openConverter, 0},
    {"NLS2_GetCodepageName", codepageName, 0},
    {"NLS2_GetCodepageId", codepageId, 0},
    {"NLS2_allocateLocale", allocate, 0},
    {"NLS2_GetLocale", getLocale, 0},
    {"NLS2_GetThreadLocale", threadLocale, 0},
    {"NLS2_ConvertNativeLocale", convertNative, 0},
    {"NLS2_initLocaleObject", initObject, 0},
    {"NLS2_SetLocaleFromNative", fromNative, 0},
    {"NLS2_GetLocaleNumInfo, NLS2_GetLocaleCodepageId", numbers, 0},
    {"NLS2_SetLocaleNumInfo", setNumber, 0},
    {"names of languages, NLS2_GetLocaleMapEntry", names, 0},
    {"NLS2_detectUnicodeSignature", signature, 0},
    {"streams", streams, 0},
    {"NLS2_ResourceOpen, NLS2_GetStringByKey", bundle, 0},
    {"field_translator, as it is", field<nls2::padding::as_is, nls2::on_bad::stop, 37>, 0},
    {"field_translator, strip", field<nls2::padding::strip, nls2::on_bad::replace, 37>, 0},
    {"field_translator, strip, mixed", field<nls2::padding::strip, nls2::on_bad::stop, 930>, 0},
    {"field_translator, fill", field<nls2::padding::fill, nls2::on_bad::stop, 930>, 0},
    {"field_translator, keep", field<nls2::padding::keep_blanks, nls2::on_bad::replace, 930>, 0},
    {"NLS2_Init, NLS2_ValidateLocale, NLS2_BuildStamp", constants, 0},
};

} // namespace

std::span<const Call> calls() { return table; }

void prepareFiles() {
  std::strcpy(filePath, "/tmp/nls2-proof-XXXXXX");
  close(mkstemp(filePath));
}

void removeFiles() { unlink(filePath); }

} // namespace proof
