// Records of one length, read in chunks of many.
#pragma once

#include "io/input_file.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>

namespace nls2::tool {

struct RecordChunk {
  std::unique_ptr<char[]> bytes;
  std::size_t length = 0;     // bytes of whole records
  std::size_t tail = 0;       // bytes of a short last record behind them
  uint64_t recordsBefore = 0; // in the input
};

class RecordReader {
public:
  RecordReader(InputFile &input, std::size_t recordLength, int wakeFd);

  // The next whole records, as soon as there is one; false at the end of the input. Throws Error.
  bool read(RecordChunk &chunk);

private:
  InputFile &input_;
  const std::size_t recordLength_;
  const std::size_t chunkLength_;
  const int wakeFd_;
  std::string carried_; // the beginning of a record whose end has not been read
  uint64_t records_ = 0;
};

} // namespace nls2::tool
