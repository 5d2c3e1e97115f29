// nls2 translate on megabytes: order, equality with another implementation, bounded memory.

#include "nls2.h"
#include "tool_runner.h"

#include <fstream>
#include <gtest/gtest.h>
#include <iconv.h>
#include <random>

namespace tools {

namespace {

constexpr std::size_t length = 80;

// EBCDIC records of every byte but the null, with blanks of every kind at their ends.
std::string randomRecords(std::size_t count) {
  std::mt19937 random(20240229);
  std::string all;
  all.reserve(count * length);
  for (std::size_t i = 0; i < count; ++i) {
    const std::size_t text = random() % (length + 1);
    for (std::size_t k = 0; k < length; ++k) {
      const char blanks[] = {'\x40', '\x40', '\x40', '\x41', '\x05'};
      all += k < text ? static_cast<char>(1 + random() % 255) : blanks[random() % 5];
    }
  }
  return all;
}

std::string utf8ByIconv(const std::string &ebcdic) {
  const iconv_t converter = iconv_open("UTF-8", "IBM037");
  std::string out(ebcdic.size() * 3, '\0');
  char *in = const_cast<char *>(ebcdic.data());
  char *to = out.data();
  std::size_t inLeft = ebcdic.size();
  std::size_t outLeft = out.size();
  EXPECT_EQ(iconv(converter, &in, &inLeft, &to, &outLeft), 0U);
  iconv_close(converter);
  out.resize(out.size() - outLeft);
  return out;
}

void trim(std::string &text) {
  for (bool more = true; more && !text.empty();) {
    more = true;
    if (text.back() == ' ' || text.back() == '\t') {
      text.pop_back();
    } else if (text.ends_with("\u00A0")) {
      text.resize(text.size() - 2);
    } else {
      more = false;
    }
  }
}

std::string stripped(const std::string &all) {
  std::string out;
  for (std::size_t at = 0; at < all.size(); at += length) {
    std::string text = utf8ByIconv(all.substr(at, length));
    trim(text);
    out += text + "\n";
  }
  return out;
}

TEST(LargeInput, StrippedRecordsAreAsIconvHasThem) {
  const std::string all = randomRecords(30000);
  const Result result =
      runTool("translate --from 37 --to 1208 --record-length 80 --strip --newline lf", all);
  EXPECT_EQ(result.exitCode, 0) << result.err;
  EXPECT_TRUE(result.out == stripped(all)) << result.out.size();
}

TEST(LargeInput, EveryRecordIsOneCallOfTheLibrary) {
  const std::string all = randomRecords(30000);
  std::string expected;
  for (std::size_t at = 0; at < all.size(); at += length) {
    char dest[200];
    int32_t consumed = 0;
    int32_t status = 0;
    const int32_t written = NLS2_TranslateString(1141, dest, sizeof dest, 37, all.data() + at,
                                                 length, &consumed, NLS2_STRING_FILL, &status);
    ASSERT_EQ(status, 0);
    expected.append(dest, static_cast<std::size_t>(written));
  }
  const Result result =
      runTool("translate --from 37 --to 1141 --record-length 80 --fill --out-length 200", all);
  EXPECT_TRUE(result.out == expected) << result.out.size() << result.err;
}

TEST(LargeInput, PiecesOfAnySizeFromAPipe) {
  const TempDir dir;
  const std::string all = randomRecords(5000);
  RunningTool tool(words("translate --from 37 --to 1208 --record-length 80 --strip --newline lf"),
                   dir.path("out"), dir.path("err"));
  std::size_t size = 1;
  for (std::size_t at = 0; at < all.size(); at += size) {
    size = at * 7 % 3001 + 1;
    ASSERT_TRUE(tool.feed(std::string_view(all).substr(at, size)));
  }
  EXPECT_EQ(tool.wait(), 0);
  EXPECT_TRUE(readFile(dir.path("out")) == stripped(all));
}

std::size_t peakKilobytes(pid_t pid) {
  std::ifstream status("/proc/" + std::to_string(pid) + "/status");
  for (std::string word; status >> word;) {
    if (word == "VmHWM:") {
      std::size_t kilobytes = 0;
      status >> kilobytes;
      return kilobytes;
    }
  }
  return 0;
}

TEST(LargeInput, MemoryStaysUnder32Megabytes) {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
  GTEST_SKIP() << "a sanitizer's own memory counts too";
#endif
  const TempDir dir;
  RunningTool tool(words("translate --from 37 --to 57359 --record-length 80"), "/dev/null",
                   dir.path("err"));
  const std::string megabyte(13107 * length, '\xC1');
  for (int i = 0; i < 64; ++i) {
    ASSERT_TRUE(tool.feed(megabyte));
  }
  const std::size_t peak = peakKilobytes(tool.pid());
  EXPECT_GT(peak, 0U);
  EXPECT_LT(peak, 32U * 1024);
  EXPECT_EQ(tool.wait(), 0);
}

} // namespace

} // namespace tools
