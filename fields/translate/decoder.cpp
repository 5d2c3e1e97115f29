// Bytes of the source page into UTF-16, and where in them a character is.
#include "translate/decoder.h"

#include "pages/page_traits.h"
#include "translate/replacement.h"

#include <algorithm>
#include <cstring>
#include <new>
#include <unicode/utf16.h>

namespace zelfields {
namespace {

// ICU takes no more at once.
constexpr std::size_t mostUnits = 0x3FFFFFFF;
constexpr std::ptrdiff_t mostBytes = 0x7FFFFFFF;

// The bytes at which a converter stopped because they are not valid.
int64_t invalidBytes(const UConverter *from) {
  char bytes[8];
  int8_t count = sizeof bytes;
  UErrorCode error = U_ZERO_ERROR;
  ucnv_getInvalidChars(from, bytes, &count, &error);
  return std::max<int64_t>(count, 1);
}

// A text as its units, one by one, and the place of the character that each belongs to. ICU's own
// places of replaced bytes are wrong in pages with extensions, so these are noted as they occur.
class Units {
public:
  Units(UConverter *from, std::string_view text) : from_(from), text_(text), decoder_(from, text) {
    noted_[piece] = -1;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_setToUCallBack(from, note, this, &policy_, &context_, &error);
  }
  ~Units() {
    UErrorCode error = U_ZERO_ERROR;
    ucnv_setToUCallBack(from_, policy_, context_, nullptr, nullptr, &error);
  }
  Units(const Units &) = delete;
  Units &operator=(const Units &) = delete;

  // False after the last unit.
  bool next() {
    while (++at_ >= count_) {
      if (decoder_.isDone()) {
        offset_ = static_cast<int64_t>(text_.size());
        return false;
      }
      read();
    }
    if (noted_[at_] >= 0) {
      offset_ = noted_[at_];
    } else if (offsets_[at_] >= 0) { // else it is left over from the piece before
      offset_ = start_ + offsets_[at_];
    }
    return true;
  }
  char16_t unit() const { return units_[at_]; }
  int64_t offset() const { return offset_; } // after the last unit, the end of the text

private:
  static constexpr std::size_t piece = 64;

  void read() {
    const int64_t leftOver = noted_[piece];
    std::fill_n(noted_, piece + 1, -1);
    noted_[0] = leftOver;
    start_ = decoder_.read();
    count_ = decoder_.decode(units_, true, offsets_);
    at_ = static_cast<std::size_t>(-1);
  }

  static void note(const void *context, UConverterToUnicodeArgs *arguments, const char *,
                   int32_t length, UConverterCallbackReason reason, UErrorCode *error) {
    if (reason > UCNV_IRREGULAR) {
      return;
    }
    Units &units = *static_cast<Units *>(const_cast<void *>(context));
    UErrorCode ignored = U_ZERO_ERROR;
    const char *const begin = units.text_.data();
    const std::less_equal<> before; // what ICU reads again is elsewhere
    if (before(begin, arguments->source) && before(arguments->source, begin + units.text_.size())) {
      units.noted_[arguments->target - units.units_] =
          arguments->source - begin - ucnv_toUCountPending(arguments->converter, &ignored) -
          std::max(length, 1);
    }
    replaceBytes(arguments, error);
  }

