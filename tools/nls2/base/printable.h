// Names and bytes as messages show them.
#pragma once

#include <cstdint>
#include <fmt/core.h>
#include <string>
#include <string_view>

namespace nls2::tool {

// A file name for a message, with control characters (also U+0080 to U+009F) escaped.
inline std::string printable(std::string_view name) {
  std::string text;
  for (std::size_t i = 0; i < name.size(); ++i) {
    const auto byte = static_cast<unsigned char>(name[i]);
    const auto next = static_cast<unsigned char>(i + 1 < name.size() ? name[i + 1] : '\0');
    if (byte == '\n') {
      text += "\\n";
    } else if (byte < 0x20 || byte == 0x7F) {
      text += fmt::format("\\x{:02X}", byte);
    } else if (byte == 0xC2 && (next & 0xE0) == 0x80) {
      text += fmt::format("\\xC2\\x{:02X}", next);
      ++i;
    } else {
      text += name[i];
    }
  }
  return text;
}

// The name of a file in messages; "-" is a standard stream.
inline std::string shownName(const std::string &path, const char *stream) {
  return path == "-" ? stream : path.empty() ? "\"\"" : printable(path);
}

// "D096"
inline std::string hexOf(std::string_view bytes) {
  constexpr std::string_view digits = "0123456789ABCDEF";
  std::string text;
  text.reserve(2 * bytes.size());
  for (const char byte : bytes) {
    text += digits[static_cast<unsigned char>(byte) >> 4];
    text += digits[byte & 15];
  }
  return text;
}

} // namespace nls2::tool
