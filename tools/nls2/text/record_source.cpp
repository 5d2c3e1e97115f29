// Reads the records of a file, in pieces or one by one.

#include "text/record_source.h"

#include <algorithm>

namespace nls2::tool {

namespace {

constexpr std::size_t usualPiece = std::size_t{256} * 1024;
constexpr std::size_t longest = std::size_t{1} << 30;

Reader openReader(const RecordShape &shape, const char *option) {
  auto problem = sized<NLS2F_Problem>();
  NLS2F_Reader *reader = nullptr;
  if (!isDone(NLS2F_OpenReader(shape.format.c_str(), shape.page.get(), &reader, &problem))) {
    throw usageError("{}: \"{}\": {}", option, printable(shape.format), wordsOf(problem));
  }
  return Reader(reader);
}

} // namespace

int64_t fixedLength(const std::string &format) {
  return format.starts_with("fixed:") ? wholeNumber<int64_t>(format.substr(6)).value_or(0) : 0;
}

Writer openWriter(const char *option, const std::string &format, const CodePage &page) {
  auto problem = sized<NLS2F_Problem>();
  NLS2F_Writer *writer = nullptr;
  if (!isDone(NLS2F_OpenWriter(format.c_str(), page.get(), &writer, &problem))) {
    throw usageError("{}: \"{}\": {}", option, printable(format), wordsOf(problem));
  }
  return Writer(writer);
}

RecordSource::RecordSource(InputFile &input, RecordShape shape, const char *option)
    : input_(input), shape_(std::move(shape)),
      fixed_(static_cast<std::size_t>(fixedLength(shape_.format))),
      hasEnds_(shape_.format.starts_with("lines") || shape_.format.starts_with("csv")),
      prefix_(shape_.format.starts_with("prefixed") || shape_.format == "blocked" ? 4 : 0),
      reader_(openReader(shape_, option)) {}

CodePage RecordSource::page() const {
  const char *name = "";
  isDone(NLS2F_ReaderPage(reader_.get(), &name));
  return *name == '\0' || name == shape_.page.name() ? shape_.page : CodePage("page", name);
}

bool RecordSource::read(RecordPiece &piece) {
  skipFixed();
  piece.problem.reset();
  piece.bytes.clear(2 * usualPiece);
  piece.bytes.append(carried_);
  piece.offset = offset_;
  while (shape_.count > 0) {
    if (find(piece)) {
      return true;
    }
    if (ended_) {
      break;
    }
    if (piece.bytes.size() > longest) {
      throw failure("{}: record {} at byte {} is longer than 1 GiB", input_.name(), records_ + 1,
                    offset_);
    }
    readMore(piece);
  }
  return false;
}

// Skips records by their length.
void RecordSource::skipFixed() {
  constexpr uint64_t farthest = std::numeric_limits<int64_t>::max();
  if (fixed_ != 0 && shape_.skip > 0) {
    records_ = std::exchange(shape_.skip, 0);
    offset_ = records_ > farthest / fixed_ ? farthest : records_ * fixed_;
    input_.skip(offset_);
  }
}

// Reads no byte after the last fixed record wanted.
void RecordSource::readMore(RecordPiece &piece) {
  std::size_t most = usualPiece;
  if (fixed_ != 0) {
    const uint64_t records = std::clamp<uint64_t>(usualPiece / fixed_, 1, shape_.mostInPiece);
    const std::size_t wanted = std::min<uint64_t>(records, shape_.count) * fixed_;
    most = std::min(wanted - std::min(wanted, piece.bytes.size()), usualPiece);
  }
  const std::size_t got = input_.read(piece.bytes.room(most).data(), most);
  piece.bytes.commit(got);
  ended_ = got == 0;
}

// True if there are records now, or a problem. What follows the records is kept for the next piece.
bool RecordSource::find(RecordPiece &piece) {
  const uint64_t most = std::max<uint64_t>(shape_.mostInPiece, 2);
  const uint64_t limit = shape_.count > most ? most : shape_.count;
  const uint64_t dropped = shape_.skip + (shape_.hasHeader && !foundHeader_ ? 1 : 0);
  piece.records.resize(dropped > 0 ? most : limit);
  auto problem = sized<NLS2F_Problem>();
  int64_t end = 0;
  int64_t count = 0;
  const std::string_view bytes = piece.bytes.bytes();
  const bool isFine = isDone(NLS2F_ReadRecords(
      reader_.get(), bytes.data(), sizeOf(bytes), ended_ ? 1 : 0, &end, piece.records.data(),
      static_cast<int64_t>(piece.records.size()), &count, &problem));
  piece.records.resize(static_cast<std::size_t>(count));
  if (!isFine && records_ == 0 && !ended_ && bytes.size() < usualPiece) {
    return false; // more of the input shows whether another format holds
  }
  if (!isFine) {
    piece.problem = problem;
    piece.whole = {{0, sizeOf(bytes)}};
    piece.number = records_ + 1;
    shape_.count = 0;
    return true;
  }
  if (count == 0) {
    return false;
  }
  const auto used = static_cast<std::size_t>(end);
  setBounds(piece, used);
  carried_ = bytes.substr(used);
  dropHeader(piece, used);
  const std::size_t skipped = std::min<uint64_t>(shape_.skip, piece.records.size());
  shape_.skip -= skipped;
  const std::size_t kept = std::min<uint64_t>(shape_.count, piece.records.size() - skipped);
  piece.records.erase(piece.records.begin(), piece.records.begin() + static_cast<long>(skipped));
  piece.whole.erase(piece.whole.begin(), piece.whole.begin() + static_cast<long>(skipped));
  piece.records.resize(kept);
  piece.whole.resize(kept);
  piece.number = records_ + skipped + 1;
  records_ += skipped + kept;
  shape_.count -= kept;
  offset_ += used;
  if (kept > 0) {
    return true;
  }
  piece.bytes.truncate(0);
  piece.bytes.append(carried_);
  piece.offset = offset_;
  return find(piece);
}

// Where each record begins and ends with all that belongs to it.
void RecordSource::setBounds(RecordPiece &piece, std::size_t end) const {
  piece.whole.resize(piece.records.size());
  for (std::size_t i = 0; i < piece.records.size(); ++i) {
    const NLS2F_Span &record = piece.records[i];
    const int64_t begin = record.offset - static_cast<int64_t>(prefix_);
    const int64_t next =
        i + 1 < piece.records.size() ? piece.records[i + 1].offset : static_cast<int64_t>(end);
    piece.whole[i] = {begin, (hasEnds_ ? next : record.offset + record.length) - begin};
  }
}

// Keeps the header, and what is before the first record.
void RecordSource::dropHeader(RecordPiece &piece, std::size_t end) {
  if (begun_ && (!shape_.hasHeader || foundHeader_)) {
    return;
  }
  begun_ = true;
  if (shape_.hasHeader) {
    header_ = piece.text(0);
    foundHeader_ = true;
    piece.records.erase(piece.records.begin());
    piece.whole.erase(piece.whole.begin());
  }
  const std::size_t before =
      piece.whole.empty() ? end : static_cast<std::size_t>(piece.whole.front().offset);
  preamble_ = hasEnds_ ? piece.bytes.bytes().substr(0, before) : "";
}

std::optional<Record> RecordFile::next() {
  while (next_ == piece_.records.size()) {
    next_ = 0;
    if (!source_.read(piece_)) {
      piece_.records.clear();
      return {};
    }
    if (piece_.problem) {
      throw failure("{}: {} {} at byte {}: {}", input_.name(), unit_, piece_.number, piece_.offset,
                    wordsOf(*piece_.problem));
    }
  }
  const std::size_t i = next_++;
  const std::string_view text = piece_.text(i);
  const NLS2F_Span &whole = piece_.whole[i];
  const auto end = static_cast<std::size_t>(whole.offset + whole.length) -
                   static_cast<std::size_t>(piece_.records[i].offset) - text.size();
  return Record{text, {text.data() + text.size(), end}, piece_.number + i, piece_.offsetOf(i)};
}

Option linesOrFixed(std::string &format) {
  return value("read", "FORMAT", "lines (the default) or fixed:N", [&](const std::string &text) {
    if (!text.starts_with("lines") && !text.starts_with("fixed")) {
      throw usageError("--read: \"{}\" is not lines or fixed:N", printable(text));
    }
    format = text;
  });
}

std::string lineEnd(const std::string &format, const CodePage &page) {
  if (!format.starts_with("lines")) {
    return "";
  }
  const NLS2F_Span empty{0, 0};
  std::string end(16, '\0');
  int64_t written = 0;
  int64_t done = 0;
  isDone(NLS2F_WriteRecords(openWriter("--read", format, page).get(), "", &empty, 1, end.data(),
                            sizeOf(end), &written, &done, nullptr));
  end.resize(static_cast<std::size_t>(written));
  return end;
}

} // namespace nls2::tool
