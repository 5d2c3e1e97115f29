// Streams on real files: bytes on disk, lines and units read back, signatures, the edges.

#include "io/io_fixture.h"

#include <cstring>
#include <unicode/ustdio.h>
#include <vector>

namespace {

using io_test::deadLocale;
using io_test::TempFile;

class Streams : public testing::Test {
protected:
  UFILE *open(const char *permissions, const char *encoding) {
    return NLS2_OpenStream(locale_.get(), file_.path(), permissions, encoding);
  }
  void close(UFILE *stream) { EXPECT_EQ(NLS2_CloseStream(locale_.get(), stream), 0); }

  std::u16string line(UFILE *stream, int32_t capacity = 80) {
    std::vector<UChar> buffer(static_cast<std::size_t>(capacity), u'#');
    const UChar *result = NLS2_Fgets(locale_.get(), stream, buffer.data(), capacity);
    EXPECT_TRUE(result == nullptr || result == buffer.data());
    return result == nullptr ? u"(end)" : std::u16string(result);
  }
  // Reads of `length` units each until one reads nothing, joined.
  std::u16string rest(UFILE *stream, int32_t length) {
    std::u16string all;
    std::vector<UChar> buffer(static_cast<std::size_t>(length));
    int32_t got = 0;
    while ((got = NLS2_ReadString(locale_.get(), stream, buffer.data(), length)) > 0) {
      all.append(buffer.data(), static_cast<std::size_t>(got));
    }
    EXPECT_EQ(got, 0);
    return all;
  }

