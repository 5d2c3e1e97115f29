// CSV as of RFC 4180: where its records end, and NLS2F_SplitCsv and NLS2F_JoinCsv.
#include "records/reader.h"

#include <cstring>
#include <unicode/utypes.h>

namespace zelfields {
namespace {

constexpr std::size_t npos = std::string_view::npos;

// Takes the fields of a record one after another, without their quotes.
class CsvSplitter {
public:
  CsvSplitter(std::string_view record, char *out) : record_(record), out_(out) {}

  // False after the last field, or at a fault.
  bool next(NLS2F_Span &field) {
    if (at_ > record_.size() || hasFault()) {
      return false;
    }
    field.offset = used_;
    const bool isQuoted = record_.substr(at_).starts_with('"');
    isQuoted ? takeQuoted() : takePlain();
    field.length = used_ - field.offset;
    ++at_; // the comma, or past the end
    return !hasFault();
  }

  bool hasFault() const { return faultAt_ != npos; }
  ProblemFacts fault() const {
    return {.kind = NLS2F_INVALID_CSV,
            .offset = static_cast<int64_t>(faultAt_),
            .bytes = record_.substr(faultAt_, 1)};
  }

private:
  void put(std::size_t end) {
    const std::size_t length = end - at_;
    if (length != 0) {
      std::memcpy(out_ + used_, record_.data() + at_, length);
    }
    used_ += static_cast<int64_t>(length);
    at_ = end;
  }

  void takePlain() {
    const std::size_t end = std::min(record_.find(',', at_), record_.size());
    const std::size_t quote = record_.substr(0, end).find('"', at_);
    faultAt_ = quote;
    put(end);
  }

  void takeQuoted() {
    const std::size_t opened = at_++;
    for (;;) {
      const std::size_t quote = record_.find('"', at_);
      if (quote == npos) {
        faultAt_ = opened;
        return;
      }
      put(quote);
      ++at_;
      if (!record_.substr(at_).starts_with('"')) {
        break;
      }
      put(at_ + 1);
    }
    if (at_ < record_.size() && record_[at_] != ',') {
      faultAt_ = at_;
    }
  }

  std::string_view record_;
  char *out_;
  std::size_t at_ = 0;
  int64_t used_ = 0;
  std::size_t faultAt_ = npos;
};

// U+FEFF at a record's beginning could be taken for a mark.
bool needsQuotes(std::string_view field) {
  return field.find_first_of("\",\r\n") != npos || field.starts_with("\xEF\xBB\xBF");
}

// Writes as long as there is room, and counts on.
class CsvOutput {
public:
  CsvOutput(char *out, int64_t room) : out_(out), room_(static_cast<std::size_t>(room)) {}

  void put(std::string_view bytes) {
    if (fits(bytes.size()) && !bytes.empty()) {
      std::memcpy(out_ + used_, bytes.data(), bytes.size());
    }
    used_ += bytes.size();
  }

  void putQuoted(std::string_view field) {
    put("\"");
    for (std::size_t quote; (quote = field.find('"')) != npos; field.remove_prefix(quote + 1)) {
      put(field.substr(0, quote + 1));
      put("\"");
    }
    put(field);
    put("\"");
  }

  bool fits(std::size_t more = 0) const { return used_ <= room_ && more <= room_ - used_; }
  int64_t used() const { return static_cast<int64_t>(used_); }

private:
  char *out_;
  std::size_t room_;
  std::size_t used_ = 0;
};

} // namespace

// A quote opens a field at its beginning only, so that a record with one elsewhere ends in its line.
Found nextCsv(Piece &piece, ReaderState &state) {
  const std::string_view text = piece.text;
  const std::size_t record = piece.at;
  std::size_t at = std::max(
      record, static_cast<std::size_t>(std::max<int64_t>(state.searched - state.total, 0)));
  for (;;) {
    const std::size_t lf = state.isQuoted ? npos : text.find('\n', at);
    const std::size_t quote = text.substr(0, lf).find('"', at);
    if (quote != npos) {
      const int64_t place = state.total + static_cast<int64_t>(quote);
      const bool opens = quote == record || text[quote - 1] == ',' || place == state.closedAt;
      state.closedAt = state.isQuoted ? place + 1 : -1;
      state.isQuoted = !state.isQuoted && opens;
      at = quote + 1;
    } else if (lf != npos) {
      const bool hasReturn = lf > record && text[lf - 1] == '\r';
      return piece.found(record, lf - record - (hasReturn ? 1 : 0), lf + 1);
    } else {
      break;
    }
  }
  state.searched = state.total + static_cast<int64_t>(text.size());
  if (!piece.isLast || record == text.size()) {
    return Found::more;
  }
  return state.isQuoted ? piece.failed(NLS2F_CUT_SHORT, record)
                        : piece.found(record, text.size() - record, text.size());
}

} // namespace zelfields

using namespace zelfields;

int32_t NLS2F_SplitCsv(const void *record, int64_t length, void *out, NLS2F_Span *fields,
                       int64_t capacity, int64_t *count, NLS2F_Problem *problem) {
  if (!cleared(count) || !isRange(record, length) || !isRange(out, length) ||
      !isRange(fields, capacity) || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  CsvSplitter splitter(viewOf(record, length), static_cast<char *>(out));
  NLS2F_Span field;
  for (; splitter.next(field); ++*count) {
    if (*count < capacity) {
      fields[*count] = field;
    }
  }
  if (splitter.hasFault()) {
    *count = 0;
    return setProblem(problem, splitter.fault());
  }
  return *count <= capacity ? 0 : U_BUFFER_OVERFLOW_ERROR;
}

int32_t NLS2F_JoinCsv(const void *bytes, const NLS2F_Span *fields, int64_t count, void *out,
                      int64_t room, int64_t *written, NLS2F_Problem *problem) {
  if (!cleared(written) || !isRange(fields, count) || !isRange(out, room) || !isProblem(problem)) {
    return NLS2_ERR_INVALID_PARAMETER;
  }
  CsvOutput output(static_cast<char *>(out), room);
  for (int64_t i = 0; i < count; ++i) {
    if (!isSpan(bytes, fields[i])) {
      return NLS2_ERR_INVALID_PARAMETER;
    }
    const std::string_view field = spanOf(bytes, fields[i]);
    output.put(i == 0 ? "" : ",");
    needsQuotes(field) || (count == 1 && field.empty()) ? output.putQuoted(field)
                                                        : output.put(field);
  }
  if (!output.fits()) {
    return setProblem(problem, {.kind = NLS2F_NO_ROOM, .needed = output.used()});
  }
  *written = output.used();
  return 0;
}
