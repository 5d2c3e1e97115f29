// nls2::field_translator: the table against the general path, and both against bare ICU.

#include "nls2.hpp"
#include "support/probe.h"

#include <gtest/gtest.h>
#include <random>
#include <sstream>
#include <vector>

namespace {

using namespace std::string_literals;
using nls2::code_page;
using nls2::field_policy;
using nls2::field_problem;
using nls2::field_result;
using nls2::field_translator;
using nls2::on_bad;
using nls2::padding;

// Every code page that opens, of the numbers in use.
const std::vector<code_page> &allPages() {
  static const std::vector<code_page> pages = [] {
    std::vector<code_page> found;
    for (int32_t number = 1; number < 57373; number += number == 9999 ? 40000 : 1) {
      std::error_code error;
      if (nls2::open_converter(code_page(number), error)) {
        found.emplace_back(number);
      }
    }
    return found;
  }();
  return pages;
}

std::string encoded(code_page page, const std::u16string &text) {
  const nls2::converter converter = nls2::open_converter(page);
  std::string bytes(text.size() * 16 + 64, '\0');
  UErrorCode error = U_ZERO_ERROR;
  bytes.resize(static_cast<std::size_t>(
      ucnv_fromUChars(converter.get(), bytes.data(), static_cast<int32_t>(bytes.size()),
                      text.data(), static_cast<int32_t>(text.size()), &error)));
  return bytes;
}

std::u16string decoded(code_page page, const std::string &bytes) {
  const nls2::converter converter = nls2::open_converter(page);
  std::u16string text(bytes.size() * 4 + 16, u'\0');
  UErrorCode error = U_ZERO_ERROR;
  text.resize(static_cast<std::size_t>(
      ucnv_toUChars(converter.get(), text.data(), static_cast<int32_t>(text.size()), bytes.data(),
                    static_cast<int32_t>(bytes.size()), &error)));
  return text;
}

class Random {
public:
  std::size_t below(std::size_t bound) { return generator_() % bound; }

  code_page page() { return allPages()[below(allPages().size())]; }

  field_policy policy() {
    constexpr padding paddings[] = {padding::as_is, padding::strip, padding::fill,
                                    padding::keep_blanks};
    field_policy policy{.padding = paddings[below(4)]};
    policy.width = policy.padding == padding::fill || below(3) == 0 ? 1 + below(40) : 0;
    policy.bad = below(2) == 0 ? on_bad::stop : on_bad::replace;
    return policy;
  }

