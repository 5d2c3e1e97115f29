// All functions that take a text, on blocks of exactly its size. Conversions between a code page and
// UTF-8 or UTF-16 agree with the same calls of bare ICU.

#include "nls2.h"
#include "property.h"

#include <cstring>

namespace {

using property::check;
using property::exact;
using property::Input;
using property::Output;
using property::Page;

NLS2_Locale *made(uint32_t language) {
  int32_t status = 0;
  return NLS2_GetLocale(language, 819, 0, &status);
}

NLS2_Locale *localeIn(Input &input, int32_t page) {
  static NLS2_Locale *const locales[] = {made(0x03480001), made(0x01140002)}; // English, German
  NLS2_Locale *const chosen = input.oneOf(locales);
  const auto number = static_cast<uint32_t>(page);
  check(chosen != nullptr && NLS2_SetLocaleNumInfo(chosen, NLS2_ATTRIBUTE_CODEPAGE, number, 0) == 0,
        "a locale object is made");
  return chosen;
}

// Both calls take (target, capacity, status) and agree for every capacity up to two units more than
// needed. `untouched` is the status after a success.
template <class Unit, class Library, class Icu>
void compare(int32_t untouched, int32_t room, Library library, Icu icu) {
  UErrorCode error = U_ZERO_ERROR;
  const int32_t needed = icu(static_cast<Unit *>(nullptr), 0, &error);
  const auto at = [&](int32_t capacity) {
    const auto units = static_cast<size_t>(capacity);
    const Output<Unit> ours(units);
    const Output<Unit> bare(units);
    int32_t status = 99;
    const int32_t length = library(ours.get(), capacity, &status);
    error = U_ZERO_ERROR;
    const int32_t expected = icu(bare.get(), capacity, &error);
    check(status == (U_FAILURE(error) ? error : untouched), "status of a conversion");
    check(length == (U_FAILURE(error) ? 0 : expected), "length of a conversion");
    check(std::equal(ours.get(), ours.get() + units, bare.get()), "units of a conversion");
  };
  for (int32_t capacity = 0; capacity <= needed + 2 && needed <= 60; ++capacity) {
    at(capacity);
  }
  at(room);
}

// `length` may be -1 for a text that ends in a null.
void convertBytes(const NLS2_Locale *in, const Page &page, const char *bytes, int32_t length,
                  int32_t room) {
  const auto converter = open(page);
  compare<UChar>(
      0, room,
      [=](UChar *to, int32_t n, auto *e) { return NLS2_toUTF16(in, bytes, length, to, n, e); },
      [&](UChar *to, int32_t n, auto *e) {
        return ucnv_toUChars(converter.getAlias(), to, n, bytes, length, e);
      });
  compare<char>(
      0, room,
      [=](char *to, int32_t n, auto *e) { return NLS2_toUTF8(in, bytes, length, to, n, e); },
      [&](char *to, int32_t n, auto *e) {
        return ucnv_convert("utf-8", page.icuName, to, n, bytes, length, e);
      });
  compare<char>( // whose status a success never sets
      99, room,
      [=](char *to, int32_t n, auto *e) { return NLS2_fromUTF8(in, to, n, bytes, length, e); },
      [&](char *to, int32_t n, auto *e) {
        return ucnv_convert(page.icuName, "utf-8", to, n, bytes, length, e);
      });
}

void convertUnits(const NLS2_Locale *in, const Page &page, const UChar *units, int32_t length,
                  int32_t room) {
  const auto converter = open(page);
  compare<char>(
      0, room,
      [=](char *to, int32_t n, auto *e) { return NLS2_fromUTF16(in, units, n, to, length, e); },
      [&](char *to, int32_t n, auto *e) {
        return ucnv_fromUChars(converter.getAlias(), to, n, units, length, e);
      });
}

void convert(const NLS2_Locale *in, const Page &page, const std::string &text, int32_t room) {
  convertBytes(in, page, exact(text).get(), static_cast<int32_t>(text.size()), room);
  convertBytes(in, page, exact(text + '\0').get(), -1, room);
  std::u16string units = decode(page, text).append(text.size() / 2, u'\0');
  std::memcpy(units.data() + units.size() - text.size() / 2, text.data(), text.size() / 2 * 2);
  convertUnits(in, page, exact(units).get(), static_cast<int32_t>(units.size()), room);
  convertUnits(in, page, exact(units + u'\0').get(), -1, room);
}

void compareAndFind(const NLS2_Locale *in, const std::string &one, const std::string &two) {
  const auto first = exact(one);
  const auto second = exact(two);
  const auto firstSize = static_cast<int16_t>(one.size());
  const auto secondSize = static_cast<int16_t>(two.size());
  for (const uint32_t options : {0U, static_cast<uint32_t>(SORT_IGNORETRAILING)}) {
    int32_t status = 0;
    const int32_t order =
        NLS2_Strcoll(in, first.get(), firstSize, second.get(), secondSize, options, &status);
    const int32_t back =
        NLS2_Strcoll(in, second.get(), secondSize, first.get(), firstSize, options, &status);
    check(order == -back, "the order of two texts, both ways");
  }
  for (const uint32_t options : {0U, static_cast<uint32_t>(IGNORECASE)}) {
    const int32_t found =
        NLS2_Findstr(in, first.get(), firstSize, second.get(), secondSize, options);
    check(found >= -1 && found <= 1, "an answer of Findstr");
  }
  // A walk over UTF-8 characters may read up to 3 bytes more.
  const auto walked = exact(one + std::string(4, '\0'));
  int32_t status = 0;
  NLS2_Strcoll(in, walked.get(), -1, walked.get(), firstSize, CHARBASED, &status);
}

void inPlace(const NLS2_Locale *in, const std::string &text, int32_t room) {
  std::string buffer = text;
  buffer.resize(std::max(text.size(), static_cast<size_t>(room)));
  const auto size = static_cast<int32_t>(buffer.size());
  int32_t status = 0;
  for (const auto function : {NLS2_StringToUnicode, NLS2_UnicodeToString}) {
    const Output<char> block(buffer.size());
    std::copy(buffer.begin(), buffer.end(), block.get());
    function(in, block.get(), size, block.get(), static_cast<int32_t>(text.size()), &status);
  }
}

void names(const std::string &text) {
  const auto name = exact(property::terminated(text));
  int32_t status = 0;
  NLS2_MapWindowsNameToCCSID(name.get(), &status);
  NLS2_LanguageIDFromShortPosixName(name.get(), &status);
  NLS2_SetLocaleFromNative(name.get(), 0);
  int32_t length = 0;
  const auto bytes = exact(text);
  NLS2_detectUnicodeSignature(bytes.get(), static_cast<int32_t>(text.size()), &length, &status);
  check(length >= 0 && length <= static_cast<int32_t>(text.size()), "a signature's length");
}

void measureAndMap(const NLS2_Locale *in, const std::string &text, int32_t room) {
  const auto terminated = exact(property::terminated(text));
  const Output<char> mapped(static_cast<size_t>(room));
  int32_t status = 0;
  NLS2_Strlen(in, terminated.get(), 0, &status);
  check(NLS2_ByteLength(in, terminated.get(), &status) <= 4, "a character's bytes");
  NLS2_MapString(in, mapped.get(), room, terminated.get(), 0, NLS2_MAP_LOWERCASE);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  Input input(data, std::min<size_t>(size, 4000));
  const Page page = input.page();
  const NLS2_Locale *in = localeIn(input, page.number);
  const auto room = static_cast<int32_t>(input.below(301));
  const std::string two = input.flag() ? input.text(page) : input.bytes(input.below(2000));
  const std::string one = input.text(page);
  convert(in, page, one, room);
  compareAndFind(in, one, two);
  inPlace(in, one, room);
  names(two);
  measureAndMap(in, one, room);
  return 0;
}
