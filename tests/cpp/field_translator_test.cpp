// nls2::field_translator: known answers. properties/field.cpp compares its two paths.

#include "nls2.hpp"
#include "support/probe.h"

#include <gtest/gtest.h>
#include <sstream>
#include <vector>

namespace {

using namespace std::string_literals;
using namespace nls2;

// "problem replaced offset needed U+code-point | source bytes | output".
std::string shown(const field_result &r, std::string_view out) {
  std::ostringstream text;
  text << static_cast<int>(r.problem) << ' ' << r.replaced << ' ' << r.offset << ' ' << r.needed
       << " U+" << std::hex << static_cast<uint32_t>(r.code_point);
  for (const std::string_view bytes : {r.source_bytes(), out}) {
    text << " |";
    for (const char byte : bytes) {
      text << ' ' << static_cast<unsigned>(static_cast<unsigned char>(byte));
    }
  }
  return text.str();
}

TEST(FieldTranslator, SaysWhatFailedAndWhere) {
  constexpr field_policy strip{.padding = padding::strip};
  constexpr field_policy replace{.bad = on_bad::replace};
  constexpr field_policy mark{.bad = on_bad::replace, .drop_ignorable = false};
  constexpr field_policy fill{.padding = padding::fill, .width = 5};
  constexpr field_policy keep{.padding = padding::keep_blanks, .width = 5};
  const struct {
    const char *reason;
    int32_t from, to;
    field_policy policy;
    std::string field;
    std::size_t room;
    const char *answer;
  } rows[] = {
      // clang-format off
      {"invalid bytes", 1208, 37, {}, "AB\xE6\x97", 9, "1 0 2 0 U+0 | e6 97 |"},
      {"a character that the page lacks", 1208, 37, {}, "AB\xD0\x96 ", 9, "2 0 2 0 U+416 | d0 96 |"},
      {"one of two units", 1208, 37, strip, "\xF0\x9F\x98\x80", 9, "2 0 0 0 U+1f600 | f0 9f 98 80 |"},
      {"one that ICU would drop", 1208, 37, {}, "A\xE2\x80\x8B", 9, "2 0 1 0 U+200b | e2 80 8b |"},
      {"which counts as replaced", 1208, 37, replace, "A\xE2\x80\x8B", 9, "0 1 0 0 U+0 | | c1"},
      {"and is, if asked", 1208, 37, mark, "A\xE2\x80\x8B", 9, "0 1 0 0 U+0 | | c1 3f"},
      {"also by the table", 37, 437, mark, "\xC1\xCA", 9, "0 1 0 0 U+0 | | 41 7f"},
      {"one of two units, which two pieces share", 1208, 37, {}, std::string(63, '0') + "\xF0\x9F\x98\x80zz", 99, "2 0 63 0 U+1f600 | f0 9f 98 80 |"},
      {"half a pair", 57370, 1208, {}, "A\xED\xA0\x80\x42", 9, "2 0 1 0 U+d800 | ed a0 80 |"},
      {"half a pair at the end", 57370, 1208, {}, "\xED\xA0\x80", 9, "2 0 0 0 U+d800 | ed a0 80 |"},
      {"invalid, with a U+FFFD that is lacking: once", 1208, 37, replace, "\xFFy", 9, "0 1 0 0 U+0 | | 3f a8"},
      {"no room", 37, 1208, {}, "\xC1\x43\xC2", 3, "3 0 2 4 U+0 | c2 |"},
      {"no room to shift back", 1208, 930, {}, "\xE6\x97\xA5", 3, "3 0 3 4 U+0 | |"},
      {"a null", 37, 1208, strip, "\xC1\0\xC2\0"s, 9, "4 0 1 0 U+0 | 0 |"},
      {"a null without a zero byte", 57367, 1208, strip, "\x01\x50\x51", 9, "4 0 1 0 U+0 | 50 |"},
      {"blanks of two bytes", 37, 1200, fill, "\xC1", 9, "5 0 0 4 U+0 | |"},
      {"a filled field beyond the output", 37, 1208, fill, "\xC1", 4, "3 0 0 5 U+0 | |"},
      {"kept blanks beyond it", 37, 1208, {.padding = padding::keep_blanks}, "\xC1@@", 2, "3 0 0 3 U+0 | |"},
      {"no blank in the page", 37, 16684, fill, "@", 9, "2 0 0 0 U+20 | |"},
      {"blanks are cut off, nulls among them too", 37, 1208, strip, "\xC1@\0@\0"s, 9, "0 0 0 0 U+0 | | 41"},
      {"a field as it is", 37, 1208, {}, "\xC1@\0@"s, 9, "0 0 0 0 U+0 | | 41 20 0 20"},
      {"filled exactly", 37, 1208, fill, "\xC1", 9, "0 0 0 0 U+0 | | 41 20 20 20 20"},
      {"as many blanks as there were", 37, 1208, keep, "\xC1@@", 9, "0 0 0 0 U+0 | | 41 20 20"},
      {"or as fit", 37, 1208, keep, "\xC1\xC1\xC1\xC1@@", 9, "0 0 0 0 U+0 | | 41 41 41 41 20"},
      {"room to the last byte, shifts too", 1208, 930, fill, "\xE6\x97\xA5 ", 5, "0 0 0 0 U+0 | | e 45 62 f 40"},
      // clang-format on
  };
  for (const auto &row : rows) {
    for (const bool useTable : {true, false}) {
      field_policy policy = row.policy;
      policy.use_table = useTable;
      field_translator translator(code_page(row.from), code_page(row.to), policy);
      std::vector<char> out(row.room);
      const field_result result = translator.translate(row.field, out);
      const std::string bytes(out.data(), result.written);
      EXPECT_EQ(shown(result, bytes), row.answer) << row.reason;
      std::string appended = "before";
      translator.translate(row.field, appended);
      EXPECT_TRUE(row.room != 9 || appended == "before" + bytes) << row.reason;
    }
  }
}

TEST(FieldTranslator, MakersReportWhatDoesNotOpen) {
  const struct {
    int32_t from, to;
    field_policy policy;
    int status;
  } rows[] = {{57364, 1208, {}, U_FILE_ACCESS_ERROR},
              {37, 57364, {}, U_FILE_ACCESS_ERROR},
              {37, 1208, {.padding = padding::fill}, NLS2_ERR_INVALID_OPTION},
              {37, 1208, {}, 0}};
  for (const auto &row : rows) {
    std::error_code error;
    field_translator(code_page(row.from), code_page(row.to), row.policy, error);
    EXPECT_EQ(error.value(), row.status);
  }
  EXPECT_THROW(field_translator(code_page(57364), code_page(1208)), error);
}

TEST(FieldTranslator, AllocatesNothingAfterItIsMade) {
  const std::string field(1000, '\x40');
  std::vector<char> out(4000);
  for (const int to : {1208, 930}) {
    for (const padding how : {padding::as_is, padding::strip, padding::fill}) {
      field_translator translator(code_page(37), code_page(to), {.padding = how, .width = 1200});
      const long before = support::heapRequests();
      EXPECT_TRUE(translator.translate(std::span(field).first(80), out));
      EXPECT_TRUE(translator.translate(std::span(field), out));
      EXPECT_EQ(support::heapRequests(), before) << to;
    }
  }
}

} // namespace
