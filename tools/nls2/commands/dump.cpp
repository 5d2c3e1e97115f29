// nls2 dump: shows a file in hex and, beside it, as text of a code page.

#include "base/options.h"
#include "codepage/code_page.h"
#include "codepage/display.h"
#include "io/input_file.h"
#include "io/output_file.h"

#include <algorithm>
#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(A character is shown at its first byte and takes one column per byte. Unprintable characters, shifts
and invalid bytes are dots. Each record begins a new line and is decoded separately. The last line is
the offset of the end.
)";

constexpr std::size_t bytesALine = 16;

struct Arguments {
  std::string path = "-";
  int32_t page = 0;
  int32_t recordLength = 0; // 0: the whole file is one record
};

// Decodes byte by byte, because only that shows which bytes belong to each character.
class PageDump {
public:
  explicit PageDump(CodePage page) : page_(std::move(page)) {
    UErrorCode error = U_ZERO_ERROR;
    ucnv_setToUCallBack(page_.converter(), onInvalid, this, nullptr, nullptr, &error);
    requireSuccess(error, "decode");
  }
  PageDump(const PageDump &) = delete; // the converter holds a pointer to it
  PageDump &operator=(const PageDump &) = delete;

  // Adds a byte of the record. A line is ready as soon as its text is known.
  void add(const char &byte) {
    bytes_ += byte;
    decode(&byte, false);
    while (cells_.size() >= bytesALine) {
      endLine(bytesALine);
    }
  }

  // Ends the record: the next byte begins a new line, and decoding starts afresh.
  void endRecord() {
    decode("", true);
    ucnv_reset(page_.converter());
    while (!bytes_.empty()) {
      endLine(std::min(bytesALine, bytes_.size()));
    }
  }

  // Adds a last line with the offset of the end.
  void end() { lines_ += offset_ > 0 ? fmt::format("{:08x}\n", offset_) : ""; }

  // The lines completed since the last call.
  std::string takeLines() { return std::exchange(lines_, {}); }

private:
  // Invalid bytes become dots. They may precede a character of the same call.
  static void onInvalid(const void *dump, UConverterToUnicodeArgs *, const char *, int32_t length,
                        UConverterCallbackReason reason, UErrorCode *error) {
    if (reason <= UCNV_IRREGULAR) {
      static_cast<PageDump *>(const_cast<void *>(dump))->addDots(static_cast<std::size_t>(length));
      *error = U_ZERO_ERROR;
    }
  }

  // Some converters report bytes again that they had consumed before.
  void addDots(std::size_t length) {
    cells_.insert(cells_.end(), std::min(length, bytes_.size() - cells_.size()), ".");
  }

  // One column per byte. A wide character covers the cells after its own, which stay empty.
  void addCharacter(std::u16string_view text, std::size_t length) {
    const Display display = displayOf(text);
    for (std::size_t i = 0; i < length; ++i) {
      const bool isCovered = static_cast<int>(i) < display.columns;
      cells_.push_back((i == 0 ? display.text : std::string()) + (isCovered ? "" : " "));
    }
  }

  // Bytes that the converter consumes without producing a character, such as shifts, become dots.
  void decode(const char *byte, bool isLast) {
    std::array<char16_t, 32> units;
    char16_t *end = units.data();
    UErrorCode error = U_ZERO_ERROR;
    ucnv_toUnicode(page_.converter(), &end, units.data() + units.size(), &byte,
                   byte + (isLast ? 0 : 1), nullptr, static_cast<UBool>(isLast), &error);
    requireSuccess(error, "decode");
    const auto pending = static_cast<std::size_t>(ucnv_toUCountPending(page_.converter(), &error));
    const std::size_t unknown = bytes_.size() - cells_.size();
    const std::size_t length = unknown - std::min(pending, unknown);
    held_.append(units.data(), end);
    if (held_.empty()) {
      addDots(length);
    } else if (isLast || !U16_IS_LEAD(held_.back())) {
      addCharacter(std::exchange(held_, {}), length);
    }
  }

  void endLine(std::size_t length) {
    constexpr const char *digits = "0123456789abcdef";
    std::string hex;
    std::string text;
    bool isCovered = true; // by a character of the line before
    for (std::size_t i = 0; i < length; ++i) {
      const auto byte = static_cast<unsigned char>(bytes_[i]);
      hex.append(i == bytesALine / 2 ? "  " : " ").append(1, digits[byte / 16]);
      hex += digits[byte % 16];
      isCovered = isCovered && cells_[i].empty();
      const bool isCut = i + 1 == bytesALine && i + 1 < cells_.size() && cells_[i + 1].empty();
      text += isCovered ? " " : isCut ? "." : cells_[i];
    }
    lines_ += fmt::format("{:08x} {:<49}  |{}|\n", offset_, hex, text);
    offset_ += length;
    bytes_.erase(0, length);
    cells_.erase(cells_.begin(), cells_.begin() + static_cast<std::ptrdiff_t>(length));
  }

  CodePage page_;
  uint64_t offset_ = 0;            // of the first byte not yet in a line
  std::string bytes_;              // from that offset on
  std::vector<std::string> cells_; // the text shown for each byte decoded so far
  std::u16string held_;            // the first half of a surrogate pair
  std::string lines_;
};

int dumpFile(const Arguments &arguments) {
  PageDump dump(CodePage(arguments.page, "--from"));
  InputFile in(arguments.path);
  OutputFile out("-");
  out.requireOther(in);
  std::string bytes(std::size_t{64} * 1024, '\0');
  int32_t done = 0; // bytes of the record
  while (const std::size_t got = in.read(bytes.data(), bytes.size())) {
    for (std::size_t i = 0; i < got; ++i) {
      dump.add(bytes[i]);
      if (arguments.recordLength != 0 && ++done == arguments.recordLength) {
        dump.endRecord();
        done = 0;
      }
    }
    out.write(dump.takeLines());
  }
  dump.endRecord();
  dump.end();
  out.write(dump.takeLines());
  out.commit();
  return exitDone;
}

} // namespace

Command dumpCommand() {
  const auto arguments = std::make_shared<Arguments>();
  return {
      .operands = {{"FILE", "input file; standard input if - or not given", into(arguments->path)}},
      .options = {required(pageValue("from", "code page of the file", arguments->page)),
                  numberValue("record-length", "N", "length of every record, in bytes",
                              arguments->recordLength, 1, 1 << 30)},
      .notes = notes,
      .run = [arguments] { return dumpFile(*arguments); }};
}

} // namespace nls2::tool
