// Customers' names out of EBCDIC records, sorted and greeted in each of two languages.
//
// usage: greet DIRECTORY (of the resource bundles)

#include <nls2.h>

#include <algorithm>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace {

void check(const char *what, int32_t status) {
  if (status > 0) { // negative ones are warnings
    throw std::runtime_error(std::string(what) + ": status " + std::to_string(status));
  }
}

struct Release {
  void operator()(NLS2_Locale *locale) const { NLS2_ReleaseLocale(locale); }
  void operator()(UResourceBundle *bundle) const { NLS2_ResourceClose(bundle); }
};
using Locale = std::unique_ptr<NLS2_Locale, Release>;
using Bundle = std::unique_ptr<UResourceBundle, Release>;

constexpr int32_t utf8 = 1208;

Locale makeLocale(const char *posixName) {
  int32_t status = 0;
  const uint32_t language = NLS2_LanguageIDFromShortPosixName(posixName, &status);
  check(posixName, status);
  Locale locale(NLS2_GetLocale(language, utf8, 0, &status));
  check("NLS2_GetLocale", status);
  return locale;
}

// A field of an international EBCDIC record as UTF-8, without its trailing blanks.
std::string fieldText(std::string_view field) {
  std::string text(field.size() * 3, '\0');
  int32_t consumed = 0;
  int32_t status = 0;
  NLS2_TranslateString(utf8, text.data(), static_cast<int32_t>(text.size()), 500, field.data(),
                       static_cast<int32_t>(field.size()), &consumed, NLS2_STRING_STRIP_TRAILING,
                       &status);
  check("NLS2_TranslateString", status);
  text.resize(text.find('\0')); // the result counts UTF-16 units; the bytes end at the null
  return text;
}

std::string message(const NLS2_Locale *locale, const Bundle &bundle, const char *key) {
  int32_t length = 0;
  int32_t status = 0;
  const UChar *string = NLS2_GetStringByKey(bundle.get(), key, &length, &status);
  check("NLS2_GetStringByKey", status);
  std::string text(static_cast<std::size_t>(length) * 3, '\0');
  const int32_t bytes = NLS2_fromUTF16(locale, string, static_cast<int32_t>(text.size()),
                                       text.data(), length, &status);
  check("NLS2_fromUTF16", status);
  text.resize(static_cast<std::size_t>(bytes));
  return text;
}

bool sortsBefore(const NLS2_Locale *locale, const std::string &left, const std::string &right) {
  int32_t status = 0;
  const int32_t order = NLS2_Strcoll(locale, left.c_str(), -1, right.c_str(), -1, 0, &status);
  check("NLS2_Strcoll", status);
  return order < 0;
}

void greet(const char *posixName, const char *directory, std::vector<std::string> names) {
  const Locale locale = makeLocale(posixName);
  int32_t status = 0;
  const Bundle bundle(NLS2_ResourceOpen(directory, locale.get(), &status));
  check("NLS2_ResourceOpen", status);
  std::sort(names.begin(), names.end(), [&](const std::string &left, const std::string &right) {
    return sortsBefore(locale.get(), left, right);
  });
  for (const std::string &name : names) {
    std::cout << message(locale.get(), bundle, "greeting") << ", " << name << "!\n";
  }
  std::cout << message(locale.get(), bundle, "farewell") << ".\n";
}

} // namespace

int main(int argc, char **argv) {
  if (argc != 2) {
    std::cerr << "usage: greet DIRECTORY\n";
    return 2;
  }
  try {
    const std::vector<std::string> names = {
        fieldText("\xE9\x96\x53\x40\x40\x40\x40\x40\x40\x40"),  // Zoë
        fieldText("\x71\x94\x89\x93\x85\x40\x40\x40\x40\x40"),  // Émile
        fieldText("\xEC\xA9\x93\x85\x94\x40\x40\x40\x40\x40")}; // Özlem
    greet("de_DE", argv[1], names);
    greet("fr_FR", argv[1], names);
    return 0;
  } catch (const std::exception &error) {
    std::cerr << error.what() << '\n';
    return 1;
  }
}
