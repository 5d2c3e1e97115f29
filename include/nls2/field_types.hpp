// field_types.hpp - what a field translator is asked for, and what it answers.
#ifndef NLS2_FIELD_TYPES_HPP
#define NLS2_FIELD_TYPES_HPP

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace nls2 {

// What becomes of the blanks at a field's end. Blanks are u_isblank characters (tabs and all space
// characters). Under all but as_is they are cut off, and nulls (U+0000) among and after them too;
// the rest is the field's text.
enum class padding {
  as_is,      // the field as it is, blanks and nulls too
  strip,      // the text alone
  fill,       // the text, and blanks (U+0020) up to exactly `width` bytes
  keep_blanks // the text, and as many blanks (U+0020) as there were, or as fit in `width`
};

// What to do with bytes that are not valid in the source page, and with characters that the
// destination page lacks.
enum class on_bad {
  stop,   // the field fails
  replace // the page's substitution character takes their place, and they are counted
};

struct field_policy {
  nls2::padding padding = nls2::padding::as_is;
  std::size_t width = 0; // bytes: of a filled field; of others the most, 0 for no limit
  on_bad bad = on_bad::stop;
  // Under replace, what becomes of characters that are ignorable by default (U+00AD, U+200B ...) and
  // that the destination page lacks: true drops them, as ICU and NLS2_TranslateString do; false puts
  // a substitution character for them too. Both count them.
  bool drop_ignorable = true;
  bool use_table = true; // false: always through ICU. The results are the same, only slower
};

enum class field_problem {
  none,
  invalid_bytes, // bytes that are not valid in the source page
  not_in_page,   // a character that the destination page lacks
  no_room,       // the text takes more than `width`, or than the output has
  embedded_null, // a null inside the text of a field that is to be stripped, filled or kept
  no_exact_fill, // no number of blanks makes the field exactly `width` bytes long
  no_memory,     // the work buffer of a field longer than any before could not be allocated
  too_long       // the field has more than 1 GiB
};

struct field_result {
  std::size_t written = 0;  // bytes of the output, exactly; 0 on failure
  std::size_t replaced = 0; // characters that became substitution characters
  field_problem problem = field_problem::none;

  // On failure. `offset` is in bytes from the field's beginning, of the bytes or the character that
  // failed, or that was the first not to fit.
  std::size_t offset = 0;
  std::array<char, 8> bytes = {}; // the source's bytes there, as far as they have room
  std::uint8_t byte_count = 0;
  char32_t code_point = 0; // of a character that the destination page lacks
  std::size_t needed =
      0; // no_room: the bytes that it takes; no_exact_fill: the next shorter length

  explicit operator bool() const noexcept { return problem == field_problem::none; }
  std::string_view source_bytes() const noexcept { return {bytes.data(), byte_count}; }
};

namespace detail {

inline constexpr std::size_t longest_field = std::size_t{1} << 30;

inline field_result failed_field(field_problem problem, std::size_t needed = 0) noexcept {
  field_result result;
  result.problem = problem;
  result.needed = needed;
  return result;
}

} // namespace detail

} // namespace nls2

#endif
