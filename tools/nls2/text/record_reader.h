// Reads records of one length, or lines, in batches or one by one.
#pragma once

#include "base/errors.h"
#include "codepage/code_page.h"
#include "io/byte_buffer.h"
#include "io/input_file.h"

#include <limits>
#include <string_view>

namespace nls2::tool {

// The form of the records of a file, and which of them to read.
struct RecordShape {
  std::size_t length = 0; // bytes of each; 0: lines
  int32_t page = 0;       // in which lines end
  bool isText = true;     // CR LF and NEL (U+0085) end a line too
  uint64_t skip = 0;
  uint64_t count = std::numeric_limits<uint64_t>::max();
  uint64_t mostInBatch = std::numeric_limits<uint64_t>::max();
};

struct Record {
  std::string_view text;
  std::string_view whole; // with the line's end
  uint64_t number = 0;    // in the input, from 1
  uint64_t offset = 0;    // in the input
};

// The line feed of a page. Throws usageError if the page has none, or if lines depend on the text
// before them; with `isMoved` (lines are reordered or selected) also if they may depend on it.
std::string lineFeedOf(const CodePage &page, bool isMoved);

// One form of line end, and the search for it in a text that grows at its end.
class EndPattern {
public:
  explicit EndPattern(std::string bytes) : bytes_(std::move(bytes)) {}

  std::size_t length() const { return bytes_.size(); }
  // The first place at or after `from`, counted in whole units from the beginning of the text; npos
  // if there is none yet. `from` never decreases.
  std::size_t next(std::string_view text, std::size_t from);
  // Starts a new text, which begins at the beginning of a line.
  void restart();

private:
  std::string bytes_; // one unit; empty if the page lacks the character
  std::size_t found_ = std::string_view::npos;
  std::size_t searched_ = 0; // no place before this one
};

class RecordBatch {
public:
  // Nothing after the last one. The last record of the input may be too short.
  std::optional<Record> next();
  std::size_t size() const { return bytes_.size(); }

private:
  friend class RecordReader;

  struct LineBounds {
    std::size_t text = 0; // bytes without the end
    std::size_t end = 0;  // bytes with it
  };

  ByteBuffer bytes_;
  std::size_t length_ = 0; // of every record; 0: lines
  std::vector<LineBounds> lines_;
  std::size_t line_ = 0; // the next
  Record next_;          // `whole` is the rest of the batch
};

class RecordReader {
public:
  // Throws usageError if the page has no line feed, or if its lines depend on the text before them.
  RecordReader(InputFile &input, const RecordShape &shape);

  // Reads the next records as soon as there is one, or skips lines; false at the end of the input.
  // Throws Error.
  bool read(RecordBatch &batch);

private:
  // Both return the number of bytes skipped in the batch.
  std::size_t readRecords(RecordBatch &batch);
  std::size_t readLines(RecordBatch &batch);
  std::size_t findLines(RecordBatch &batch);
  RecordBatch::LineBounds nextLine(std::string_view text);
  void readMore(RecordBatch &batch, std::size_t most);
  void carry(RecordBatch &batch, std::size_t from);

  InputFile &input_;
  RecordShape shape_; // with `count` and `skip` of what is left to read
  EndPattern lineFeed_{""};
  EndPattern nextLine_{""};
  std::string carriageReturn_;
  std::string carried_;     // an incomplete record at the end of the last batch
  std::size_t scanned_ = 0; // where the next line of the batch begins
  uint64_t records_ = 0;
  uint64_t offset_ = 0;
  bool ended_ = false;
};

// Reads the records of one file one by one.
class RecordFile {
public:
  // Throws Error.
  RecordFile(const std::string &path, const RecordShape &shape)
      : input_(path), shape_(shape), reader_(input_, shape) {}

  // The next record, valid until the next call; nothing at the end. Only the last line may lack its
  // end; a short last record is an Error.
  std::optional<Record> next();
  const InputFile &input() const { return input_; }

  // Calls `use` with the text. Turns a TextFault into an Error that names the place of the record.
  template <typename Use>
  auto apply(const Record &record, Use use) const {
    try {
      return use(record.text);
    } catch (const TextFault &fault) {
      throw fail(record, fault.what());
    }
  }

private:
  Error fail(const Record &record, const std::string &what) const;

  InputFile input_;
  const RecordShape shape_;
  RecordReader reader_;
  RecordBatch batch_;
};

} // namespace nls2::tool
