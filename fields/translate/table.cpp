// A memory of the path: what each character becomes, for pages in which that is always the same.
#include "translate/table.h"

#include "pages/page_traits.h"
#include "translate/sources.h"

#include <algorithm>
#include <cstring>
#include <new>
#include <unicode/uchar.h>
#include <unicode/utf16.h>
#include <utility>

namespace zelfields {
namespace {

constexpr std::size_t rowsOfBlock = 256;
constexpr std::size_t allRows = 0x10000; // 512 KiB

// The row of a last shift: no text, and so no end of one.
constexpr Row noCharacter = row::known | row::null;

// Whether a code point is a blank or a null.
Row kindOf(uint32_t codePoint) {
  const bool isBlank = codePoint == ' ' || codePoint == '\t' ||
                       (codePoint > 0x7E && u_isblank(static_cast<UChar32>(codePoint)) != 0);
  return codePoint == 0 ? row::null : isBlank ? row::blank : 0;
}

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

  Row a, b, c, d, e, f, g, h;
};

// What a loop writes. As a local object, all of it stays in registers.
template <bool shifts>
class Output {
public:
  Output(char *begin, char *limit) : at_(begin), limit_(limit) {}

  char *at() const { return at_; }
  int64_t replaced() const { return replaced_; }
  bool hasRoomForEight() const {
    return limit_ - at_ >= EightRows::count * static_cast<std::ptrdiff_t>(row::mostBytes);
  }

  void putPlain(const EightRows &rows) {
    char *target = at_;
    rows.forEach([&](Row row) { *target++ = row::firstByte(row); });
    at_ += EightRows::count;
  }
  void putKnown(const EightRows &rows) {
    rows.forEach([&](Row row) {
      row::putFour(at_, row);
      at_ += row::size(row);
      replaced_ += (row & row::replaced) != 0 ? 1 : 0;
    });
  }
  // False if there is no room.
  bool put(Row row) {
    const auto size = static_cast<std::ptrdiff_t>(row::size(row));
    if (shifts && size != 0 && (size == 2) != mode_ && !shift()) {
      return false;
    }
    if (limit_ - at_ >= static_cast<std::ptrdiff_t>(row::mostBytes)) {
      row::putFour(at_, row);
    } else if (limit_ - at_ < size) {
      return false;
    } else {
      char bytes[row::mostBytes];
      row::putFour(bytes, row);
      std::memcpy(at_, bytes, static_cast<std::size_t>(size));
    }
    at_ += size;
    replaced_ += (row & row::replaced) != 0 ? 1 : 0;
    return true;
  }
  bool close() { return !mode_ || shift(); }

private:
  bool shift() {
    if (at_ == limit_) {
      return false;
    }
    mode_ = !mode_;
    *at_++ = mode_ ? shiftOut : shiftIn;
    return true;
  }

  char *at_;
  char *limit_;
  int64_t replaced_ = 0;
  bool mode_ = false;
};

} // namespace

Table::Table(Path &path, bool isBare)
    : path_(path), isPadded_(path.policy().padding != NLS2F_AS_IS) {
  const UConverterType to = ucnv_getType(path.to());
  if (isBare && (isStateless(to) || to == UCNV_EBCDIC_STATEFUL)) {
    chooseSource();
  }
}

Table::Table(Path &path, const Table &other)
    : path_(path), isPadded_(other.isPadded_), run_(other.run_), spell_(other.spell_),
      size_(other.size_), learned_(other.learned_) {
  reserve();
  for (std::size_t at = 0; at < size_; at += rowsOfBlock) {
    if (learned_[at / rowsOfBlock]) {
      std::copy_n(&other.rows_[at], rowsOfBlock, &rows_[at]);
    }
  }
}

// Memory that is not written to takes no room.
void Table::reserve() {
  if (size_ != 0) {
    rows_.reset(static_cast<Row *>(std::calloc(size_, sizeof(Row))));
    if (!rows_) {
      throw std::bad_alloc();
    }
  }
}

template <class Source>
void Table::use(std::size_t rows) {
  const bool shifts = ucnv_getType(path_.to()) == UCNV_EBCDIC_STATEFUL;
  run_ = shifts ? &Table::run<Source, true> : &Table::run<Source, false>;
  spell_ = Source::spell;
  size_ = rows;
  reserve();
}

