// Streams on real files: lines of every end, and who owns the file.

#include "nls2.hpp"

#include <fstream>
#include <gtest/gtest.h>
#include <unistd.h>

namespace {

using namespace std::string_literals;
using namespace nls2;

class Streams : public testing::Test {
protected:
  ~Streams() override { unlink(path.c_str()); }
  stream open(std::string_view mode, std::string_view encoding = "UTF-8") {
    return open_stream(where, path, mode, encoding);
  }

  locale where = default_locale();
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
      file.read_line(line);
      std::array<char16_t, 3> next{}; // what a carriage return made it look at comes first
      EXPECT_TRUE(file.read(std::span(next).first(1)) == 1 && next[0] == end[0]);
      EXPECT_TRUE(file.read(next) == 3 && next[end.size() - 1] == 0xD83D);
    }
  }
}

TEST_F(Streams, OwnTheirFile) {
  stream file = open("w", "ibm-1141");
  file.write_line(u"Gr\u00FC\u00DFe");
  file.flush();
  std::string bytes;
  std::getline(std::ifstream(path, std::ios::binary), bytes, '\0');
  EXPECT_EQ(bytes, "\xC7\x99\xD0\xA1\x85\x25");
  stream other(std::move(file));
  other = std::move(*&other);
  other.reset(other.get());
  EXPECT_TRUE(!file && other);
}

} // namespace
