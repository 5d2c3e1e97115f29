// Bytes side by side with their text: offset, hex, and what a code page makes of them.
#pragma once

#include "codepage/code_page.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace nls2::tool {

// Decodes byte by byte, since only that shows which bytes each character takes.
class PageDump {
public:
  explicit PageDump(CodePage page);
  PageDump(const PageDump &) = delete; // the converter reports into it
  PageDump &operator=(const PageDump &) = delete;

  // Goes on within a record. Lines are appended to `out` as soon as their text is known.
  void add(std::string_view bytes, std::string &out);
  // The next byte begins a record: a line, and the decoding, too.
  void endRecord(std::string &out);
  // The line with the offset of the end.
  void end(std::string &out) const;

private:
  static void onInvalid(const void *dump, UConverterToUnicodeArgs *arguments, const char *bytes,
                        int32_t length, UConverterCallbackReason reason, UErrorCode *error);

  void decode(const char *byte, bool isLast);
  void addCharacter(std::u16string_view text, std::size_t length);
  void addDots(std::size_t length);
  void takeLine(std::string &out, std::size_t length);

  CodePage page_;
  uint64_t offset_ = 0;            // of the first byte that is not in a line yet
  std::string bytes_;              // from there
  std::vector<std::string> cells_; // what stands in their columns, as far as it is known
};

} // namespace nls2::tool
