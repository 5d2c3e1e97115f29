// Text into bytes of the destination page, as far as there is room, and what went wrong.
#pragma once

#include "translate/room.h"

#include <string_view>
#include <unicode/ucnv.h>
#include <vector>

namespace zelfields {

// Room for whole pieces, for pages in which a character becomes other bytes if the room ends.
struct WholePieces {
  std::vector<char> bytes;
  std::vector<int32_t> offsets;
};

// Encodes one text, in one or more pieces. Bytes that do not fit are counted and dropped, so that
// the size is that of the whole text.
class Encoder {
public:
  static constexpr int64_t none = -1;

  // `to` is at the beginning of a text.
  Encoder(UConverter *to, Room room, WholePieces *whole = nullptr)
      : to_(to), room_(room), whole_(whole) {}

  // False if a character stops the converter: bad() is its first unit.
  bool add(std::u16string_view piece);
  // Ends the text and closes shift states. A text without units has not even a signature.
  bool finish();

  // Takes the memory for pieces of so many units, if any is needed.
  void makeRoomFor(std::size_t units);
  // The room for what comes now.
  void into(Room room) { room_ = room; }
  // Whether all units are encoded. Some may be kept back, to see which one follows.
  bool isSettled() const;

  int64_t size() const { return size_; }    // bytes, whether they fit or not
  int64_t units() const { return before_; } // that were added
  int64_t bad() const { return bad_; }
  // The first unit of the first character that does not fit: units() if only the last shift does
  // not, none if all fits.
  int64_t unfit() const { return unfit_; }

private:
  // A piece, and how far it is encoded.
  struct Progress {
    const char16_t *begin;
    const char16_t *source;
    const char16_t *end;
  };

  bool encode(std::u16string_view text);
  bool allFits() const { return unfit_ == none; }
  void write(Progress &piece, UErrorCode &error);
  void writeWhole(Progress &piece, UErrorCode &error);
  void count(Progress &piece, UErrorCode &error);
  int64_t resolved(const Progress &piece) const;
  bool noteBad(int64_t after);

  UConverter *to_;
  Room room_; // that is left
  WholePieces *whole_;
  int64_t size_ = 0;
  int64_t before_ = 0;
  int64_t bad_ = none;
  int64_t unfit_ = none;
  char16_t half_ = 0; // of a pair, for a converter that would lose it
};

} // namespace zelfields
