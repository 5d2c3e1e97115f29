// Reads the records of a file, in pieces or one by one.
#pragma once

#include "codepage/code_page.h"
#include "io/byte_buffer.h"
#include "io/input_file.h"

#include <limits>
#include <optional>
#include <string_view>
#include <vector>

namespace nls2::tool {

// The form of the records of a file, and which of them to read.
struct RecordShape {
  std::string format = "lines";
  CodePage page;
  bool hasHeader = false; // the first record is none of them
  uint64_t skip = 0;
  uint64_t count = std::numeric_limits<uint64_t>::max();
  uint64_t mostInPiece = 1 << 15;
};

// Records that were read together, or one problem.
struct RecordPiece {
  ByteBuffer bytes;
  std::vector<NLS2F_Span> records;      // in the bytes, without line ends and prefixes
  std::vector<NLS2F_Span> whole;        // with them
  uint64_t number = 0;                  // of the first record in the input, from 1
  uint64_t offset = 0;                  // of the bytes in the input
  std::optional<NLS2F_Problem> problem; // found where a record should be; `whole` is then the rest

  std::string_view text(std::size_t i) const { return bytesOf(bytes.bytes().data(), records[i]); }
  std::string_view wholeOf(std::size_t i) const { return bytesOf(bytes.bytes().data(), whole[i]); }
  uint64_t offsetOf(std::size_t i) const { return offset + static_cast<uint64_t>(whole[i].offset); }
};

class RecordSource {
public:
  // Throws usageError with `option` if the format or the page does not suit.
  RecordSource(InputFile &input, RecordShape shape, const char *option = "--read");

  // Reads the next records, as soon as there is one; false at the end of the input. Throws Error.
  bool read(RecordPiece &piece);

  // After the first read(): the record before all others, and the bytes before those; for lines
  // and CSV, with a byte-order mark.
  const std::string &header() const { return header_; }
  const std::string &preamble() const { return preamble_; }
  bool foundHeader() const { return foundHeader_; }
  // After the first read(): the page of the texts, as a byte-order mark may choose it.
  CodePage page() const;

private:
  bool find(RecordPiece &piece);
  void setBounds(RecordPiece &piece, std::size_t end) const;
  void dropHeader(RecordPiece &piece, std::size_t end);
  void readMore(RecordPiece &piece);
  void skipFixed();

  InputFile &input_;
  RecordShape shape_; // with `count` and `skip` of what is left to read
  const std::size_t fixed_;
  const bool hasEnds_; // lines and CSV
  std::size_t prefix_; // bytes before a record that belong to it
  Reader reader_;
  std::string carried_; // bytes of no record yet
  std::string header_;
  std::string preamble_;
  bool foundHeader_ = false;
  bool begun_ = false;
  bool ended_ = false;
  uint64_t records_ = 0; // found, or skipped
  uint64_t offset_ = 0;  // of what is carried
};

struct Record {
  std::string_view text;
  std::string_view end; // of a line
  uint64_t number = 0;  // in the input, from 1
  uint64_t offset = 0;
};

// N of "fixed:N"; 0 for other formats.
int64_t fixedLength(const std::string &format);

// Throws usageError with `option` if the format or the page does not suit.
Writer openWriter(const char *option, const std::string &format, const CodePage &page);

// The option --read of commands for lines and fixed records.
Option linesOrFixed(std::string &format);

// What ends a written line of the page; empty for fixed records. Throws usageError.
std::string lineEnd(const std::string &format, const CodePage &page);

// Reads the records of one file one by one.
class RecordFile {
public:
  // Throws Error.
  RecordFile(const std::string &path, RecordShape shape)
      : input_(path), unit_(shape.format.starts_with("lines") ? "line" : "record"),
        source_(input_, std::move(shape)) {}

  // The next record, valid until the next call; nothing at the end. Throws Error.
  std::optional<Record> next();
  const InputFile &input() const { return input_; }
  CodePage page() const { return source_.page(); }

  // Calls `use` with the text. Turns a TextFault into an Error that names the place of the record.
  template <typename Use>
  auto apply(const Record &record, Use use) const {
    try {
      return use(record.text);
    } catch (const TextFault &fault) {
      throw failure("{}: {} {} at byte {}{}", input_.name(), unit_, record.number, record.offset,
                    fault.what());
    }
  }

private:
  InputFile input_;
  const char *unit_;
  RecordSource source_;
  RecordPiece piece_;
  std::size_t next_ = 0;
};

} // namespace nls2::tool
