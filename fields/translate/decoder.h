// Bytes of the source page into UTF-16, and where in them a character is.
#pragma once

#include "nls2_fields.h"

#include <functional>
#include <span>
#include <string_view>
#include <unicode/ucnv.h>

namespace zelfields {

// Decodes one text, piece by piece.
class Decoder {
public:
  // `from` is at the text's beginning.
  Decoder(UConverter *from, std::string_view text) : from_(from), text_(text) {}

  // As many units as fit, or all that are left. `last` ends the text.
  std::size_t decode(std::span<char16_t> units, bool last, int32_t *offsets = nullptr);

  bool isDone() const { return isDone_; }          // all is read and decoded, or stopped
  bool hasStopped() const { return invalid_ > 0; } // because of bytes that are not valid
  int64_t read() const { return static_cast<int64_t>(read_); }
  // The end of what is decoded: where bytes that are not valid begin, if any.
  int64_t valid() const { return valid_; }
  int64_t invalid() const { return invalid_; } // how many bytes are not

private:
  UConverter *from_;
  std::string_view text_;
  std::size_t read_ = 0;
  int64_t valid_ = 0;
  int64_t invalid_ = 0;
  bool isDone_ = false;
};

// What a problem says of its place: `size` bytes of the text from `offset` on.
void setPlace(NLS2F_Problem &problem, std::string_view text, int64_t offset, int64_t size);

// Brings a converter to where a text begins.
using Rewind = std::function<UConverter *()>;

// Sets the place of a character, given by its first unit in the decoded text, and its code point.
//
//   before  bytes at the beginning of `text` that the rewound converter has read
void setPlaceOfUnit(NLS2F_Problem &problem, std::string_view text, std::size_t before, int64_t unit,
                    const Rewind &rewind);

} // namespace zelfields
