// The loops over a field: rows are found, and their bytes written.
#pragma once

#include "translate/row.h"
#include "translate/sources.h"
#include "translate/table.h"

#include <cstring>

namespace zelfields {

// Eight rows at once. Spelt out for each, since compilers leave such loops rolled at lower levels of
// optimisation.
struct EightRows {
  static constexpr std::ptrdiff_t count = 8;

  template <class Source>
  static EightRows of(const Row *rows, const char *source) {
    const auto at = [&](std::size_t i) { return rows[Source::codeAt(source, i)]; };
    return {at(0), at(1), at(2), at(3), at(4), at(5), at(6), at(7)};
  }
  template <class Use>
  void forEach(Use use) const {
    use(a), use(b), use(c), use(d), use(e), use(f), use(g), use(h);
  }
  Row common() const { return a & b & c & d & e & f & g & h; }
  Row any() const { return a | b | c | d | e | f | g | h; }
  // Whether the first `few` have a flag.
  bool firstHave(std::ptrdiff_t few, Row flag) const {
    Row common = flag;
    forEach([&](Row row) { common &= row | (few-- > 0 ? 0 : flag); });
    return common != 0;
  }

  Row a, b, c, d, e, f, g, h;
};

// What a loop writes. As a local object, all of it stays in registers.
template <bool shifts>
class Output {
public:
  Output(char *begin, int64_t size) : at_(begin), limit_(begin + size) {}

  char *at() const { return at_; }
  bool hasReplaced() const { return (seen_ & row::replaced) != 0; }
  bool hasRoomForEight() const { return limit_ - at_ >= EightRows::count * (row::mostBytes + 1); }

  // Writes eight rows if they are alike, or need no shift. False if not.
  [[gnu::always_inline]] bool put(const EightRows &rows, Row refused) {
    const Row common = rows.common();
    if ((common & row::plain) != 0 && !mode_) {
      putPlain(rows, EightRows::count);
    } else if ((common & row::pair) != 0 && (!shifts || mode_)) {
      putPairs(rows, EightRows::count);
    } else if (!shifts && (common & row::known) != 0 && (rows.any() & refused) == 0) {
      seen_ |= rows.any();
      rows.forEach([&](Row row) { row::putFour(at_, row), at_ += row::size(row); });
    } else {
      return false;
    }
    return true;
  }
  // Likewise the first few of them.
  [[gnu::always_inline]] bool putFirst(const EightRows &rows, std::ptrdiff_t few) {
    if (!mode_ && rows.firstHave(few, row::plain)) {
      putPlain(rows, few);
    } else if (!shifts && rows.firstHave(few, row::pair)) {
      putPairs(rows, few);
    } else {
      return false;
    }
    return true;
  }
  // False if there is no room; `isSafe` if there must be.
  template <bool isSafe>
  [[gnu::always_inline]] bool put(Row row) {
    const std::ptrdiff_t size = row::size(row);
    if (shifts && size != 0 && (size == 2) != mode_) {
      if (!isSafe && at_ == limit_) {
        return false;
      }
      shift();
    }
    if (isSafe || limit_ - at_ >= row::mostBytes) {
      row::putFour(at_, row);
    } else if (limit_ - at_ < size) {
      return false;
    } else {
      char bytes[row::mostBytes];
      row::putFour(bytes, row);
      std::memcpy(at_, bytes, static_cast<std::size_t>(size));
    }
    at_ += size;
    seen_ |= row;
    return true;
  }
  bool close() {
    if (mode_ && at_ == limit_) {
      return false;
    }
    if (mode_) {
      shift();
    }
    return true;
  }

private:
  void putPlain(const EightRows &rows, std::ptrdiff_t few) {
    char *target = at_;
    rows.forEach([&](Row row) { *target++ = row::firstByte(row); });
    at_ += few;
  }
  void putPairs(const EightRows &rows, std::ptrdiff_t few) {
    char *target = at_;
    rows.forEach([&](Row row) { row::putTwo(target, row), target += 2; });
    at_ += 2 * few;
  }
  void shift() {
    mode_ = !mode_;
    *at_++ = mode_ ? shiftOut : shiftIn;
  }

