// Records of one length, or lines, read in batches of many or one by one.
#pragma once

#include "base/errors.h"
#include "codepage/code_page.h"
#include "io/byte_buffer.h"
#include "io/input_file.h"

#include <limits>
#include <string_view>

namespace nls2::tool {

// What the records of a file are, and which of them are wanted.
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

// The line feed of a page. Throws usageError where it has none, and where lines depend on the text
// before them; with `isMoved`, for lines that get other neighbours, also where they may do so.
std::string lineFeedOf(const CodePage &page, bool isMoved);

// One way to write a line's end, and the search for it in a text that grows at its end.
class EndPattern {
public:
  explicit EndPattern(std::string bytes) : bytes_(std::move(bytes)) {}

  std::size_t length() const { return bytes_.size(); }
  // The first place from `from` on, a whole number of units from the text's beginning; npos where
  // there is none yet. `from` never goes back.
  std::size_t next(std::string_view text, std::size_t from);
  // For a new text, which begins at a line's beginning.
  void restart();

private:
  std::string bytes_; // one unit; none where the page does not have the character
  std::size_t found_ = std::string_view::npos;
  std::size_t searched_ = 0; // no place before this one
};

class RecordBatch {
public:
  // Nothing after the last one. The last record of the input may be shorter than the others.
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
  // Throws usageError for a page that has no line feed, or in which a line cannot be read without
  // the text before it.
  RecordReader(InputFile &input, const RecordShape &shape);

  // The next records, as soon as there is one, or lines that were skipped; false at the end of the
  // input. Throws Error.
  bool read(RecordBatch &batch);

private:
  // The bytes of the batch that were skipped.
  std::size_t readRecords(RecordBatch &batch);
  std::size_t readLines(RecordBatch &batch);
  std::size_t findLines(RecordBatch &batch);
  RecordBatch::LineBounds nextLine(std::string_view text);
  void readMore(RecordBatch &batch, std::size_t most);
  void carry(RecordBatch &batch, std::size_t from);

  InputFile &input_;
  RecordShape shape_; // `count` are those that may still be read, `skip` those to be skipped yet
  EndPattern lineFeed_{""};
  EndPattern nextLine_{""};
  std::string carriageReturn_;
  std::string carried_;     // the beginning of a record whose end has not been read
  std::size_t scanned_ = 0; // where the next line of the batch begins
  uint64_t records_ = 0;
  uint64_t offset_ = 0;
  bool ended_ = false;
};

// The records of one file, for a command that reads them one by one.
class RecordFile {
public:
  // Throws Error.
  RecordFile(const std::string &path, const RecordShape &shape)
      : input_(path), shape_(shape), reader_(input_, shape) {}

  // The next record, valid until the next call; nothing at the end. The last line need not have its
  // end, the last record must be whole. Throws Error.
  std::optional<Record> next();
  const InputFile &input() const { return input_; }

  // What `use` makes of its text. Throws Error, which says where the record is, for a TextFault.
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
