// The calls of this room's case files.

#include "support/dispatch.h"

#include <gtest/gtest.h>

namespace {

using support::shown;
using support::Words;

// Input and output are one buffer: the input, its length, where dest is and its size.
template <auto function>
std::string inPlace(const Words &w) {
  int32_t status = 99;
  const int32_t result =
      function(w.object(0), w.text(1) + w.number(3), w.number(4), w.text(1), w.number(2), &status);
  const std::string text = w.text(1) ? std::string(w.text(1), w[1].size()) : "null";
  return shown(result) + ", " + shown(status) + ", " + shown(text);
}

// The lengths of all first bytes, where one differs from that of the byte before.
std::string byteLengths(const Words &w) {
  std::string lengths;
  int32_t before = 0;
  for (int byte = 0; byte <= 0xFF; ++byte) {
    const char alone[] = {static_cast<char>(byte)};
    int32_t status = 99;
    if (const int32_t length = NLS2_ByteLength(w.object(0), alone, &status); length != before) {
      lengths += shown(std::string(alone, 1)) + " " + shown(length) + ", ";
      before = length;
    }
  }
  return lengths;
}

TEST(Convert, Cases) {
  support::expectCases(CASES_FOLDER, {
                                         CALL(NLS2_ConversionRatio),
                                         CALL(NLS2_Strlen),
                                         CALL(NLS2_ByteLength),
                                         {"lengths-by-byte", byteLengths},
                                         CALL(NLS2_StringToDouble),
                                         {"NLS2_StringToUnicode", inPlace<NLS2_StringToUnicode>},
                                         {"NLS2_UnicodeToString", inPlace<NLS2_UnicodeToString>},
                                         CALL(NLS2_toUTF8),
                                         CALL(NLS2_fromUTF8),
                                         CALL(NLS2_toUTF16),
                                         CALL(NLS2_fromUTF16),
                                         CALL(NLS2_TranslateString),
                                     });
}

} // namespace
