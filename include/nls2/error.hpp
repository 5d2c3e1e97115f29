// error.hpp - statuses of nls2.h as std::error_code, with messages in plain words.
#ifndef NLS2_ERROR_HPP
#define NLS2_ERROR_HPP

#include "nls2.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <string>
#include <system_error>
#include <type_traits>

#if defined(__cpp_exceptions)
#define NLS2_HAS_EXCEPTIONS 1
#else
#define NLS2_HAS_EXCEPTIONS 0
#endif

namespace nls2 {

// What a program may want to tell apart, whichever status says it: `error == errc::no_memory` holds
// for 32 and for ICU's 7. The statuses of each stand beside it.
enum class errc {
  no_memory = 1,      // 32, 7
  invalid_argument,   // 36, 37, 1, 8
  invalid_locale,     // 38
  language_not_found, // 39
  unknown_code_page,  // 4: this ICU has no converter for the number or name
  no_room,            // 15
  too_long,           // 31
  invalid_text,       // 10, 11, 12, 18, 19
  not_found,          // 2: no bundle, or no such key in it
  wrong_type          // 17: the key names no string
};

// The category of this library's errors. The value of an error code is the status: the library's
// own (NLS2_ERR_*) or ICU's UErrorCode. message(status) has the form "the destination is too small
// (U_BUFFER_OVERFLOW_ERROR)", for warnings and for statuses that nobody gives too.
NLS2_API const std::error_category &category() noexcept;

// The category of errc.
NLS2_API const std::error_category &condition_category() noexcept;

inline std::error_condition make_error_condition(errc condition) noexcept {
  return {static_cast<int>(condition), condition_category()};
}

// The error code of a status. ICU's warnings, which are negative, are successes.
inline std::error_code make_status(std::int32_t status) noexcept {
  return {status > 0 ? status : 0, category()};
}

#if NLS2_HAS_EXCEPTIONS
// What the throwing functions throw. Its code is of category(), but for failures of the system to
// open, read or write a file: those have errno and std::generic_category().
class NLS2_API error : public std::system_error {
public:
  error(std::error_code code, const char *what) : std::system_error(code, what) {}
  error(std::int32_t status, const char *what) : error(make_status(status), what) {}

