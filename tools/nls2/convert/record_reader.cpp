// Records of one length, or lines, read in batches of many.

#include "convert/record_reader.h"

#include "errors.h"

#include <algorithm>
#include <limits>

namespace nls2::tool {

namespace {

constexpr std::size_t usualBatch = std::size_t{256} * 1024;
constexpr std::size_t longestLine = std::size_t{1} << 30;

constexpr std::size_t usualOutput = std::size_t{2} << 20;

// The bytes that a record takes in the output at the least, where it is filled.
std::size_t filledLength(const TranslateOptions &options) {
  const std::size_t filled = options.padding == nls2::padding::fill ? options.outLength : 0;
  std::size_t length = options.fields.empty() ? filled : 0;
  for (const FieldSpec &field : options.fields) {
    length += field.width != 0 ? field.width : filled;
  }
  return length;
}

uint64_t product(uint64_t a, uint64_t b) {
  uint64_t result = 0;
  return __builtin_mul_overflow(a, b, &result) ? std::numeric_limits<uint64_t>::max() : result;
}

} // namespace

RecordReader::RecordReader(InputFile &input, const TranslateOptions &options, int wakeFd)
    : input_(input), wakeFd_(wakeFd), recordLength_(options.recordLength), toSkip_(options.skip),
      left_(options.count),
      mostRecords_(std::max<std::size_t>(usualOutput / (filledLength(options) + 1), 1)) {
  if (recordLength_ == 0) {
    ends_.emplace(CodePage(options.from, "--from"));
  }
}

bool RecordReader::read(RecordBatch &batch) {
  if (!started_) {
    started_ = true;
    start();
  }
  batch.bytes.clear(2 * usualBatch);
  batch.bytes.append(carried_);
  carried_.clear();
  batch.begin = 0;
  batch.recordLength = recordLength_;
  const bool there = left_ > 0 && (recordLength_ != 0 ? readRecords(batch) : readLines(batch));
  batch.recordsBefore = records_;
  batch.offset = offset_;
  const uint64_t count =
      recordLength_ != 0 ? (batch.size() + recordLength_ - 1) / recordLength_ : batch.lines.size();
  records_ += count;
  offset_ += batch.size();
  left_ -= there ? count : left_;
  return there;
}

// Records can be skipped by their length, lines only by looking at them.
void RecordReader::start() {
  if (recordLength_ != 0 && toSkip_ > 0) {
    const uint64_t bytes = product(toSkip_, recordLength_);
    input_.skip(bytes, wakeFd_);
    records_ = toSkip_;
    offset_ = bytes;
  }
}

// 0 at the end of the input.
std::size_t RecordReader::readMore(RecordBatch &batch, std::size_t most) {
  const std::size_t got = input_.read(batch.bytes.room(most).data(), most, wakeFd_);
  batch.bytes.commit(got);
  ended_ = got == 0;
  return got;
}

// No byte after the last record wanted is taken from the input.
bool RecordReader::readRecords(RecordBatch &batch) {
  const uint64_t most = std::clamp<uint64_t>(usualBatch / recordLength_, 1, mostRecords_);
  const auto wanted = static_cast<std::size_t>(std::min(left_, most) * recordLength_);
  while (batch.bytes.size() < recordLength_ && !ended_) {
    readMore(batch, std::min(wanted - batch.bytes.size(), usualBatch));
  }
  if (!ended_) {
    const std::size_t whole = batch.bytes.size() / recordLength_ * recordLength_;
    carried_ = batch.bytes.bytes().substr(whole);
    batch.bytes.truncate(whole);
  }
  return batch.bytes.size() > 0;
}

bool RecordReader::readLines(RecordBatch &batch) {
  batch.lines.clear();
  scanned_ = 0;
  ends_->restart();
  for (;;) {
    const std::size_t before = scanned_;
    findLines(batch);
    skipLines(batch);
    if (!batch.lines.empty() || (ended_ && scanned_ == batch.bytes.size())) {
      break;
    }
    if (batch.bytes.size() - scanned_ > longestLine) {
      refuseLongLine();
    }
    if (scanned_ == before) {
      readMore(batch, usualBatch);
    }
  }
  carried_ = batch.bytes.bytes().substr(scanned_);
  batch.bytes.truncate(scanned_);
  return !batch.lines.empty();
}

// The last line may have no end.
void RecordReader::findLines(RecordBatch &batch) {
  const std::string_view text = batch.bytes.bytes();
  const uint64_t most =
      left_ < mostRecords_ ? std::min<uint64_t>(left_ + toSkip_, mostRecords_) : mostRecords_;
  while (batch.lines.size() < most) {
    const auto line = ends_->lineAt(text, scanned_);
    if (!line) {
      break;
    }
    batch.lines.push_back(*line);
    scanned_ += line->end;
  }
  if (ended_ && batch.lines.size() < most && scanned_ < text.size()) {
    batch.lines.push_back({text.size() - scanned_, text.size() - scanned_});
    scanned_ = text.size();
  }
}

void RecordReader::skipLines(RecordBatch &batch) {
  const auto skipped = static_cast<std::ptrdiff_t>(std::min<uint64_t>(toSkip_, batch.lines.size()));
  const auto end = batch.lines.begin() + skipped;
  for (auto line = batch.lines.begin(); line != end; ++line) {
    batch.begin += line->end;
    offset_ += line->end;
  }
  batch.lines.erase(batch.lines.begin(), end);
  toSkip_ -= static_cast<uint64_t>(skipped);
  records_ += static_cast<uint64_t>(skipped);
}

void RecordReader::refuseLongLine() const {
  throw failure("{}: line {} at byte {}: it is longer than 1 GiB", input_.name(), records_ + 1,
                offset_);
}

} // namespace nls2::tool
