// Translates a field, compares it and writes it, with owners that give back what they hold.

#include <nls2.hpp>

#include <iostream>

int main() {
  try {
    const nls2::converter converter = nls2::open_converter(nls2::code_page(930));
    const nls2::locale german =
        nls2::make_locale(nls2::language_id::from_name("de_DE"), nls2::utf8_page);
    const std::string name =
        nls2::translate(nls2::utf8_page, nls2::code_page(1141), "\xC7\xD0\xA1");
    nls2::stream nothing = nls2::open_stream(german, "/dev/null", "w", "ibm-1141");
    nothing.write_line(nls2::to_utf16(german, name));
    nothing.close();
    if (converter && name == "G\u00FC\u00DF" && nls2::compare(german, name, "Gz") < 0) {
      return 0;
    }
    std::cerr << "wrong text: " << name << '\n';
  } catch (const nls2::error &error) {
    std::cerr << error.what() << '\n';
  }
  return 1;
}
