// Conversion, comparison and search: the C interface's answers, with lengths and nulls checked.

#include "nls2.hpp"

#include <gtest/gtest.h>

namespace {

using namespace std::string_literals;
using namespace nls2;

locale in(int page, std::string_view name = "de_DE") {
  return make_locale(language_id::from_name(name), code_page(page));
}

// The whole output fits a span of its size, and no smaller one.
template <class Output, class Convert>
void expectSpans(const Output &expected, Convert convert) {
  Output out = expected;
  std::error_code none;
  EXPECT_EQ(convert(out, none), expected.size());
  EXPECT_EQ(out, expected);
  if (!out.empty()) {
    out.pop_back();
    convert(out, none);
    EXPECT_EQ(none, errc::no_room);
  }
}

TEST(Text, ConvertsByteForByteInEveryForm) {
  const code_page utf8(1208);
  for (const int number : {37, 930, 1141, 1200, 1204, 1208, 57361, 57363, 57369}) {
    const locale where = in(number);
    const code_page page(number);
    const std::string grows(100, 'x'); // to four bytes each in UTF-32
    for (const std::string &text : {""s, "A"s, "Gr\u00FC\u00DFe \u65E5"s, "a\0b"s, grows}) {
      SCOPED_TRACE(std::to_string(number) + " " + text);
      std::string c(2000, '?');
      int32_t status = 0;
      const auto length = static_cast<int32_t>(text.size());
      c.resize(static_cast<std::size_t>(
          NLS2_fromUTF8(where.get(), c.data(), 2000, text.data(), length, &status)));
      EXPECT_EQ(from_utf8(where, text), c);
      EXPECT_EQ(translate(page, utf8, text), c);
      const std::string back = to_utf8(where, c);
      EXPECT_EQ(translate(utf8, page, c), back);
      const std::u16string units = to_utf16(where, c);
      EXPECT_EQ(to_utf16(in(1208), back), units);
      EXPECT_EQ(from_utf16(where, units), c);
      expectSpans(c, [&](auto &out, auto &e) { return from_utf8(where, text, out, e); });
      expectSpans(back, [&](auto &out, auto &e) { return to_utf8(where, c, out, e); });
      expectSpans(units, [&](auto &out, auto &e) { return to_utf16(where, c, out, e); });
      expectSpans(c, [&](auto &out, auto &e) { return from_utf16(where, units, out, e); });
      expectSpans(c, [&](auto &out, auto &e) { return translate(page, utf8, text, out, e); });
    }
  }
}

TEST(Text, IsComparedByTheRulesOfTheLanguage) {
  using enum trailing_blanks;
  const locale german = in(1208);
  EXPECT_TRUE(compare(german, "\u00E4", "z") < 0 && compare(in(1208, "sv_SE"), "\u00E4", "z") > 0);
  EXPECT_TRUE(compare(german, "a ", "a") > 0 && compare(german, "a \t", "a", ignore) == 0);
  EXPECT_TRUE(compare(german, "a\0"s, "a") == 0 && compare(german, "a\0b"s, "ac") < 0);
  const std::string most(32767, 'x');
  EXPECT_TRUE(compare(german, most, most.substr(1)) > 0 && compare(german, "", most) < 0);
}

TEST(Text, IsFound) {
  using enum letter_case;
  const locale german = in(1208);
  EXPECT_TRUE(contains(german, "Stra\u00DFe", "\u00DF") && contains(german, "", ""));
  EXPECT_FALSE(contains(german, "Stra\u00DFe", "STRA"));
  EXPECT_TRUE(contains(german, "Stra\u00DFe", "STRA", ignore));
  const unicode_signature signature = detect_unicode_signature("\xEF\xBB\xBFx");
  EXPECT_TRUE(signature.encoding == "UTF-8" && signature.length == 3);
  EXPECT_TRUE(detect_unicode_signature({}).encoding.empty());
}

} // namespace
