// Messages: statuses in words, file names that print, and standard error.

#include "errors.h"

#include "nls2/error.hpp"

#include <cstdio>

namespace nls2::tool {

std::string statusText(int32_t status) { return category().message(status); }

std::string printable(std::string_view name) {
  std::string text;
  for (std::size_t i = 0; i < name.size(); ++i) {
    const auto byte = static_cast<unsigned char>(name[i]);
    // U+0080 to U+009F control a terminal too.
    const bool isTwoByteControl = byte == 0xC2 && i + 1 < name.size() &&
                                  (static_cast<unsigned char>(name[i + 1]) & 0xE0) == 0x80;
    if (byte == '\n') {
      text += "\\n";
    } else if (byte < 0x20 || byte == 0x7F) {
      text += fmt::format("\\x{:02X}", byte);
    } else if (isTwoByteControl) {
      text += fmt::format("\\xC2\\x{:02X}", static_cast<unsigned char>(name[++i]));
    } else {
      text += name[i];
    }
  }
  return text;
}

void complain(const char *text) noexcept { std::fprintf(stderr, "nls2: %s\n", text); }

} // namespace nls2::tool
