// Translates fields of German EBCDIC records to UTF-8, without their trailing blanks.
#include <iostream>
#include <nls2.hpp>

int main() {
  nls2::translator to_utf8(nls2::code_page("ibm-1141"), nls2::code_page("utf-8"),
                           {.padding = nls2::padding::strip});
  for (const char *field : {"\xC7\x99\xD0\xA1\x85\x40\x40", "\x81\xA4\xA2\x40\xD2\x6A\x93\x95"}) {
    std::cout << to_utf8.translate(field) << '\n';
  }
}
