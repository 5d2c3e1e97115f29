// bad_text.hpp - what converters do with bytes and characters that do not convert, and where in a
// field they are.
#ifndef NLS2_DETAIL_BAD_TEXT_HPP
#define NLS2_DETAIL_BAD_TEXT_HPP

#include "nls2/field_types.hpp"

#include <algorithm>
#include <span>
#include <unicode/ucnv.h>
#include <unicode/ucnv_cb.h>
#include <unicode/ucnv_err.h>
#include <unicode/utf16.h>

namespace nls2::detail {

inline bool failed(UErrorCode error) noexcept { return error > U_ZERO_ERROR; }

// Pointers into an empty span may be null, which ICU refuses.
inline const char *begin_of(std::span<const char> bytes) noexcept {
  return bytes.data() != nullptr ? bytes.data() : "";
}

// Characters replaced in one field. Bytes that are not valid become U+FFFD, which the destination
// may lack in its turn: such a pair counts once.
struct replacement_count {
  std::size_t decoding = 0;
  std::size_t encoding = 0;
  std::size_t encoding_fffd = 0;

  std::size_t total() const noexcept {
    return decoding + encoding + encoding_fffd - std::min(decoding, encoding_fffd);
  }
};

// Callbacks of a converter that stops, and of one that counts and substitutes. ICU's own would drop
// characters that are ignorable by default (U+00AD, U+200B ...) without a word where the page lacks
// them; these report them like any other.
inline void stop_to_unicode(const void *, UConverterToUnicodeArgs *, const char *, std::int32_t,
                            UConverterCallbackReason, UErrorCode *) noexcept {}
inline void stop_from_unicode(const void *, UConverterFromUnicodeArgs *, const UChar *,
                              std::int32_t, UChar32, UConverterCallbackReason,
                              UErrorCode *) noexcept {}

inline void count_to_unicode(const void *count, UConverterToUnicodeArgs *arguments,
                             const char *bytes, std::int32_t length,
                             UConverterCallbackReason reason, UErrorCode *error) noexcept {
  if (reason <= UCNV_IRREGULAR) {
    ++static_cast<replacement_count *>(const_cast<void *>(count))->decoding;
    UCNV_TO_U_CALLBACK_SUBSTITUTE(nullptr, arguments, bytes, length, reason, error);
  }
}

template <bool drops_ignorable>
void count_from_unicode(const void *count, UConverterFromUnicodeArgs *arguments, const UChar *units,
                        std::int32_t length, UChar32 code_point, UConverterCallbackReason reason,
                        UErrorCode *error) noexcept {
  if (reason <= UCNV_IRREGULAR) {
    auto &counted = *static_cast<replacement_count *>(const_cast<void *>(count));
    ++(code_point == 0xFFFD ? counted.encoding_fffd : counted.encoding);
    if constexpr (drops_ignorable) {
      UCNV_FROM_U_CALLBACK_SUBSTITUTE(nullptr, arguments, units, length, code_point, reason, error);
    } else {
      *error = U_ZERO_ERROR;
      ucnv_cbFromUWriteSub(arguments, 0, error);
    }
  }
}

// A problem at the bytes of the field from `offset` to before `next`.
inline field_result problem_at(field_problem problem, std::span<const char> field,
                               std::size_t offset, std::size_t next) noexcept {
  field_result result = failed_field(problem);
  result.offset = offset;
  const std::size_t count = std::min(next - offset, result.bytes.size());
  std::copy_n(begin_of(field) + offset, count, result.bytes.begin());
  result.byte_count = static_cast<std::uint8_t>(count);
  return result;
}

// The bytes at which a conversion stopped because they are not valid.
inline std::size_t invalid_length(UConverter *from) noexcept {
  std::array<char, 8> bytes = {};
  auto count = static_cast<std::int8_t>(bytes.size());
  UErrorCode error = U_ZERO_ERROR;
  ucnv_getInvalidChars(from, bytes.data(), &count, &error);
  return failed(error) ? 0 : static_cast<std::size_t>(count);
}

// Decodes a field in small pieces and calls `use(unit, offset, next)` with every unit, the place of
// its character's first byte and of the next character's, until it returns false. `consumed` are
// the bytes read by then.
template <class Use>
UErrorCode for_each_unit(UConverter *from, std::span<const char> field, std::size_t &consumed,
                         Use use) noexcept {
  constexpr std::size_t piece = 64;
  const char *const begin = begin_of(field);
  const char *source = begin;
  std::size_t place = 0;
  ucnv_resetToUnicode(from);
  for (;;) {
    std::array<char16_t, piece> units;
    std::array<std::int32_t, piece> offsets;
    const auto start = static_cast<std::size_t>(source - begin);
    char16_t *target = units.data();
    UErrorCode error = U_ZERO_ERROR;
    ucnv_toUnicode(from, &target, target + piece, &source, begin + field.size(), offsets.data(),
                   true, &error);
    const auto count = static_cast<std::size_t>(target - units.data());
    consumed = static_cast<std::size_t>(source - begin);
    const bool stopped = failed(error) && error != U_BUFFER_OVERFLOW_ERROR;
    const std::size_t valid = consumed - (stopped ? invalid_length(from) : 0);
    for (std::size_t i = 0; i < count; ++i) {
      if (offsets[i] >= 0) { // -1: a unit left over from the piece before
        place = start + static_cast<std::size_t>(offsets[i]);
      }
      const auto *after = std::find_if(offsets.data() + i, offsets.data() + count,
                                       [&](std::int32_t other) { return other > offsets[i]; });
      const bool is_last = after == offsets.data() + count;
      if (!use(units[i], place, is_last ? valid : start + static_cast<std::size_t>(*after))) {
        return U_ZERO_ERROR;
      }
    }
    if (error != U_BUFFER_OVERFLOW_ERROR) {
      return error;
    }
  }
}

// The place of a unit of the decoded field, as the place of a problem.
inline field_result problem_at_unit(UConverter *from, std::span<const char> field, std::size_t unit,
                                    field_problem problem) noexcept {
  field_result found = failed_field(problem);
  std::size_t consumed = 0;
  for_each_unit(from, field, consumed, [&](char16_t, std::size_t offset, std::size_t next) {
    if (unit-- != 0) {
      return true;
    }
    found = problem_at(problem, field, offset, next);
    return false;
  });
  ucnv_resetToUnicode(from);
  return found;
}

// Encodes a field unit by unit, to see what fails and where. Leaves both converters reset.
class field_examiner {
public:
  field_examiner(UConverter *from, UConverter *to, std::span<const char> field) noexcept
      : from_(from), to_(to), field_(field) {}