  char *at_;
  char *limit_;
  Row seen_ = 0;
  bool mode_ = false; // whether two bytes are a character
};

// The row of the next character; one that is not known if only the path understands it. `isSafe` if
// the field does not end within it.
template <class Source, bool isSafe>
[[gnu::always_inline]] inline Row Table::nextRow(const Row *rows, const char *&source,
                                                 const char *end, bool &mode) {
  const uint32_t code = Source::template next<isSafe>(source, end, mode);
  if (code >= noCode) [[unlikely]] {
    return code == endOfField ? row::none : 0;
  }
  Row next = rows[code];
  if (Source::hasLeads && (next & row::lead) != 0 && (isSafe || source != end)) {
    return rowOf(code << 8 | byteAt(source++));
  }
  if (next == 0) [[unlikely]] {
    next = learn(code);
    if (Source::hasLeads && (next & row::lead) != 0 && (isSafe || source != end)) {
      return rowOf(code << 8 | byteAt(source++));
    }
  }
  return next;
}

// Cuts blanks and nulls off the end.
template <class Source>
// NOLINTNEXTLINE(readability-function-cognitive-complexity): one loop, for speed
inline const char *Table::trim(const char *begin, const char *end, int64_t &cut) {
  if constexpr (Source::codesAreBytes) {
    constexpr Row cuts = row::blank | row::null;
    const Row *const rows = rows_.get();
    while (end - begin >= EightRows::count) {
      const char *const start = end - EightRows::count;
      if ((rows[byteAt(start)] & rows[byteAt(end - 1)] & cuts) == 0) {
        break;
      }
      const Row common = EightRows::of<Source>(rows, start).common();
      if ((common & cuts) == 0) {
        break;
      }
      cut += (common & row::blank) != 0 ? EightRows::count : 0;
      end = start;
    }
  }
  while (end != begin) {
    const char *start = end;
    const uint32_t code = Source::last(begin, start);
    const Row kind = Source::codesAreBytes ? rowOf(code) : code < noCode ? row::kindOf(code) : 0;
    if ((kind & (row::blank | row::null)) == 0) {
      break;
    }
    cut += (kind & row::blank) != 0 ? 1 : 0;
    end = start;
  }
  return end;
}

// Goes as far as eight codes can be looked up at once. The result is how many should now be looked
// up one by one.
template <class Source, bool shifts>
[[gnu::always_inline]] inline int Table::runBlocks(const char *&source, const char *end,
                                                   Output<shifts> &output, Row refused, bool mode) {
  constexpr std::ptrdiff_t blockBytes = EightRows::count * Source::blockWidth;
  while (end - source >= blockBytes && output.hasRoomForEight()) {
    const std::ptrdiff_t sure = Source::codesInBlock(source, mode);
    if (sure == 0) {
      return 1;
    }
    const auto eight = EightRows::of<Source>(rows_.get(), source);
    if (sure < EightRows::count) {
      const bool isPut = output.putFirst(eight, sure);
      source += isPut ? sure * Source::blockWidth : 0;
      return isPut ? 1 : static_cast<int>(sure);
    }
    if (!output.put(eight, refused)) {
      return EightRows::count;
    }
    source += blockBytes;
  }
  return 1;
}

// Translates a text, or finds that the path must.
template <class Source, bool shifts>
// NOLINTNEXTLINE(readability-function-cognitive-complexity): one loop, for speed
bool Table::run(std::string_view field, Room room, Done &done) {
  const char *source = field.data();
  const char *end = source + field.size();
  int64_t cut = 0;
  Row refused = 0;
  if (isPadded_) {
    if constexpr (!Source::findsEnd) {
      return runToEnd<Source, shifts>(field, room, done);
    }
    end = trim<Source>(source, end, cut);
    refused = row::null;
  }
  const Row *const rows = rows_.get();
  Output<shifts> output(room.begin, std::min(width_, room.size));
  bool mode = false; // the source's
  while (source != end) {
    int singles = runBlocks<Source, shifts>(source, end, output, refused, mode);
    const auto goesOn = [&] {
      return source != end && (singles-- > 0 || Source::isNoBlock(source, mode));
    };
    // Eight at a time need no look at the ends.
    while (end - source >= EightRows::count * Source::longest && output.hasRoomForEight() &&
           goesOn()) {
      for (int i = EightRows::count; i > 0; i = goesOn() ? i - 1 : 0) {
        const Row next = nextRow<Source, true>(rows, source, end, mode);
        if (!row::isKnown(next) || (next & refused) != 0) {
          return false;
        }
        output.template put<true>(next);
      }
    }
    while (goesOn()) {
      const Row next = nextRow<Source, false>(rows, source, end, mode);
      if (!row::isKnown(next) || (next & refused) != 0 || !output.template put<false>(next)) {
        return false;
      }
    }
  }
  return finish<Source>(output, field.data(), end, cut, room, done);
}

// Likewise for a page whose blanks can be found only on the way to its end.
template <class Source, bool shifts>
bool Table::runToEnd(std::string_view field, Room room, Done &done) {
  const Row *const rows = rows_.get();
  const char *source = field.data();
  const char *const end = source + field.size();
  Output<shifts> output(room.begin, std::min(width_, room.size));
  Output<shifts> text = output; // without the blanks and nulls so far at its end
  const char *textEnd = source;
  int64_t cut = 0;
  bool nulls = false;
  bool mode = false;
  while (source != end) {
    const Row next = nextRow<Source, false>(rows, source, end, mode);
    if (!row::isKnown(next) || !output.template put<false>(next)) {
      return false;
    }
    if ((next & (row::blank | row::null)) != 0) {
      cut += (next & row::blank) != 0 ? 1 : 0;
      nulls |= (next & row::null) != 0;
    } else if (nulls) {
      return false;
    } else {
      text = output;
      textEnd = source;
      cut = 0;
    }
  }
  return finish<Source>(text, field.data(), textEnd, cut, room, done);
}

template <class Source, bool shifts>
inline bool Table::finish(Output<shifts> output, const char *begin, const char *end, int64_t cut,
                          Room room, Done &done) {
  if (!output.close()) {
    return false;
  }
  done.written = output.at() - room.begin;
  done.replaced = 0;
  bool mode = false;
  for (const char *source = begin; output.hasReplaced() && source != end;) {
    const Row next = nextRow<Source, false>(rows_.get(), source, end, mode);
    done.replaced += (next & row::replaced) != 0 ? 1 : 0;
  }
  return !putsBlanks_ || addBlanks(cut, room, done);
}

} // namespace zelfields