void Table::chooseSource() {
  switch (const UConverterType from = ucnv_getType(path_.from())) {
  case UCNV_MBCS:
  case UCNV_DBCS:
    return use<MixedSource>(allRows);
  case UCNV_EBCDIC_STATEFUL:
    return use<ShiftedSource>(allRows);
  case UCNV_UTF8:
  case UCNV_CESU8:
    return use<Utf8Source>(allRows);
  case UCNV_UTF16_BigEndian:
    return use<UnitSource<uint16_t, true>>(allRows);
  case UCNV_UTF16_LittleEndian:
    return use<UnitSource<uint16_t, false>>(allRows);
  case UCNV_UTF32_BigEndian:
    return use<UnitSource<uint32_t, true>>(allRows);
  case UCNV_UTF32_LittleEndian:
    return use<UnitSource<uint32_t, false>>(allRows);
  default:
    return isSingleByte(from) ? use<SingleByteSource>(rowsOfBlock) : void();
  }
}

bool Table::translateField(std::string_view field, Room room, Done &done) {
  if (field.size() > Path::longestField) {
    return false;
  }
  Run run = {
      field.data(), field.data() + field.size(), room.begin, room.begin + path_.limit(room), 0, 0};
  if (!(this->*run_)(run)) {
    return false;
  }
  done = {run.target - room.begin, run.replaced};
  return path_.policy().padding < NLS2F_FILL || addBlanks(run.cut, room, done);
}

bool Table::addBlanks(int64_t cut, Room room, Done &done) const {
  const Blanks &blanks = path_.blanks();
  if (blanks.size() == 0) {
    return false;
  }
  const int64_t count = Blanks::count(path_.policy(), blanks.after(done.written), cut);
  if (count == Blanks::cannot || count * blanks.size() > room.size - done.written) {
    return false;
  }
  blanks.put(room.begin + done.written, count);
  done.written += count * blanks.size();
  done.replaced += blanks.isReplaced() ? count : 0;
  return true;
}

// Cuts blanks and nulls off the end.
template <class Source>
void Table::trim(Run &field) {
  if constexpr (Source::codesAreBytes) {
    while (field.end - field.source >= EightRows::count) {
      const char *const start = field.end - EightRows::count;
      const Row common = EightRows::of<Source>(rows_.get(), start).common();
      if ((common & (row::blank | row::null)) == 0) {
        break;
      }
      field.cut += (common & row::blank) != 0 ? EightRows::count : 0;
      field.end = start;
    }
  }
  while (field.end != field.source) {
    const char *start = field.end;
    const uint32_t code = Source::last(field.source, start);
    const Row kind = Source::codesAreBytes ? rowOf(code) : code < noCode ? kindOf(code) : 0;
    if ((kind & (row::blank | row::null)) == 0) {
      return;
    }
    field.cut += (kind & row::blank) != 0 ? 1 : 0;
    field.end = start;
  }
}

template <class Source>
inline Row Table::nextRow(const Row *rows, const char *&source, const char *end, bool &mode) {
  uint32_t code = Source::next(source, end, mode);
  if (code >= noCode) {
    return code == endOfField ? noCharacter : 0;
  }
  Row next = rows[code];
  if ((next & row::known) != 0) {
    return next;
  }
  next = rowOf(code);
  if (Source::hasLeads && (next & row::lead) != 0 && source != end && code != 0) {
    code = code << 8 | byteAt(source++);
    next = rowOf(code);
  }
  return next;
}