  UConverter *from_;
  std::string_view text_;
  Decoder decoder_;
  UConverterToUCallback policy_ = nullptr;
  const void *context_ = nullptr;
  char16_t units_[piece] = {};
  int32_t offsets_[2 * piece] = {}; // ICU writes past the end of as many as there are units
  int64_t noted_[piece + 1];        // -1 for units of valid bytes; the last is left over
  std::size_t count_ = 0;
  std::size_t at_ = 0;
  int64_t start_ = 0;
  int64_t offset_ = 0;
};

// A character: its bytes, shifts after it included, and its units.
struct Character {
  int64_t offset;
  int64_t end;
  int64_t endUnit;
  UChar32 codePoint;
};

Character characterAt(int64_t unit, std::string_view text, UConverter *converter) {
  Units units(converter, text);
  for (int64_t i = 0; i <= unit; ++i) {
    units.next();
  }
  Character found = {units.offset(), 0, unit + 1, units.unit()};
  bool more = units.next();
  if (more && U16_IS_LEAD(found.codePoint) && U16_IS_TRAIL(units.unit())) {
    found.codePoint = U16_GET_SUPPLEMENTARY(found.codePoint, units.unit());
    ++found.endUnit;
    more = units.next();
  }
  while (more && units.offset() <= found.offset) {
    more = units.next();
  }
  found.end = units.offset();
  return found;
}

// The end of a character without shifts after it: its bytes are read one by one until its units
// come. In base 64 it shares its last byte with the next character.
int64_t endWithoutShifts(const Character &character, std::string_view text, UConverter *converter) {
  const char *source = text.data();
  const bool shares = isOneOf(ucnv_getType(converter), {UCNV_UTF7, UCNV_IMAP_MAILBOX});
  const int64_t end = std::min<int64_t>(character.end + (shares ? 1 : 0), std::ssize(text));
  int64_t decoded = 0;
  for (int64_t limit = std::max<int64_t>(character.offset, 0);
       decoded < character.endUnit && limit <= end;) {
    char16_t piece[64];
    char16_t *target = piece;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_toUnicode(converter, &target, piece + std::size(piece), &source, text.data() + limit,
                   nullptr, false, &error);
    decoded += target - piece;
    limit += error == U_BUFFER_OVERFLOW_ERROR ? 0 : 1;
  }
  return source - text.data();
}

} // namespace

std::size_t Decoder::decode(std::span<char16_t> units, bool last, int32_t *offsets) {
  char16_t *target = units.data();
  const char *source = text_.data() + read_;
  const char *const end = text_.data() + text_.size();
  const char *const until = source + std::min(end - source, mostBytes);
  UErrorCode error = U_ZERO_ERROR;
  ucnv_toUnicode(from_, &target, target + std::min(units.size(), mostUnits), &source, until,
                 offsets, static_cast<UBool>(last && until == end), &error);
  if (error == U_MEMORY_ALLOCATION_ERROR) {
    throw std::bad_alloc();
  }
  read_ = static_cast<std::size_t>(source - text_.data());
  isDone_ = error != U_BUFFER_OVERFLOW_ERROR && (until == end || U_FAILURE(error));
  valid_ = read();
  if (U_FAILURE(error) && isDone_) {
    UErrorCode ignored = U_ZERO_ERROR;
    invalid_ = invalidBytes(from_);
    valid_ -= invalid_ + ucnv_toUCountPending(from_, &ignored);
  }
  return static_cast<std::size_t>(target - units.data());
}

void setPlace(NLS2F_Problem &problem, std::string_view text, int64_t offset, int64_t size) {
  problem.offset = std::max<int64_t>(offset, 0);
  problem.byteCount = static_cast<int32_t>(std::min<int64_t>(size, sizeof problem.bytes));
  std::memset(problem.bytes, 0, sizeof problem.bytes);
  text.substr(static_cast<std::size_t>(problem.offset))
      .copy(reinterpret_cast<char *>(problem.bytes), static_cast<std::size_t>(problem.byteCount));
}

void setPlaceOfUnit(NLS2F_Problem &problem, std::string_view text, std::size_t before, int64_t unit,
                    const Rewind &rewind) {
  const std::string_view rest = text.substr(before);
  UConverter *converter = rewind();
  Character character = characterAt(unit, rest, converter);
  if (hasStates(ucnv_getType(converter))) {
    character.end = endWithoutShifts(character, rest, rewind());
  }
  setPlace(problem, text, static_cast<int64_t>(before) + character.offset,
           character.end - character.offset);
  problem.codePoint = static_cast<uint32_t>(character.codePoint);
}

} // namespace zelfields
