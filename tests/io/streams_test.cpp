// Streams on real files: bytes on disk, lines and units read back, the edges.

#include "support/call_cases.h"

#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <unicode/ustdio.h>
#include <unistd.h>

namespace {

using namespace std::string_literals;

class Streams : public testing::Test {
protected:
  ~Streams() override { unlink(path.c_str()); }

  UFILE *open(const char *permissions, const char *encoding) {
    return NLS2_OpenStream(live.get(), path.c_str(), permissions, encoding);
  }
  std::string bytes() {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  }
  // All lines, read into a buffer of this capacity; a | ends each.
  std::u16string lines(UFILE *stream, int32_t capacity) {
    std::u16string all;
    const auto buffer = support::exact(std::u16string(static_cast<std::size_t>(capacity), u'#'));
    NLS2_Frewind(stream);
    while (const UChar *line = NLS2_Fgets(live.get(), stream, buffer.get(), capacity)) {
      all.append(line).append(u"|");
    }
    return all;
  }
  // Reads of `length` units each until one reads nothing, joined.
  std::u16string units(UFILE *stream, int32_t length) {
    std::u16string all;
    const auto buffer = support::exact(std::u16string(static_cast<std::size_t>(length), u'#'));
    NLS2_Frewind(stream);
    while (const int32_t got = NLS2_ReadString(live.get(), stream, buffer.get(), length)) {
      all.append(buffer.get(), static_cast<std::size_t>(got));
    }
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
    EXPECT_EQ(lines(stream, 80), u"G\u00FC\u00DF\n|ja|");
    EXPECT_EQ(lines(stream, 3), u"G\u00FC|\u00DF\n|ja|");
    EXPECT_EQ(units(stream, 3), u"G\u00FC\u00DF\nja");
    EXPECT_EQ(NLS2_CloseStream(live.get(), stream), 0);
    EXPECT_EQ(bytes(), expected);
  }
}

TEST_F(Streams, WhatDoesNotOpen) {
  EXPECT_EQ(open("r", "UTF-8"), nullptr) << "no such file";
  std::ofstream(path) << "text";
  const NLS2_Locale unlisted{};
  EXPECT_EQ(NLS2_OpenStream(&unlisted, path.c_str(), "w", "UTF-8"), nullptr);
  EXPECT_EQ(open("?", "UTF-8"), nullptr) << "no such mode";
  EXPECT_EQ(open("r", "no-such-encoding"), nullptr);
  EXPECT_EQ(bytes(), "text") << "none of these may touch the file";
  EXPECT_EQ(open("w", "no-such-encoding"), nullptr);
  EXPECT_EQ(bytes(), "") << "as nls2.h warns";
}

} // namespace
