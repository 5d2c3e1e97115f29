// language.hpp - language ids, their names, and the table of known locales.
#ifndef NLS2_LANGUAGE_HPP
#define NLS2_LANGUAGE_HPP

#include "nls2/detail/common.hpp"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>

namespace nls2 {

// A language id of localeMap: a country number in the upper 16 bits (ISO 3166 numeric, with
// exceptions), the library's language number in the lower 16. Any number may be held.
class language_id {
public:
  constexpr explicit language_id(std::uint32_t number) noexcept : number_(number) {}

  // The id of the first record with this short POSIX name ("de_DE"), case and all; 0 on failure.
  // Errors: NLS2_ERR_INVALID_PARAMETER for a name that no record has, and for one with a null
  // inside; 31 (too_long) from 132 bytes up.
  static language_id from_name(std::string_view name, std::error_code &error) noexcept {
    const detail::terminated<sizeof LocaleMapEntry::shortName> text(name);
    std::int32_t status = text.status();
    const std::uint32_t number =
        status == 0 ? NLS2_LanguageIDFromShortPosixName(text.c_str(), &status) : 0;
    error = make_status(status);
    return language_id(number);
  }
#if NLS2_HAS_EXCEPTIONS
  static language_id from_name(std::string_view name) {
    return detail::or_throw("cannot find the language",
                            [=](std::error_code &error) { return from_name(name, error); });
  }
#endif

  constexpr std::uint32_t number() const noexcept { return number_; }
  constexpr std::uint16_t country() const noexcept {
    return static_cast<std::uint16_t>(number_ >> 16);
  }
  constexpr std::uint16_t language() const noexcept {
    return static_cast<std::uint16_t>(number_ & 0xFFFF);
  }
  friend constexpr bool operator==(language_id, language_id) noexcept = default;

private:
  std::uint32_t number_;
};

// The records of localeMap, in the order in which they are searched. Some ids and names stand in
// two of them.
inline std::span<const LocaleMapEntry> locale_records() noexcept {
  return {localeMap, NLS2_LOCALE_MAP_RECORDS - 1};
}

// The first record with a language id; null when there is none.
inline const LocaleMapEntry *find_record(language_id language) noexcept {
  return NLS2_GetLocaleMapEntry(language.number());
}

// The short POSIX name of a language id ("en_US"), from the first record that has it; static text.
// Empty on failure. Error: NLS2_ERR_LANGUAGE_NOT_FOUND.
inline std::string_view name_of(language_id language, std::error_code &error) noexcept {
  const LocaleMapEntry *record = find_record(language);
  error = make_status(record != nullptr ? 0 : NLS2_ERR_LANGUAGE_NOT_FOUND);
  return record != nullptr ? record->shortName : std::string_view();
}

// The ISO 639 code of a language id ("en"). Empty on failure. Error: NLS2_ERR_LANGUAGE_NOT_FOUND.
inline std::string iso_language(language_id language, std::error_code &error) {
  char name[sizeof LocaleMapEntry::localeName] = "";
  error = make_status(NLS2_GetLanguageName(language.number(), name, sizeof name));
  return error ? std::string() : std::string(name);
}

// Whether the name of a record of localeMap occurs anywhere in a POSIX locale name such as
// "en_US.UTF-8" (NLS2_SetLocaleFromNative). "C" stands for ICU's default locale. False for a name
// with a null inside and for more than 131 bytes.
inline bool is_known_locale(std::string_view posix_name) noexcept {
  const detail::terminated<sizeof LocaleMapEntry::localeName> text(posix_name);
  return text.status() == 0 && NLS2_SetLocaleFromNative(text.c_str(), 0) == 0;
}

#if NLS2_HAS_EXCEPTIONS
inline std::string_view name_of(language_id language) {
  return detail::or_throw("cannot name the language",
                          [=](std::error_code &error) { return name_of(language, error); });
}

inline std::string iso_language(language_id language) {
  return detail::or_throw("cannot name the language",
                          [=](std::error_code &error) { return iso_language(language, error); });
}
#endif

} // namespace nls2

#endif
