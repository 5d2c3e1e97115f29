// field_path.hpp - a field through ICU: the path that is right for every pair of code pages.
#ifndef NLS2_DETAIL_FIELD_PATH_HPP
#define NLS2_DETAIL_FIELD_PATH_HPP

#include "nls2/code_page.hpp"
#include "nls2/detail/bad_text.hpp"
#include "nls2/detail/page_traits.hpp"

#include <algorithm>
#include <cstring>
#include <memory>
#include <new>
#include <unicode/uchar.h>

namespace nls2::detail {

// Two open converters with the policy's callbacks, and a buffer for the text between them. It stays
// where it is made, since ICU's converters point at its count.
//
// The converters are in their initial states whenever a field begins: ICU resets them at the end of
// input that converts, and errors are followed by a reset by hand.
class field_path {
public:
  field_path(code_page from, code_page to, const field_policy &policy,
             std::error_code &error) noexcept
      : policy_(policy), from_(open_converter(from, error)) {
    if (!error) {
      to_ = open_converter(to, error);
    }
    if (!error) {
      error = set_callbacks();
    }
    if (!error && !reserve(usual_units)) {
      error = make_status(NLS2_ERR_NO_MEMORY);
    }
    if (!error) {
      learn_pages();
    }
  }
  field_path(const field_path &) = delete;
  field_path &operator=(const field_path &) = delete;

  const field_policy &policy() const noexcept { return policy_; }
  UConverter *from() const noexcept { return from_.get(); }
  UConverter *to() const noexcept { return to_.get(); }
  std::size_t blank_size() const noexcept { return blank_size_; }

  // The most bytes of the output that the text may take.
  std::size_t limit(std::span<char> out) const noexcept {
    return policy_.width != 0 ? std::min(policy_.width, out.size()) : out.size();
  }

  // The bytes of output that are enough for any field of `bytes` bytes.
  std::size_t max_size(std::size_t bytes) const noexcept {
    const std::size_t units = can_grow_in_units(ucnv_getType(from())) ? 2 * bytes : bytes;
    return (units + 10) * static_cast<std::size_t>(ucnv_getMaxCharSize(to()));
  }

  void translate(std::span<const char> field, std::span<char> out, field_result &result) noexcept {
    if (field.size() > longest_field) {
      result = failed_field(field_problem::too_long);
      return;
    }
    count_ = {};
    policy_.padding == padding::as_is ? straight(field, out, result) : padded(field, out, result);
    result.replaced = result ? count_.total() : 0;
  }

  // Puts after a translated text the blanks that fill the field, or as many as there were.
  void add_blanks(std::size_t blanks, std::span<char> out, field_result &result) const noexcept {
    const bool filling = policy_.padding == padding::fill;
    const std::size_t left = policy_.width != 0 ? policy_.width - result.written : unbounded;
    if ((filling ? left : std::min(blanks, left)) == 0) {
      return;
    }
    if (blank_size_ == 0) {
      result = failed_field(field_problem::not_in_page);
      result.code_point = U' ';
      return;
    }
    const std::size_t fitting = left / blank_size_;
    if (filling && fitting * blank_size_ != left) {
      result = failed_field(field_problem::no_exact_fill, result.written + fitting * blank_size_);
      return;
    }
    const std::size_t bytes = (filling ? fitting : std::min(blanks, fitting)) * blank_size_;
    if (bytes > out.size() - result.written) {
      result = failed_field(field_problem::no_room, result.written + bytes);
      return;
    }
    put_blanks(out.data() + result.written, bytes);
    result.written += bytes;
  }

private:
  static constexpr std::size_t usual_units = 2048;
  static constexpr std::size_t unbounded = static_cast<std::size_t>(-1);

