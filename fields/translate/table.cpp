// A memory of the path: what each character becomes, for pages in which that is always the same.
#include "translate/table.h"

#include "pages/page_traits.h"
#include "translate/loops.h"

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

} // namespace

Table::Table(Path &path, bool isBare)
    : path_(path), isPadded_(path.policy().padding != NLS2F_AS_IS),
      putsBlanks_(path.policy().padding >= NLS2F_FILL),
      width_(path.policy().width != 0 ? path.policy().width : INT64_MAX) {
  const UConverterType to = ucnv_getType(path.to());
  if (isBare && (isStateless(to) || to == UCNV_EBCDIC_STATEFUL)) {
    chooseSource();
  }
}

Table::Table(Path &path, const Table &other)
    : path_(path), isPadded_(other.isPadded_), putsBlanks_(other.putsBlanks_), width_(other.width_),
      run_(other.run_), spell_(other.spell_), size_(other.size_), learned_(other.learned_) {
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

Row Table::learn(uint32_t code) {
  learned_[code / rowsOfBlock] = true;
  return rows_[code] = ask(code);
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
  if (text.empty() && waits && length == 1 && code != 0) {
    return row::lead;
  }
  const bool isOne = text.size() == 1 && !U16_IS_SURROGATE(text[0]);
  const bool isPair = text.size() == 2 && U16_IS_LEAD(text[0]) && U16_IS_TRAIL(text[1]);
  const bool isValid = path_.replaced().total() == 0 || size_ == rowsOfBlock;
  if (waits || decoder.hasStopped() || !isValid || !(isOne || isPair)) {
    return row::unlearned;
  }
  const Row kind = isOne ? row::kindOf(text[0]) : 0;
  char written[16];
  Encoder encoder(to, {written, sizeof written});
  if (!encoder.add(text) || !encoder.isSettled() || !encoder.finish()) {
    return row::unlearned | kind;
  }
  const Row flags = kind | (path_.replaced().total() != 0 ? row::replaced : 0);
  const std::string_view out(written, static_cast<std::size_t>(encoder.size()));
  if (ucnv_getType(to) != UCNV_EBCDIC_STATEFUL) {
    return std::ssize(out) <= row::mostBytes ? row::make(out, flags) : row::unlearned | kind;
  }
  if (out.size() == 4 && out.front() == shiftOut && out.back() == shiftIn) {
    return row::make(out.substr(1, 2), flags);
  }
  const bool isShift = out.size() == 1 && (out[0] == shiftOut || out[0] == shiftIn);
  return out.size() <= 1 && !isShift ? row::make(out, flags) : row::unlearned | kind;
}

} // namespace zelfields
