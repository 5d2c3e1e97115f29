// locale.hpp - locale objects: a language and a code page.
#ifndef NLS2_LOCALE_HPP
#define NLS2_LOCALE_HPP

#include "nls2/code_page.hpp"
#include "nls2/detail/common.hpp"
#include "nls2/language.hpp"

#include <string_view>

namespace nls2 {

namespace detail {
inline void release_locale(NLS2_Locale *owned) noexcept { NLS2_ReleaseLocale(owned); }
} // namespace detail

// Owns a locale object. Move-only; may own none. Every function that takes one gives
// NLS2_ERR_INVALID_LOCALE for one that owns none, or whose object somebody else gave back.
class locale : public detail::owner<NLS2_Locale, detail::release_locale> {
public:
  using owner::owner;

  // Whether the object is on the list of live ones.
  bool is_live() const noexcept { return NLS2_ValidateLocale(get()) == 0; }

  // The object's code page; 0 on failure.
  code_page page(std::error_code &error) const noexcept {
    std::int32_t status = 0;
    const std::uint32_t number = NLS2_GetLocaleCodepageId(get(), &status);
    error = make_status(status);
    return code_page(static_cast<std::int32_t>(number));
  }

  // The object's language; 0 on failure.
  language_id language(std::error_code &error) const noexcept {
    std::int32_t status = 0;
    const std::uint32_t number = NLS2_GetLocaleNumInfo(get(), NLS2_ATTRIBUTE_LANGUAGE_ID, &status);
    error = make_status(status);
    return language_id(number);
  }

  // The locale's name as ICU has it ("de_DE"), as long as neither the object nor its language
  // changes; empty where the object is not live.
  std::string_view name() const noexcept {
    return is_live() ? std::string_view(get()->icuLocale) : std::string_view();
  }

  // Changes the code page, which is not checked before text is converted. Error:
  // NLS2_ERR_INVALID_PARAMETER for 255, which the C interface takes for "no change".
  void set_page(code_page page, std::error_code &error) noexcept {
    error =
        make_status(page.number() == NLS2_LANGUAGE_ID_END
                        ? NLS2_ERR_INVALID_PARAMETER
                        : set(NLS2_ATTRIBUTE_CODEPAGE, static_cast<std::uint32_t>(page.number())));
  }

  // Changes the language and the name, and leaves the code page. Error:
  // NLS2_ERR_LANGUAGE_NOT_FOUND for an id that localeMap does not hold.
  void set_language(language_id language, std::error_code &error) noexcept {
    error = make_status(is_live() && find_record(language) == nullptr
                            ? NLS2_ERR_LANGUAGE_NOT_FOUND
                            : set(NLS2_ATTRIBUTE_LANGUAGE_ID, language.number()));
  }

#if NLS2_HAS_EXCEPTIONS
  code_page page() const {
    return detail::or_throw("cannot get the code page",
                            [this](std::error_code &error) { return page(error); });
  }
  language_id language() const {
    return detail::or_throw("cannot get the language",
                            [this](std::error_code &error) { return language(error); });
  }
  void set_page(code_page page) {
    detail::or_throw("cannot change the code page",
                     [=, this](std::error_code &error) { set_page(page, error); });
  }
  void set_language(language_id language) {
    detail::or_throw("cannot change the language",
                     [=, this](std::error_code &error) { set_language(language, error); });
  }
#endif

private:
  std::int32_t set(std::uint32_t attribute, std::uint32_t value) noexcept {
    return NLS2_SetLocaleNumInfo(get(), attribute, value, 0);
  }
};

// A new object for the process's default locale and code page, as ICU reports them. Null on
// failure. Errors: NLS2_ERR_NO_MEMORY; NLS2_ERR_INVALID_PARAMETER where localeMap does not hold the
// default locale; the statuses of NLS2_GetCodepageId where the default code page has no number.
inline locale default_locale(std::error_code &error) noexcept {
  std::int32_t status = 0;
  locale made(NLS2_allocateLocale(&status));
  error = make_status(status);
  return made;
}

// A new object for a language and the process's default code page. Null on failure. Errors:
// NLS2_ERR_LANGUAGE_NOT_FOUND for an id that localeMap does not hold; default_locale's, since every
// object starts from the defaults.
inline locale make_locale(language_id language, std::error_code &error) noexcept {
  locale made;
  if (find_record(language) == nullptr) {
    error = make_status(NLS2_ERR_LANGUAGE_NOT_FOUND);
    return made;
  }
  std::int32_t status = 0;
  made.reset(NLS2_GetLocale(language.number(), 0, 0, &status));
  error = make_status(status);
  return made;
}

// A new object for a language and a code page, which is not checked before text is converted. Null
// on failure. Errors: as above; NLS2_ERR_INVALID_PARAMETER for the code pages 0 and 255, which the
// C interface takes for "as it is".
//
// The language is the one asked for with every code page, also with 912, for which NLS2_GetLocale
// may give hr_HR.
inline locale make_locale(language_id language, code_page page, std::error_code &error) noexcept {
  if (page.number() == 0) {
    error = make_status(NLS2_ERR_INVALID_PARAMETER);
    return locale();
  }
  locale made = make_locale(language, error);
  if (!error) {
    made.set_page(page, error);
  }
  if (error) {
    made.reset();
  }
  return made;
}

// How many bytes of the destination's code page to reserve for a byte of the source's
// (NLS2_ConversionRatio). Usually too large, but signatures and shifts back to the initial state
// come on top. 0 on failure. Errors: open_converter's for either code page.
inline int conversion_ratio(const locale &to, const locale &from, std::error_code &error) noexcept {
  std::int32_t status = 0;
  const std::int32_t ratio = NLS2_ConversionRatio(to.get(), from.get(), &status);
  error = make_status(status);
  return error ? 0 : ratio;
}

#if NLS2_HAS_EXCEPTIONS
inline locale default_locale() {
  return detail::or_throw("cannot make a locale object",
                          [](std::error_code &error) { return default_locale(error); });
}

inline locale make_locale(language_id language) {
  return detail::or_throw("cannot make a locale object",
                          [=](std::error_code &error) { return make_locale(language, error); });
}

inline locale make_locale(language_id language, code_page page) {
  return detail::or_throw("cannot make a locale object", [=](std::error_code &error) {
    return make_locale(language, page, error);
  });
}

inline int conversion_ratio(const locale &to, const locale &from) {
  return detail::or_throw("cannot compare the code pages", [&](std::error_code &error) {
    return conversion_ratio(to, from, error);
  });
}
#endif

} // namespace nls2

#endif
