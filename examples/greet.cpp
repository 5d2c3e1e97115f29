// Customers' names out of EBCDIC records, sorted and greeted in each of two languages.
//
// usage: greet DIRECTORY (of the resource bundles)

#include <nls2.hpp>

#include <algorithm>
#include <exception>
#include <iostream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace {

// A field of an international EBCDIC record as UTF-8, without its trailing blanks.
std::string fieldText(nls2::field_translator &translator, std::string_view field) {
  std::string text;
  if (!translator.translate(field, text)) {
    throw std::runtime_error("the field is not text of its code page");
  }
  return text;
}

void greet(std::string_view language, std::string_view directory, std::vector<std::string> names) {
  const auto locale = nls2::make_locale(nls2::language_id::from_name(language), nls2::utf8_page);
  const auto bundle = nls2::open_bundle(directory, locale);
  const auto before = [&](const std::string &left, const std::string &right) {
    return nls2::compare(locale, left, right) < 0;
  };
  std::ranges::sort(names, before);
  for (const std::string &name : names) {
    std::cout << nls2::from_utf16(locale, bundle.string("greeting")) << ", " << name << "!\n";
  }
  std::cout << nls2::from_utf16(locale, bundle.string("farewell")) << ".\n";
}

} // namespace

int main(int argc, char **argv) {
  if (argc != 2) {
    std::cerr << "usage: greet DIRECTORY\n";
    return 2;
  }
  try {
    nls2::field_translator translator(nls2::code_page(500), nls2::utf8_page,
                                      {.padding = nls2::padding::strip});
    std::vector<std::string> names;
    for (const char *field : {"\xE9\x96\x53\x40\x40\x40\x40\x40\x40\x40",    // Zoë
                              "\x71\x94\x89\x93\x85\x40\x40\x40\x40\x40",    // Émile
                              "\xEC\xA9\x93\x85\x94\x40\x40\x40\x40\x40"}) { // Özlem
      names.push_back(fieldText(translator, field));
    }
    greet("de_DE", argv[1], names);
    greet("fr_FR", argv[1], names);
    return 0;
  } catch (const std::exception &error) {
    std::cerr << error.what() << '\n';
    return 1;
  }
}
