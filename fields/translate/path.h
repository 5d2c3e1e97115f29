// A field through ICU: the path that is right for every pair of pages.
#pragma once

#include "pages/page.h"
#include "translate/blanks.h"
#include "translate/decoder.h"
#include "translate/encoder.h"
#include "translate/problem.h"
#include "translate/replacement.h"

#include <memory>
#include <string_view>
#include <unicode/localpointer.h>

namespace zelfields {

// Two converters with the policy's callbacks, and a buffer for the text between them. It remains
// where it is made, since the converters point at its counts.
class Path {
public:
  static constexpr int64_t longestField = INT32_MAX;
  // Fields of up to so many bytes need no more memory.
  static constexpr std::size_t usualField = 2048;
  // Units that are encoded at once if a text need not be seen whole: as many as ucnv_convertEx() does.
  static constexpr std::size_t pieceUnits = 1024;

  // Takes over two converters that nobody else uses.
  Path(UConverter *from, UConverter *to, const NLS2F_Policy &policy, UErrorCode &error);
  Path(const Path &) = delete;
  Path &operator=(const Path &) = delete;

  const NLS2F_Policy &policy() const { return policy_; }
  UConverter *from() const { return from_.getAlias(); }
  UConverter *to() const { return to_.getAlias(); }
  const Blanks &blanks() const { return blanks_; }
  Replacements &replaced() { return replaced_; }

  // The most bytes that the text may take.
  int64_t limit(Room room) const {
    return policy_.width != 0 ? std::min(policy_.width, room.size) : room.size;
  }
  int64_t maxSize(int64_t length) const;

  // Begins a text that goes through the converters one by one. The result is the encoding one.
  UConverter *begin() {
    replaced_ = {};
    restart(from_);
    return restart(to_);
  }
  // False if the field is the problem.
  bool translate(std::string_view field, Room room, Done &done, NLS2F_Problem &problem);

private:
  bool asIs(std::string_view field, Room room, Done &done, NLS2F_Problem &problem);
  bool padded(std::string_view field, Room room, Done &done, NLS2F_Problem &problem);
  bool apart(std::string_view field, const Encoder &text, int64_t cut, Room room, Done &done,
             NLS2F_Problem &problem);
  bool together(std::string_view field, std::size_t units, const Encoder &text, int64_t cut,
                Room room, Done &done, NLS2F_Problem &problem);
  Encoder encoderInto(Room room);
  void reserve(std::size_t units);
  std::size_t decodeAll(Decoder &decoder, std::size_t length);

  // Each says what the problem is, and where. They return false.
  bool badUnit(int32_t kind, std::string_view field, int64_t unit, NLS2F_Problem &problem);
  bool badText(std::string_view field, const Decoder &decoder, const Encoder &encoder,
               NLS2F_Problem &problem);
  bool noRoom(std::string_view field, const Encoder &encoder, int64_t units, int64_t needed,
              NLS2F_Problem &problem);
  bool noExactFill(std::string_view field, const Sizes &sizes, NLS2F_Problem &problem) const;

  const NLS2F_Policy policy_;
  icu::LocalUConverterPointer from_;
  icu::LocalUConverterPointer to_;
  Replacements replaced_;
  Blanks blanks_;
  std::unique_ptr<char16_t[]> units_;
  std::size_t capacity_ = 0;
  bool looksAhead_ = false;
  WholePieces whole_;
};

} // namespace zelfields
