// Pages by their names, and fields that fail or are replaced: what is reported of them.
#include "nls2_fields.h"

#include <gtest/gtest.h>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

namespace {

using namespace std::string_literals;

struct Close {
  void operator()(NLS2F_Page *page) const { NLS2F_ClosePage(page); }
  void operator()(NLS2F_Translator *translator) const { NLS2F_CloseTranslator(translator); }
};
using Page = std::unique_ptr<NLS2F_Page, Close>;

Page openPage(const char *name, int32_t &status) {
  NLS2F_Page *page = nullptr;
  status = NLS2F_OpenPageByName(name, &page);
  return Page(page);
}

TEST(Pages, AreWhatTheirNamesOpen) {
  const struct {
    const char *name;
    const char *answer; // status: number kind states signature ICU's name
  } rows[] = {
      {"ibm-37", "0: 37 1 0 0 ibm-37_P100-1995"},
      {"ibm-37,swaplfnl", "0: 0 1 0 0 ibm-37_P100-1995,swaplfnl"},
      {"ibm-37-s390", "0: 0 1 0 0 ibm-37_P100-1995,swaplfnl"},
      {"cp949", "0: 0 2 0 0 ibm-949_P110-1999"},
      {"949", "-122: 949 2 0 0 windows-949-2000"},
      {"ibm-930", "0: 930 2 1 0 ibm-930_P120-1999"},
      {"utf-16le,version=1", "0: 0 3 0 1 UTF-16LE,version=1"},
      {"25546", "0: 25546 4 1 0 ISO_2022,locale=ko,version=1"},
      {"ibm-1411", "4: ibm-1141, ibm-1201, ibm-13491"},
      {"99999999999", "4: "},
  };
  for (const auto &row : rows) {
    int32_t status = 0;
    const Page page = openPage(row.name, status);
    std::ostringstream answer;
    NLS2F_PageFacts facts{};
    facts.size = sizeof facts;
    char near[192] = "";
    if (NLS2F_PageInfo(page.get(), &facts) == 0) {
      answer << status << ": " << facts.number << ' ' << facts.kind << ' ' << facts.hasStates << ' '
             << facts.hasSignature << ' ' << facts.name;
    } else {
      EXPECT_EQ(NLS2F_NearPageNames(row.name, near, sizeof near), 0);
      answer << status << ": " << near;
    }
    EXPECT_EQ(answer.str(), row.answer) << row.name;
  }
}

TEST(Fields, FailWithPlaceNeedCharacterAndBytes) {
  constexpr int64_t claimed = int64_t{3} << 30; // room, of which 64 bytes are real
  const struct {
    const char *reason, *from, *to;
    int32_t padding, onBad;
    int64_t width;
    std::string field;
    int64_t room;
    const char *answer; // kind offset needed U+code-point: source bytes, or count: output
  } rows[] = {
      // clang-format off
      {"a null", "37", "1208", 1, 0, 0, "\xC1\0\xC2\0"s, 9, "4 1 0 U+0: 0"},
      {"invalid bytes after a null", "1208", "37", 1, 0, 0, "A\0\xE6\x97"s, 9, "1 2 0 U+0: E6 97"},
      {"a character before them that the page lacks", "1208", "37", 1, 0, 0, "\xD0\x96\xE6\x97", 9, "2 0 0 U+416: D0 96"},
      {"one that ICU would drop", "1208", "37", 0, 0, 0, "A\xE2\x80\x8B", 9, "2 1 0 U+200B: E2 80 8B"},
      {"which counts", "1208", "37", 0, 1, 0, "A\xE2\x80\x8B", 9, "1: C1"},
      {"and shows if asked", "1208", "37", 0, 2, 0, "A\xE2\x80\x8B", 9, "1: C1 3F"},
      {"a character of two halves", "57370", "37", 0, 0, 0, "A\xED\xA0\xBD\xED\xB8\x80", 9, "2 1 0 U+1F600: ED A0 BD ED B8 80"},
      {"half of one", "57370", "1208", 0, 0, 0, "A\xED\xB0\x80", 9, "2 1 0 U+DC00: ED B0 80"},
      {"without the shift after it", "930", "37", 0, 0, 0, "\xC1\x0E\x43\x81\x0F\xC1", 9, "2 2 0 U+30A2: 43 81"},
      {"replaced twice, counted once", "970", "16684", 0, 1, 0, "\xAF", 9, "1: FE FE"},
      {"blanks that are replaced", "37", "16684", 3, 1, 0, "\x40\x40", 9, "2: FE FE FE FE"},
      {"a blank that the page lacks", "37", "16684", 3, 0, 0, "\x05\x40", 9, "2 0 0 U+20: 5"},
      {"no room for a character", "37", "1208", 0, 0, 0, "\xC1\x43\xC2", 2, "3 1 4 U+E4: 43"},
      {"nor for a last shift", "1208", "930", 0, 0, 0, "\xE6\x97\xA5", 3, "3 3 4 U+0:"},
      {"nor for kept blanks", "37", "1208", 3, 0, 0, "\xC1\x40\x40", 0, "3 0 3 U+41: C1"},
      {"the width drops them", "37", "1208", 3, 0, 2, "\xC1\x40\x40", 9, "0: 41 20"},
      {"but no text", "37", "1208", 3, 0, 2, "\xC1\xC1\xC1", 9, "3 2 3 U+41: C1"},
      {"no exact fill", "37", "1200", 2, 0, 5, "\xC1", 3, "5 1 4 U+0:"},
      {"half a pair into SCSU", "1200", "57363", 0, 0, 0, "\x4E\x2D\x65\x87\x00\x41\xD8\x3D"s, 9, "1 6 0 U+0: D8 3D"},
      {"Chinese into SCSU without room", "1200", "57363", 0, 0, 0, "\x4E\x2D\x65\x87\x00\x41"s, 3, "3 2 7 U+6587: 65 87"},
      {"a header", "1208", "25546", 0, 0, 0, "A", 9, "0: 1B 24 29 43 41"},
      {"no text, no header", "930", "25546", 0, 0, 0, "\x0E\x0F", 9, "0:"},
      {"more room than ICU takes", "1200", "57363", 0, 0, 0, "\0A\0B\0C"s, claimed, "0: 41 42 43"},
      // clang-format on
  };
  for (const auto &row : rows) {
    int32_t status = 0;
    const Page from = openPage(row.from, status);
    const Page to = openPage(row.to, status);
    const NLS2F_Policy policy = {sizeof policy, row.padding, row.onBad, 0, row.width};
    NLS2F_Translator *opened = nullptr;
    ASSERT_EQ(NLS2F_OpenTranslator(from.get(), to.get(), &policy, &opened), 0);
    const std::unique_ptr<NLS2F_Translator, Close> translator(opened);
    const std::vector<char> out(row.room == claimed ? 64 : static_cast<std::size_t>(row.room));
    int64_t written = 0;
    int64_t replaced = 0;
    NLS2F_Problem problem{};
    problem.size = sizeof problem;
    status =
        NLS2F_Translate(opened, row.field.data(), std::ssize(row.field),
                        const_cast<char *>(out.data()), row.room, &written, &replaced, &problem);
    std::ostringstream answer;
    answer << std::hex << std::uppercase;
    if (status == NLS2F_ERR_FIELD) {
      answer << problem.kind << ' ' << problem.offset << ' ' << problem.needed << " U+"
             << problem.codePoint << ':';
    } else {
      answer << replaced << ':';
    }
    const char *bytes = status == 0 ? out.data() : reinterpret_cast<char *>(problem.bytes);
    for (int64_t i = 0; i < (status == 0 ? written : problem.byteCount); ++i) {
      answer << ' ' << static_cast<unsigned>(static_cast<unsigned char>(bytes[i]));
    }
    EXPECT_EQ(answer.str(), row.answer) << row.reason;
  }
}

} // namespace