  // The first bad byte or character of the first `text_units` units or, where they convert, the
  // first that does not fit in `room` bytes; no problem where all is well.
  field_result examine(std::size_t text_units, std::size_t room) noexcept {
    ucnv_resetFromUnicode(to_);
    std::size_t consumed = 0;
    UErrorCode error = U_ZERO_ERROR;
    const UErrorCode decoding = for_each_unit(
        from_, field_, consumed, [&](char16_t unit, std::size_t offset, std::size_t next) {
          if (text_units-- == 0) {
            return false;
          }
          encode(&unit, 1, error);
          note(error, room, offset, next);
          if (U16_IS_LEAD(unit)) { // which fails with the next unit, if that is no trail
            lead_offset_ = offset;
            lead_next_ = next;
          }
          return !failed(error);
        });
    if (failed(decoding)) {
      note_invalid_bytes(consumed);
    } else if (!failed(error)) {
      encode(u"", 0, error); // closes shift states
      note(error, room, field_.size(), field_.size());
      found_.needed = found_ ? 0 : total_;
    }
    ucnv_resetToUnicode(from_);
    ucnv_resetFromUnicode(to_);
    return found_;
  }

private:
  void encode(const char16_t *unit, std::size_t count, UErrorCode &error) noexcept {
    std::array<char, 64> bytes;
    char *target = bytes.data();
    ucnv_fromUnicode(to_, &target, target + bytes.size(), &unit, unit + count, nullptr, count == 0,
                     &error);
    total_ += static_cast<std::size_t>(target - bytes.data());
  }

  void note(UErrorCode error, std::size_t room, std::size_t offset, std::size_t next) noexcept {
    if (failed(error)) {
      const char32_t character = invalid_character();
      found_ = U16_IS_LEAD(character)
                   ? problem_at(field_problem::not_in_page, field_, lead_offset_, lead_next_)
                   : problem_at(field_problem::not_in_page, field_, offset, next);
      found_.code_point = character;
    } else if (total_ > room && found_) {
      found_ = problem_at(field_problem::no_room, field_, offset, next);
    }
  }

  char32_t invalid_character() const noexcept {
    std::array<UChar, 8> units = {};
    auto count = static_cast<std::int8_t>(units.size());
    UErrorCode error = U_ZERO_ERROR;
    ucnv_getInvalidUChars(to_, units.data(), &count, &error);
    UChar32 character = 0;
    U16_GET(units.data(), 0, 0, count, character);
    return static_cast<char32_t>(character);
  }

  void note_invalid_bytes(std::size_t consumed) noexcept {
    const std::size_t length = invalid_length(from_);
    found_ = problem_at(field_problem::invalid_bytes, field_, consumed - length, consumed);
  }

  UConverter *from_;
  UConverter *to_;
  std::span<const char> field_;
  field_result found_;
  std::size_t total_ = 0;
  std::size_t lead_offset_ = 0; // of the last lead surrogate
  std::size_t lead_next_ = 0;
};

} // namespace nls2::detail

#endif
