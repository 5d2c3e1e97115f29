// Every function that takes a text, on blocks of exactly the text's size, and bare ICU beside the
// conversions.

#include "checks.h"
#include "nls2.h"

#include <unicode/localpointer.h>
#include <unicode/ucnv.h>

namespace {

using fuzz::check;

struct Sizes {
  int32_t source;
  int32_t target;
};

NLS2_Locale *locale(FuzzedDataProvider &input, uint32_t page) {
  constexpr uint32_t languages[] = {0x03480001, 0x01140002}; // English, German
  static NLS2_Locale *const made[] = {
      [](int32_t status) { return NLS2_GetLocale(languages[0], 819, 0, &status); }(0),
      [](int32_t status) { return NLS2_GetLocale(languages[1], 819, 0, &status); }(0)};
  NLS2_Locale *const chosen = made[input.ConsumeBool() ? 1 : 0];
  check(chosen != nullptr && NLS2_SetLocaleNumInfo(chosen, NLS2_ATTRIBUTE_CODEPAGE, page, 0) == 0,
        "a locale object is made");
  return chosen;
}

void decode(const NLS2_Locale *in, const fuzz::Page &page, const char *source, Sizes sizes) {
  const auto units = static_cast<size_t>(sizes.target);
  const fuzz::Output<UChar> target(units);
  const fuzz::Output<UChar> bare(units);
  int32_t status = 0;
  const int32_t length =
      NLS2_toUTF16(in, source, sizes.source, target.get(), sizes.target, &status);
  UErrorCode error = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(ucnv_open(page.icuName, &error));
  const int32_t expected =
      ucnv_toUChars(converter.getAlias(), bare.get(), sizes.target, source, sizes.source, &error);
  check(status == (U_FAILURE(error) ? error : 0), "status of toUTF16");
  check(length == (U_FAILURE(error) ? 0 : expected), "length of toUTF16");
  check(std::equal(target.get(), target.get() + units, bare.get()), "units of toUTF16");

  const fuzz::Output<char> bytes(units);
  NLS2_toUTF8(in, source, sizes.source, bytes.get(), sizes.target, &status);
  NLS2_fromUTF8(in, bytes.get(), sizes.target, source, sizes.source, &status);
}

void encode(const NLS2_Locale *in, const fuzz::Page &page, const std::u16string &text,
            int32_t room) {
  const auto source = fuzz::exact(text);
  const fuzz::Output<char> target(static_cast<size_t>(room));
  const fuzz::Output<char> bare(static_cast<size_t>(room));
  int32_t status = 0;
  const auto units = static_cast<int32_t>(text.size());
  const int32_t length = NLS2_fromUTF16(in, source.get(), room, target.get(), units, &status);
  UErrorCode error = U_ZERO_ERROR;
  const icu::LocalUConverterPointer converter(ucnv_open(page.icuName, &error));
  const int32_t expected =
      ucnv_fromUChars(converter.getAlias(), bare.get(), room, source.get(), units, &error);
  check(status == (U_FAILURE(error) ? error : 0), "status of fromUTF16");
  check(length == (U_FAILURE(error) ? 0 : expected), "length of fromUTF16");
  check(std::equal(target.get(), target.get() + room, bare.get()), "bytes of fromUTF16");
}

void compareAndFind(const NLS2_Locale *in, const std::string &one, const std::string &two) {
  const auto first = fuzz::exact(one);
  const auto second = fuzz::exact(two);
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
  // A walk over UTF-8 characters may go up to 3 bytes on, which must be there to read.
  const auto walked = fuzz::exact(one + std::string(4, '\0'));
  int32_t status = 0;
  NLS2_Strcoll(in, walked.get(), -1, walked.get(), firstSize, CHARBASED, &status);
}

void inPlace(const NLS2_Locale *in, const std::string &text, int32_t room) {
  std::string buffer = text;
  buffer.resize(std::max(text.size(), static_cast<size_t>(room)));
  const auto size = static_cast<int32_t>(buffer.size());
  int32_t status = 0;
  for (const auto function : {NLS2_StringToUnicode, NLS2_UnicodeToString}) {
    const fuzz::Output<char> block(buffer.size());
    std::copy(buffer.begin(), buffer.end(), block.get());
    function(in, block.get(), size, block.get(), static_cast<int32_t>(text.size()), &status);
  }
}

void names(const std::string &text) {
  const auto name = fuzz::exact(std::string(text.c_str()) + '\0');
  int32_t status = 0;
  NLS2_MapWindowsNameToCCSID(name.get(), &status);
  NLS2_LanguageIDFromShortPosixName(name.get(), &status);
  NLS2_SetLocaleFromNative(name.get(), 0);
  int32_t length = 0;
  const auto bytes = fuzz::exact(text);
  NLS2_detectUnicodeSignature(bytes.get(), static_cast<int32_t>(text.size()), &length, &status);
  check(length >= 0 && length <= static_cast<int32_t>(text.size()), "a signature's length");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  FuzzedDataProvider input(data, std::min<size_t>(size, 4000));
  const fuzz::Page &page = fuzz::page(input);
  const NLS2_Locale *in = locale(input, static_cast<uint32_t>(page.number));
  const auto room = input.ConsumeIntegralInRange<int32_t>(0, 300);
  const std::string one = input.ConsumeBytesAsString(input.ConsumeIntegralInRange<size_t>(0, 2000));
  const std::string two = input.ConsumeRemainingBytesAsString();

  const auto source = fuzz::exact(one);
  decode(in, page, source.get(), {static_cast<int32_t>(one.size()), room});
  std::u16string units(one.size() / 2, u'\0');
  std::memcpy(units.data(), one.data(), units.size() * 2);
  encode(in, page, units, room);
  compareAndFind(in, one, two);
  inPlace(in, one, room);
  names(two);
  const auto terminated = fuzz::exact(std::string(one.c_str()) + '\0');
  const fuzz::Output<char> mapped(static_cast<size_t>(room));
  int32_t status = 0;
  NLS2_Strlen(in, terminated.get(), 0, &status);
  check(NLS2_ByteLength(in, terminated.get(), &status) <= 4, "a character's bytes");
  NLS2_MapString(in, mapped.get(), room, terminated.get(), 0, NLS2_MAP_LOWERCASE);
  return 0;
}
