// Text: the ranges that functions take, whole texts, fields, columns, chunks, order and search.

#include "nls2.hpp"

#include <gtest/gtest.h>

namespace {

using namespace std::string_literals;
using namespace nls2;

// An array of characters may be all text or end at a null, so only literals convert.
template <class Source>
constexpr bool converts = std::is_constructible_v<byte_view, Source>;
static_assert(!converts<char (&)[3]> && !converts<char8_t (&)[3]> && converts<std::byte (&)[3]>);
static_assert(!converts<std::vector<int>> && !std::is_constructible_v<byte_room, std::string &>);
static_assert(byte_view("A\0B").size() == 3 && byte_view(u8"\u00E9").size() == 2);

TEST(Bytes, AreAnyContiguousRange) {
  unsigned char raw[4] = {};
  const auto sizes = [](auto... views) { return (std::to_string(views.size()) + ...); };
  EXPECT_EQ(sizes(byte_view("abc"), byte_view("ab"s.c_str()), byte_view("ab\0"s),
                  byte_view(u8"12345"s), byte_view(raw), byte_view(std::vector<std::byte>(6)),
                  byte_view()),
            "3235460");
  EXPECT_TRUE(byte_room(raw).size() == 4 && byte_room(std::span(raw).first(2)).data() == raw);
}

TEST(Translator, TranslatesFieldsInEveryForm) {
  translator first(code_page(37), code_page("utf-8"), {.padding = padding::strip});
  translator strip = first;
  const translator taken = std::move(first);
  EXPECT_TRUE(strip && taken && !first);
  std::array<std::byte, 9> out{};
  const field_result result = strip.translate("\xC1\x51\x40", out);
  EXPECT_TRUE(result && result.written == 3 && result.replaced == 0 && !result.error());
  EXPECT_EQ(std::memcmp(out.data(), "A\xC3\xA9", 4), 0);
  std::string text = "before";
  EXPECT_TRUE(strip.translate("\xC1\x40", text) && text == "beforeA");
  EXPECT_EQ(strip.translate(text, text).status, 37) << "the field would move";
  EXPECT_TRUE(strip.translate("\xC1\x00\xC2", text).error() == errc::bad_field &&
              text == "beforeA");
}

TEST(Translator, ReportsProblemsWithPlaceBytesAndWords) {
  translator to(code_page("utf-8"), code_page("ibm-37"));
  std::array<char, 3> out{};
  const field_result lacks = to.translate("AB\u0416", out);
  const problem &found = lacks.problem;
  EXPECT_EQ(lacks.error(), make_status(U_INVALID_CHAR_FOUND));
  EXPECT_TRUE(!lacks && found.kind() == problem_kind::not_in_page && found.offset() == 2);
  EXPECT_TRUE(found.code_point() == 0x416 && found.bytes() == "\u0416");
  EXPECT_TRUE(to.describe(found).ends_with("ibm-37_P100-1995")) << to.describe(found);
  EXPECT_EQ(to.translate("ABCD", out).error(), errc::no_room);
  EXPECT_EQ(to.translate("\xFF", out).error(), std::errc::illegal_byte_sequence);
}

TEST(Translator, TranslatesColumnsWithinTheirSpans) {
  translator strip(code_page(37), code_page(1208), {.padding = padding::strip});
  const std::string records = "_\xC1\x40_\x51\xC2_\xC3\0_\0\xC1"s; // fields of two bytes
  const column rows{std::string_view(records).substr(1), 2, 3};
  std::array<char, 9> out{};
  std::vector<std::int32_t> offsets(5);
  std::array<std::uint8_t, 1> good{};
  const column_result result = strip.translate(rows, out, offsets, good);
  EXPECT_TRUE(result && result.done == 4 && result.failed == 1 && result.written == 5);
  EXPECT_EQ(std::string_view(out.data(), 5), "A\u00E9BC");
  EXPECT_EQ(offsets, (std::vector<std::int32_t>{0, 1, 4, 5, 5}));
  EXPECT_TRUE(good[0] == 7 && result.problem.record() == 3);
  std::vector<std::int64_t> wide(5), many(10);
  const column_result stopped = strip.translate(rows, out, wide);
  EXPECT_TRUE(!stopped && stopped.done == 3 && stopped.written == 5 && wide[3] == 5);
  EXPECT_EQ(strip.translate(rows, out, many).status, 37) << "more rows than fields";
  EXPECT_EQ(strip.translate({records, 1, 0}, out, many, good).status, 37) << "eight bits only";
}

TEST(Translator, TranslatesChunks) {
  translator to(code_page("utf-8"), code_page("ibm-930"));
  std::array<char, 32> out{};
  const chunk_result first = to.translate_chunk("A\xE6\x97", false, out);
  EXPECT_TRUE(first && first.read == 3);
  const auto rest = std::span(out).subspan(first.written);
  const chunk_result last = to.translate_chunk("\xA5", true, rest);
  EXPECT_EQ(std::string(out.data(), first.written + last.written), to.translate("A\u65E5"));
}

TEST(Text, ConvertsStrictlyOrCounts) {
  const code_page utf8("utf-8"), mixed(930), latin(819);
  const std::string bytes = translate(utf8, mixed, "a\0\u65E5");
  EXPECT_EQ(bytes, "\x62\0\x0E\x45\x62\x0F"s);
  EXPECT_EQ(to_utf16(mixed, bytes), u"a\0\u65E5"s);
  std::size_t replaced = 9;
  EXPECT_TRUE(translate(utf8, latin, "x\u65E5\u65E5", replaced) == "x\x1A\x1A" && replaced == 2);
  EXPECT_TRUE(to_utf16(utf8, "x\xFF", replaced) == u"x\uFFFD" && replaced == 1);
  EXPECT_TRUE(from_utf16(latin, u"x", replaced) == "x" && replaced == 0);
}

TEST(Text, IsComparedAndFoundByTheRulesOfTheLanguage) {
  const code_page utf8("utf-8");
  collator german("de_DE", utf8), swedish("sv_SE", utf8);
  collator loose("de_DE", utf8, {.ignore_trailing_blanks = true, .ignore_case = true});
  EXPECT_TRUE(german.compare("\u00E4", "z") < 0 && swedish.compare("\u00E4", "z") > 0);
  EXPECT_EQ(loose.compare("a \t", "a"), std::weak_ordering::equivalent);
  const std::string key = german.sort_key("\uFDFA\uFDFA"); // longer than its first room
  EXPECT_TRUE(key.size() > 56 && key.back() == '\0' && german.sort_key("a") < key);
  const occurrence where = loose.find("xStra\u00DFe", "STRA\u00DF");
  EXPECT_TRUE(where.position == 1 && where.length == 6 && german.find("a", "a").length == 1);
  EXPECT_FALSE(german.find("Stra", "STRA"));
  const unicode_signature signature = detect_unicode_signature("\xEF\xBB\xBFx");
  EXPECT_TRUE(signature.encoding == "UTF-8" && signature.length == 3);
}

} // namespace
