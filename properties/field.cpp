// nls2::field_translator: the table against the general path, room to the byte, and what every
// result promises.

#include "property.h"

#include <map>
#include <nls2.hpp>
#include <tuple>

namespace {

using nls2::code_page;
using nls2::field_policy;
using nls2::field_problem;
using nls2::field_result;
using nls2::field_translator;
using nls2::on_bad;
using nls2::padding;
using property::check;

// Translators live from one input to the next, so that a state left behind shows.
using Key = std::tuple<int32_t, int32_t, int, size_t, int, bool, bool>;
std::map<Key, field_translator> made;

field_translator &translator(code_page from, code_page to, const field_policy &policy) {
  const Key key(from.number(), to.number(), static_cast<int>(policy.padding), policy.width,
                static_cast<int>(policy.bad), policy.use_table, policy.drop_ignorable);
  return made.try_emplace(key, from, to, policy).first->second;
}

struct Answer {
  field_result result;
  std::string bytes;
};

// Into a heap block of exactly `room` bytes.
Answer translated(field_translator &with, const std::string &field, size_t room) {
  const auto source = property::exact(field);
  const property::Output<char> block(room);
  const field_result result =
      with.translate(std::span(source.get(), field.size()), std::span(block.get(), room));
  check(result.written <= room, "no more is written than there is room");
  return {result, std::string(block.get(), result.written)};
}

bool same(const field_result &one, const field_result &two) {
  return one.written == two.written && one.replaced == two.replaced && one.problem == two.problem &&
         one.offset == two.offset && one.source_bytes() == two.source_bytes() &&
         one.code_point == two.code_point && one.needed == two.needed;
}

void checkResult(const Answer &answer, const field_policy &policy, const std::string &field) {
  const field_result &result = answer.result;
  check(result || (result.written == 0 && result.replaced == 0), "a failure writes nothing");
  check(result.offset + result.byte_count <= field.size(), "the bytes are the field's");
  check(result.source_bytes() == std::string_view(field).substr(result.offset, result.byte_count),
        "and stand where it says");
  if (result) {
    check(policy.padding != padding::fill || result.written == policy.width, "filled exactly");
    check(policy.width == 0 || result.written <= policy.width, "no longer than the width");
    check(policy.bad == on_bad::replace || result.replaced == 0, "nothing replaced unasked");
  } else {
    check(policy.bad == on_bad::stop || (result.problem != field_problem::invalid_bytes),
          "what is to be replaced is no problem");
  }
}

// Room to the byte is enough, and a byte less is not.
void checkRoom(field_translator &with, const Answer &answer, const std::string &field) {
  const Answer tight = translated(with, field, answer.bytes.size());
  check(same(tight.result, answer.result) && tight.bytes == answer.bytes, "room to the byte");
  if (!answer.bytes.empty()) {
    const field_result less = translated(with, field, answer.bytes.size() - 1).result;
    check(less.problem == field_problem::no_room && less.written == 0, "a byte too few");
  }
}

// With options 0 the C interface gives the same bytes.
void checkAgainstC(code_page from, code_page to, const Answer &answer, const std::string &field) {
  if (field.empty()) {
    return;
  }
  std::string dest(answer.bytes.size() + 64, '#');
  int32_t consumed = 0;
  int32_t status = 0;
  const int32_t length = NLS2_TranslateString(
      to.number(), dest.data(), static_cast<int32_t>(dest.size()), from.number(), field.data(),
      static_cast<int32_t>(field.size()), &consumed, 0, &status);
  check(status == 0 && dest.substr(0, static_cast<size_t>(length)) == answer.bytes,
        "the bytes of NLS2_TranslateString");
}

field_policy policyFrom(property::Input &input) {
  constexpr padding paddings[] = {padding::as_is, padding::strip, padding::fill,
                                  padding::keep_blanks};
  field_policy policy{.padding = input.oneOf(paddings)};
  const auto width = input.below(21);
  policy.width = policy.padding == padding::fill ? width + 1 : width;
  policy.bad = input.flag() ? on_bad::stop : on_bad::replace;
  policy.drop_ignorable = input.flag();
  return policy;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  property::Input input(data, size);
  const property::Page page = input.page();
  const code_page from(page.number);
  const code_page to(input.page().number);
  field_policy policy = policyFrom(input);
  const std::string field = input.text(page);

  if (made.size() > 2000) {
    made.clear();
  }
  if (std::getenv("FUZZ_SHOW") != nullptr) {
    std::fprintf(stderr, "from %d to %d padding %d width %zu bad %d, %zu bytes\n", from.number(),
                 to.number(), static_cast<int>(policy.padding), policy.width,
                 static_cast<int>(policy.bad), field.size());
  }
  field_translator &fast = translator(from, to, policy);
  const size_t room = fast.max_size(field.size());
  const Answer answer = translated(fast, field, room);
  policy.use_table = false;
  field_translator &general = translator(from, to, policy);
  const Answer slow = translated(general, field, room);
  check(same(answer.result, slow.result) && answer.bytes == slow.bytes, "both paths agree");
  checkResult(answer, policy, field);
  std::string appended = "before";
  const field_result again = fast.translate(field, appended);
  check(same(again, answer.result) && appended == "before" + answer.bytes, "the string form");
  if (!answer.result) {
    check(policy.width != 0 || answer.result.problem != field_problem::no_room,
          "max_size() is enough");
    return 0;
  }
  checkRoom(fast, answer, field);
  checkRoom(general, answer, field);
  if (policy.padding == padding::as_is && policy.bad == on_bad::replace && policy.width == 0 &&
      policy.drop_ignorable) {
    checkAgainstC(from, to, answer, field);
  }
  return 0;
}
