// error.hpp - statuses as std::error_code, and the two ways to receive them.
#ifndef NLS2_ERROR_HPP
#define NLS2_ERROR_HPP

#include "nls2/detail/common.hpp"

#include <cstdint>
#include <string>
#include <string_view>
#include <system_error>

namespace nls2 {
inline namespace NLS2_MODE {

// Conditions that a program may want to distinguish, whatever status reports them: `error ==
// errc::no_memory` holds for 32 and for ICU's 7. Each lists its statuses; the first is its value.
enum class errc : std::int32_t {
  no_memory = NLS2_ERR_NO_MEMORY,                   // 32, 7
  invalid_argument = NLS2_ERR_INVALID_PARAMETER,    // 37, 36, 1, 8
  invalid_locale = NLS2_ERR_INVALID_LOCALE,         // 38
  language_not_found = NLS2_ERR_LANGUAGE_NOT_FOUND, // 39
  unknown_code_page = U_FILE_ACCESS_ERROR, // 4: ICU has no converter for the number or name
  no_room = U_BUFFER_OVERFLOW_ERROR,       // 15
  too_long = detail::too_long,             // 31
  invalid_text = U_ILLEGAL_CHAR_FOUND,     // 12, 10, 11, 18, 19
  bad_field = NLS2F_ERR_FIELD,             // 40: other problems of a field
  not_found = U_MISSING_RESOURCE_ERROR,    // 2: no bundle, or no such key in it
  wrong_type = U_RESOURCE_TYPE_MISMATCH    // 17: the key's value is not a string
};

namespace detail {

struct status_row {
  std::int32_t status;
  const char *name;
  const char *words;
};

// The statuses that functions here report; ICU has more. No call of ICU's u_errorName(), which
// would bind programs to a version of ICU.
inline constexpr status_row status_rows[] = {
    {0, "U_ZERO_ERROR", "success"},
    {1, "U_ILLEGAL_ARGUMENT_ERROR", "an argument is not valid"},
    {2, "U_MISSING_RESOURCE_ERROR", "the resource is missing"},
    {4, "U_FILE_ACCESS_ERROR", "ICU has no such converter or data file"},
    {7, "U_MEMORY_ALLOCATION_ERROR", "out of memory"},
    {10, "U_INVALID_CHAR_FOUND", "the code page lacks a character"},
    {11, "U_TRUNCATED_CHAR_FOUND", "the text ends inside a character"},
    {12, "U_ILLEGAL_CHAR_FOUND", "the bytes are not valid in the code page"},
    {15, "U_BUFFER_OVERFLOW_ERROR", "the output is too small"},
    {16, "U_UNSUPPORTED_ERROR", "the operation is not supported"},
    {17, "U_RESOURCE_TYPE_MISMATCH", "the resource has another type"},
    {31, "U_INPUT_TOO_LONG_ERROR", "the input is too long"},
    {32, "NLS2_ERR_NO_MEMORY", "out of memory"},
    {36, "NLS2_ERR_INVALID_OPTION", "the options are not valid"},
    {37, "NLS2_ERR_INVALID_PARAMETER", "an argument is not valid, or a name is unknown"},
    {38, "NLS2_ERR_INVALID_LOCALE", "the locale object is not live"},
    {39, "NLS2_ERR_LANGUAGE_NOT_FOUND", "the language is unknown"},
    {40, "NLS2F_ERR_FIELD", "the field cannot be translated as its policy requires"},
};

// The value of the errc that holds for a status; the status itself if none does.
constexpr std::int32_t condition_of(std::int32_t status) noexcept {
  switch (status) {
  case U_MEMORY_ALLOCATION_ERROR:
    return NLS2_ERR_NO_MEMORY;
  case NLS2_ERR_INVALID_OPTION:
  case U_ILLEGAL_ARGUMENT_ERROR:
  case U_INDEX_OUTOFBOUNDS_ERROR:
    return NLS2_ERR_INVALID_PARAMETER;
  case U_INVALID_CHAR_FOUND:
  case U_TRUNCATED_CHAR_FOUND:
  case U_ILLEGAL_ESCAPE_SEQUENCE:
  case U_UNSUPPORTED_ESCAPE_SEQUENCE:
    return U_ILLEGAL_CHAR_FOUND;
  default:
    return status;
  }
}

class NLS2_API status_category final : public std::error_category {
public:
  const char *name() const noexcept override { return "nls2"; }

  std::string message(int status) const override {
    for (const status_row &row : status_rows) {
      if (row.status == status) {
        return std::string(row.words).append(" (").append(row.name).append(")");
      }
    }
    return (status < 0 ? "a warning of ICU (" : "a failure of ICU (") + std::to_string(status) +
           ")";
  }

  // The std::errc with the same meaning: `error == std::errc::not_enough_memory`.
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
      return {condition_of(status), *this};
    }
  }

  // Categories are compared by name: a plugin may have an object of its own.
  bool equivalent(const std::error_code &code, int condition) const noexcept override {
    return code && code.category().name() == std::string_view(name()) &&
           condition_of(code.value()) == condition;
  }
};

} // namespace detail

// The category of this library's errors and of errc. The value of an error code is the status of
// the C interfaces. message(status) has the form "the output is too small
// (U_BUFFER_OVERFLOW_ERROR)".
//
// Surprise: a plugin loaded with RTLD_LOCAL may have a category of its own, and then its codes are
// not equal (==) to the program's. Compare codes with errc or std::errc, which always works.
NLS2_API inline const std::error_category &category() noexcept {
  static const detail::status_category instance;
  return instance;
}

inline std::error_condition make_error_condition(errc condition) noexcept {
  return {static_cast<int>(condition), category()};
}

// The error code of a status. ICU's warnings, which are negative, are successes.
inline std::error_code make_status(std::int32_t status) noexcept {
  return {status > 0 ? status : 0, category()};
}

#if NLS2_HAS_EXCEPTIONS
// What a function throws. Its code belongs to category(). If the system cannot open, read or write
// a file, it is errno in std::generic_category().
class NLS2_API error : public std::system_error {
public:
  using std::system_error::system_error;
};
#endif

// The last parameter of every function that can fail: pass a std::error_code, which is cleared
// first, or pass nothing, and a failure throws nls2::error. With -fno-exceptions it must be passed.
class error_ref {
public:
#if NLS2_HAS_EXCEPTIONS
  error_ref() noexcept = default;
#endif
  error_ref(std::error_code &error) noexcept : error_(&error) { error.clear(); }

  // Reports a code: stores or throws it. True if it is clear. `what` and `name` are what failed,
  // and on what, for the exception: "cannot open the code page", "ibm-37".
  bool report(std::error_code code, [[maybe_unused]] std::string_view what,
              [[maybe_unused]] std::string_view name = {}) const {
    if (error_ != nullptr) {
      *error_ = code;
    }
#if NLS2_HAS_EXCEPTIONS
    if (code && error_ == nullptr) {
      throw error(code, std::string(what).append(name.empty() ? "" : " ").append(name));
    }
#endif
    return !code;
  }
  bool report(std::int32_t status, std::string_view what, std::string_view name = {}) const {
    return report(make_status(status), what, name);
  }

private:
  std::error_code *error_ = nullptr;
};

} // namespace NLS2_MODE
} // namespace nls2

template <>
struct std::is_error_condition_enum<nls2::errc> : std::true_type {};

#endif
