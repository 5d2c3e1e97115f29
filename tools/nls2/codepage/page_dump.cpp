// Bytes side by side with their text: offset, hex, and what a code page makes of them.

#include "codepage/page_dump.h"

#include "codepage/display.h"
#include "errors.h"

#include <algorithm>
#include <array>
#include <new>

namespace nls2::tool {

namespace {

constexpr std::size_t bytesALine = 16;

void require(UErrorCode error) {
  if (error == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc();
  }
  if (U_FAILURE(error)) {
    throw failure("cannot decode: {}", statusText(error));
  }
}

} // namespace

PageDump::PageDump(CodePage page) : page_(std::move(page)) {
  UErrorCode error = U_ZERO_ERROR;
  ucnv_setToUCallBack(page_.converter(), onInvalid, this, nullptr, nullptr, &error);
  require(error);
}

// Every byte that is not valid is a dot. It may come before a character of the same call.
void PageDump::onInvalid(const void *dump, UConverterToUnicodeArgs *, const char *, int32_t length,
                         UConverterCallbackReason reason, UErrorCode *error) {
  if (reason <= UCNV_IRREGULAR) {
    static_cast<PageDump *>(const_cast<void *>(dump))->addDots(static_cast<std::size_t>(length));
    *error = U_ZERO_ERROR;
  }
}

// Some converters count bytes once more that they had taken before.
void PageDump::addDots(std::size_t length) {
  cells_.insert(cells_.end(), std::min(length, bytes_.size() - cells_.size()), ".");
}

// One column a byte. What a wide character covers is an empty cell.
void PageDump::addCharacter(std::u16string_view text, std::size_t length) {
  const Display display = displayOf(text);
  for (std::size_t i = 0; i < length; ++i) {
    const bool isCovered = static_cast<int>(i) < display.columns;
    cells_.push_back((i == 0 ? display.text : std::string()) + (isCovered ? "" : " "));
  }
}

// What the converter has taken without a character, or a character's part, such as a shift, is a
// dot.
void PageDump::decode(const char *byte, bool isLast) {
  std::array<char16_t, 32> units;
  char16_t *end = units.data();
  const char *sourceEnd = byte + (isLast ? 0 : 1);
  UErrorCode error = U_ZERO_ERROR;
  ucnv_toUnicode(page_.converter(), &end, units.data() + units.size(), &byte, sourceEnd, nullptr,
                 static_cast<UBool>(isLast), &error);
  require(error);
  const auto pending = static_cast<std::size_t>(ucnv_toUCountPending(page_.converter(), &error));
  const std::size_t known = bytes_.size() - std::min(pending, bytes_.size() - cells_.size());
  if (end == units.data()) {
    addDots(known - cells_.size());
  } else {
    addCharacter({units.data(), end}, known - cells_.size());
  }
}

void PageDump::add(std::string_view bytes, std::string &out) {
  for (const char &byte : bytes) {
    bytes_ += byte;
    decode(&byte, false);
    while (cells_.size() >= bytesALine) {
      takeLine(out, bytesALine);
    }
  }
}

void PageDump::endRecord(std::string &out) {
  decode("", true);
  ucnv_reset(page_.converter());
  while (!bytes_.empty()) {
    takeLine(out, std::min(bytesALine, bytes_.size()));
  }
}

void PageDump::end(std::string &out) const {
  out += offset_ > 0 ? fmt::format("{:08x}\n", offset_) : "";
}

void PageDump::takeLine(std::string &out, std::size_t length) {
  constexpr const char *digits = "0123456789abcdef";
  std::string hex;
  std::string text;
  bool isCovered = true; // by a character of the line before, whose columns are not here
  for (std::size_t i = 0; i < length; ++i) {
    const auto byte = static_cast<unsigned char>(bytes_[i]);
    hex.append(i == bytesALine / 2 ? "  " : " ").append(1, digits[byte / 16]);
    hex.append(1, digits[byte % 16]);
    isCovered = isCovered && cells_[i].empty();
    text += isCovered ? " " : cells_[i];
  }
  out += fmt::format("{:08x} {:<49}  |{}|\n", offset_, hex, text);
  offset_ += length;
  bytes_.erase(0, length);
  cells_.erase(cells_.begin(), cells_.begin() + static_cast<std::ptrdiff_t>(length));
}

} // namespace nls2::tool
