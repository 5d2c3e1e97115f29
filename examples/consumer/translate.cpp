// Translates a field, compares it and writes it, with owners that release what they hold.

#include <nls2.hpp>
#include <nls2/stream.hpp>

#include <iostream>

int main() {
  try {
    const nls2::code_page utf8("utf-8");
    const std::string name = nls2::translate(nls2::code_page("ibm-1141"), utf8, "\xC7\xD0\xA1");
    const nls2::locale german(nls2::language_id("de_DE"), 1208);
    nls2::stream nothing(german, "/dev/null", "w", "ibm-1141");
    nothing.write_line(nls2::to_utf16(utf8, name));
    nothing.close();
    nls2::collator order(german.name(), utf8);
    if (name == "G\u00FC\u00DF" && order.compare(name, "Gz") < 0) {
      return 0;
    }
    std::cerr << "wrong text: " << name << '\n';
  } catch (const nls2::error &error) {
    std::cerr << error.what() << '\n';
  }
  return 1;
}
