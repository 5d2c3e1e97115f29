// nls2::translator: one that has learned against one that has not, room to the byte, and what every
// result promises.

#include "property.h"

#include <cstring>
#include <map>
#include <nls2.hpp>
#include <tuple>
#include <unicode/uchar.h>

namespace {

using nls2::code_page;
using nls2::field_policy;
using nls2::field_result;
using nls2::on_bad;
using nls2::padding;
using nls2::problem_kind;
using property::check;

// Translators are kept for later inputs, so that state left behind shows.
using Key = std::tuple<int32_t, int32_t, int, size_t, int>;
std::map<Key, nls2::translator> made;

nls2::translator &translator(int32_t from, int32_t to, const field_policy &policy) {
  const Key key(from, to, static_cast<int>(policy.padding), policy.width,
                static_cast<int>(policy.bad));
  nls2::translator &kept = made[key];
  if (!kept) {
    kept = nls2::translator(code_page(from), code_page(to), policy);
  }
  return kept;
}

struct Answer {
  field_result result;
  std::string bytes;
};

// Into a heap block of exactly `room` bytes.
Answer translated(nls2::translator &with, const std::string &field, size_t room) {
  const auto source = property::exact(field);
  const property::Output<char> block(room);
  const field_result result =
      with.translate(std::span(source.get(), field.size()), std::span(block.get(), room));
  check(result.written <= room, "no more is written than there is room");
  return {result, std::string(block.get(), result.written)};
}

bool same(const field_result &one, const field_result &two) {
  return one.written == two.written && one.replaced == two.replaced && one.status == two.status &&
         std::memcmp(one.problem.get(), two.problem.get(), sizeof(NLS2F_Problem)) == 0;
}

void checkResult(const Answer &answer, const field_policy &policy, const std::string &field) {
  const field_result &result = answer.result;
  check(result || (result.written == 0 && result.replaced == 0), "a failure writes nothing");
  const nls2::problem &found = result.problem;
  check(found.offset() <= field.size() &&
            std::string_view(field).substr(found.offset()).starts_with(found.bytes()),
        "the bytes are the field's");
  if (result) {
    check(policy.padding != padding::fill || result.written == policy.width, "filled exactly");
    check(policy.width == 0 || result.written <= policy.width, "no longer than the width");
    check(policy.bad != on_bad::stop || result.replaced == 0, "nothing replaced unasked");
  } else {
    check(policy.bad == on_bad::stop || found.kind() != problem_kind::invalid_bytes,
          "what is to be replaced is no problem");
  }
}

// Exactly enough room succeeds, and one byte less fails.
void checkRoom(nls2::translator &with, const Answer &answer, const std::string &field) {
  const Answer tight = translated(with, field, answer.bytes.size());
  check(same(tight.result, answer.result) && tight.bytes == answer.bytes, "room to the byte");
  if (!answer.bytes.empty()) {
    const field_result less = translated(with, field, answer.bytes.size() - 1).result;
    check(less.problem.kind() == problem_kind::no_room && less.written == 0, "a byte too few");
  }
}

// NLS2_TranslateString with options 0 writes the same bytes.
void checkAgainstC(int32_t from, int32_t to, const Answer &answer, const std::string &field) {
  if (field.empty()) {
    return;
  }
  std::string dest(answer.bytes.size() + 64, '#');
  int32_t consumed = 0;
  int32_t status = 0;
  const int32_t length =
      NLS2_TranslateString(to, dest.data(), static_cast<int32_t>(dest.size()), from, field.data(),
                           static_cast<int32_t>(field.size()), &consumed, 0, &status);
  check(status == 0 && dest.substr(0, static_cast<size_t>(length)) == answer.bytes,
        "the bytes of NLS2_TranslateString");
}

// With padding: bare ICU converts the text together with every possible number of blanks.
void checkPadding(const property::Page &from, const property::Page &to, const field_policy &policy,
                  const Answer &answer, const std::string &field) {
  std::u16string text = decode(from, field);
  size_t end = text.size();
  size_t blanks = 0;
  for (; end > 0 && (text[end - 1] == 0 || u_isblank(text[end - 1]) != 0); --end) {
    blanks += text[end - 1] != 0 ? 1 : 0;
  }
  text.resize(end);
  if (text.find(u'\0') != text.npos) {
    return check(answer.result.problem.kind() == problem_kind::embedded_null, "a null inside");
  }
  const bool fills = policy.padding == padding::fill;
  blanks = fills ? policy.width : policy.padding == padding::strip ? 0 : blanks;
  for (size_t tried = 0; tried <= blanks; ++tried) {
    const std::u16string padded = text + std::u16string(fills ? tried : blanks - tried, u' ');
    const std::string bytes = encode(to, padded);
    if (fills ? bytes.size() == policy.width : policy.width == 0 || bytes.size() <= policy.width) {
      return check(answer.result && answer.bytes == bytes, "text and blanks as bare ICU has them");
    }
  }
  check(!answer.result, "no number of blanks fits");
}

field_policy policyFrom(property::Input &input) {
  constexpr padding paddings[] = {padding::as_is, padding::strip, padding::fill,
                                  padding::keep_blanks};
  field_policy policy{.padding = input.oneOf(paddings)};
  const auto width = input.below(21);
  policy.width = policy.padding == padding::fill ? width + 1 : width;
  constexpr on_bad actions[] = {on_bad::stop, on_bad::replace, on_bad::replace_visibly};
  policy.bad = input.oneOf(actions);
  return policy;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  property::Input input(data, size);
  const property::Page page = input.page();
  const property::Page target = input.page();
  const int32_t from = page.number;
  const int32_t to = target.number;
  const field_policy policy = policyFrom(input);
  const std::string field = input.text(page);

  if (made.size() > 2000) {
    made.clear();
  }
  nls2::translator &fast = translator(from, to, policy);
  const size_t room = fast.max_size(field.size());
  const Answer answer = translated(fast, field, room);
  nls2::translator fresh(code_page(from), code_page(to), policy);
  const Answer slow = translated(fresh, field, room);
  check(same(answer.result, slow.result) && answer.bytes == slow.bytes, "what it learned is right");
  checkResult(answer, policy, field);
  if (policy.padding != padding::as_is && policy.bad == on_bad::replace) {
    checkPadding(page, target, policy, answer, field);
  }
  std::string appended = "before";
  const field_result again = fast.translate(field, appended);
  check(same(again, answer.result) && appended == "before" + answer.bytes, "the string form");
  if (!answer.result) {
    check(policy.width != 0 || answer.result.problem.kind() != problem_kind::no_room,
          "max_size() is enough");
    return 0;
  }
  checkRoom(fast, answer, field);
  if (policy.padding == padding::as_is && policy.bad == on_bad::replace && policy.width == 0) {
    checkAgainstC(from, to, answer, field);
  }
  return 0;
}
