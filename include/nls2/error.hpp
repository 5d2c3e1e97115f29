// error.hpp - statuses of nls2.h as std::error_code, with messages in words.
#ifndef NLS2_ERROR_HPP
#define NLS2_ERROR_HPP

#include "nls2.h"

#include <cstdint>
#include <string>
#include <system_error>

#if defined(__cpp_exceptions)
#define NLS2_HAS_EXCEPTIONS 1
#else
#define NLS2_HAS_EXCEPTIONS 0
#endif

namespace nls2 {

// The category of this library's errors. An error code's value is the status: the library's own
// (NLS2_ERR_*) or ICU's UErrorCode.
const std::error_category &category() noexcept;

// The error code of a status. Warnings of ICU's, which are negative, are successes.
inline std::error_code make_status(std::int32_t status) noexcept {
  return {status > 0 ? status : 0, category()};
}

#if NLS2_HAS_EXCEPTIONS
// What the throwing functions throw.
class error : public std::system_error {
public:
  error(std::int32_t status, const char *what) : std::system_error(make_status(status), what) {}

  std::int32_t status() const noexcept { return code().value(); }
};
#endif

namespace detail {

class status_category final : public std::error_category {
public:
  const char *name() const noexcept override { return "nls2"; }
  std::string message(int status) const override {
    return u_errorName(static_cast<UErrorCode>(status));
  }
};

} // namespace detail

inline const std::error_category &category() noexcept {
  static const detail::status_category instance;
  return instance;
}

} // namespace nls2

#endif
