// collator.hpp - the order of texts by the rules of a language, sort keys, and search.
#ifndef NLS2_COLLATOR_HPP
#define NLS2_COLLATOR_HPP

#include "nls2/bytes.hpp"
#include "nls2/code_page.hpp"
#include "nls2/detail/common.hpp"
#include "nls2/error.hpp"

#include <compare>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace nls2 {
inline namespace NLS2_MODE {

struct collation {
  bool ignore_trailing_blanks = false; // u_isblank: tabs and all space separators
  bool ignore_case = false;            // in find() alone
};

// Where a pattern is in a text: bytes, shifts inside it included.
struct occurrence {
  static constexpr std::size_t nowhere = std::string_view::npos;

  std::size_t position = nowhere;
  std::size_t length = 0;

  explicit operator bool() const noexcept { return position != nowhere; }
};

namespace detail {
inline void close_collator(NLS2F_Collator *owned) noexcept { NLS2F_CloseCollator(owned); }
} // namespace detail

// Compares and searches texts in one code page by the rules of one language, and stays open for the
// next. For one thread at a time. Move-only; an empty one fails with 37 (invalid_argument). Bytes
// that are not valid count as U+FFFD.
class collator : public detail::owner<NLS2F_Collator, detail::close_collator> {
public:
  using owner::owner;

  // `locale` is any of ICU's names ("sv_SE"). Empty on failure. Errors: 37 (invalid_argument) for
  // an empty page or name; 31 (too_long) for a name of 160 bytes or more; 32 (no_memory); ICU's.
  //
  // Surprise: a language without rules of its own, or an unknown one, gets the root's. To refuse
  // unknown languages, look the name up with language_id() first.
  collator(std::string_view locale, const code_page &page, const collation &how NLS2_MAY_OMIT,
           error_ref error NLS2_MAY_OMIT) {
    const detail::terminated<160> name(locale);
    const std::uint32_t options =
        (how.ignore_trailing_blanks ? std::uint32_t{SORT_IGNORETRAILING} : 0) |
        (how.ignore_case ? std::uint32_t{IGNORECASE} : 0);
    NLS2F_Collator *opened = nullptr;
    const std::int32_t status =
        name.status() != 0 ? name.status()
                           : NLS2F_OpenCollator(name.c_str(), page.get(), options, &opened);
    reset(opened);
    error.report(status, "cannot open a collator for", locale);
  }

  // The order of two texts at tertiary strength: case and accents count, punctuation too.
  // Equivalent on failure. Errors: 32 (no_memory); ICU's.
  [[nodiscard]] std::weak_ordering compare(byte_view first, byte_view second,
                                           error_ref error NLS2_MAY_OMIT) {
    std::int32_t order = 0;
    const std::int32_t status =
        NLS2F_Compare(get(), first.data(), detail::to_int64(first.size()), second.data(),
                      detail::to_int64(second.size()), &order);
    return error.report(status, "cannot compare the texts") ? order <=> 0
                                                            : std::weak_ordering::equivalent;
  }

  // A key whose bytes have that order: key1 < key2. For texts that are compared more than once.
  // Empty on failure. Errors: as above.
  [[nodiscard]] std::string sort_key(byte_view text, error_ref error NLS2_MAY_OMIT) {
    std::string key(4 * text.size() + 32, '\0');
    std::int64_t length = 0;
    std::int32_t status = U_BUFFER_OVERFLOW_ERROR;
    for (int i = 0; i < 2 && status == U_BUFFER_OVERFLOW_ERROR; ++i) {
      status = NLS2F_SortKey(get(), text.data(), detail::to_int64(text.size()), key.data(),
                             detail::to_int64(key.size()), &length);
      key.resize(static_cast<std::size_t>(length));
    }
    if (!error.report(status, "cannot make a sort key")) {
      key.clear();
    }
    return key;
  }

  // Where a pattern first occurs in a text, unit for unit in UTF-16; an empty pattern at 0. With
  // ignore_case both are put in lower case first, by the rules of the language. Errors: as above.
  [[nodiscard]] occurrence find(byte_view text, byte_view pattern, error_ref error NLS2_MAY_OMIT) {
    std::int64_t position = -1;
    std::int64_t length = 0;
    const std::int32_t status =
        NLS2F_Find(get(), text.data(), detail::to_int64(text.size()), pattern.data(),
                   detail::to_int64(pattern.size()), &position, &length);
    if (!error.report(status, "cannot search the text") || position < 0) {
      return {};
    }
    return {static_cast<std::size_t>(position), static_cast<std::size_t>(length)};
  }
};

} // namespace NLS2_MODE
} // namespace nls2

#endif
