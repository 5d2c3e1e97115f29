// language.hpp - language ids, their names, and the table of known locales.
#ifndef NLS2_LANGUAGE_HPP
#define NLS2_LANGUAGE_HPP

#include "nls2/detail/common.hpp"
#include "nls2/error.hpp"

#include <compare>
#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>

namespace nls2 {
inline namespace NLS2_MODE {

// A language id of localeMap: a country number in the upper 16 bits (ISO 3166 numeric, with
// exceptions), the library's language number in the lower 16. Any number can be stored.
class language_id {
public:
  constexpr explicit language_id(std::uint32_t number) noexcept : number_(number) {}

  // The id of the first record with this short POSIX name ("de_DE"), case and all; 0 on failure.
  // Error: 39 (language_not_found) for any other name.
  explicit language_id(std::string_view name, error_ref error NLS2_MAY_OMIT) : number_(0) {
    const detail::terminated<sizeof LocaleMapEntry::shortName> text(name);
    std::int32_t status = text.status();
    if (status == 0) {
      number_ = NLS2_LanguageIDFromShortPosixName(text.c_str(), &status);
    }
    error.report(status == 0 ? 0 : NLS2_ERR_LANGUAGE_NOT_FOUND, "cannot find the language", name);
  }

  [[nodiscard]] constexpr std::uint32_t number() const noexcept { return number_; }
  [[nodiscard]] constexpr std::uint16_t country() const noexcept {
    return static_cast<std::uint16_t>(number_ >> 16);
  }
  [[nodiscard]] constexpr std::uint16_t language() const noexcept {
    return static_cast<std::uint16_t>(number_ & 0xFFFF);
  }
  friend constexpr auto operator<=>(language_id, language_id) noexcept = default;

private:
  std::uint32_t number_;
};

// The records of localeMap, in the order in which they are searched. Some ids and names are in two
// of them.
[[nodiscard]] inline std::span<const LocaleMapEntry> locale_records() noexcept {
  return {localeMap, NLS2_LOCALE_MAP_RECORDS - 1};
}

// The first record with a language id; null if there is none.
[[nodiscard]] inline const LocaleMapEntry *find_record(language_id language) noexcept {
  return NLS2_GetLocaleMapEntry(language.number());
}

// The short POSIX name of a language id ("en_US"), from the first record that has it; static text.
// Empty on failure. Error: 39 (language_not_found).
[[nodiscard]] inline std::string_view name_of(language_id language, error_ref error NLS2_MAY_OMIT) {
  const LocaleMapEntry *record = find_record(language);
  error.report(record != nullptr ? 0 : NLS2_ERR_LANGUAGE_NOT_FOUND, "cannot name the language",
               std::to_string(language.number()));
  return record != nullptr ? record->shortName : std::string_view();
}

// The ISO 639 code of a language id ("en"). Empty on failure. Error: 39 (language_not_found).
[[nodiscard]] inline std::string iso_language(language_id language, error_ref error NLS2_MAY_OMIT) {
  char name[sizeof LocaleMapEntry::localeName] = "";
  return error.report(NLS2_GetLanguageName(language.number(), name, sizeof name),
                      "cannot name the language", std::to_string(language.number()))
             ? std::string(name)
             : std::string();
}

} // namespace NLS2_MODE
} // namespace nls2

#endif
