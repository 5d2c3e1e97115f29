// code_page.hpp - code pages as a type, their names, and ICU's converters for them.
#ifndef NLS2_CODE_PAGE_HPP
#define NLS2_CODE_PAGE_HPP

#include "nls2/detail/common.hpp"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <unicode/ucnv.h>

namespace nls2 {

// A code page by its number: a CCSID, or one of the private numbers from 57352 up that
// NLS2_MapCodepageIdToName lists. Any number may be held; a converter shows whether it opens.
class code_page {
public:
  constexpr explicit code_page(std::int32_t number) noexcept : number_(number) {}

  // The code page of a converter name, by ICU's rules for names ("ibm-1141", "UTF-8", any case):
  // ICU's CCSID for it, or else the number of ccsidMap. Number 0 on failure. Errors: 4
  // (unknown_code_page) for a name that ICU does not know; NLS2_ERR_INVALID_PARAMETER for an empty
  // name, one with a null inside and a converter that has no number; 31 (too_long) from 256 bytes
  // up; ICU's.
  //
  // Surprise: 874, 932, 936, 949 and 950 open Windows tables, so the number of "ibm-932" is 932,
  // but code page 932 is Shift-JIS. To open exactly what a name says, use ucnv_open().
  static code_page from_name(std::string_view name, std::error_code &error) noexcept;
#if NLS2_HAS_EXCEPTIONS
  static code_page from_name(std::string_view name);
#endif

  constexpr std::int32_t number() const noexcept { return number_; }
  friend constexpr bool operator==(code_page, code_page) noexcept = default;

private:
  std::int32_t number_;
};

inline constexpr code_page utf8_page{1208};

namespace detail {
inline void close_converter(UConverter *owned) noexcept { ucnv_close(owned); }
} // namespace detail

// Owns an open converter of ICU's. Move-only; may own none.
class converter : public detail::owner<UConverter, detail::close_converter> {
public:
  using owner::owner;
};

// Opens the converter of a code page (NLS2_MapCodepageIdToName); null on failure. Errors: 4
// (unknown_code_page) for a number that this ICU has no converter for; ICU's.
//
// Surprise: ICU reads -37 as 37.
inline converter open_converter(code_page page, std::error_code &error) noexcept {
  std::int32_t two_nulls = 0;
  std::int32_t status = 0;
  converter opened(NLS2_MapCodepageIdToName(page.number(), &two_nulls, &status));
  error = make_status(status);
  return opened;
}

// ICU's canonical name of a code page's converter: "UTF-8" for 1208. Empty on failure. Errors:
// open_converter's; 2 (not_found) where ICU has no name.
inline std::string name_of(code_page page, std::error_code &error) {
  char name[UCNV_MAX_CONVERTER_NAME_LENGTH] = "";
  error = make_status(NLS2_GetCodepageName(page.number(), name, sizeof name));
  return error ? std::string() : std::string(name);
}

// The records of ccsidMap: Windows names and their code pages, in the order in which they are
// searched. A search finds a name inside a longer one, so from_name() asks ICU first.
inline std::span<const CcsidMapEntry> windows_names() noexcept {
  return {ccsidMap, NLS2_CCSID_MAP_RECORDS - 1};
}

inline code_page code_page::from_name(std::string_view name, std::error_code &error) noexcept {
  const detail::terminated<256> text(name);
  if (name.empty() || text.status() != 0) {
    error = make_status(name.empty() ? NLS2_ERR_INVALID_PARAMETER : text.status());
    return code_page(0);
  }
  UErrorCode failure = U_ZERO_ERROR;
  const converter opened(ucnv_open(text.c_str(), &failure));
  std::int32_t number = opened ? ucnv_getCCSID(opened.get(), &failure) : 0;
  std::int32_t status = failure;
  if (status <= 0 && number == 0) {
    number = static_cast<std::int32_t>(NLS2_MapWindowsNameToCCSID(text.c_str(), &status));
  }
  error = make_status(status);
  return code_page(error ? 0 : number);
}

#if NLS2_HAS_EXCEPTIONS
inline code_page code_page::from_name(std::string_view name) {
  return detail::or_throw("cannot find the code page's number",
                          [=](std::error_code &error) { return from_name(name, error); });
}

inline converter open_converter(code_page page) {
  return detail::or_throw("cannot open a converter for the code page",
                          [=](std::error_code &error) { return open_converter(page, error); });
}

inline std::string name_of(code_page page) {
  return detail::or_throw("cannot name the code page",
                          [=](std::error_code &error) { return name_of(page, error); });
}
#endif

} // namespace nls2

#endif
