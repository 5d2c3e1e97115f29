// Records of one length, or lines, read in batches of many.
#pragma once

#include "codepage/code_page.h"
#include "convert/byte_buffer.h"
#include "convert/translate.h"
#include "io/input_file.h"

#include <algorithm>
#include <string_view>

namespace nls2::tool {

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

struct LineBounds {
  std::size_t text = 0; // bytes without the end
  std::size_t end = 0;  // bytes with it
};

struct RecordBatch {
  ByteBuffer bytes;
  std::size_t begin = 0;        // of the first record; what is before it was skipped
  std::size_t recordLength = 0; // 0: lines
  std::vector<LineBounds> lines;
  uint64_t recordsBefore = 0; // in the input
  uint64_t offset = 0;        // of the first record in the input

  std::size_t size() const { return bytes.size() - begin; }

  // Calls `use(record, whole)`, `whole` with the line's end, until it returns false. The last
  // record of the input may be shorter than the others.
  template <typename Use>
  void forEach(Use use) const {
    std::string_view rest = bytes.bytes().substr(begin);
    for (std::size_t i = 0; !rest.empty(); ++i) {
      const std::string_view whole =
          rest.substr(0, recordLength != 0 ? recordLength : lines[i].end);
      if (!use(recordLength != 0 ? whole : rest.substr(0, lines[i].text), whole)) {
        return;
      }
      rest.remove_prefix(whole.size());
    }
  }
};

class RecordReader {
public:
  // Throws usageError for a page that has no line feed, or in which a line cannot be read without
  // the text before it.
  RecordReader(InputFile &input, const TranslateOptions &options);

  // The next records, as soon as there is one, or lines that were skipped; false at the end of the
  // input. Throws Error.
  bool read(RecordBatch &batch);

private:
  void readRecords(RecordBatch &batch);
  void skipRecords();
  void readLines(RecordBatch &batch);
  void findLines(RecordBatch &batch);
  LineBounds nextLine(std::string_view text);
  void readMore(RecordBatch &batch, std::size_t most);
  void carry(RecordBatch &batch, std::size_t from);

  InputFile &input_;
  const std::size_t recordLength_;
  EndPattern lineFeed_{""};
  EndPattern nextLine_{""};
  std::string carriageReturn_;
  uint64_t toSkip_;
  uint64_t left_;              // records that may still be read
  const uint64_t mostRecords_; // in a batch, so that its output stays small too
  std::string carried_;        // the beginning of a record whose end has not been read
  std::size_t scanned_ = 0;    // where the next line of the batch begins
  uint64_t records_ = 0;
  uint64_t offset_ = 0;
  bool ended_ = false;
};

} // namespace nls2::tool
