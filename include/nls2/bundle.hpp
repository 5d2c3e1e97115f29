// bundle.hpp - resource bundles and the strings in them.
#ifndef NLS2_BUNDLE_HPP
#define NLS2_BUNDLE_HPP

#include "nls2/detail/common.hpp"
#include "nls2/error.hpp"
#include "nls2/locale.hpp"

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace nls2 {
inline namespace NLS2_MODE {

namespace detail {
inline void close_bundle(UResourceBundle *owned) noexcept { NLS2_ResourceClose(owned); }
} // namespace detail

// Owns a resource bundle of ICU's (<unicode/ures.h>). Move-only; may be empty.
class bundle : public detail::owner<UResourceBundle, detail::close_bundle> {
public:
  using owner::owner;

  // Opens the bundle of a locale. `package` is a directory of .res files, or one and a base name
  // (ures_open). Empty on failure. Errors:
  //
  //   2   not_found: there is no bundle at all, not even for the root
  //   37  invalid_argument: an empty package, or one with a null inside
  //   38  invalid_locale
  //   31  too_long: a package of 4,096 bytes or more
  //   other  ICU's
  //
  // Surprise: the bundle may be that of a parent locale or, for a language without any, of the
  // process's default locale or the root; ures_getLocaleByType(bundle.get(), ULOC_ACTUAL_LOCALE,
  // ...) tells which.
  bundle(std::string_view package, const locale &where, error_ref error NLS2_MAY_OMIT) {
    const detail::terminated<4096> path(package);
    std::int32_t status = path.status();
    if (status == 0) {
      open(path.c_str(), where, status);
    }
    error.report(status, "cannot open the resource bundle", package);
  }

  // The same for ICU's own data.
  explicit bundle(const locale &where, error_ref error NLS2_MAY_OMIT) {
    std::int32_t status = 0;
    open(nullptr, where, status);
    error.report(status, "cannot open ICU's resource bundle of", where.name());
  }

  // The string that the bundle, or a parent of it, holds under a key: UTF-16 whatever the locale's
  // code page, valid until the bundle is closed. Empty on failure. Errors:
  //
  //   2   not_found: there is no such key
  //   17  wrong_type: the key's value is not a string
  //   1   invalid_argument: the bundle is empty
  //   37  invalid_argument: an empty key, or one with a null inside
  //   31  too_long: a key of 256 bytes or more
  [[nodiscard]] std::u16string_view string(std::string_view key,
                                           error_ref error NLS2_MAY_OMIT) const & {
    const detail::terminated<256> text(key);
    std::int32_t status = text.status();
    std::int32_t length = 0;
    const UChar *found =
        status == 0 ? NLS2_GetStringByKey(get(), text.c_str(), &length, &status) : nullptr;
    return error.report(status, "cannot find the string", key)
               ? std::u16string_view(found, static_cast<std::size_t>(length))
               : std::u16string_view();
  }
  std::u16string_view string(std::string_view key, error_ref error NLS2_MAY_OMIT) const && = delete;

private:
  void open(const char *path, const locale &where, std::int32_t &status) noexcept {
    reset(NLS2_ResourceOpen(path, where.get(), &status));
    if (status == U_FILE_ACCESS_ERROR) { // no such file: a bundle, not a code page
      status = U_MISSING_RESOURCE_ERROR;
    }
  }
};

} // namespace NLS2_MODE
} // namespace nls2

#endif
