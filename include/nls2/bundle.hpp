// bundle.hpp - resource bundles and the strings in them.
#ifndef NLS2_BUNDLE_HPP
#define NLS2_BUNDLE_HPP

#include "nls2/detail/common.hpp"
#include "nls2/locale.hpp"

#include <cstdint>
#include <string_view>

namespace nls2 {

namespace detail {
inline void close_bundle(UResourceBundle *owned) noexcept { NLS2_ResourceClose(owned); }
} // namespace detail

// Owns a resource bundle of ICU's (<unicode/ures.h>). Move-only; may own none.
class bundle : public detail::owner<UResourceBundle, detail::close_bundle> {
public:
  using owner::owner;

  // The string that the bundle, or a parent of it, holds under a key: UTF-16 whatever the locale's
  // code page, valid until the bundle is closed. Empty on failure. Errors:
  //
  //   2   not_found: no string under this key
  //   17  wrong_type: the key names no string
  //   1   no bundle is owned
  //   31  too_long: a key of 256 bytes or more
  //   NLS2_ERR_INVALID_PARAMETER  a null inside the key
  std::u16string_view string(std::string_view key, std::error_code &error) const noexcept {
    const detail::terminated<256> text(key);
    std::int32_t status = text.status();
    std::int32_t length = 0;
    const UChar *found =
        status == 0 ? NLS2_GetStringByKey(get(), text.c_str(), &length, &status) : nullptr;
    error = make_status(status);
    return error ? std::u16string_view()
                 : std::u16string_view(found, static_cast<std::size_t>(length));
  }

#if NLS2_HAS_EXCEPTIONS
  std::u16string_view string(std::string_view key) const {
    return detail::or_throw("cannot find the string in the bundle",
                            [&](std::error_code &error) { return string(key, error); });
  }
#endif
};

// Opens the bundle of a locale. `package` is a directory of .res files, or one and a base name
// (ures_open). Null on failure. Errors:
//
//   2   not_found: there is no bundle at all, not even for the root
//   NLS2_ERR_INVALID_LOCALE
//   NLS2_ERR_INVALID_PARAMETER  an empty package, or one with a null inside
//   31  too_long: a package of 4,096 bytes or more
//   other  ICU's
//
// A bundle of a parent of the locale may stand in, for a language without one that of the process's
// default locale before the root: ures_getLocaleByType(bundle.get(), ULOC_ACTUAL_LOCALE, ...) says
// which it is.
inline bundle open_bundle(std::string_view package, const locale &where,
                          std::error_code &error) noexcept {
  const detail::terminated<4096> path(package);
  std::int32_t status = package.empty() ? NLS2_ERR_INVALID_PARAMETER : path.status();
  bundle opened(status == 0 ? NLS2_ResourceOpen(path.c_str(), where.get(), &status) : nullptr);
  error = make_status(status);
  return opened;
}

// The same for ICU's own data.
inline bundle open_bundle(const locale &where, std::error_code &error) noexcept {
  std::int32_t status = 0;
  bundle opened(NLS2_ResourceOpen(nullptr, where.get(), &status));
  error = make_status(status);
  return opened;
}

#if NLS2_HAS_EXCEPTIONS
inline bundle open_bundle(std::string_view package, const locale &where) {
  return detail::or_throw("cannot open the resource bundle", [&](std::error_code &error) {
    return open_bundle(package, where, error);
  });
}

inline bundle open_bundle(const locale &where) {
  return detail::or_throw("cannot open the resource bundle",
                          [&](std::error_code &error) { return open_bundle(where, error); });
}
#endif

} // namespace nls2

#endif