  std::error_code set_callbacks() noexcept {
    const bool stop = policy_.bad == on_bad::stop;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_setToUCallBack(from(), stop ? stop_to_unicode : count_to_unicode, &count_, nullptr,
                        nullptr, &error);
    ucnv_setFromUCallBack(to(),
                          stop                     ? stop_from_unicode
                          : policy_.drop_ignorable ? count_from_unicode<true>
                                                   : count_from_unicode<false>,
                          &count_, nullptr, nullptr, &error);
    return make_status(error);
  }

  void learn_pages() noexcept {
    const UConverterType type = ucnv_getType(to());
    null_is_zero_byte_ = null_is_zero_byte(ucnv_getType(from()));
    blank_depends_on_text_ = blank_depends_on_text(type);
    first_brings_more_ = first_brings_more(type);
    needs_reset_ = needs_reset(type);
    cuts_bytes_ = ucnv_getType(from()) == UCNV_UTF8 && !needs_reset_ &&
                  (policy_.padding == padding::strip || !blank_depends_on_text_);
    units_[0] = units_[1] = u' ';
    std::array<char, 32> written = {};
    UErrorCode error = U_ZERO_ERROR;
    const std::size_t one = encode(1, written, error);
    const std::size_t two = encode(2, written, error);
    blank_size_ = failed(error) ? 0 : std::min(two - one, blank_.size());
    std::copy_n(written.data() + one, blank_size_, blank_.begin());
  }

  void put_blanks(char *target, std::size_t bytes) const noexcept {
    if (blank_size_ == 1) {
      std::memset(target, blank_[0], bytes);
      return;
    }
    for (std::size_t i = 0; i < bytes; i += blank_size_) {
      std::memcpy(target + i, blank_.data(), blank_size_);
    }
  }

  // Makes room for `units` units; what the buffer held is lost.
  bool reserve(std::size_t units) noexcept {
    if (units <= capacity_) {
      return true;
    }
    units_.reset(); // first, so that the two are never held at once
    units_.reset(new (std::nothrow) char16_t[units]);
    capacity_ = units_ ? units : 0;
    return units_ != nullptr;
  }

  // Decodes the whole field into the buffer. Most pages give at most a unit a byte.
  std::size_t decode(std::span<const char> field, UErrorCode &error) noexcept {
    for (std::size_t units = field.size() + 16;; units = 2 * capacity_) {
      if (!reserve(units)) {
        error = U_MEMORY_ALLOCATION_ERROR;
        return 0;
      }
      char16_t *target = units_.get();
      const char *source = begin_of(field);
      error = U_ZERO_ERROR;
      ucnv_toUnicode(from(), &target, target + capacity_, &source, source + field.size(), nullptr,
                     true, &error);
      if (!failed(error)) {
        return static_cast<std::size_t>(target - units_.get());
      }
      ucnv_resetToUnicode(from());
      if (error != U_BUFFER_OVERFLOW_ERROR) {
        return 0;
      }
      count_ = {};
    }
  }

  // Encodes the first `units` units of the buffer; the result is the bytes that they take.
  std::size_t encode(std::size_t units, std::span<char> out, UErrorCode &error) noexcept {
    if (units == 0) {
      return 0; // not even a signature
    }
    char nowhere = 0;
    char *const begin = out.data() != nullptr ? out.data() : &nowhere;
    char *target = begin;
    const char16_t *source = units_.get();
    const char16_t *const end = source + units;
    if (needs_reset_) {
      ucnv_resetFromUnicode(to());
    }
    ucnv_fromUnicode(to(), &target, target + out.size(), &source, end, nullptr, true, &error);
    if (error == U_BUFFER_OVERFLOW_ERROR) { // unless what is left takes no bytes
      std::array<char, 16> more;
      char *rest = more.data();
      UErrorCode again = U_ZERO_ERROR;
      ucnv_fromUnicode(to(), &rest, rest + more.size(), &source, end, nullptr, true, &again);
      error = rest == more.data() ? again : error;
    }
    if (failed(error)) {
      ucnv_resetFromUnicode(to());
    }
    return static_cast<std::size_t>(target - begin);
  }

