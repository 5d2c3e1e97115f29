// What the C++ interface refuses: with which status, and in which words.

#include "nls2.hpp"
#include "nls2/bundle.hpp"
#include "nls2/stream.hpp"
#include "support/probe.h"

#include <gtest/gtest.h>
#include <unistd.h>

namespace {

using namespace std::string_literals;
using namespace nls2;

// The status that a call leaves in `error`.
#define STATUS_OF(...)                                                                             \
  [&](std::error_code error) {                                                                     \
    static_cast<void>(__VA_ARGS__);                                                                \
    return error.value();                                                                          \
  }(std::error_code(99, category()))

// The message of the exception that a call throws, without that of its status.
template <class Call>
std::string whatOf(Call call) {
  try {
    static_cast<void>(call());
    return "nothing";
  } catch (const error &thrown) {
    const std::string what = thrown.what();
    return what.substr(0, what.rfind(": " + thrown.code().message()));
  }
}

// A plugin may have a category object of its own.
struct OtherCategory : std::error_category {
  const char *name() const noexcept override { return "nls2"; }
  std::string message(int /*status*/) const override { return ""; }
} otherCategory;

TEST(Refusals, AreStatusesWithWordsAndConditions) {
  EXPECT_EQ(category().message(15), "the output is too small (U_BUFFER_OVERFLOW_ERROR)");
  for (const detail::status_row &row : detail::status_rows) {
    EXPECT_TRUE(row.status == 40 || std::string(row.name) == nls2_status_name(row.status));
  }
  const std::tuple<errc, std::errc, std::vector<int>> rows[] = {
      {errc::no_memory, std::errc::not_enough_memory, {7, 32}},
      {errc::invalid_argument, std::errc::invalid_argument, {1, 8, 36, 37}},
      {errc::no_room, std::errc::no_buffer_space, {15}},
      {errc::invalid_text, std::errc::illegal_byte_sequence, {10, 11, 12, 18, 19}}};
  for (const auto &[condition, standard, statuses] : rows) {
    for (int status = -1; status < 42; ++status) {
      const std::error_code code = make_status(status);
      const bool same = std::find(statuses.begin(), statuses.end(), status) != statuses.end();
      EXPECT_EQ(code == condition, same) << status;
      EXPECT_EQ(std::error_code(status, otherCategory) == condition, same) << status;
      EXPECT_EQ(code == standard, same) << status;
    }
  }
}

TEST(Refusals, NameWhatTheyRefuse) {
  const locale where(language_id("de"), 1208);
  const std::string unknown = whatOf([] { return code_page("ibm-1411"); });
  EXPECT_EQ(unknown.find("cannot open the code page ibm-1411 (similar: ibm-"), 0U) << unknown;
  EXPECT_EQ(whatOf([] { return language_id("xx"); }), "cannot find the language xx");
  EXPECT_EQ(whatOf([&] { return bundle("/no", where); }), "cannot open the resource bundle /no");
  EXPECT_EQ(whatOf([&] { return stream(where, "/no/x", "r", "UTF-8"); }), "cannot open /no/x");
  const std::string bad =
      whatOf([] { return translate(code_page(1208), code_page(37), "\u0416"); });
  EXPECT_EQ(bad.find("offset 0: the character U+0416"), 0U) << bad;
}

TEST(Refusals, OfArguments) {
  const code_page utf8(1208);
  const interpose::Held before = interpose::held();
  EXPECT_EQ(STATUS_OF(code_page("", error)), 37);
  EXPECT_EQ(STATUS_OF(code_page("cp37\0x"s, error)), 37);
  EXPECT_EQ(STATUS_OF(language_id("de_at", error)), 39);
  EXPECT_EQ(STATUS_OF(name_of(language_id(255), error)), 39);
  EXPECT_EQ(STATUS_OF(locale(language_id(0), 37, error)), 39);
  EXPECT_EQ(STATUS_OF(locale(language_id("de"), 0, error)), 37);
  EXPECT_EQ(STATUS_OF(translator(utf8, utf8, {.width = SIZE_MAX}, error)), 36);
  EXPECT_EQ(interpose::held(), before);
}

TEST(Refusals, OfWhatIsEmpty) {
  const code_page none, utf8(1208);
  EXPECT_EQ(STATUS_OF(translator(utf8, none, {}, error)), 37);
  EXPECT_EQ(STATUS_OF(collator("de", none, {}, error)), 37);
  EXPECT_EQ(STATUS_OF(bundle("x", locale(), error)), 38);
  translator moved;
  std::array<char, 9> out{};
  std::array<std::int64_t, 2> offsets{};
  EXPECT_EQ(moved.translate("x", out).error(), errc::invalid_argument);
  EXPECT_EQ(moved.translate({"x", 1, 1}, out, offsets).status, 37);
  EXPECT_EQ(moved.translate_chunk("x", true, out).status, 37);
  EXPECT_EQ(STATUS_OF(moved.translate("x", error)), 37);
  EXPECT_EQ(STATUS_OF(translator(moved, error)), 37);
  EXPECT_EQ(moved.max_size(9), 0U);
  EXPECT_EQ(STATUS_OF(collator().sort_key("b", error)), 37);
}

TEST(Refusals, OfStreams) {
  const std::string path = testing::TempDir() + "nls2_refused_" + std::to_string(getpid());
  locale where = locale::of_process();
  EXPECT_EQ(STATUS_OF(stream(where, path, "w", "no-such-page", {}, error)), 4);
  std::u16string line;
  EXPECT_EQ(STATUS_OF(stream(where, "/", "r", "UTF-8").read_line(line, error)), EISDIR);
  stream full(where, "/dev/full", "w", "UTF-8");
  full.write(u"x");
  EXPECT_EQ(STATUS_OF((full.close(error), 0)), ENOSPC);
  stream file(where, "/dev/null", "w", "UTF-8");
  where.reset(); // a stream may outlive its locale, but not work without it
  EXPECT_EQ(STATUS_OF(stream(where, path, "w", "UTF-8", {}, error)), 38);
  EXPECT_EQ(STATUS_OF((file.write(u"x", error), 0)), 38);
  EXPECT_NE(access(path.c_str(), F_OK), 0) << "no file is made";
}

} // namespace