  // Any bytes, or words of several scripts with blanks and now and then a null after them.
  std::string field(code_page page) {
    if (below(3) == 0) {
      std::string bytes(below(30), '\0');
      for (char &byte : bytes) {
        byte = static_cast<char>(below(256));
      }
      return bytes;
    }
    const char16_t *words[] = {u"A",          u"Zed",    u"\u00E9", u"\u65E5\u672C",
                               u"\u3042",     u"1",      u" ",      u"\u0416",
                               u"\U0001F600", u"\u3000", u"\t",     u"\u00AD"};
    std::u16string text;
    for (std::size_t i = below(8); i > 0; --i) {
      text += words[below(std::size(words))];
    }
    return encoded(page, text.append(below(5), u' ').append(below(12) == 0 ? 1 : 0, u'\0'));
  }

private:
  std::mt19937 generator_{20261121};
};

struct Answer {
  field_result result;
  std::string bytes;
};

// The output has `room` bytes and no more.
Answer ask(field_translator &translator, const std::string &field, std::size_t room) {
  const auto out = std::make_unique<char[]>(room);
  const field_result result = translator.translate(field, std::span(out.get(), room));
  EXPECT_LE(result.written, room);
  return {result, std::string(out.get(), std::min(result.written, room))};
}

// "problem replaced offset needed U+code-point | source bytes | output".
std::string shown(const Answer &answer) {
  const field_result &r = answer.result;
  std::ostringstream text;
  text << static_cast<int>(r.problem) << ' ' << r.replaced << ' ' << r.offset << ' ' << r.needed
       << " U+" << std::hex << static_cast<uint32_t>(r.code_point);
  for (const std::string_view bytes : {r.source_bytes(), std::string_view(answer.bytes)}) {
    text << " |";
    for (const char byte : bytes) {
      text << ' ' << static_cast<unsigned>(static_cast<unsigned char>(byte));
    }
  }
  return text.str();
}

// What ICU makes of text and blanks converted as one, trying every number of blanks.
std::string byBruteForce(code_page to, std::u16string text, const field_policy &policy) {
  std::size_t end = text.size();
  std::size_t blanks = 0;
  for (; end > 0 && (text[end - 1] == 0 || u_isblank(text[end - 1]) != 0); --end) {
    blanks += text[end - 1] != 0 ? 1 : 0;
  }
  text.resize(end);
  if (text.find(u'\0') != text.npos) {
    return "null";
  }
  const bool filled = policy.padding == padding::fill;
  const std::size_t most = filled ? policy.width : policy.padding == padding::strip ? 0 : blanks;
  for (std::size_t left = 0; left <= most; ++left) {
    const std::size_t count = filled ? left : most - left;
    const std::string bytes = encoded(to, text + std::u16string(count, u' '));
    if (filled ? bytes.size() == policy.width : policy.width == 0 || bytes.size() <= policy.width) {
      return bytes;
    }
  }
  return "impossible";
}

TEST(FieldTranslator, TableAndGeneralPathAndBareIcuAgree) {
  Random random;
  std::size_t failures = 0;
  for (int round = 0; round < 1500 && !HasFailure(); ++round) {
    const code_page from = random.page();
    const code_page to = random.page();
    field_policy policy = random.policy();
    field_translator first(from, to, policy);
    policy.use_table = false;
    field_translator general(from, to, policy);
    field_translator usual = first; // a copy, as each thread has one
    for (int i = 0; i < 12; ++i) {
      const std::string field = random.field(from);
      const std::size_t room =
          random.below(3) == 0 ? random.below(60) : usual.max_size(field.size());
      const Answer answer = ask(usual, field, room);
      SCOPED_TRACE(std::to_string(from.number()) + " to " + std::to_string(to.number()) +
                   ", padding " + std::to_string(static_cast<int>(policy.padding)) + ", width " +
                   std::to_string(policy.width) + ", room " + std::to_string(room) + ", field " +
                   testing::PrintToString(field));
      ASSERT_EQ(shown(answer), shown(ask(general, field, room)));
      failures += answer.result ? 0 : 1;
      if (policy.bad == on_bad::stop || room < usual.max_size(field.size())) {
        continue;
      }
      if (policy.padding != padding::as_is) {
        const std::string expected = byBruteForce(to, decoded(from, field), policy);
        ASSERT_EQ(answer.result                                           ? answer.bytes
                  : answer.result.problem == field_problem::embedded_null ? "null"
                                                                          : "impossible",
                  expected);
      } else if (answer.result && !field.empty()) {
        std::string bytes(answer.bytes.size() + 1, '\0');
        int32_t consumed = 0;
        int32_t status = 0;
        bytes.resize(static_cast<std::size_t>(NLS2_TranslateString(
            to.number(), bytes.data(), static_cast<int32_t>(bytes.size()), from.number(),
            field.data(), static_cast<int32_t>(field.size()), &consumed, 0, &status)));
        ASSERT_EQ(answer.bytes, bytes) << status;
      }
    }
  }
  EXPECT_GT(failures, 500U);
}

TEST(FieldTranslator, TextThatFillsItsRoomToTheLastByteIsWhole) {
  const std::u16string text = u"Ab \u00E9\u65E5\u672CZ";
  std::u16string faces; // in SCSU and BOCU-1 a byte each
  while (faces.size() < 80) {
    faces += u"\U0001F600";
  }
  for (const code_page to : allPages()) {
    field_translator back(to, code_page(1200), {.bad = on_bad::replace});
    const std::string many = encoded(to, faces);
    EXPECT_TRUE(ask(back, many, back.max_size(many.size())).result) << to.number();
    const std::string whole = encoded(to, text);
    const std::string field = encoded(code_page(1208), text) + "  ";
    for (const padding padding : {padding::strip, padding::fill, padding::keep_blanks}) {
      for (const std::size_t less : {0U, 1U}) {
        field_translator exact(
            code_page(1208), to,
            {.padding = padding, .width = whole.size() - less, .bad = on_bad::replace});
        const Answer answer = ask(exact, field, whole.size() - less);
        EXPECT_EQ(answer.bytes, less == 0 ? whole : "") << to.number();
        EXPECT_EQ(answer.result.problem, less == 0 ? field_problem::none : field_problem::no_room);
        EXPECT_EQ(answer.result.needed, less == 0 ? 0 : whole.size()) << to.number();
      }
    }
  }
}

TEST(FieldTranslator, SaysWhatFailedAndWhere) {
  constexpr field_policy strip{.padding = padding::strip};
  constexpr field_policy replace{.bad = on_bad::replace};
  constexpr field_policy mark{.bad = on_bad::replace, .drop_ignorable = false};
  constexpr field_policy fill{.padding = padding::fill, .width = 5};
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
      // clang-format on
  };
  for (const auto &row : rows) {
    field_translator translator(code_page(row.from), code_page(row.to), row.policy);
    const Answer answer = ask(translator, row.field, row.room);
    EXPECT_EQ(shown(answer), row.answer) << row.reason;
    std::string appended = "before";
    if (row.room == 9) {
      translator.translate(row.field, appended);
      EXPECT_EQ(appended, "before" + answer.bytes) << row.reason;
    }
  }
}

TEST(FieldTranslator, MakersReportWhatDoesNotOpen) {
  std::error_code error;
  field_translator(code_page(57364), code_page(1208), {}, error);
  EXPECT_EQ(error, nls2::make_status(U_FILE_ACCESS_ERROR));
  field_translator(code_page(37), code_page(57364), {}, error);
  EXPECT_EQ(error, nls2::make_status(U_FILE_ACCESS_ERROR));
  field_translator(code_page(37), code_page(1208), {.padding = padding::fill}, error);
  EXPECT_EQ(error, nls2::make_status(NLS2_ERR_INVALID_OPTION));
  field_translator(code_page(37), code_page(1208), {}, error);
  EXPECT_FALSE(error);
  EXPECT_THROW(field_translator(code_page(57364), code_page(1208)), nls2::error);
}

TEST(FieldTranslator, AllocatesNothingAfterItIsMade) {
  const std::string field(1000, '\x40');
  std::vector<char> out(4000);
  for (const auto &[from, to] : {std::pair(37, 1208), std::pair(930, 1208), std::pair(37, 930)}) {
    for (const padding padding :
         {padding::as_is, padding::strip, padding::fill, padding::keep_blanks}) {
      field_translator translator(code_page(from), code_page(to),
                                  {.padding = padding, .width = 1200});
      const long before = support::heapRequests();
      for (const std::size_t size : {10U, 80U, 1000U}) {
        EXPECT_TRUE(translator.translate(std::span(field).first(size), out));
      }
      EXPECT_EQ(support::heapRequests(), before) << from << " to " << to;
    }
  }
}

} // namespace
