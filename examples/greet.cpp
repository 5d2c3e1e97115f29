// Customers' names out of EBCDIC records, sorted and greeted in each of two languages.
//
// usage: greet DIRECTORY (of the resource bundles)

#include <nls2.hpp>
#include <nls2/bundle.hpp>

#include <algorithm>
#include <exception>
#include <iostream>
#include <string>
#include <string_view>
#include <vector>

namespace {

void greet(std::string_view language, std::string_view directory, std::vector<std::string> names) {
  const nls2::code_page utf8("utf-8");
  const nls2::locale locale(nls2::language_id(language), 1208);
  const nls2::bundle messages(directory, locale);
  nls2::collator order(language, utf8);
  std::ranges::sort(names, [&](const std::string &left, const std::string &right) {
    return order.compare(left, right) < 0;
  });
  for (const std::string &name : names) {
    std::cout << nls2::from_utf16(utf8, messages.string("greeting")) << ", " << name << "!\n";
  }
  std::cout << nls2::from_utf16(utf8, messages.string("farewell")) << ".\n";
}

} // namespace

int main(int argc, char **argv) {
  if (argc != 2) {
    std::cerr << "usage: greet DIRECTORY\n";
    return 2;
  }
  try {
    nls2::translator to_utf8(nls2::code_page("ibm-500"), nls2::code_page("utf-8"),
                             {.padding = nls2::padding::strip});
    std::vector<std::string> names;
    for (const char *field : {"\xE9\x96\x53\x40\x40\x40\x40\x40\x40\x40",    // Zoë
                              "\x71\x94\x89\x93\x85\x40\x40\x40\x40\x40",    // Émile
                              "\xEC\xA9\x93\x85\x94\x40\x40\x40\x40\x40"}) { // Özlem
      names.push_back(to_utf8.translate(field));
    }
    greet("de_DE", argv[1], names);
    greet("fr_FR", argv[1], names);
    return 0;
  } catch (const std::exception &error) {
    std::cerr << error.what() << '\n';
    return 1;
  }
}