  // Says what is wrong with the field's first `text` units.
  void explain(UErrorCode cause, std::span<const char> field, std::size_t text, std::size_t room,
               field_result &result) noexcept {
    if (cause == U_MEMORY_ALLOCATION_ERROR) {
      result = failed_field(field_problem::no_memory);
      return;
    }
    result = field_examiner(from(), to(), field).examine(text, room);
    if (result) { // SCSU may take a byte less when it is measured whole
      result = failed_field(field_problem::no_room, room + 1);
    }
  }

  void straight(std::span<const char> field, std::span<char> out, field_result &result) noexcept {
    if (field.empty()) {
      return;
    }
    char nowhere = 0;
    char *const begin = out.data() != nullptr ? out.data() : &nowhere;
    char *target = begin;
    const char *source = field.data();
    UErrorCode error = U_ZERO_ERROR;
    ucnv_convertEx(to(), from(), &target, target + limit(out), &source, source + field.size(),
                   nullptr, nullptr, nullptr, nullptr, needs_reset_, true, &error);
    if (!failed(error)) {
      result.written = static_cast<std::size_t>(target - begin);
      return;
    }
    ucnv_resetToUnicode(from());
    ucnv_resetFromUnicode(to());
    count_ = {};
    const std::size_t units = decode(field, error); // what is left over may take no bytes
    if (failed(error)) {
      explain(error, field, unbounded, limit(out), result);
    } else {
      put_text(field, units, out, result);
    }
  }

  void put_text(std::span<const char> field, std::size_t text, std::span<char> out,
                field_result &result) noexcept {
    UErrorCode error = U_ZERO_ERROR;
    result.written = encode(text, out.first(limit(out)), error);
    if (failed(error)) {
      explain(error, field, text, limit(out), result);
    }
  }

  // Cuts the blanks and nulls off the end of the buffer's units; the result is the blanks.
  std::size_t trim(std::size_t &end) const noexcept {
    std::size_t blanks = 0;
    while (end > 0) {
      const char16_t last = units_[end - 1];
      if (last > 0x20 && last < 0x7F) {
        break;
      }
      UChar32 character = 0;
      std::size_t start = end;
      U16_PREV(units_.get(), 0, start, character);
      const bool blank = character == 0x20 || u_isblank(character);
      if (!blank && character != 0) {
        break;
      }
      blanks += blank ? 1 : 0;
      end = start;
    }
    return blanks;
  }

  // The first null of the text, or `text` where it has none.
  std::size_t find_null(std::span<const char> field, std::size_t text) const noexcept {
    if (null_is_zero_byte_ && std::memchr(begin_of(field), 0, field.size()) == nullptr) {
      return text;
    }
    const char16_t *begin = units_.get();
    return static_cast<std::size_t>(std::find(begin, begin + text, u'\0') - begin);
  }

  // A field of UTF-8 that ends in ASCII is cut where it is, and goes straight through; nothing is
  // to be seen in UTF-16. False where that does not do.
  bool cut_and_straight(std::span<const char> field, std::span<char> out,
                        field_result &result) noexcept {
    std::size_t text = field.size();
    std::size_t blanks = 0;
    for (; text > 0; --text) {
      const char last = field[text - 1];
      if (last != ' ' && last != '\t' && last != '\0') {
        break;
      }
      blanks += last != '\0' ? 1 : 0;
    }
    if (text == 0 || field[text - 1] < 0x21 || field[text - 1] > 0x7E ||
        std::memchr(field.data(), 0, text) != nullptr) {
      return false;
    }
    straight(field.first(text), out, result);
    if (result && policy_.padding != padding::strip) {
      add_blanks(blanks, out, result);
    }
    return true;
  }

