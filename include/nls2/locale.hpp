// locale.hpp - locale objects: a language and the number of a code page.
#ifndef NLS2_LOCALE_HPP
#define NLS2_LOCALE_HPP

#include "nls2/detail/common.hpp"
#include "nls2/error.hpp"
#include "nls2/language.hpp"

#include <cstdint>
#include <string>
#include <string_view>

namespace nls2 {
inline namespace NLS2_MODE {

namespace detail {
inline void release_locale(NLS2_Locale *owned) noexcept { NLS2_ReleaseLocale(owned); }
} // namespace detail

// Owns a locale object, for streams, bundles and the functions of nls2.h. Move-only; may be empty.
// Every function that takes one fails with 38 (invalid_locale) if it is empty or its object was
// released elsewhere.
class locale : public detail::owner<NLS2_Locale, detail::release_locale> {
public:
  using owner::owner;

  // A new object for the process's default locale and code page, as ICU reports them. Empty on
  // failure. Errors: 32 (no_memory); 37 (invalid_argument) if localeMap does not hold the default
  // locale; the statuses of NLS2_GetCodepageId if the default code page has no number.
  //
  // Surprise: a default locale that localeMap does not hold ("nb_NO", "en") makes this fail, and
  // the constructors below as well. Call ICU's uloc_setDefault() first.
  [[nodiscard]] static locale of_process(error_ref error NLS2_MAY_OMIT) {
    std::int32_t status = 0;
    locale made(NLS2_allocateLocale(&status));
    error.report(status, "cannot make a locale object");
    return made;
  }

  // A new object for a language and the process's default code page. Empty on failure. Errors: 39
  // (language_not_found) for an id that localeMap does not hold; of_process()'s.
  explicit locale(language_id language, error_ref error NLS2_MAY_OMIT) { make(language, error); }

  // A new object for a language and a code page, whose number is not checked before text is
  // converted. Empty on failure. Errors: as above; 37 (invalid_argument) for the numbers 0 and 255,
  // which mean "no change" in the C interface.
  //
  // The language is always the requested one, even with code page 912, for which NLS2_GetLocale may
  // return hr_HR.
  locale(language_id language, std::int32_t page, error_ref error NLS2_MAY_OMIT) {
    if (!make(language, error)) {
      return;
    }
    std::error_code failure;
    set_page(page != 0 ? page : std::int32_t{NLS2_LANGUAGE_ID_END}, failure);
    if (failure) {
      reset();
      error.report(failure, cannot_change_page, std::to_string(page));
    }
  }

  // Whether the object is on the list of live ones.
  [[nodiscard]] bool is_live() const noexcept { return NLS2_ValidateLocale(get()) == 0; }

  // The number of the object's code page; 0 on failure.
  [[nodiscard]] std::int32_t page(error_ref error NLS2_MAY_OMIT) const {
    std::int32_t status = 0;
    const std::uint32_t number = NLS2_GetLocaleCodepageId(get(), &status);
    error.report(status, "cannot get the code page");
    return static_cast<std::int32_t>(number);
  }

  // The object's language; 0 on failure.
  [[nodiscard]] language_id language(error_ref error NLS2_MAY_OMIT) const {
    std::int32_t status = 0;
    const std::uint32_t number = NLS2_GetLocaleNumInfo(get(), NLS2_ATTRIBUTE_LANGUAGE_ID, &status);
    error.report(status, "cannot get the language");
    return language_id(number);
  }

  // The locale's name as ICU has it ("de_DE"); empty if the object is not live. The view is valid
  // until the object is released or its language changes.
  [[nodiscard]] std::string_view name() const &noexcept {
    return is_live() ? std::string_view(get()->icuLocale) : std::string_view();
  }
  std::string_view name() const && = delete;

  // Changes the code page, which is not checked before text is converted. Error: 37
  // (invalid_argument) for 255, which means "no change" in the C interface.
  void set_page(std::int32_t page, error_ref error NLS2_MAY_OMIT) {
    error.report(page == NLS2_LANGUAGE_ID_END
                     ? NLS2_ERR_INVALID_PARAMETER
                     : NLS2_SetLocaleNumInfo(get(), NLS2_ATTRIBUTE_CODEPAGE,
                                             static_cast<std::uint32_t>(page), 0),
                 cannot_change_page, std::to_string(page));
  }

  // Changes the language and the name, and leaves the code page. Error: 39 (language_not_found) for
  // an id that localeMap does not hold.
  void set_language(language_id language, error_ref error NLS2_MAY_OMIT) {
    error.report(
        is_live() && find_record(language) == nullptr
            ? NLS2_ERR_LANGUAGE_NOT_FOUND
            : NLS2_SetLocaleNumInfo(get(), NLS2_ATTRIBUTE_LANGUAGE_ID, language.number(), 0),
        "cannot change the language to", std::to_string(language.number()));
  }

private:
  static constexpr const char *cannot_change_page = "cannot set the code page";

  bool make(language_id language, error_ref error) {
    std::int32_t status = NLS2_ERR_LANGUAGE_NOT_FOUND;
    if (find_record(language) != nullptr) {
      reset(NLS2_GetLocale(language.number(), 0, 0, &status));
    }
    return error.report(status, "cannot make a locale object for the language",
                        std::to_string(language.number()));
  }
};

} // namespace NLS2_MODE
} // namespace nls2

#endif
