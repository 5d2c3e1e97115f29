// code_page.hpp - code pages as a type, and ICU's converters for them.
#ifndef NLS2_CODE_PAGE_HPP
#define NLS2_CODE_PAGE_HPP

#include "nls2/error.hpp"

#include <cstdint>
#include <unicode/ucnv.h>
#include <utility>

namespace nls2 {

// A code page by its number: a CCSID, or one of the private numbers from 57352 up. Any number may
// be held; whether it opens is seen when a converter is made.
class code_page {
public:
  constexpr explicit code_page(std::int32_t number) noexcept : number_(number) {}

  constexpr std::int32_t number() const noexcept { return number_; }
  friend constexpr bool operator==(code_page, code_page) noexcept = default;

private:
  std::int32_t number_;
};

// Owns an open ICU converter. Move-only; may own none.
class converter {
public:
  constexpr converter() noexcept = default;
  explicit converter(UConverter *owned) noexcept : owned_(owned) {}
  converter(converter &&other) noexcept : owned_(other.release()) {}
  converter &operator=(converter &&other) noexcept {
    reset(other.release());
    return *this;
  }
  ~converter() { reset(); }

  UConverter *get() const noexcept { return owned_; }
  explicit operator bool() const noexcept { return owned_ != nullptr; }
  UConverter *release() noexcept { return std::exchange(owned_, nullptr); }
  void reset(UConverter *owned = nullptr) noexcept {
    if (UConverter *old = std::exchange(owned_, owned); old != nullptr && old != owned) {
      ucnv_close(old);
    }
  }

private:
  UConverter *owned_ = nullptr;
};

// Opens the converter of a code page (NLS2_MapCodepageIdToName). It is null on failure.
inline converter open_converter(code_page page, std::error_code &error) noexcept {
  std::int32_t two_nulls = 0;
  std::int32_t status = 0;
  converter opened(NLS2_MapCodepageIdToName(page.number(), &two_nulls, &status));
  error = make_status(status);
  return opened;
}

#if NLS2_HAS_EXCEPTIONS
inline converter open_converter(code_page page) {
  std::error_code error;
  converter opened = open_converter(page, error);
  if (error) {
    throw nls2::error(error.value(), "cannot open a converter for the code page");
  }
  return opened;
}
#endif

} // namespace nls2

#endif