  void padded(std::span<const char> field, std::span<char> out, field_result &result) noexcept {
    if (cuts_bytes_ && cut_and_straight(field, out, result)) {
      return;
    }
    UErrorCode error = U_ZERO_ERROR;
    std::size_t text = decode(field, error);
    if (failed(error)) {
      return explain(error, field, unbounded, out.size(), result);
    }
    const std::size_t blanks = trim(text);
    if (const std::size_t null = find_null(field, text); null != text) {
      result = problem_at_unit(from(), field, null, field_problem::embedded_null);
      return;
    }
    const bool bare = policy_.padding == padding::strip ||
                      (policy_.padding == padding::keep_blanks && blanks == 0);
    // Half a pair at the end of the text is one thing before a blank and another at the end of all.
    if (!bare && (blank_depends_on_text_ || (text != 0 && U16_IS_LEAD(units_[text - 1])))) {
      return together(field, text, blanks, out, result);
    }
    put_text(field, text, out, result);
    if (bare || !result) {
      return;
    }
    if (result.written == 0 && first_brings_more_) {
      return together(field, text, blanks, out, result);
    }
    add_blanks(blanks, out, result);
  }

  // The bytes of the text and a number of blanks; decodes again when the buffer must grow.
  std::size_t size_with(std::span<const char> field, std::size_t text, std::size_t blanks,
                        UErrorCode &error) noexcept {
    if (text + blanks > capacity_) {
      count_ = {};
      if (reserve(text + blanks)) {
        decode(field, error);
      } else {
        error = U_MEMORY_ALLOCATION_ERROR;
      }
    }
    if (failed(error)) {
      return 0;
    }
    std::fill_n(units_.get() + text, blanks, u' ');
    const replacement_count before = count_;
    const auto size = ucnv_fromUChars(to(), nullptr, 0, units_.get(),
                                      static_cast<std::int32_t>(text + blanks), &error);
    count_ = before;
    ucnv_resetFromUnicode(to());
    error = error == U_BUFFER_OVERFLOW_ERROR ? U_ZERO_ERROR : error;
    return static_cast<std::size_t>(size);
  }

  // Text and blanks converted as one, for pages in which a blank's bytes depend on what precedes
  // it.
  void together(std::span<const char> field, std::size_t text, std::size_t blanks,
                std::span<char> out, field_result &result) noexcept {
    const bool filling = policy_.padding == padding::fill;
    const std::size_t width = policy_.width != 0 ? policy_.width : unbounded;
    UErrorCode error = U_ZERO_ERROR;
    const std::size_t bare = size_with(field, text, 0, error);
    const std::size_t one = size_with(field, text, 1, error);
    const std::size_t two = size_with(field, text, 2, error); // from here on each takes as much
    if (failed(error) || bare > limit(out)) {
      return explain(failed(error) ? error : U_BUFFER_OVERFLOW_ERROR, field, text, limit(out),
                     result);
    }
    const std::size_t each = std::max<std::size_t>(two - one, 1);
    const std::size_t fitting = one > width ? 0 : 1 + (width - one) / each;
    const std::size_t count = !filling ? std::min(blanks, fitting) : bare == width ? 0 : fitting;
    const std::size_t size = size_with(field, text, count, error);
    if (!failed(error) && ((filling && size != width) || size > out.size())) {
      result = failed_field(
          filling && size != width ? field_problem::no_exact_fill : field_problem::no_room, size);
      return;
    }
    result.written = failed(error) ? 0 : encode(text + count, out, error);
    if (failed(error)) {
      explain(error, field, text, limit(out), result);
    }
  }

  const field_policy policy_;
  converter from_;
  converter to_;
  replacement_count count_;
  std::unique_ptr<char16_t[]> units_;
  std::size_t capacity_ = 0;
  std::array<char, 8> blank_ = {}; // as it is written after other text
  std::size_t blank_size_ = 0;     // 0: the destination page has no blank
  bool needs_reset_ = false;
  bool cuts_bytes_ = false;
  bool null_is_zero_byte_ = false;
  bool blank_depends_on_text_ = false;
  bool first_brings_more_ = false;
};

} // namespace nls2::detail

#endif
