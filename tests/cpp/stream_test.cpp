// Streams on real files: lines of every end, and what does not convert.

#include "nls2/stream.hpp"

#include <fstream>
#include <gtest/gtest.h>
#include <unistd.h>

namespace {

using namespace std::string_literals;
using namespace nls2;

class Streams : public testing::Test {
protected:
  ~Streams() override { unlink(path.c_str()); }
  stream open(std::string_view mode, std::string_view encoding = "UTF-8", on_bad bad = {}) {
    return {where, path, mode, encoding, bad};
  }
  std::string bytes() { return {std::istreambuf_iterator(std::ifstream(path).rdbuf()), {}}; }

  locale where = locale::of_process();
  const std::string path = testing::TempDir() + "nls2_cpp_" + std::to_string(getpid());
};

TEST_F(Streams, LinesEndWhereTheyEnd) {
  for (const std::size_t length : {1U, 254U, 255U, 256U, 510U}) { // pieces have 255 units
    const std::u16string text(length, u'x');
    const std::u16string lines[] = {text, u"", u"\U0001F600", u"a\0\uFFFF"s + text, u"", text};
    for (const std::u16string_view end :
         {u"\n", u"\v", u"\f", u"\r", u"\r\n", u"\x85", u"\u2028", u"\u2029"}) {
      stream file = open("w+");
      for (const std::u16string &line : lines) {
        file.write(line + (&line == std::end(lines) - 1 ? u"" : std::u16string(end)));
      }
      file.rewind();
      std::u16string line;
      for (const std::u16string &expected : lines) {
        EXPECT_TRUE(file.read_line(line) && line == expected) << length << " " << int{end[0]};
      }
      EXPECT_FALSE(file.read_line(line));
      file.rewind();
      EXPECT_TRUE(file.read_line(line));
      std::array<char16_t, 3> next{}; // what a carriage return made it look at comes first
      EXPECT_TRUE(file.read(std::span(next).first(1)) == 1 && next[0] == end[0]);
      EXPECT_TRUE(file.read(next) == 3 && next[end.size() - 1] == 0xD83D);
    }
  }
}

TEST_F(Streams, CountOrReportWhatTheyReplace) {
  stream first = open("w+", "ibm-1141", on_bad::replace);
  first.write(u"\u00DF\u0416\u200B");
  stream counting = std::move(first);
  counting.write_line(u"\u0416");
  EXPECT_TRUE(!first && counting.replaced() == 3);
  counting.close();
  EXPECT_EQ(bytes(), "\xA1\x3F\x3F\x25");
  std::error_code cause;
  stream strict = open("w+", "ibm-37");
  strict.write(u"\u0416", cause);
  EXPECT_EQ(cause, errc::invalid_text);
  strict.write(u"A"); // reported once
  std::ofstream(path) << "x\n\xFF\n";
  std::u16string line;
  EXPECT_FALSE(open("r").read_line(line, cause));
  EXPECT_EQ(cause, errc::invalid_text);
  stream lossy = open("r", "UTF-8", on_bad::replace);
  EXPECT_TRUE(lossy.read_line(line) && lossy.read_line(line) && line == u"\uFFFD");
}

} // namespace
