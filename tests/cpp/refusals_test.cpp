// What the C++ interface refuses, and with which status.

#include "nls2.hpp"
#include "support/probe.h"

#include <gtest/gtest.h>
#include <unistd.h>

namespace {

using namespace std::string_literals;
using namespace nls2;

locale in(int page) { return make_locale(language_id::from_name("de_DE"), code_page(page)); }

// The status that a call leaves in `error`.
#define STATUS_OF(call)                                                                            \
  [&](std::error_code error) {                                                                     \
    call;                                                                                          \
    return error.value();                                                                          \
  }(std::error_code(99, category()))

TEST(Refusals, OfNamesAndNumbers) {
  const interpose::Held before = interpose::held();
  EXPECT_EQ(STATUS_OF(code_page::from_name("hz", error)), 37) << "it has no number";
  EXPECT_EQ(STATUS_OF(code_page::from_name("", error)), 37);
  EXPECT_EQ(STATUS_OF(code_page::from_name("cp37\0x"s, error)), 37);
  EXPECT_EQ(STATUS_OF(code_page::from_name("no-such-page", error)), 4);
  EXPECT_EQ(STATUS_OF(code_page::from_name(std::string(256, 'x'), error)), 31);
  EXPECT_EQ(STATUS_OF(name_of(code_page(57364), error)), 4);
  EXPECT_EQ(STATUS_OF(language_id::from_name("de_at", error)), 37);
  EXPECT_EQ(STATUS_OF(name_of(language_id(255), error)), 39);
  EXPECT_EQ(STATUS_OF(iso_language(language_id(1), error)), 39);
  EXPECT_EQ(STATUS_OF(make_locale(language_id::from_name("de"), code_page(0), error)), 37);
  EXPECT_EQ(STATUS_OF(make_locale(language_id(0), code_page(37), error)), 39);
  EXPECT_EQ(interpose::held(), before);
}

TEST(Refusals, OfLocales) {
  locale none, where = in(1208);
  EXPECT_TRUE(!none.is_live() && none.name().empty());
  EXPECT_THROW(none.page(), error);
  EXPECT_EQ(STATUS_OF(where.set_language(language_id(255), error)), 39);
  EXPECT_EQ(STATUS_OF(where.set_page(code_page(255), error)), 37);
  EXPECT_EQ(STATUS_OF(none.set_page(code_page(37), error)), 38);
  EXPECT_EQ(STATUS_OF(none.set_language(language_id(0), error)), 38);
  EXPECT_EQ(STATUS_OF(conversion_ratio(none, none, error)), 38);
  EXPECT_EQ(STATUS_OF(to_utf16(none, "x", error)), 38);
  EXPECT_EQ(STATUS_OF(compare(none, "b", "a", error)), 38);
  EXPECT_EQ(STATUS_OF(open_bundle("x", none, error)), 38);
  support::world.locale = "nb_NO";
  EXPECT_EQ(STATUS_OF(default_locale(error)), 37);
  support::world = {};
}

TEST(Refusals, OfTexts) {
  const std::string_view bytes("x", 0x80000000U);
  const std::u16string_view units(u"x", 0x80000000U);
  const locale where = in(37);
  const std::string most(32767, 'x');
  std::array<char, 8> room{};
  EXPECT_EQ(STATUS_OF(to_utf8(where, bytes, error)), 31);
  EXPECT_EQ(STATUS_OF(from_utf16(where, units, room, error)), 31);
  EXPECT_EQ(STATUS_OF(translate(code_page(37), code_page(37), bytes, room, error)), 31);
  EXPECT_EQ(STATUS_OF(contains(where, bytes, "x", error)), 31);
  EXPECT_EQ(STATUS_OF(compare(where, most + 'x', "", error)), 31);
  EXPECT_EQ(STATUS_OF(compare(where, "", most + 'x', error)), 31);
  EXPECT_EQ(STATUS_OF(to_utf8(in(4711), "x", error)), 4);
  EXPECT_EQ(STATUS_OF(compare(in(4711), "b", "a", trailing_blanks::ignore, error)), 4);
  EXPECT_EQ(STATUS_OF(contains(in(1208), "\u0130", "i", letter_case::ignore, error)), 16);
  EXPECT_THROW(translate(code_page(0), code_page(37), "x"), error);
  const std::tuple<int, int, std::string> nulls[] = {
      {0, 1208, "a b"},
      {37, 1208, std::string(300, 'x') + '\0'},
      {0, 1200, "\0a\0b"s},
      {37, 1200, "\0a\0\0"s},
      {37, 57366, "a+AAA-b"}}; // UTF-7: a null without a zero byte
  for (const auto &[status, page, text] : nulls) {
    EXPECT_EQ(STATUS_OF(compare(in(page), text, "", trailing_blanks::ignore, error)), status);
    EXPECT_EQ(STATUS_OF(contains(in(page), "", text, error)), status) << page << text;
  }
}

TEST(Refusals, OfBundles) {
  const locale german = in(1208);
  const bundle messages = open_bundle(MESSAGES_DIR, german);
  EXPECT_EQ(STATUS_OF(messages.string("none", error)), 2);
  EXPECT_EQ(STATUS_OF(messages.string("greeting\0"s, error)), 37);
  EXPECT_EQ(STATUS_OF(bundle().string("greeting", error)), 1);
  EXPECT_EQ(STATUS_OF(open_bundle("", german, error)), 37);
  EXPECT_EQ(STATUS_OF(open_bundle("/nowhere", german, error)), 2);
}

TEST(Refusals, OfStreams) {
  const std::string path = testing::TempDir() + "nls2_refused_" + std::to_string(getpid());
  locale where = default_locale();
  const auto status = [&](const std::string &name, std::string_view mode, std::string_view code) {
    return STATUS_OF(open_stream(where, name, mode, code, error));
  };
  EXPECT_EQ(status(path, "w", "no-such-page"), 4);
  EXPECT_EQ(status(path, "w", ""), 37);
  EXPECT_EQ(status(path, "w", "UTF-8\0"s), 37);
  EXPECT_EQ(status(path, "w\0"s, "UTF-8"), 37);
  EXPECT_EQ(status(path + "\0x"s, "w", "UTF-8"), 37);
  EXPECT_EQ(status(path, "w+++++++", "UTF-8"), 31);
  stream file = open_stream(where, "/dev/null", "w", "UTF-8");
  where.reset(); // a stream may outlive its locale, but not work without it
  EXPECT_EQ(status(path, "w", "UTF-8"), 38);
  EXPECT_EQ(STATUS_OF(file.write(u"x", error)), 38);
  EXPECT_EQ(STATUS_OF(file.close(error)), 38);
  EXPECT_FALSE(file);
  EXPECT_EQ(STATUS_OF(file.write(u"x", error)), 37);
  EXPECT_NE(access(path.c_str(), F_OK), 0) << "no file is made";
}

TEST(Refusals, OfTheSystemKeepItsNumber) {
  const locale where = default_locale();
  std::u16string line;
  std::error_code cause;
  EXPECT_FALSE(open_stream(where, "/", "r", "UTF-8").read_line(line, cause));
  EXPECT_EQ(cause, std::errc::is_a_directory);
  stream full = open_stream(where, "/dev/full", "w", "UTF-8");
  full.write(u"x", cause);
  full.close(cause);
  EXPECT_EQ(cause, std::errc::no_space_on_device);
  EXPECT_FALSE(open_stream(where, "/nowhere/x", "r", "UTF-8", cause));
  EXPECT_EQ(cause, std::errc::no_such_file_or_directory);
}

} // namespace
