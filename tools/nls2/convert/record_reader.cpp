// Records of one length, or lines, read in batches of many.

#include "convert/record_reader.h"

#include "errors.h"

#include <set>

namespace nls2::tool {

namespace {

constexpr std::size_t npos = std::string_view::npos;
constexpr std::size_t usualBatch = std::size_t{256} * 1024;
constexpr std::size_t usualOutput = std::size_t{2} << 20;
constexpr std::size_t longestLine = std::size_t{1} << 30;

std::string bytesOf(const CodePage &page, char16_t character) {
  const auto encoded = page.encoded(character);
  return encoded ? encoded->bytes : "";
}

// Searching bytes finds characters only where no character's bytes can hold another's. That is so
// for single bytes below 0x40 in every page, and for the encodings of Unicode that are searched.
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

std::string bytesOfLineFeed(const CodePage &page) {
  static const std::set dependent{UCNV_UTF16, UCNV_UTF32, UCNV_SCSU, UCNV_COMPOUND_TEXT};
  std::string bytes = bytesOf(page, u'\n');
  if (bytes.empty()) {
    throw usageError("--lines: code page {} has no line feed", page.number());
  }
  if (dependent.contains(ucnv_getType(page.converter()))) {
    throw usageError("--lines: a line of code page {} depends on the text before it; of UTF-16 "
                     "and UTF-32 give the page without a signature, such as 1200",
                     page.number());
  }
  return bytes;
}

// The bytes that a record takes in the output at the least, where it is filled.
std::size_t filledLength(const TranslateOptions &options) {
  const std::size_t filled = options.padding == nls2::padding::fill ? options.outLength : 0;
  std::size_t length = options.fields.empty() ? filled : 0;
  for (const FieldSpec &field : options.fields) {
    length += field.width != 0 ? field.width : filled;
  }
  return length;
}

} // namespace

// UTF-8 has a byte as its unit, and an end of two bytes that cannot begin inside a character.
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

RecordReader::RecordReader(InputFile &input, const TranslateOptions &options)
    : input_(input), recordLength_(options.recordLength), toSkip_(options.skip),
      left_(options.count),
      mostRecords_(std::max<std::size_t>(usualOutput / (filledLength(options) + 1), 1)) {
  if (recordLength_ == 0) {
    const CodePage page(options.from, "--from");
    lineFeed_ = EndPattern(bytesOfLineFeed(page));
    nextLine_ = EndPattern(bytesOfNel(page));
    carriageReturn_ = bytesOf(page, u'\r');
  }
}

bool RecordReader::read(RecordBatch &batch) {
  if (left_ == 0) {
    return false;
  }
  batch.bytes.clear(2 * usualBatch);
  batch.bytes.append(carried_);
  batch.lines.clear();
  batch.begin = 0;
  batch.recordLength = recordLength_;
  recordLength_ != 0 ? readRecords(batch) : readLines(batch);
  batch.recordsBefore = records_;
  batch.offset = offset_;
  const uint64_t count =
      recordLength_ != 0 ? (batch.size() + recordLength_ - 1) / recordLength_ : batch.lines.size();
  records_ += count;
  offset_ += batch.size();
  left_ -= count;
  return batch.bytes.size() > 0;
}

void RecordReader::readMore(RecordBatch &batch, std::size_t most) {
  const std::size_t got = input_.read(batch.bytes.room(most).data(), most);
  batch.bytes.commit(got);
  ended_ = got == 0;
}

// Keeps the bytes from there on for the next batch.
void RecordReader::carry(RecordBatch &batch, std::size_t from) {
  carried_ = batch.bytes.bytes().substr(from);
  batch.bytes.truncate(from);
}

// No byte after the last record wanted is taken from the input.
void RecordReader::readRecords(RecordBatch &batch) {
  skipRecords();
  const uint64_t most = std::clamp<uint64_t>(usualBatch / recordLength_, 1, mostRecords_);
  const auto wanted = static_cast<std::size_t>(std::min(left_, most) * recordLength_);
  while (batch.bytes.size() < recordLength_ && !ended_) {
    readMore(batch, std::min(wanted - batch.bytes.size(), usualBatch));
  }
  const std::size_t size = batch.bytes.size();
  carry(batch, ended_ ? size : size / recordLength_ * recordLength_);
}

// Records can be skipped by their length, lines only by looking at them.
void RecordReader::skipRecords() {
  constexpr uint64_t most = std::numeric_limits<uint64_t>::max();
  if (toSkip_ > 0) {
    offset_ = toSkip_ > most / recordLength_ ? most : toSkip_ * recordLength_;
    records_ = std::exchange(toSkip_, 0);
    input_.skip(offset_);
  }
}

void RecordReader::readLines(RecordBatch &batch) {
  scanned_ = 0;
  lineFeed_.restart();
  nextLine_.restart();
  findLines(batch);
  while (scanned_ == 0 && !ended_) {
    if (batch.bytes.size() > longestLine) {
      throw failure("{}: line {} at byte {}: it is longer than 1 GiB", input_.name(), records_ + 1,
                    offset_);
    }
    readMore(batch, usualBatch);
    findLines(batch);
  }
  carry(batch, scanned_);
}

void RecordReader::findLines(RecordBatch &batch) {
  const std::string_view text = batch.bytes.bytes();
  while (scanned_ < text.size() && batch.lines.size() < std::min(left_, mostRecords_)) {
    const LineBounds line = nextLine(text);
    if (line.end == 0) {
      return;
    }
    scanned_ += line.end;
    if (toSkip_ > 0) {
      --toSkip_;
      ++records_;
      offset_ += line.end;
      batch.begin = scanned_;
    } else {
      batch.lines.push_back(line);
    }
  }
}

// LF, CR LF and NEL (U+0085) end a line. It has no bytes where its end is not in the text yet; the
// last line may have no end.
LineBounds RecordReader::nextLine(std::string_view text) {
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

} // namespace nls2::tool
