// Records of one length, read in chunks of many.

#include "convert/record_reader.h"

#include <algorithm>

namespace nls2::tool {

namespace {

constexpr std::size_t usualChunk = std::size_t{128} * 1024;

} // namespace

RecordReader::RecordReader(InputFile &input, std::size_t recordLength, int wakeFd)
    : input_(input), recordLength_(recordLength),
      chunkLength_(std::max<std::size_t>(usualChunk / recordLength, 1) * recordLength),
      wakeFd_(wakeFd) {}

bool RecordReader::read(RecordChunk &chunk) {
  if (!chunk.bytes) {
    chunk.bytes = std::make_unique_for_overwrite<char[]>(chunkLength_);
  }
  std::copy(carried_.begin(), carried_.end(), chunk.bytes.get());
  std::size_t have = carried_.size();
  bool ended = false;
  while (have < recordLength_ && !ended) {
    const std::size_t got = input_.read(chunk.bytes.get() + have, chunkLength_ - have, wakeFd_);
    have += got;
    ended = got == 0;
  }
  chunk.recordsBefore = records_;
  chunk.length = have / recordLength_ * recordLength_;
  const std::size_t rest = have - chunk.length;
  chunk.tail = ended ? rest : 0;
  carried_.assign(chunk.bytes.get() + chunk.length, ended ? 0 : rest);
  records_ += chunk.length / recordLength_;
  return have > 0;
}

} // namespace nls2::tool
