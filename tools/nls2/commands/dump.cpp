// nls2 dump: shows a file in hex and, beside it, as text of a code page.

#include "base/options.h"
#include "codepage/display.h"
#include "codepage/page_text.h"
#include "io/output_file.h"
#include "text/record_source.h"

#include <algorithm>
#include <memory>

namespace nls2::tool {

namespace {

constexpr const char *notes =
    R"(A character is shown at its first byte and takes one column per byte. Unprintable characters, shifts
and invalid bytes are dots. With --read each record begins a new line with its number and column, and
is decoded separately; N and M then count records, else bytes. The last line is the offset of the end.
)";

constexpr std::size_t bytesALine = 16;

struct Arguments {
  std::string path = "-";
  std::optional<CodePage> page;
  std::optional<std::string> format; // none: the whole file is one text
  uint64_t skip = 0;
  uint64_t count = std::numeric_limits<uint64_t>::max();
};

class PageDump {
public:
  PageDump(const CodePage &page, bool hasRecords) : text_(page), hasRecords_(hasRecords) {}

  // Begins a record at an offset in the file.
  void begin(uint64_t record, uint64_t offset) {
    record_ = record;
    begin_ = offset_ = offset;
    text_.reset();
  }

  // Adds bytes of the record. A line is ready as soon as its text is known.
  void add(std::string_view bytes, bool isLast) {
    bytes_ += bytes;
    const std::size_t needed = isLast ? 1 : PageText::longest;
    while (bytes_.size() - cells_.size() >= needed) {
      addCells(text_.next(std::string_view(bytes_).substr(cells_.size(), PageText::longest)));
      if (cells_.size() > bytesALine) {
        endLine(bytesALine);
      }
    }
    while (isLast && !bytes_.empty()) {
      endLine(std::min(bytesALine, bytes_.size()));
    }
  }

  // Adds a last line with the offset of the end.
  void end() {
    lines_ += offset_ > 0
                  ? fmt::format("{}{:08x}\n", hasRecords_ ? std::string(15, ' ') : "", offset_)
                  : "";
  }

  // The lines completed since the last call.
  std::string takeLines() { return std::exchange(lines_, {}); }

private:
  // One column per byte. A wide character covers the cells after its own, which stay empty.
  void addCells(const PageText::Piece &piece) {
    const Display display = displayOf(fromUtf8(piece.text));
    for (std::size_t i = 0; i < piece.length; ++i) {
      const bool isCovered = static_cast<int>(i) < display.columns;
      cells_.push_back(piece.meaning != Meaning::character
                           ? "."
                           : (i == 0 ? display.text : std::string()) + (isCovered ? "" : " "));
    }
  }

  void endLine(std::size_t length) {
    std::string hex;
    std::string text;
    bool isCovered = true; // by a character of the line before
    for (std::size_t i = 0; i < length; ++i) {
      hex += (i == bytesALine / 2 ? "  " : " ") + hexOf(bytes_.substr(i, 1));
      isCovered = isCovered && cells_[i].empty();
      const bool isCut = i + 1 == bytesALine && i + 1 < cells_.size() && cells_[i + 1].empty();
      text += isCovered ? " " : isCut ? "." : cells_[i];
    }
    std::ranges::transform(hex, hex.begin(), [](unsigned char c) { return std::tolower(c); });
    if (hasRecords_) {
      lines_ += fmt::format("{:>8} {:>5} ", record_, offset_ - begin_ + 1);
    }
    lines_ += fmt::format("{:08x} {:<49}  |{}|\n", offset_, hex, text);
    offset_ += length;
    bytes_.erase(0, length);
    cells_.erase(cells_.begin(), cells_.begin() + static_cast<std::ptrdiff_t>(length));
  }

  PageText text_;
  const bool hasRecords_;
  uint64_t record_ = 0;
  uint64_t begin_ = 0;             // of the record
  uint64_t offset_ = 0;            // of the first byte not yet in a line
  std::string bytes_;              // from that offset on
  std::vector<std::string> cells_; // the text shown for each byte decoded so far
  std::string lines_;
};

void dumpBytes(const Arguments &arguments, InputFile &in, OutputFile &out) {
  PageDump dump(*arguments.page, false);
  std::string bytes(std::size_t{64} * 1024, '\0');
  in.skip(arguments.skip);
  dump.begin(0, arguments.skip);
  std::size_t got = 0;
  for (uint64_t left = arguments.count;
       left > 0 && (got = in.read(bytes.data(), std::min<uint64_t>(left, bytes.size()))) > 0;
       left -= got) {
    dump.add(std::string_view(bytes).substr(0, got), false);
    out.write(dump.takeLines());
  }
  dump.add("", true);
  dump.end();
  out.write(dump.takeLines());
}

// A record that is cut short is shown, too.
void dumpRecords(const Arguments &arguments, InputFile &in, OutputFile &out) {
  RecordSource source(in, {.format = *arguments.format,
                           .page = *arguments.page,
                           .skip = arguments.skip,
                           .count = arguments.count});
  std::optional<PageDump> dump;
  RecordPiece piece;
  while (source.read(piece)) {
    if (!dump) {
      dump.emplace(source.page(), true);
    }
    for (std::size_t i = 0; i < piece.records.size(); ++i) {
      dump->begin(piece.number + i, piece.offset + static_cast<uint64_t>(piece.records[i].offset));
      dump->add(piece.text(i), true);
      out.put(dump->takeLines());
    }
    if (piece.problem) {
      dump->begin(piece.number, piece.offset);
      dump->add(piece.bytes.bytes(), true);
      out.put(dump->takeLines());
      out.flush();
      throw failure("{}: record {} at byte {}: {}", in.name(), piece.number, piece.offset,
                    wordsOf(*piece.problem));
    }
  }
  if (dump) {
    dump->end();
    out.put(dump->takeLines());
  }
}

int dumpFile(const Arguments &arguments) {
  InputFile in(arguments.path);
  OutputFile out("-");
  out.requireOther(in);
  (arguments.format ? dumpRecords : dumpBytes)(arguments, in, out);
  out.commit();
  return exitDone;
}

} // namespace

Command dumpCommand() {
  const auto arguments = std::make_shared<Arguments>();
  constexpr uint64_t most = std::numeric_limits<int64_t>::max();
  return {
      .operands = {{"FILE", "input file; standard input if - or not given", into(arguments->path)}},
      .options = {required(pageValue("from", "code page of the file", arguments->page)),
                  value("read", "FORMAT", "how the records are framed: fixed:80, lines, ...",
                        into(arguments->format)),
                  numberValue("skip", "N", "skip the first N records or bytes", arguments->skip, 0,
                              most),
                  numberValue("count", "M", "show at most M of them", arguments->count, 0, most)},
      .notes = notes,
      .run = [arguments] { return dumpFile(*arguments); }};
}

} // namespace nls2::tool
