// A layout is either refused with the place of a word, or has fields in its records that write down
// as the same layout, and whose numbers can be read.

#include "nls2_fields.h"
#include "property.h"

namespace {

using property::check;
using property::exact;
using property::Input;

NLS2F_Layout *open(const std::string &text, uint32_t options) {
  static NLS2F_Page *const page = [] {
    NLS2F_Page *opened = nullptr;
    check(NLS2F_OpenPageByNumber(37, &opened) == 0, "a page opens");
    return opened;
  }();
  NLS2F_Layout *layout = nullptr;
  NLS2F_Problem problem{};
  problem.size = sizeof problem;
  const int32_t status =
      NLS2F_OpenLayout(exact(text).get(), std::ssize(text), page, options, &layout, &problem);
  if (status != 0) {
    size_t line = 0;
    for (int64_t i = 0; i < problem.record; ++i) {
      line = text.find('\n', line) + 1;
      check(line != 0, "the line of a fault");
    }
    check(line + static_cast<size_t>(problem.offset) <= text.size(), "the byte of a fault");
    char words[256];
    check(NLS2F_DescribeProblem(nullptr, &problem, words, sizeof words) == 0 && words[0] != '\0',
          "the words of a fault");
  }
  return layout;
}

// The fields in lines of their own, with names if they have none.
std::string written(const NLS2F_Layout *layout) {
  constexpr const char *kinds[] = {"text", "raw", "hex", "packed", "zoned", "binary"};
  constexpr const char *signs[] = {"", "sign=leading", "sign=trailing-separate",
                                   "sign=leading-separate"};
  int64_t count = 0;
  int64_t length = 0;
  check(NLS2F_LayoutSize(layout, &count, &length) == 0 && count > 0, "a layout has fields");
  std::string text;
  for (int64_t i = 0; i < count; ++i) {
    NLS2F_Field field{};
    field.size = sizeof field;
    check(NLS2F_LayoutField(layout, i, &field) == 0, "a field");
    check(field.first >= 0 && field.length > 0 && field.first + field.length <= length,
          "a field is in the record");
    const auto kind = std::string(kinds[field.kind]);
    const bool isNumber = field.kind >= NLS2F_PACKED;
    text += (*field.name != '\0' ? field.name : "n" + std::to_string(i)) + " " +
            std::to_string(field.first + 1) + "-" + std::to_string(field.first + field.length) +
            " " + (field.page != nullptr ? std::string("page:") + field.page : kind) +
            (isNumber ? "." + std::to_string(field.scale) : "") +
            ((field.options & NLS2F_UNSIGNED) != 0 ? " unsigned " : " ") +
            ((field.options & NLS2F_BLANK_EMPTY) != 0 ? "blank=empty " : "") +
            signs[field.options / NLS2F_SIGN_LEADING] + "\n";
    if (isNumber) {
      const std::string bytes(static_cast<size_t>(field.length), '\x0C');
      char number[34];
      int64_t used = 0;
      check(NLS2F_NumberToText(&field, bytes.data(), number, sizeof number, &used, nullptr) !=
                NLS2_ERR_INVALID_OPTION,
            "a number of the layout");
    }
  }
  return text;
}

// A few fields, most of them right.
std::string textOf(Input &input, uint32_t how) {
  constexpr const char *places[] = {"1", "2", "8", "1-4", "9-16", "17-20", "0", "4-2", "x #"};
  constexpr const char *kinds[] = {"packed.2", "zoned.31", "binary", "packed", "zoned",      "text",
                                   "raw",      "hex",      "text.1", "pack",   "page:ibm-37"};
  constexpr const char *options[] = {
      "unsigned", "blank=empty", "sign=leading", "sign=trailing", "sign=leading-separate", "signed",
      ""};
  const bool isShort = (how & NLS2F_LAYOUT_SHORT) != 0;
  std::string text = input.below(8) == 0 ? input.bytes(SIZE_MAX) : "";
  for (size_t count = 1 + input.below(4); count > 0; --count) {
    text += isShort ? "" : std::string(1, static_cast<char>('a' + input.below(20))) + " ";
    text += input.oneOf(places);
    text += input.flag() ? (isShort ? "=" : " ") + std::string(input.oneOf(kinds)) : "";
    text += input.below(3) == 0 ? (isShort ? ":" : "\t") + std::string(input.oneOf(options)) : "";
    text += count == 1 ? "" : isShort ? ";" : "\n";
  }
  return text;
}

} // namespace

int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  Input input(data, size);
  const auto how = static_cast<uint32_t>(input.below(4));
  const std::string text = textOf(input, how);
  if (NLS2F_Layout *const layout = open(text, how)) {
    const std::string lines = written(layout);
    NLS2F_CloseLayout(layout);
    NLS2F_Layout *const again = open(lines, how & NLS2F_LAYOUT_WRITES);
    check(again != nullptr && written(again) == lines, "a layout written down is the same");
    NLS2F_CloseLayout(again);
  }
  return 0;
}