// Translates a text, or finds that the path must.
template <class Source, bool shifts>
bool Table::run(Run &field) {
  if (Source::findsEnd && isPadded_) {
    trim<Source>(field);
  }
  if (!Source::findsEnd && isPadded_) {
    return runToEnd<Source, shifts>(field);
  }
  const Row refused = isPadded_ ? row::null : 0;
  const Row *const rows = rows_.get();
  const char *source = field.source;
  const char *const end = field.end;
  Output<shifts> output(field.target, field.limit);
  bool mode = false; // the source's
  while (source != end) {
    while (!shifts && end - source >= EightRows::count * Source::blockWidth &&
           output.hasRoomForEight() && Source::isBlock(source, mode)) {
      const auto eight = EightRows::of<Source>(rows, source);
      if ((eight.common() & row::plain) != 0) {
        output.putPlain(eight);
      } else if ((eight.common() & row::known) != 0 && (eight.any() & refused) == 0) {
        output.putKnown(eight);
      } else {
        break;
      }
      source += EightRows::count * Source::blockWidth;
    }
    for (int singles = EightRows::count; singles > 0 && source != end; --singles) {
      const Row next = nextRow<Source>(rows, source, end, mode);
      if ((next & row::known) == 0 || (next & refused) != 0 || !output.put(next)) {
        return false;
      }
    }
  }
  return finish(output, field);
}

// Likewise for a page whose blanks can be found only on the way to its end.
template <class Source, bool shifts>
bool Table::runToEnd(Run &field) {
  const char *source = field.source;
  Output<shifts> output(field.target, field.limit);
  Output<shifts> text = output; // without the blanks and nulls so far at its end
  const Row *const rows = rows_.get();
  bool nulls = false;
  bool mode = false;
  while (source != field.end) {
    const Row next = nextRow<Source>(rows, source, field.end, mode);
    if ((next & row::known) == 0 || !output.put(next)) {
      return false;
    }
    if ((next & (row::blank | row::null)) != 0) {
      field.cut += (next & row::blank) != 0 ? 1 : 0;
      nulls |= (next & row::null) != 0;
    } else if (nulls) {
      return false;
    } else {
      text = output;
      field.cut = 0;
    }
  }
  return finish(text, field);
}

template <class Output>
bool Table::finish(Output output, Run &field) {
  if (!output.close()) {
    return false;
  }
  field.target = output.at();
  field.replaced = output.replaced();
  return true;
}

Row Table::rowOf(uint32_t code) {
  Row &known = rows_[code];
  if (known == 0) {
    learned_[code / rowsOfBlock] = true;
    known = ask(code);
  }
  return known;
}

// What the path makes of a character that stands alone, if it makes the same of it everywhere: so if
// neither converter waits for what follows.
Row Table::ask(uint32_t code) {
  char bytes[4];
  const std::size_t length = spell_(code, bytes);
  UConverter *const to = path_.begin();
  Decoder decoder(path_.from(), {bytes, length});
  std::array<char16_t, 8> units;
  const std::u16string_view text(units.data(), decoder.decode(units, false));
  UErrorCode error = U_ZERO_ERROR;
  const bool waits = ucnv_toUCountPending(path_.from(), &error) != 0;
  if (text.empty() && waits && length == 1) {
    return row::lead;
  }
  const bool isOne = text.size() == 1 && !U16_IS_SURROGATE(text[0]);
  const bool isPair = text.size() == 2 && U16_IS_LEAD(text[0]) && U16_IS_TRAIL(text[1]);
  const bool isValid = path_.replaced().total() == 0 || size_ == rowsOfBlock;
  if (waits || decoder.hasStopped() || !isValid || !(isOne || isPair)) {
    return row::unlearned;
  }
  const Row kind = isOne ? kindOf(text[0]) : 0;
  char written[16];
  Encoder encoder(to, {written, sizeof written});
  if (!encoder.add(text) || !encoder.isSettled() || !encoder.finish()) {
    return row::unlearned | kind;
  }
  const Row flags = kind | (path_.replaced().total() != 0 ? row::replaced : 0);
  const std::string_view out(written, static_cast<std::size_t>(encoder.size()));
  if (ucnv_getType(to) != UCNV_EBCDIC_STATEFUL) {
    return out.size() <= row::mostBytes ? row::make(out, flags) : row::unlearned | kind;
  }
  if (out.size() == 4 && out.front() == shiftOut && out.back() == shiftIn) {
    return row::make(out.substr(1, 2), flags);
  }
  const bool isShift = out.size() == 1 && (out[0] == shiftOut || out[0] == shiftIn);
  return out.size() <= 1 && !isShift ? row::make(out, flags) : row::unlearned | kind;
}

} // namespace zelfields