  const io_test::LocalePointer locale_ = io_test::makeLocale("de_DE");
  const TempFile file_;
};

std::string bytesOf(const char *text, std::size_t length) { return {text, length}; }
#define BYTES(literal) bytesOf(literal, sizeof(literal) - 1)

TEST_F(Streams, EveryEncodingHasItsBytesAndReadsBack) {
  // UTF-16 and UTF-32 are written in the machine's order.
  const std::string marked = U_IS_BIG_ENDIAN ? BYTES("\xFE\xFF\0G\0\xFC\0\xDF\0\n\0j\0a")
                                             : BYTES("\xFF\xFEG\0\xFC\0\xDF\0\n\0j\0a\0");
  const struct {
    const char *encoding;
    std::string bytes;
  } cases[] = {
      {"UTF-8", "G\xC3\xBC\xC3\x9F\nja"},
      {"UTF-16", marked},
      {"UTF-16LE", BYTES("G\0\xFC\0\xDF\0\n\0j\0a\0")},
      {"UTF-16BE", BYTES("\0G\0\xFC\0\xDF\0\n\0j\0a")},
      {"ISO-8859-1", "G\xFC\xDF\nja"},
      {"windows-1252", "G\xFC\xDF\nja"},
      {"ibm-1141", "\xC7\xD0\xA1\x25\x91\x81"},
      {"ibm-1141,swaplfnl", "\xC7\xD0\xA1\x15\x91\x81"},
  };
  for (const auto &c : cases) {
    SCOPED_TRACE(c.encoding);
    UFILE *stream = open("w+", c.encoding);
    ASSERT_NE(stream, nullptr);
    EXPECT_EQ(NLS2_Fputs(locale_.get(), u"G\u00FC\u00DF", stream), 4);
    EXPECT_EQ(NLS2_WriteString(locale_.get(), u"ja, not more", 2, stream), 2);
    NLS2_Fflush(stream);
    EXPECT_EQ(file_.bytes(), c.bytes);
    NLS2_Frewind(stream);
    EXPECT_EQ(line(stream), u"G\u00FC\u00DF\n");
    EXPECT_EQ(line(stream, 2), u"j");
    EXPECT_EQ(line(stream), u"a");
    EXPECT_EQ(line(stream), u"(end)");
    NLS2_Frewind(stream);
    EXPECT_EQ(rest(stream, 3), u"G\u00FC\u00DF\nja");
    close(stream);
    EXPECT_EQ(file_.bytes(), c.bytes);
  }
}

TEST_F(Streams, WhatForeignFilesReadAs) {
  const struct {
    const char *reason;
    const char *encoding;
    std::string bytes;
    std::vector<std::u16string> lines;
  } cases[] = {
      {"big-endian mark", "UTF-16", BYTES("\xFE\xFF\0A\0\n"), {u"A\n"}},
      {"little-endian mark",
       "UTF-16",
       BYTES("\xFF\xFE"
             "A\0\n\0"),
       {u"A\n"}},
      {"no mark: big-endian", "UTF-16", BYTES("\0A\0B"), {u"AB"}},
      {"a mark that the encoding does not know",
       "UTF-16LE",
       BYTES("\xFF\xFE"
             "A\0"),
       {u"\uFEFFA"}},
      {"nor does UTF-8",
       "UTF-8",
       "\xEF\xBB\xBF"
       "A",
       {u"\uFEFFA"}},
      {"every line end",
       "UTF-8",
       "a\r\nb\rc\n\nd\v"
       "e\ff\xC2\x85g\xE2\x80\xA8h\xE2\x80\xA9i",
       {u"a\r\n", u"b\r", u"c\n", u"\n", u"d\v", u"e\f", u"f\u0085", u"g\u2028", u"h\u2029", u"i"}},
      {"EBCDIC new line", "ibm-37", "\xC1\x15\xC2\x25\xC3", {u"A\u0085", u"B\n", u"C"}},
      {"bytes that do not convert",
       "UTF-8",
       "a\xFF"
       "b\xE2\x82",
       {u"a\uFFFDb\uFFFD"}},
      {"empty file", "UTF-8", "", {}},
  };
  for (const auto &c : cases) {
    SCOPED_TRACE(c.reason);
    file_.write(c.bytes);
    UFILE *stream = open("r", c.encoding);
    ASSERT_NE(stream, nullptr);
    for (const std::u16string &expected : c.lines) {
      EXPECT_EQ(line(stream), expected);
    }
    EXPECT_EQ(line(stream), u"(end)");
    close(stream);
  }
}

TEST_F(Streams, LongTextsGoThroughWhole) {
  std::u16string text;
  for (int i = 0; i < 3000; ++i) {
    text += u"a\U0001F600";
  }
  UFILE *stream = open("w", "UTF-8");
  EXPECT_EQ(NLS2_WriteString(locale_.get(), text.data(), 4501, stream), 4501);
  EXPECT_EQ(NLS2_WriteString(locale_.get(), text.c_str() + 4501, -1, stream), 4499)
      << "the rest, null-terminated, from the second half of a pair on";
  close(stream);
  EXPECT_EQ(file_.bytes().size(), 3000U * 5);
  for (const int32_t length : {1, 2, 7, 1024, 20000}) {
    stream = open("r", "UTF-8");
    EXPECT_EQ(rest(stream, length), text) << length;
    close(stream);
  }
}

TEST_F(Streams, WhatDoesNotOpen) {
  EXPECT_EQ(open("r", "UTF-8"), nullptr) << "no such file";
  EXPECT_EQ(NLS2_OpenStream(deadLocale(), file_.path(), "w", "UTF-8"), nullptr);
  EXPECT_FALSE(file_.exists()) << "a dead locale must not touch the file system";
  file_.write("text");
  EXPECT_EQ(open("?", "UTF-8"), nullptr) << "no such mode";
  EXPECT_EQ(open("r", "no-such-encoding"), nullptr);
  EXPECT_EQ(file_.bytes(), "text");
  EXPECT_EQ(open("w", "no-such-encoding"), nullptr);
  EXPECT_EQ(file_.bytes(), "") << "as nls2.h warns";
}

TEST_F(Streams, AnOpenStreamSurvivesADeadLocale) {
  UFILE *stream = open("w+", nullptr);
  ASSERT_NE(stream, nullptr) << "the default encoding";
  UChar buffer[4] = u"abc";
  EXPECT_EQ(NLS2_CloseStream(deadLocale(), stream), NLS2_ERR_INVALID_LOCALE);
  EXPECT_EQ(NLS2_WriteString(deadLocale(), buffer, 3, stream), 0);
  EXPECT_EQ(NLS2_Fputs(deadLocale(), buffer, stream), 0);
  EXPECT_EQ(NLS2_Fputs(locale_.get(), u"x", stream), 2);
  NLS2_Frewind(stream);
  EXPECT_EQ(NLS2_ReadString(deadLocale(), stream, buffer, 3), 0);
  EXPECT_EQ(NLS2_Fgets(deadLocale(), stream, buffer, 4), nullptr);
  EXPECT_STREQ(reinterpret_cast<const char *>(buffer), reinterpret_cast<const char *>(u"abc"));
  close(stream);
  EXPECT_EQ(file_.bytes(), "x\n");
  close(nullptr);
}

TEST(Signatures, Table) {
  const struct {
    std::string bytes;
    int32_t length; // given
    const char *name;
    int32_t signatureLength;
    int32_t status;
  } cases[] = {
      {BYTES("\xFF\xFE\x41\0"), 4, "UTF-16LE", 2, 0},
      {BYTES("\xFF\xFE\0\0"), 4, "UTF-32LE", 4, 0},
      {BYTES("\xFF\xFE\0\0"), 3, "UTF-16LE", 2, 0},
      {BYTES("\xFE\xFF"), 2, "UTF-16BE", 2, 0},
      {BYTES("\0\0\xFE\xFF"), 4, "UTF-32BE", 4, 0},
      {"\xEF\xBB\xBF", -1, "UTF-8", 3, 0},
      {"+/v8-", 5, "UTF-7", 5, 0},
      {"\x0E\xFE\xFF", 3, "SCSU", 3, 0},
      {"\xFB\xEE\x28", 3, "BOCU-1", 3, 0},
      {"\xDD\x73\x66\x73", 4, "UTF-EBCDIC", 4, 0},
      {"plain", 5, "", 0, 0},
      {"\xEF\xBB", 2, "", 0, 0},
      {"", 0, "", 0, 0},
      {"\xFF\xFE", -2, "", -9, U_ILLEGAL_ARGUMENT_ERROR},
  };
  for (const auto &c : cases) {
    int32_t signatureLength = -9;
    int32_t status = -9;
    const char *name =
        NLS2_detectUnicodeSignature(c.bytes.c_str(), c.length, &signatureLength, &status);
    EXPECT_EQ(name != nullptr ? name : std::string(), c.name) << c.name;
    EXPECT_EQ(signatureLength, c.signatureLength) << c.name;
    EXPECT_EQ(status, c.status) << c.name;
  }
}

} // namespace
