// Numbers of every length and scale go to a field and back as the digits that they are, and whatever
// bytes read as a number can be written and read again.

#include "nls2_fields.h"
#include "property.h"

#include <cstring>

namespace {

using property::check;
using property::exact;
using property::Input;
using property::Output;

NLS2F_Field fieldFrom(Input &input) {
  const bool isAscii = input.flag();
  NLS2F_Field field{};
  field.size = sizeof field;
  field.kind = static_cast<int32_t>(NLS2F_PACKED + input.below(3));
  field.scale = static_cast<int32_t>(input.below(32));
  field.options = static_cast<uint32_t>(input.below(16));
  field.length = static_cast<int64_t>(1 + input.below(32));
  field.zero = isAscii ? '0' : 0xF0;
  field.plus = isAscii ? '+' : 0x4E;
  field.minus = isAscii ? '-' : 0x60;
  field.blank = isAscii ? ' ' : 0x40;
  return field;
}

// How many digits are sure to fit; 0 if there is no such field.
size_t digitsOf(const NLS2F_Field &field) {
  const auto length = static_cast<size_t>(field.length);
  const bool isSeparate = (field.options & NLS2F_SIGN_SEPARATE) != 0;
  const bool hasSign = (field.options & (NLS2F_SIGN_LEADING | NLS2F_SIGN_SEPARATE)) != 0;
  const bool isUnsigned = (field.options & NLS2F_UNSIGNED) != 0;
  if (field.kind == NLS2F_ZONED) {
    const size_t digits = length - (isSeparate ? 1 : 0);
    return hasSign && isUnsigned ? 0 : digits > 31 ? 0 : digits;
  }
  constexpr size_t binary[] = {0, 2, 4, 0, 9, 0, 0, 0, 18};
  return hasSign                      ? 0
         : field.kind == NLS2F_PACKED ? (length <= 16 ? 2 * length - 1 : 0)
                                      : (length <= 8 ? binary[length] : 0);
}

struct Text {
  int32_t status;
  std::string text;
  NLS2F_Problem problem;
};

Text textOf(const NLS2F_Field &field, const std::string &bytes, size_t room) {
  Text answer{};
  answer.problem.size = sizeof answer.problem;
  const Output<char> text(room);
  int64_t written = -1;
  answer.status = NLS2F_NumberToText(&field, exact(bytes).get(), text.get(),
                                     static_cast<int64_t>(room), &written, &answer.problem);
  answer.text.assign(text.get(), static_cast<size_t>(written));
  return answer;
}

int32_t write(const NLS2F_Field &field, const std::string &text, std::string &bytes) {
  const Output<char> out(static_cast<size_t>(field.length));
  const int32_t status =
      NLS2F_TextToNumber(&field, exact(text).get(), std::ssize(text), out.get(), nullptr);
  bytes.assign(out.get(), static_cast<size_t>(field.length));
  return status;
}

void goThereAndBack(Input &input, const NLS2F_Field &field, size_t most) {
  std::string digits;
  for (size_t count = 1 + input.below(most); count > 0; --count) {
    digits += static_cast<char>('0' + input.below(10));
  }
  const size_t first = digits.find_first_not_of('0');
  const bool isZero = first == digits.npos;
  const bool isNegative = (field.options & NLS2F_UNSIGNED) == 0 && input.flag();
  std::string text = isZero ? "" : digits.substr(first);
  const auto scale = static_cast<size_t>(field.scale);
  text.insert(0, text.size() <= scale ? scale + 1 - text.size() : 0, '0');
  text.insert(text.size() - scale, scale != 0 ? "." : "");
  const std::string given = (isNegative ? "-" : input.flag() ? " +" : "\t") + text + " ";
  const std::string expected = (isNegative && !isZero ? "-" : "") + text;
  std::string bytes;
  const int32_t status = write(field, given, bytes);
  const bool looksEmpty = field.kind == NLS2F_BINARY && (field.options & NLS2F_BLANK_EMPTY) != 0 &&
                          bytes.find_first_not_of(static_cast<char>(field.blank)) == bytes.npos;
  check(status == (looksEmpty ? NLS2F_ERR_FIELD : 0), "a number that fits is written");
  if (status == 0) {
    check(textOf(field, bytes, expected.size()).text == expected, "a number comes back");
    const Text less = textOf(field, bytes, expected.size() - 1);
    check(less.problem.needed == std::ssize(expected), "the room that a number needs");
  }
}

} // namespace

int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  Input input(data, size);
  const NLS2F_Field field = fieldFrom(input);
  const size_t most = digitsOf(field);
  std::string bytes = input.bytes(static_cast<size_t>(field.length));
  bytes.resize(static_cast<size_t>(field.length), static_cast<char>(field.zero));
  const Text read = textOf(field, bytes, 34);
  check((most == 0) == (read.status == NLS2_ERR_INVALID_OPTION), "which fields are numbers");
  std::string again;
  if (read.status == 0) {
    check(write(field, read.text, again) == 0, "what was read can be written");
    check(textOf(field, again, 34).text == read.text, "what was read comes back");
  } else if (most != 0) {
    const auto at = static_cast<size_t>(read.problem.offset);
    check(at < bytes.size() && std::memcmp(read.problem.bytes, &bytes[at], 1) == 0,
          "the byte that is to blame");
  }
  if (most != 0) {
    goThereAndBack(input, field, most);
  }
  return 0;
}
