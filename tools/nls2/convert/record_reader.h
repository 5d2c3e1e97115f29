// Records of one length, or lines, read in batches of many.
#pragma once

#include "convert/byte_buffer.h"
#include "convert/line_ends.h"
#include "convert/translate_options.h"
#include "io/input_file.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace nls2::tool {

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
    if (recordLength == 0) {
      for (const LineBounds &line : lines) {
        if (!use(rest.substr(0, line.text), rest.substr(0, line.end))) {
          return;
        }
        rest.remove_prefix(line.end);
      }
      return;
    }
    while (!rest.empty()) {
      const std::string_view record = rest.substr(0, recordLength);
      if (!use(record, record)) {
        return;
      }
      rest.remove_prefix(record.size());
    }
  }
};

class RecordReader {
public:
  // Throws usageError for a code page whose lines cannot be found.
  RecordReader(InputFile &input, const TranslateOptions &options, int wakeFd);

  // The next records, as soon as there is one; false at the end of the input. Throws Error.
  bool read(RecordBatch &batch);

private:
  void start();
  bool readRecords(RecordBatch &batch);
  bool readLines(RecordBatch &batch);
  std::size_t readMore(RecordBatch &batch, std::size_t most);
  void findLines(RecordBatch &batch);
  void skipLines(RecordBatch &batch);
  [[noreturn]] void refuseLongLine() const;

  InputFile &input_;
  const int wakeFd_;
  const std::size_t recordLength_;
  std::optional<LineEnds> ends_; // of lines
  uint64_t toSkip_;
  uint64_t left_;                 // records that may still be read
  const std::size_t mostRecords_; // in a batch, so that its output stays small too
  std::string carried_;           // the beginning of a record whose end has not been read
  std::size_t scanned_ = 0;       // where the next line of the batch begins
  uint64_t records_ = 0;
  uint64_t offset_ = 0;
  bool started_ = false;
  bool ended_ = false;
};

} // namespace nls2::tool
