// An open reader: where the records of an input begin and end.
#pragma once

#include "records/format.h"

#include <vector>

namespace zelfields {

// The state of a search for one record; positions count from the beginning of the input.
struct ReaderState {
  int64_t total = 0;    // bytes read
  int64_t records = 0;  // that have been found
  int64_t searched = 0; // no end of the next record begins before
  int64_t mainAt = -1;  // lines: the next main end, if it is known
  int64_t mainSearched = 0;
  int64_t closedAt = -1; // csv: after the last closing quote
  bool isQuoted = false;
  int64_t blockEnd = 0; // blocked
  Detail hint = Detail::none;
};

// What there is at a place of a piece.
enum class Found { record, more, problem };

// A piece of the input, and one record after another in it.
struct Piece {
  std::string_view text;
  bool isLast;
  std::size_t at = 0;         // where the next record begins, with its prefix
  NLS2F_Span record = {0, 0}; // if there is one
  ProblemFacts problem = {};  // if there is one: `offset` counts from the piece

  std::string_view rest() const { return text.substr(at); }
  Found found(std::size_t begin, std::size_t length, std::size_t next) {
    record = {static_cast<int64_t>(begin), static_cast<int64_t>(length)};
    at = next;
    return Found::record;
  }
  Found failed(int32_t kind, std::size_t offset, int64_t needed = 0, std::string_view bytes = {}) {
    problem = {
        .kind = kind, .offset = static_cast<int64_t>(offset), .needed = needed, .bytes = bytes};
    return Found::problem;
  }
};

Found nextLine(const LineEnds &ends, Piece &piece, ReaderState &state);
Found nextCsv(Piece &piece, ReaderState &state);
Found nextPrefixed(const RecordFormat &format, Piece &piece, int64_t total, int64_t &blockEnd);

// Another format in which the first prefixes hold, if those of this one do not.
inline constexpr int prefixesForHint = 10;
Detail hintFor(const RecordFormat &format, Piece piece);

} // namespace zelfields

struct NLS2F_Reader {
  // Pages from which a byte-order mark chooses. The first is that of an input without one.
  struct MarkedPage {
    std::string mark;
    std::string name;
    zelfields::LineEnds ends;
  };

  zelfields::RecordFormat format;
  std::vector<MarkedPage> pages;
  std::size_t page = 0;
  zelfields::ReaderState state;
};
