// Streams on real files: bytes on disk, lines and units read back, the edges.

#include "support/live_locale.h"

#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <unicode/ustdio.h>
#include <unistd.h>
#include <vector>

namespace {

using namespace std::string_literals;

class Streams : public testing::Test {
protected:
  ~Streams() override { unlink(path.c_str()); }

  UFILE *open(const char *permissions, const char *encoding) {
    return NLS2_OpenStream(live.get(), path.c_str(), permissions, encoding);
  }
  void close(UFILE *stream) { EXPECT_EQ(NLS2_CloseStream(live.get(), stream), 0); }
  void write(const std::string &bytes) { std::ofstream(path, std::ios::binary) << bytes; }
  std::string bytes() {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  }
  // All lines, read into a buffer of this capacity; a | ends each.
  std::u16string lines(UFILE *stream, int32_t capacity = 80) {
    std::u16string all;
    const auto buffer = std::make_unique<UChar[]>(static_cast<std::size_t>(capacity));
    while (const UChar *line = NLS2_Fgets(live.get(), stream, buffer.get(), capacity)) {
      EXPECT_EQ(line, buffer.get());
      all.append(line).append(u"|");
    }
    return all;
  }
  // Reads of `length` units each until one reads nothing, joined.
  std::u16string units(UFILE *stream, int32_t length) {
    std::u16string all;
    const auto buffer = std::make_unique<UChar[]>(static_cast<std::size_t>(length));
    int32_t got = 0;
    while ((got = NLS2_ReadString(live.get(), stream, buffer.get(), length)) > 0) {
      all.append(buffer.get(), static_cast<std::size_t>(got));
    }
    EXPECT_EQ(got, 0);
    return all;
  }

  const support::LiveLocale live{1208, "de_DE"};
  const std::string path = testing::TempDir() + "nls2_io_" + std::to_string(getpid());
};

TEST_F(Streams, EveryEncodingHasItsBytesAndReadsBack) {
  const std::string little = "G\0\xFC\0\xDF\0\n\0j\0a\0"s;
  const std::string big = "\0G\0\xFC\0\xDF\0\n\0j\0a"s;
  const std::pair<const char *, std::string> cases[] = {
      {"UTF-8", "G\xC3\xBC\xC3\x9F\nja"},
      {"UTF-16", U_IS_BIG_ENDIAN ? "\xFE\xFF" + big : "\xFF\xFE" + little}, // the machine's order
      {"UTF-16LE", little},
      {"UTF-16BE", big},
      {"ISO-8859-1", "G\xFC\xDF\nja"},
      {"ibm-1141", "\xC7\xD0\xA1\x25\x91\x81"},
      {"ibm-1141,swaplfnl", "\xC7\xD0\xA1\x15\x91\x81"},
  };
  for (const auto &[encoding, expected] : cases) {
    SCOPED_TRACE(encoding);
    UFILE *stream = open("w+", encoding);
    ASSERT_NE(stream, nullptr);
    EXPECT_EQ(NLS2_Fputs(live.get(), u"G\u00FC\u00DF", stream), 4);
    EXPECT_EQ(NLS2_WriteString(live.get(), u"ja, not more", 2, stream), 2);
    NLS2_Fflush(stream);
    EXPECT_EQ(bytes(), expected);
    NLS2_Frewind(stream);
    EXPECT_EQ(lines(stream), u"G\u00FC\u00DF\n|ja|");
    NLS2_Frewind(stream);
    EXPECT_EQ(lines(stream, 3), u"G\u00FC|\u00DF\n|ja|");
    NLS2_Frewind(stream);
    EXPECT_EQ(units(stream, 3), u"G\u00FC\u00DF\nja");
    close(stream);
    EXPECT_EQ(bytes(), expected);
  }
}

TEST_F(Streams, WhatForeignFilesReadAs) {
  const struct {
    const char *reason;
    const char *encoding;
    std::string bytes;
    std::u16string lines;
  } cases[] = {
      {"big-endian mark", "UTF-16", "\xFE\xFF\0A\0\n"s, u"A\n|"},
      {"little-endian mark", "UTF-16", "\xFF\xFE\x41\0\n\0"s, u"A\n|"},
      {"no mark: big-endian", "UTF-16", "\0A\0B"s, u"AB|"},
      {"a mark that the encoding does not know", "UTF-16LE", "\xFF\xFE\x41\0"s, u"\uFEFFA|"},
      {"nor does UTF-8", "UTF-8", "\xEF\xBB\xBFx", u"\uFEFFx|"},
      {"every line end", "UTF-8", "a\r\nb\rc\n\nd\vi\fj\xC2\x85g\xE2\x80\xA8h\xE2\x80\xA9i",
       u"a\r\n|b\r|c\n|\n|d\v|i\f|j\u0085|g\u2028|h\u2029|i|"},
      {"EBCDIC new line", "ibm-37", "\xC1\x15\xC2\x25\xC3", u"A\u0085|B\n|C|"},
      {"bytes that do not convert", "UTF-8", "a\xFFx\xE2\x82", u"a\uFFFDx\uFFFD|"},
      {"empty file", "UTF-8", "", u""},
  };
  for (const auto &c : cases) {
    write(c.bytes);
    UFILE *stream = open("r", c.encoding);
    ASSERT_NE(stream, nullptr) << c.reason;
    EXPECT_EQ(lines(stream), c.lines) << c.reason;
    close(stream);
  }
}

TEST_F(Streams, LongTextsGoThroughWhole) {
  std::u16string text;
  for (int i = 0; i < 3000; ++i) {
    text += u"a\U0001F600";
  }
  UFILE *stream = open("w", "UTF-8");
  EXPECT_EQ(NLS2_WriteString(live.get(), text.data(), 4501, stream), 4501);
  EXPECT_EQ(NLS2_WriteString(live.get(), text.c_str() + 4501, -1, stream), 4499)
      << "the rest, null-terminated, from the second half of a pair on";
  close(stream);
  EXPECT_EQ(bytes().size(), 3000U * 5);
  for (const int32_t length : {1, 2, 7, 1024, 20000}) {
    stream = open("r", "UTF-8");
    EXPECT_EQ(units(stream, length), text) << length;
    close(stream);
  }
}

TEST_F(Streams, WhatDoesNotOpen) {
  EXPECT_EQ(open("r", "UTF-8"), nullptr) << "no such file";
  write("text");
  const NLS2_Locale unlisted{};
  EXPECT_EQ(NLS2_OpenStream(&unlisted, path.c_str(), "w", "UTF-8"), nullptr);
  EXPECT_EQ(open("?", "UTF-8"), nullptr) << "no such mode";
  EXPECT_EQ(open("r", "no-such-encoding"), nullptr);
  EXPECT_EQ(bytes(), "text") << "none of these may touch the file";
  EXPECT_EQ(open("w", "no-such-encoding"), nullptr);
  EXPECT_EQ(bytes(), "") << "as nls2.h warns";
}

} // namespace
