// Reads records of one length, or lines, in batches or one by one.

#include "text/record_reader.h"

#include <set>

namespace nls2::tool {

namespace {

constexpr std::size_t npos = std::string_view::npos;
constexpr std::size_t usualBatch = std::size_t{256} * 1024;
constexpr std::size_t longestLine = std::size_t{1} << 30;

std::string bytesOf(const CodePage &page, char16_t character) {
  const auto encoded = page.encoded(character);
  return encoded ? encoded->bytes : "";
}

// A byte search is correct only if the bytes of the line end cannot be part of another character.
// That holds for single bytes below 0x40 in every page, and in the Unicode encodings listed here.
std::string bytesOfNel(const CodePage &page) {
  static const std::set searched{UCNV_UTF8,
                                 UCNV_CESU8,
                                 UCNV_UTF16_BigEndian,
                                 UCNV_UTF16_LittleEndian,
                                 UCNV_UTF32_BigEndian,
                                 UCNV_UTF32_LittleEndian};
  std::string bytes = bytesOf(page, u'\u0085');
  return bytes.size() == 1 || searched.contains(ucnv_getType(page.converter())) ? bytes : "";
}

} // namespace

std::string lineFeedOf(const CodePage &page, bool isMoved) {
  static const std::set dependent{UCNV_UTF16, UCNV_UTF32, UCNV_SCSU, UCNV_ISCII,
                                  UCNV_COMPOUND_TEXT};
  static const std::set withStates{UCNV_HZ, UCNV_ISO_2022};
  std::string bytes = bytesOf(page, u'\n');
  if (bytes.empty()) {
    throw usageError("code page {} has no line feed", page.number());
  }
  const UConverterType type = ucnv_getType(page.converter());
  if (dependent.contains(type) || (isMoved && withStates.contains(type))) {
    throw usageError("code page {} has no lines that can be read one by one; for UTF-16 and UTF-32 "
                     "use a page without a signature, such as 1200",
                     page.number());
  }
  return bytes;
}

// In UTF-8 the unit is a byte: its NEL has two, which cannot begin inside a character.
std::size_t EndPattern::next(std::string_view text, std::size_t from) {
  if (bytes_.empty() || (found_ != npos && found_ >= from)) {
    return found_;
  }
  const std::size_t unit = bytes_.front() == '\xC2' ? 1 : bytes_.size();
  found_ = text.find(bytes_, std::max(from, searched_));
  while (found_ != npos && found_ % unit != 0) {
    found_ = text.find(bytes_, found_ + 1);
  }
  searched_ = found_ != npos ? found_ : text.size() - std::min(text.size(), bytes_.size() - 1);
  return found_;
}

void EndPattern::restart() {
  found_ = npos;
  searched_ = 0;
}

std::optional<Record> RecordBatch::next() {
  Record record = next_;
  if (record.whole.empty()) {
    return {};
  }
  const LineBounds bounds = length_ != 0 ? LineBounds{length_, length_} : lines_[line_++];
  record.text = record.whole.substr(0, bounds.text);
  record.whole = record.whole.substr(0, bounds.end);
  next_.whole.remove_prefix(record.whole.size());
  next_.offset += record.whole.size();
  ++next_.number;
  return record;
}

RecordReader::RecordReader(InputFile &input, const RecordShape &shape)
    : input_(input), shape_(shape) {
  if (shape.length == 0) {
    const CodePage page(shape.page, "--from");
    lineFeed_ = EndPattern(lineFeedOf(page, !shape.isText));
    if (shape.isText) {
      nextLine_ = EndPattern(bytesOfNel(page));
      carriageReturn_ = bytesOf(page, u'\r');
    }
  }
}

bool RecordReader::read(RecordBatch &batch) {
  if (shape_.count == 0) {
    return false;
  }
  batch.bytes_.clear(2 * usualBatch);
  batch.bytes_.append(carried_);
  batch.lines_.clear();
  batch.line_ = 0;
  batch.length_ = shape_.length;
  const std::size_t skipped = shape_.length != 0 ? readRecords(batch) : readLines(batch);
  batch.next_ = {{}, batch.bytes_.bytes().substr(skipped), records_ + 1, offset_};
  const std::size_t size = batch.next_.whole.size();
  const uint64_t count =
      shape_.length != 0 ? (size + shape_.length - 1) / shape_.length : batch.lines_.size();
  records_ += count;
  offset_ += size;
  shape_.count -= count;
  return batch.bytes_.size() > 0;
}

void RecordReader::readMore(RecordBatch &batch, std::size_t most) {
  const std::size_t got = input_.read(batch.bytes_.room(most).data(), most);
  batch.bytes_.commit(got);
  ended_ = got == 0;
}

// Keeps the bytes from `from` on for the next batch.
void RecordReader::carry(RecordBatch &batch, std::size_t from) {
  carried_ = batch.bytes_.bytes().substr(from);
  batch.bytes_.truncate(from);
}

// Skips records by their length. Reads no byte after the last record wanted.
std::size_t RecordReader::readRecords(RecordBatch &batch) {
  constexpr uint64_t farthest = std::numeric_limits<uint64_t>::max();
  if (shape_.skip > 0) {
    records_ = std::exchange(shape_.skip, 0);
    offset_ = records_ > farthest / shape_.length ? farthest : records_ * shape_.length;
    input_.skip(offset_);
  }
  const uint64_t most = std::clamp<uint64_t>(usualBatch / shape_.length, 1, shape_.mostInBatch);
  const auto wanted = static_cast<std::size_t>(std::min(shape_.count, most) * shape_.length);
  while (batch.bytes_.size() < shape_.length && !ended_) {
    readMore(batch, std::min(wanted - batch.bytes_.size(), usualBatch));
  }
  const std::size_t size = batch.bytes_.size();
  carry(batch, ended_ ? size : size / shape_.length * shape_.length);
  return 0;
}

// Lines must be read to be skipped.
std::size_t RecordReader::readLines(RecordBatch &batch) {
  scanned_ = 0;
  lineFeed_.restart();
  nextLine_.restart();
  std::size_t skipped = findLines(batch);
  while (scanned_ == 0 && !ended_) {
    if (batch.bytes_.size() > longestLine) {
      throw failure("{}: line {} at byte {}: longer than 1 GiB", input_.name(), records_ + 1,
                    offset_);
    }
    readMore(batch, usualBatch);
    skipped = findLines(batch);
  }
  carry(batch, scanned_);
  return skipped;
}

// Returns the number of bytes in skipped lines, which come first.
std::size_t RecordReader::findLines(RecordBatch &batch) {
  const std::string_view text = batch.bytes_.bytes();
  std::size_t skipped = 0;
  while (scanned_ < text.size() &&
         batch.lines_.size() < std::min(shape_.count, shape_.mostInBatch)) {
    const RecordBatch::LineBounds line = nextLine(text);
    if (line.end == 0) {
      break;
    }
    scanned_ += line.end;
    if (shape_.skip > 0) {
      --shape_.skip;
      ++records_;
      offset_ += line.end;
      skipped = scanned_;
    } else {
      batch.lines_.push_back(line);
    }
  }
  return skipped;
}

// LF, CR LF and NEL (U+0085) end a line; the last line may have no end. Empty if the end is not in
// the text yet.
RecordBatch::LineBounds RecordReader::nextLine(std::string_view text) {
  const std::size_t lf = lineFeed_.next(text, scanned_);
  const std::size_t nel = nextLine_.next(text, scanned_);
  if (lf == npos && nel == npos) {
    const std::size_t rest = ended_ ? text.size() - scanned_ : 0;
    return {rest, rest};
  }
  const std::size_t length = std::min(lf, nel) - scanned_;
  if (nel < lf) {
    return {length, length + nextLine_.length()};
  }
  const bool hasReturn =
      !carriageReturn_.empty() && text.substr(scanned_, length).ends_with(carriageReturn_);
  return {length - (hasReturn ? carriageReturn_.size() : 0), length + lineFeed_.length()};
}

std::optional<Record> RecordFile::next() {
  std::optional<Record> record = batch_.next();
  while (!record && reader_.read(batch_)) {
    record = batch_.next();
  }
  if (record && record->text.size() < shape_.length) {
    throw fail(*record,
               fmt::format(": the input ends after {} of {} bytes; is --record-length {} right?",
                           record->text.size(), shape_.length, shape_.length));
  }
  return record;
}

Error RecordFile::fail(const Record &record, const std::string &what) const {
  return failure("{}: {} {} at byte {}{}", input_.name(), shape_.length == 0 ? "line" : "record",
                 record.number, record.offset, what);
}

} // namespace nls2::tool