  // The status of nls2.h, or errno (see above).
  std::int32_t status() const noexcept { return code().value(); }
};
#endif

namespace detail {

struct status_row {
  std::int32_t status;
  const char *name; // as u_errorName() has it in the newest ICU
  const char *words;
};

inline constexpr std::array<status_row, 37> status_rows{{
    {0, "U_ZERO_ERROR", "success"},
    {1, "U_ILLEGAL_ARGUMENT_ERROR", "an argument is not valid"},
    {2, "U_MISSING_RESOURCE_ERROR", "the resource is missing"},
    {3, "U_INVALID_FORMAT_ERROR", "the data has the wrong format"},
    {4, "U_FILE_ACCESS_ERROR", "ICU has no such converter or data file"},
    {5, "U_INTERNAL_PROGRAM_ERROR", "ICU has an internal error"},
    {6, "U_MESSAGE_PARSE_ERROR", "the message cannot be parsed"},
    {7, "U_MEMORY_ALLOCATION_ERROR", "out of memory"},
    {8, "U_INDEX_OUTOFBOUNDS_ERROR", "an index is out of bounds"},
    {9, "U_PARSE_ERROR", "the text cannot be parsed"},
    {10, "U_INVALID_CHAR_FOUND", "a character has no counterpart in the code page"},
    {11, "U_TRUNCATED_CHAR_FOUND", "the text ends inside a character"},
    {12, "U_ILLEGAL_CHAR_FOUND", "the bytes are not valid in the code page"},
    {13, "U_INVALID_TABLE_FORMAT", "a conversion table is damaged"},
    {14, "U_INVALID_TABLE_FILE", "a conversion table is missing"},
    {15, "U_BUFFER_OVERFLOW_ERROR", "the destination is too small"},
    {16, "U_UNSUPPORTED_ERROR", "the operation is not supported"},
    {17, "U_RESOURCE_TYPE_MISMATCH", "the resource has another type"},
    {18, "U_ILLEGAL_ESCAPE_SEQUENCE", "an escape sequence is not valid"},
    {19, "U_UNSUPPORTED_ESCAPE_SEQUENCE", "an escape sequence is not supported"},
    {20, "U_NO_SPACE_AVAILABLE", "there is no room to shape Arabic letters"},
    {21, "U_CE_NOT_FOUND_ERROR", "a collation element is missing"},
    {22, "U_PRIMARY_TOO_LONG_ERROR", "a primary collation weight is too long"},
    {23, "U_STATE_TOO_OLD_ERROR", "the saved state is too old"},
    {24, "U_TOO_MANY_ALIASES_ERROR", "a resource has too many aliases, perhaps in a circle"},
    {25, "U_ENUM_OUT_OF_SYNC_ERROR", "a collection changed while it was read"},
    {26, "U_INVARIANT_CONVERSION_ERROR", "a character is not an invariant one"},
    {27, "U_INVALID_STATE_ERROR", "the object is not in a state for this operation"},
    {28, "U_COLLATOR_VERSION_MISMATCH", "the versions of the collation data do not match"},
    {29, "U_USELESS_COLLATOR_ERROR", "the collator has options, but no rules"},
    {30, "U_NO_WRITE_PERMISSION", "the data is read-only"},
    {31, "U_INPUT_TOO_LONG_ERROR", "the input is too long"},
    {NLS2_ERR_NO_MEMORY, "NLS2_ERR_NO_MEMORY", "out of memory"},
    {NLS2_ERR_INVALID_OPTION, "NLS2_ERR_INVALID_OPTION", "the options name no action"},
    {NLS2_ERR_INVALID_PARAMETER, "NLS2_ERR_INVALID_PARAMETER",
     "an argument is not valid, or a name is unknown"},
    {NLS2_ERR_INVALID_LOCALE, "NLS2_ERR_INVALID_LOCALE", "no live locale object"},
    {NLS2_ERR_LANGUAGE_NOT_FOUND, "NLS2_ERR_LANGUAGE_NOT_FOUND", "the language id is unknown"},
}};

inline std::string status_message(const char *words, const char *name) {
  std::string message(words);
  return message.append(" (").append(name).append(")");
}

// The condition that a status stands for; 0 for one without.
constexpr int condition_of(std::int32_t status) noexcept {
  switch (status) {
  case NLS2_ERR_NO_MEMORY:
  case U_MEMORY_ALLOCATION_ERROR:
    return static_cast<int>(errc::no_memory);
  case NLS2_ERR_INVALID_OPTION:
  case NLS2_ERR_INVALID_PARAMETER:
  case U_ILLEGAL_ARGUMENT_ERROR:
  case U_INDEX_OUTOFBOUNDS_ERROR:
    return static_cast<int>(errc::invalid_argument);
  case NLS2_ERR_INVALID_LOCALE:
    return static_cast<int>(errc::invalid_locale);
  case NLS2_ERR_LANGUAGE_NOT_FOUND:
    return static_cast<int>(errc::language_not_found);
  case U_FILE_ACCESS_ERROR:
    return static_cast<int>(errc::unknown_code_page);
  case U_BUFFER_OVERFLOW_ERROR:
    return static_cast<int>(errc::no_room);
  case 31: // U_INPUT_TOO_LONG_ERROR, which ICU 66 has no name for
    return static_cast<int>(errc::too_long);
  case U_INVALID_CHAR_FOUND:
  case U_TRUNCATED_CHAR_FOUND:
  case U_ILLEGAL_CHAR_FOUND:
  case U_ILLEGAL_ESCAPE_SEQUENCE:
  case U_UNSUPPORTED_ESCAPE_SEQUENCE:
    return static_cast<int>(errc::invalid_text);
  case U_MISSING_RESOURCE_ERROR:
    return static_cast<int>(errc::not_found);
  case U_RESOURCE_TYPE_MISMATCH:
    return static_cast<int>(errc::wrong_type);
  default:
    return 0;
  }
}

class NLS2_API status_category final : public std::error_category {
public:
  const char *name() const noexcept override { return "nls2"; }

  std::string message(int status) const override {
    const auto *row = std::find_if(status_rows.begin(), status_rows.end(),
                                   [=](const status_row &each) { return each.status == status; });
    if (row != status_rows.end()) {
      return status_message(row->words, row->name);
    }
    const char *icu_name = u_errorName(static_cast<UErrorCode>(status));
    if (*icu_name == '[') { // "[BOGUS UErrorCode]"
      return status_message("unknown status", std::to_string(status).c_str());
    }
    return status_message(status < 0 ? "a warning of ICU" : "an error of ICU", icu_name);
  }

  // Those of std::errc that say the same: `error == std::errc::not_enough_memory`.
  std::error_condition default_error_condition(int status) const noexcept override {
    switch (static_cast<errc>(condition_of(status))) {
    case errc::no_memory:
      return std::errc::not_enough_memory;
    case errc::invalid_argument:
      return std::errc::invalid_argument;
    case errc::no_room:
      return std::errc::no_buffer_space;
    case errc::too_long:
      return std::errc::value_too_large;
    case errc::invalid_text:
      return std::errc::illegal_byte_sequence;
    default:
      return {status, *this};
    }
  }
};

class NLS2_API status_conditions final : public std::error_category {
public:
  const char *name() const noexcept override { return "nls2 condition"; }

  // The words of the first status of the condition.
  std::string message(int condition) const override {
    const auto *row =
        std::find_if(status_rows.begin(), status_rows.end(), [=](const status_row &each) {
          return condition_of(each.status) == condition;
        });
    return condition != 0 && row != status_rows.end() ? row->words : "unknown condition";
  }

  bool equivalent(const std::error_code &code, int condition) const noexcept override {
    return code && code.category() == category() && condition_of(code.value()) == condition;
  }
};

} // namespace detail

inline const std::error_category &category() noexcept {
  static const detail::status_category instance;
  return instance;
}

inline const std::error_category &condition_category() noexcept {
  static const detail::status_conditions instance;
  return instance;
}

} // namespace nls2

template <>
struct std::is_error_condition_enum<nls2::errc> : std::true_type {};

#endif
