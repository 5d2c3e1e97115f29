// Code pages as the commands see them: do they open, and how single characters are written in them.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace nls2::tool {

constexpr int32_t utf8Page = 1208;
constexpr int32_t utf16lePage = 57359;
constexpr int32_t utf7Page = 57366;

// Throws UsageError where the library cannot open the code page; `option` is who named it.
void requireCodePage(int32_t page, const char *option);

// A text from one code page to another as it is, in a buffer that grows until it fits. The status
// is the library's; the text is empty on failure.
std::string translateText(int32_t to, int32_t from, std::string_view text, int32_t &status);

// One character as it stands inside a text of a code page.
struct EncodedCharacter {
  std::string bytes;
  std::size_t signatureLength = 0; // bytes that the page puts before its first character
};
EncodedCharacter encodedCharacter(int32_t page, char ascii);

// The blank of a page in which every byte is a character by itself; nothing for other pages.
std::optional<char> singleByteBlank(int32_t page);

// Whether the page has this character, and not only a substitute for it.
bool hasCharacter(int32_t page, char ascii);

} // namespace nls2::tool
