// Streams on a real file: its bytes, what they read back as, and what does not open.

#include "support/call_cases.h"

#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <unicode/ustdio.h>
#include <unistd.h>

namespace {

const std::string path = testing::TempDir() + "nls2_io_" + std::to_string(getpid());

std::string bytes() {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

TEST(Streams, WriteAndReadBack) {
  const support::LiveLocale live(1208, "de_DE");
  for (const auto &[encoding, expected] : {std::pair("UTF-8", "G\xC3\xBC\xC3\x9F\nja"),
                                           {"ibm-1141", "\xC7\xD0\xA1\x25\x91\x81"},
                                           {"ibm-1141,swaplfnl", "\xC7\xD0\xA1\x15\x91\x81"}}) {
    UFILE *stream = NLS2_OpenStream(live.get(), path.c_str(), "w+", encoding);
    ASSERT_NE(stream, nullptr) << encoding;
    EXPECT_EQ(NLS2_Fputs(live.get(), u"G\u00FC\u00DF", stream), 4);
    EXPECT_EQ(NLS2_WriteString(live.get(), u"ja, not more", 2, stream), 2);
    NLS2_Fflush(stream);
    EXPECT_EQ(bytes(), expected);
    NLS2_Frewind(stream);
    UChar units[5] = {};
    EXPECT_EQ(NLS2_Fgets(live.get(), stream, units, 3), units);
    EXPECT_EQ(units, std::u16string(u"G\u00FC")) << "as much as has room";
    EXPECT_EQ(NLS2_ReadString(live.get(), stream, units, 4), 4);
    EXPECT_EQ(units, std::u16string(u"\u00DF\nja"));
    EXPECT_EQ(NLS2_CloseStream(live.get(), stream), 0);
  }
}

TEST(Streams, WhatDoesNotOpenLeavesTheFileAlone) {
  const support::LiveLocale live(1208);
  const NLS2_Locale unlisted{};
  std::ofstream(path) << "text";
  EXPECT_EQ(NLS2_OpenStream(&unlisted, path.c_str(), "w", "UTF-8"), nullptr);
  EXPECT_EQ(NLS2_OpenStream(live.get(), path.c_str(), "?", "UTF-8"), nullptr) << "no such mode";
  EXPECT_EQ(NLS2_OpenStream(live.get(), path.c_str(), "r", "no-such-encoding"), nullptr);
  EXPECT_EQ(bytes(), "text");
  unlink(path.c_str());
}

} // namespace
